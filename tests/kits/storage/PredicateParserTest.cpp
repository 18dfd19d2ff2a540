#include <PredicateParser.h>
#include <PredicatePrinter.h>

#include "RandomPredicate.h"
#include "support/random_seed.h"

#include <gtest/gtest.h>

using host::Predicate;
using Operator = Predicate::Operator;

namespace {

constexpr time_t kNow = 1'000'000'000;

PredicateRef Parsed(std::string_view text) {
    ParsedPredicate parsed = ParsePredicate(text, kNow);
    EXPECT_EQ(parsed.error, "") << text << " at " << parsed.position;
    return parsed.predicate;
}

Predicate Comparison(const char* attribute, Operator op, Predicate::Value value) {
    Predicate comparison;
    comparison.attribute = attribute;
    comparison.op = op;
    comparison.value = std::move(value);
    return comparison;
}

void ExpectComparison(std::string_view text, const char* attribute, Operator op, Predicate::Value value) {
    PredicateRef parsed = Parsed(text);
    ASSERT_NE(parsed, nullptr) << text;
    EXPECT_TRUE(PredicatesAreEqual(*parsed, Comparison(attribute, op, std::move(value)))) << text;
}

} // namespace

TEST(PredicateParser, ReadsEveryComparison) {
    ExpectComparison("size==5", "size", Operator::equal, std::int64_t(5));
    ExpectComparison("size=5", "size", Operator::equal, std::int64_t(5));
    ExpectComparison("size!=5", "size", Operator::not_equal, std::int64_t(5));
    ExpectComparison("size<5", "size", Operator::less, std::int64_t(5));
    ExpectComparison("size<=5", "size", Operator::less_or_equal, std::int64_t(5));
    ExpectComparison("size>5", "size", Operator::greater, std::int64_t(5));
    ExpectComparison("size>=5", "size", Operator::greater_or_equal, std::int64_t(5));
}

TEST(PredicateParser, TakesBlanksBetweenParts) {
    ExpectComparison(" \t\nAudio:Artist  ==\n\"A\" ", "Audio:Artist", Operator::equal, std::string("A"));
}

TEST(PredicateParser, ReadsNumbersInTheirTypes) {
    ExpectComparison("a==-7", "a", Operator::equal, std::int64_t(-7));
    ExpectComparison("a==0x1F", "a", Operator::equal, std::int64_t(31));
    ExpectComparison("a==9223372036854775808", "a", Operator::equal, std::uint64_t(9223372036854775808u));
    ExpectComparison("a==1.5", "a", Operator::equal, 1.5);
    ExpectComparison("a==1e3", "a", Operator::equal, 1000.0);
    ExpectComparison("a==\"5\"", "a", Operator::equal, std::string("5"));
    ExpectComparison("a==5x", "a", Operator::equal, std::string("5x"));
    ExpectComparison("a==-", "a", Operator::equal, std::string("-"));
}

TEST(PredicateParser, WildcardsMakeTheSimplestComparison) {
    ExpectComparison("name==\"*.mp3\"", "name", Operator::ends_with, std::string(".mp3"));
    ExpectComparison("name==\"01*\"", "name", Operator::begins_with, std::string("01"));
    ExpectComparison("name==\"*love*\"", "name", Operator::contains, std::string("love"));
    ExpectComparison("name==*love*", "name", Operator::contains, std::string("love"));
    ExpectComparison("name==\"*\"", "name", Operator::contains, std::string(""));
    ExpectComparison("name==\"**\"", "name", Operator::contains, std::string(""));
    ExpectComparison("name==\"a*b\"", "name", Operator::matches, std::string("a*b"));
    ExpectComparison("name==\"a***b\"", "name", Operator::matches, std::string("a*b"));
    ExpectComparison("name==\"?\"", "name", Operator::matches, std::string("?"));
    ExpectComparison("name==\"[ab]\"", "name", Operator::matches, std::string("[ab]"));
    ExpectComparison("name==\"*[*\\]]*\"", "name", Operator::matches, std::string("*[*\\]]*"));
    ExpectComparison("name==\"\"", "name", Operator::equal, std::string(""));
}

