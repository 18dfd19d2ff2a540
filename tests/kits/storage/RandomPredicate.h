#pragma once

#include <PredicatePattern.h>

#include <limits>
#include <random>
#include <string>

namespace test {

/// Makes random conditions in canonical form: what a parsed text can hold.
class RandomPredicate {
  public:
    explicit RandomPredicate(std::uint64_t seed) : random_(seed) {}

    PredicateRef Tree(int depth) {
        using Operator = host::Predicate::Operator;
        if (depth == 0 || Below(4) == 0)
            return CanonicalPredicate(Comparison());
        auto node = std::make_shared<host::Predicate>();
        switch (Below(3)) {
        case 0:
            node->op = Operator::negate;
            node->operands = {Tree(depth - 1)};
            break;
        case 1:
            node->op = Operator::both;
            node->operands = {Tree(depth - 1), Tree(depth - 1)};
            break;
        default:
            node->op = Operator::either;
            node->operands = {Tree(depth - 1), Tree(depth - 1)};
            break;
        }
        return node;
    }

    /// A comparison as it may be pushed, not canonical.
    PredicateRef Comparison() {
        using Operator = host::Predicate::Operator;
        auto comparison = std::make_shared<host::Predicate>();
        comparison->attribute = Text(1, 12);
        comparison->letter_case =
            Below(3) == 0 ? host::Predicate::Case::insensitive : host::Predicate::Case::sensitive;
        if (Below(3) == 0) {
            constexpr Operator kForNumbers[] = {Operator::equal,   Operator::not_equal,
                                                Operator::less,    Operator::less_or_equal,
                                                Operator::greater, Operator::greater_or_equal};
            comparison->op = kForNumbers[Below(6)];
            comparison->value = Number();
        } else {
            constexpr Operator kForTexts[] = {
                Operator::equal,         Operator::not_equal,   Operator::less,
                Operator::less_or_equal, Operator::greater,     Operator::greater_or_equal,
                Operator::contains,      Operator::begins_with, Operator::ends_with};
            if (Below(4) == 0) {
                comparison->op = Operator::matches;
                comparison->value = Pattern();
            } else {
                comparison->op = kForTexts[Below(9)];
                comparison->value = Text(0, 12);
            }
        }
        return comparison;
    }

    /// Any bytes but zero, those that mean something to patterns and texts more often.
    std::string Text(int least, int most) {
        static constexpr std::string_view kSpecial = "*?[]\\\"'()&|!=<>~% \n^-";
        std::string text;
        for (int left = least + Below(most - least + 1); left > 0; left--) {
            if (Below(2) == 0)
                text += kSpecial[static_cast<size_t>(Below(static_cast<int>(kSpecial.size())))];
            else
                text += static_cast<char>(1 + Below(255));
        }
        return text;
    }

    std::string Pattern() {
        std::string pattern;
        for (int parts = 1 + Below(5); parts > 0; parts--) {
            switch (Below(4)) {
            case 0:
                pattern += '*';
                break;
            case 1:
                pattern += '?';
                break;
            case 2:
                pattern += Below(2) == 0 ? "[a-z]" : "[^\\]\\\"x]";
                break;
            default:
                pattern += EscapeWildcards(Text(1, 3));
                break;
            }
        }
        return pattern;
    }

    host::Predicate::Value Number() {
        switch (Below(4)) {
        case 0:
            return static_cast<std::int64_t>(random_());
        case 1:
            return static_cast<std::uint64_t>(random_());
        case 2:
            return static_cast<std::int64_t>(Below(20) - 10);
        default:
            return std::uniform_real_distribution<double>(-1e12, 1e12)(random_);
        }
    }

    int Below(int limit) { return static_cast<int>(random_() % static_cast<std::uint64_t>(limit)); }

  private:
    std::mt19937_64 random_;
};

} // namespace test
