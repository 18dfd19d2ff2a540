#include <PredicatePattern.h>

#include "RandomPredicate.h"
#include "support/random_seed.h"

#include <gtest/gtest.h>

using host::Predicate;
using Operator = Predicate::Operator;

TEST(PredicatePattern, EscapedTextsAreLiteral) {
    EXPECT_EQ(EscapeWildcards("a*b?c[d]e\\f\"g"), "a\\*b\\?c\\[d]e\\\\f\"g");
    EXPECT_EQ(Unescape("a\\*b\\\\"), "a*b\\");
    EXPECT_EQ(Unescape("a\\"), "a\\");
}

TEST(PredicatePattern, ChecksBrackets) {
    EXPECT_TRUE(IsWellFormedPattern(""));
    EXPECT_TRUE(IsWellFormedPattern("a]"));
    EXPECT_TRUE(IsWellFormedPattern("[a][^b][!c]"));
    EXPECT_TRUE(IsWellFormedPattern("[\\]]"));
    EXPECT_TRUE(IsWellFormedPattern("[[]"));
    EXPECT_TRUE(IsWellFormedPattern("\\["));
    EXPECT_FALSE(IsWellFormedPattern("["));
    EXPECT_FALSE(IsWellFormedPattern("[a\\]"));
    EXPECT_FALSE(IsWellFormedPattern("[]"));
    EXPECT_FALSE(IsWellFormedPattern("[!]"));
    EXPECT_FALSE(IsWellFormedPattern("a\\"));
}

TEST(PredicatePattern, LiteralComparisonsSurviveTheirPattern) {
    for (Operator op : {Operator::equal, Operator::contains, Operator::begins_with, Operator::ends_with}) {
        for (const char* text : {"a", "*", "?", "[x]", "\\", "\\*", "*\\", "\"", "a*b\\", "\xFF\xC3"}) {
            Predicate comparison;
            comparison.op = op;
            comparison.attribute = "a";
            comparison.value = std::string(text);
            Predicate again =
                ComparisonFromPattern("a", PatternFromComparison(comparison), Predicate::Case::sensitive);
            EXPECT_TRUE(PredicatesAreEqual(comparison, again)) << text << " " << static_cast<int>(op);
        }
    }
}

TEST(PredicatePattern, AnEmptyTextIsTakenByAnyValue) {
    for (Operator op : {Operator::contains, Operator::begins_with, Operator::ends_with}) {
        auto comparison = std::make_shared<Predicate>();
        comparison->op = op;
        comparison->attribute = "a";
        comparison->value = std::string();
        EXPECT_EQ(CanonicalPredicate(comparison)->op, Operator::contains);
    }
}

TEST(PredicatePattern, TheCanonicalFormIsItsOwn) {
    test::RandomPredicate random(RandomSeed());
    for (int i = 0; i < 20000; i++) {
        PredicateRef once = CanonicalPredicate(random.Comparison());
        ASSERT_TRUE(PredicatesAreEqual(*once, *CanonicalPredicate(once)));
    }
}

TEST(PredicatePattern, TreesDifferByShapeOperatorAttributeValueAndCase) {
    auto leaf = [](const char* attribute, Predicate::Value value,
                   Predicate::Case letterCase = Predicate::Case::sensitive) {
        auto comparison = std::make_shared<Predicate>();
        comparison->attribute = attribute;
        comparison->value = std::move(value);
        comparison->letter_case = letterCase;
        return comparison;
    };
    auto join = [](Operator op, PredicateRef left, PredicateRef right) {
        Predicate joined;
        joined.op = op;
        joined.operands = {std::move(left), std::move(right)};
        return joined;
    };
    auto a = leaf("a", std::string("1"));
    EXPECT_TRUE(PredicatesAreEqual(*a, *leaf("a", std::string("1"))));
    EXPECT_FALSE(PredicatesAreEqual(*a, *leaf("b", std::string("1"))));
    EXPECT_FALSE(PredicatesAreEqual(*a, *leaf("a", std::int64_t(1))));
    EXPECT_FALSE(PredicatesAreEqual(*a, *leaf("a", std::string("1"), Predicate::Case::insensitive)));
    auto b = leaf("b", std::string("1"));
    EXPECT_FALSE(PredicatesAreEqual(join(Operator::both, a, b), join(Operator::both, b, a)));
    EXPECT_FALSE(PredicatesAreEqual(join(Operator::both, a, b), join(Operator::either, a, b)));
}