TEST(PredicateParser, ABackslashMakesTheNextByteLiteral) {
    ExpectComparison("name==\"a\\*b\"", "name", Operator::equal, std::string("a*b"));
    ExpectComparison("name==\"\\\"\"", "name", Operator::equal, std::string("\""));
    ExpectComparison("name==\"\\\\*\"", "name", Operator::begins_with, std::string("\\"));
    ExpectComparison("name==\"\\\\\\*\"", "name", Operator::equal, std::string("\\*"));
    ExpectComparison("name==a\\ b", "name", Operator::equal, std::string("a b"));
    ExpectComparison("my\\ name==a", "my name", Operator::equal, std::string("a"));
    ExpectComparison("\"my name\"=='a'", "my name", Operator::equal, std::string("a"));
}

TEST(PredicateParser, OrderingTakesTextsLiterally) {
    ExpectComparison("name<\"a*\"", "name", Operator::less, std::string("a*"));
    ExpectComparison("name>=\"[\"", "name", Operator::greater_or_equal, std::string("["));
}

TEST(PredicateParser, TildeMakesLettersCompareWithoutCase) {
    PredicateRef parsed = Parsed("Audio:Artist==~\"*Beat*\"");
    ASSERT_NE(parsed, nullptr);
    EXPECT_EQ(parsed->op, Operator::contains);
    EXPECT_EQ(parsed->letter_case, Predicate::Case::insensitive);
    EXPECT_EQ(std::get<std::string>(parsed->value), "Beat");
}

TEST(PredicateParser, UnequalToAPatternStillNeedsTheAttribute) {
    PredicateRef parsed = Parsed("Audio:Artist!=\"*x*\"");
    ASSERT_NE(parsed, nullptr);
    ASSERT_EQ(parsed->op, Operator::both);
    EXPECT_TRUE(PredicatesAreEqual(*parsed->operands[0],
                                   Comparison("Audio:Artist", Operator::contains, std::string(""))));
    ASSERT_EQ(parsed->operands[1]->op, Operator::negate);
    EXPECT_TRUE(PredicatesAreEqual(*parsed->operands[1]->operands[0],
                                   Comparison("Audio:Artist", Operator::contains, std::string("x"))));
}

TEST(PredicateParser, AndBindsCloserThanOr) {
    PredicateRef parsed = Parsed("a==1||b==2&&c==3");
    ASSERT_NE(parsed, nullptr);
    ASSERT_EQ(parsed->op, Operator::either);
    EXPECT_EQ(parsed->operands[0]->attribute, "a");
    EXPECT_EQ(parsed->operands[1]->op, Operator::both);
}

TEST(PredicateParser, NotBindsClosest) {
    PredicateRef parsed = Parsed("!(a==1)&&b==2");
    ASSERT_NE(parsed, nullptr);
    ASSERT_EQ(parsed->op, Operator::both);
    EXPECT_EQ(parsed->operands[0]->op, Operator::negate);
}

TEST(PredicateParser, ChainsNestFromTheLeft) {
    PredicateRef parsed = Parsed("a==1||b==2||c==3");
    ASSERT_NE(parsed, nullptr);
    EXPECT_EQ(parsed->operands[0]->op, Operator::either);
    EXPECT_EQ(parsed->operands[1]->attribute, "c");
}

