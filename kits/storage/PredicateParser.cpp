#include <PredicateParser.h>

#include <DateText.h>

#include <charconv>
#include <cmath>
#include <optional>

using host::Predicate;

namespace {

bool IsBlank(char c) {
    return c == ' ' || c == '\t' || c == '\n' || c == '\r';
}

// Ends a name or a value that is not in quotes.
bool EndsBareWord(char c, bool isName) {
    if (IsBlank(c) || c == '&' || c == '|' || c == '(' || c == ')' || c == '"' || c == '\'')
        return true;
    return isName && (c == '=' || c == '<' || c == '>' || c == '!');
}

// Descends recursively, one method for each level of binding: || binds least, then &&, then !.
class Parser {
  public:
    Parser(std::string_view text, time_t now) : mText(text), mNow(now) {}

    ParsedPredicate Run() {
        ParsedPredicate result;
        if (mText.size() > kMaxPredicateLength)
            Fail("the condition is too long");
        else if (mText.find('\0') != std::string_view::npos)
            Fail("a zero byte cannot be part of a condition");
        std::optional<Tree> tree;
        if (mError.empty())
            tree = ParseAlternatives(0);
        SkipBlanks();
        if (tree && mPosition < mText.size())
            Fail("expected && or || or the end");
        if (mError.empty() && tree)
            result.predicate = std::move(tree->predicate);
        result.error = std::move(mError);
        result.position = mErrorPosition;
        return result;
    }

  private:
    struct Tree {
        PredicateRef predicate;
        int depth = 0;
    };
    using MaybeTree = std::optional<Tree>;

    MaybeTree Fail(const char* error) {
        if (mError.empty()) {
            mError = error;
            mErrorPosition = mPosition;
        }
        return std::nullopt;
    }

    void SkipBlanks() {
        while (mPosition < mText.size() && IsBlank(mText[mPosition]))
            mPosition++;
    }

    bool Take(std::string_view token) {
        SkipBlanks();
        if (!mText.substr(mPosition).starts_with(token))
            return false;
        mPosition += token.size();
        return true;
    }

    MaybeTree Join(Predicate::Operator op, Tree left, Tree right) {
        Tree result;
        result.depth = std::max(left.depth, right.depth) + 1;
        if (result.depth > kMaxPredicateDepth)
            return Fail("the condition is nested too deeply");
        auto joined = std::make_shared<Predicate>();
        joined->op = op;
        joined->operands = {std::move(left.predicate), std::move(right.predicate)};
        result.predicate = std::move(joined);
        return result;
    }

    MaybeTree ParseAlternatives(int nesting) {
        MaybeTree left = ParseConjunction(nesting);
        while (left && Take("||")) {
            MaybeTree right = ParseConjunction(nesting);
            if (!right)
                return right;
            left = Join(Predicate::Operator::either, std::move(*left), std::move(*right));
        }
        return left;
    }

    MaybeTree ParseConjunction(int nesting) {
        MaybeTree left = ParseTerm(nesting);
        while (left && Take("&&")) {
            MaybeTree right = ParseTerm(nesting);
            if (!right)
                return right;
            left = Join(Predicate::Operator::both, std::move(*left), std::move(*right));
        }
        return left;
    }

    MaybeTree ParseTerm(int nesting) {
        // Each level of a printed tree costs a parenthesis, and a negation two.
        if (nesting > 2 * kMaxPredicateDepth + 2)
            return Fail("the condition is nested too deeply");
        if (Take("!")) {
            MaybeTree operand = ParseTerm(nesting + 1);
            if (!operand)
                return operand;
            return Negated(std::move(*operand));
        }
        if (Take("(")) {
            MaybeTree inner = ParseAlternatives(nesting + 1);
            if (inner && !Take(")"))
                return Fail("expected )");
            return inner;
        }
        return ParseComparison();
    }

    MaybeTree Negated(Tree operand) {
        Tree result;
        result.depth = operand.depth + 1;
        if (result.depth > kMaxPredicateDepth)
            return Fail("the condition is nested too deeply");
        auto negated = std::make_shared<Predicate>();
        negated->op = Predicate::Operator::negate;
        negated->operands = {std::move(operand.predicate)};
        result.predicate = std::move(negated);
        return result;
    }

    // A word with its backslashes, and whether it stood in quotes.
    struct Word {
        std::string text;
        bool quoted = false;
    };

    std::optional<Word> ParseWord(bool isName) {
        SkipBlanks();
        Word word;
        char quote = 0;
        if (mPosition < mText.size() && (mText[mPosition] == '"' || mText[mPosition] == '\'')) {
            quote = mText[mPosition++];
            word.quoted = true;
        }
        for (; mPosition < mText.size(); mPosition++) {
            char c = mText[mPosition];
            if (quote != 0 ? c == quote : EndsBareWord(c, isName))
                break;
            word.text += c;
            if (c == '\\') {
                if (++mPosition == mText.size()) {
                    Fail("nothing follows the backslash");
                    return std::nullopt;
                }
                word.text += mText[mPosition];
            }
        }
        if (quote != 0) {
            if (mPosition == mText.size()) {
                Fail("the quote is not closed");
                return std::nullopt;
            }
            mPosition++;
        } else if (word.text.empty()) {
            Fail(isName ? "expected the name of an attribute" : "expected a value");
            return std::nullopt;
        }
        return word;
    }