TEST(PredicateParser, DatesAreSecondsAsOfNow) {
    ExpectComparison("last_modified>=%now%", "last_modified", Operator::greater_or_equal,
                     std::int64_t(1'000'000'000));
    ExpectComparison("last_modified<%2 hours ago%", "last_modified", Operator::less,
                     std::int64_t(999'992'800));
}

TEST(PredicateParser, MalformedTextsSayWhatIsWrongAndWhere) {
    struct Case {
        std::string_view text;
        const char* error;
        size_t position;
    };
    const Case cases[] = {
        {"", "expected the name of an attribute", 0},
        {"   ", "expected the name of an attribute", 3},
        {"name", "expected a comparison: == != < <= > >=", 4},
        {"name==", "expected a value", 6},
        {"name==\"a", "the quote is not closed", 8},
        {"name==\"a\\", "nothing follows the backslash", 9},
        {"name==\"[a\"", "a bracket is empty or not closed", 6},
        {"name==\"[]\"", "a bracket is empty or not closed", 6},
        {"name==\"[^]\"", "a bracket is empty or not closed", 6},
        {"(a==1", "expected )", 5},
        {"a==1)", "expected && or || or the end", 4},
        {"a==1 b==2", "expected && or || or the end", 5},
        {"a==1&&", "expected the name of an attribute", 6},
        {"a==1&b==2", "expected && or || or the end", 4},
        {"==5", "expected the name of an attribute", 0},
        {"\"\"==5", "expected the name of an attribute", 2},
        {"a==%nonsense%", "not a date", 3},
        {"a==%now", "the date is not closed by %", 3},
        {"a==99999999999999999999", "the number is too large", 3},
        {"a==1e999", "the number is too large", 3},
        {std::string_view("a\0==1", 5), "a zero byte cannot be part of a condition", 0},
    };
    for (const Case& c : cases) {
        ParsedPredicate parsed = ParsePredicate(c.text, kNow);
        EXPECT_EQ(parsed.predicate, nullptr) << c.text;
        EXPECT_EQ(parsed.error, c.error) << c.text;
        EXPECT_EQ(parsed.position, c.position) << c.text;
    }
}

TEST(PredicateParser, NestingIsBounded) {
    std::string deep(5000, '(');
    EXPECT_EQ(ParsePredicate(deep + "a==1" + std::string(5000, ')'), kNow).error,
              "the condition is nested too deeply");
    EXPECT_EQ(ParsePredicate(std::string(5000, '!') + "a==1", kNow).error,
              "the condition is nested too deeply");

    std::string chain = "a==1";
    for (int i = 0; i < kMaxPredicateDepth; i++)
        chain += "&&a==1";
    EXPECT_NE(ParsePredicate(chain, kNow).predicate, nullptr);
    EXPECT_EQ(ParsePredicate(chain + "&&a==1", kNow).error, "the condition is nested too deeply");
}

TEST(PredicateParser, TheDeepestTreeIsPrintedAndReadAgain) {
    for (Operator op : {Operator::both, Operator::negate}) {
        PredicateRef tree = std::make_shared<Predicate>(Comparison("a", Operator::equal, std::int64_t(1)));
        for (int i = 0; i < kMaxPredicateDepth; i++) {
            auto next = std::make_shared<Predicate>();
            next->op = op;
            next->operands = {tree};
            if (op == Operator::both)
                next->operands.push_back(
                    std::make_shared<Predicate>(Comparison("b", Operator::equal, std::int64_t(2))));
            tree = next;
        }
        ParsedPredicate parsed = ParsePredicate(PrintPredicate(*tree), kNow);
        ASSERT_NE(parsed.predicate, nullptr) << parsed.error;
        EXPECT_TRUE(PredicatesAreEqual(*parsed.predicate, *tree));
    }
}

TEST(PredicateParser, TooLongATextIsRefused) {
    std::string text = "a==\"" + std::string(kMaxPredicateLength, 'x') + "\"";
    EXPECT_EQ(ParsePredicate(text, kNow).error, "the condition is too long");
}

TEST(PredicateParser, PrintedRandomTreesAreReadBackEqual) {
    test::RandomPredicate random(RandomSeed());
    for (int i = 0; i < 5000; i++) {
        PredicateRef tree = random.Tree(5);
        std::string text = PrintPredicate(*tree);
        ParsedPredicate parsed = ParsePredicate(text, kNow);
        ASSERT_NE(parsed.predicate, nullptr) << text << "\n" << parsed.error << " at " << parsed.position;
        ASSERT_TRUE(PredicatesAreEqual(*parsed.predicate, *tree)) << text;
        ASSERT_EQ(PrintPredicate(*parsed.predicate), text);
    }
}

TEST(PredicatePrinter, WritesThePlatformsForm) {
    auto print = [](const char* text) { return PrintPredicate(*Parsed(text)); };
    EXPECT_EQ(print("name=='*.mp3'||name=='*.MP3'"), "((name==\"*.mp3\")||(name==\"*.MP3\"))");
    EXPECT_EQ(print("!size>5"), "(!(size>5))");
    EXPECT_EQ(print("a==2.0"), "(a==2.0)");
    EXPECT_EQ(print("\"my name\"==~x"), "(\"my name\"==~\"x\")");
}