    std::optional<Predicate::Operator> ParseOperator() {
        if (Take("==") || Take("="))
            return Predicate::Operator::equal;
        if (Take("!="))
            return Predicate::Operator::not_equal;
        if (Take("<="))
            return Predicate::Operator::less_or_equal;
        if (Take("<"))
            return Predicate::Operator::less;
        if (Take(">="))
            return Predicate::Operator::greater_or_equal;
        if (Take(">"))
            return Predicate::Operator::greater;
        Fail("expected a comparison: == != < <= > >=");
        return std::nullopt;
    }

    MaybeTree ParseComparison() {
        std::optional<Word> attribute = ParseWord(true);
        if (!attribute)
            return std::nullopt;
        std::string name = Unescape(attribute->text);
        if (name.empty())
            return Fail("expected the name of an attribute");
        std::optional<Predicate::Operator> op = ParseOperator();
        if (!op)
            return std::nullopt;
        SkipBlanks();
        if (mPosition < mText.size() && mText[mPosition] == '%')
            return ParseDateValue(std::move(name), *op);
        auto letterCase = Take("~") ? Predicate::Case::insensitive : Predicate::Case::sensitive;
        size_t start = mPosition;
        std::optional<Word> value = ParseWord(false);
        if (!value)
            return std::nullopt;
        if (!value->quoted && letterCase == Predicate::Case::sensitive) {
            bool tooLarge = false;
            if (std::optional<Predicate::Value> number = ParseNumber(value->text, tooLarge))
                return Comparison(std::move(name), *op, std::move(*number), letterCase);
            if (tooLarge) {
                mPosition = start;
                return Fail("the number is too large");
            }
        }
        return TextComparison(std::move(name), *op, value->text, letterCase, start);
    }

    MaybeTree TextComparison(std::string name, Predicate::Operator op, const std::string& text,
                             Predicate::Case letterCase, size_t start) {
        bool ordering = op != Predicate::Operator::equal && op != Predicate::Operator::not_equal;
        if (ordering)
            return Comparison(std::move(name), op, Unescape(text), letterCase);
        if (!IsWellFormedPattern(text)) {
            mPosition = start;
            return Fail("a bracket is empty or not closed");
        }
        Predicate equal = ComparisonFromPattern(name, text, letterCase);
        if (op == Predicate::Operator::equal)
            return Tree{std::make_shared<const Predicate>(std::move(equal)), 0};
        if (equal.op == Predicate::Operator::equal)
            return Comparison(std::move(name), op, std::move(equal.value), letterCase);
        // Unequal to a pattern is one that has the attribute, but not so.
        Predicate present = ComparisonFromPattern(std::move(name), "*", Predicate::Case::sensitive);
        MaybeTree unequal = Negated(Tree{std::make_shared<const Predicate>(std::move(equal)), 0});
        return Join(Predicate::Operator::both, Tree{std::make_shared<const Predicate>(std::move(present)), 0},
                    std::move(*unequal));
    }

    MaybeTree ParseDateValue(std::string name, Predicate::Operator op) {
        size_t start = mPosition;
        size_t end = mText.find('%', start + 1);
        if (end == std::string_view::npos)
            return Fail("the date is not closed by %");
        std::optional<time_t> time = TimeFromText(mText.substr(start + 1, end - start - 1), mNow);
        if (!time)
            return Fail("not a date");
        mPosition = end + 1;
        return Comparison(std::move(name), op, static_cast<std::int64_t>(*time), Predicate::Case::sensitive);
    }

    MaybeTree Comparison(std::string name, Predicate::Operator op, Predicate::Value value,
                         Predicate::Case letterCase) {
        auto comparison = std::make_shared<Predicate>();
        comparison->op = op;
        comparison->attribute = std::move(name);
        comparison->value = std::move(value);
        comparison->letter_case = letterCase;
        return Tree{std::move(comparison), 0};
    }

    static std::optional<Predicate::Value> ParseNumber(std::string_view word, bool& tooLarge) {
        size_t digits = word.starts_with('-') ? 1 : 0;
        if (digits == word.size() || word[digits] < '0' || word[digits] > '9')
            return std::nullopt;
        if (word.substr(digits).starts_with("0x")) {
            std::uint64_t number = 0;
            if (digits == 1 || !ReadWhole(word.substr(2), number, tooLarge, 16))
                return std::nullopt;
            return IntegerValue(number);
        }
        if (std::int64_t number = 0; ReadWhole(word, number, tooLarge, 10))
            return number;
        if (std::uint64_t number = 0; digits == 0 && ReadWhole(word, number, tooLarge, 10)) {
            tooLarge = false;
            return number;
        }
        double number = 0;
        auto [end, error] = std::from_chars(word.data(), word.data() + word.size(), number);
        if (end != word.data() + word.size())
            return std::nullopt;
        // An integer that fits no integer type is not rounded quietly.
        if (word.find_first_of(".eE") == std::string_view::npos || error != std::errc())
            tooLarge = true;
        else
            tooLarge = false;
        if (tooLarge || !std::isfinite(number))
            return std::nullopt;
        return number;
    }

    static Predicate::Value IntegerValue(std::uint64_t number) {
        if (number <= static_cast<std::uint64_t>(INT64_MAX))
            return static_cast<std::int64_t>(number);
        return number;
    }

    template <typename Number>
    static bool ReadWhole(std::string_view word, Number& number, bool& tooLarge, int base) {
        auto [end, error] = std::from_chars(word.data(), word.data() + word.size(), number, base);
        if (end != word.data() + word.size())
            return false;
        tooLarge = error == std::errc::result_out_of_range;
        return error == std::errc();
    }

    std::string_view mText;
    time_t mNow;
    size_t mPosition = 0;
    std::string mError;
    size_t mErrorPosition = 0;
};

} // namespace

ParsedPredicate ParsePredicate(std::string_view text, time_t now) {
    return Parser(text, now).Run();
}
