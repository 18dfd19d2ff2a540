#include <PredicateBuilder.h>
#include <PredicateParser.h>
#include <PredicatePrinter.h>

#include <gtest/gtest.h>

using host::Predicate;

namespace {

constexpr auto kSensitive = Predicate::Case::sensitive;

std::string Printed(const PredicateBuilder& builder) {
    PredicateRef predicate;
    status_t status = builder.Build(predicate);
    EXPECT_EQ(status, B_OK);
    return status == B_OK ? PrintPredicate(*predicate) : "";
}

status_t BuildStatus(const PredicateBuilder& builder) {
    PredicateRef predicate;
    return builder.Build(predicate);
}

void PushComparison(PredicateBuilder& builder, const char* attribute, const char* text, query_op op) {
    builder.PushAttribute(attribute);
    builder.PushValue(std::string(text), kSensitive);
    EXPECT_EQ(builder.PushOperator(op), B_OK);
}

} // namespace

TEST(PredicateBuilder, ReversePolishOrderNestsFromTheRight) {
    PredicateBuilder builder;
    PushComparison(builder, "a", "x", B_CONTAINS);
    PushComparison(builder, "b", "x", B_BEGINS_WITH);
    PushComparison(builder, "c", "x", B_ENDS_WITH);
    EXPECT_EQ(builder.PushOperator(B_OR), B_OK);
    EXPECT_EQ(builder.PushOperator(B_AND), B_OK);
    EXPECT_EQ(builder.PushOperator(B_NOT), B_OK);
    EXPECT_EQ(Printed(builder), "(!((a==\"*x*\")&&((b==\"x*\")||(c==\"*x\"))))");
}

TEST(PredicateBuilder, PushedTextsAreLiteral) {
    PredicateBuilder builder;
    PushComparison(builder, "a", "*[\"\\?", B_CONTAINS);
    EXPECT_EQ(Printed(builder), "(a==\"*\\*\\[\\\"\\\\\\?*\")");
}

TEST(PredicateBuilder, NothingPushedIsNoCondition) {
    EXPECT_EQ(BuildStatus(PredicateBuilder()), B_NO_INIT);
}

TEST(PredicateBuilder, WrongOrdersAreRefused) {
    // A: attribute, T: text, N: number, = B_EQ, c B_CONTAINS, & B_AND, ! B_NOT
    for (const char* order : {"A", "T", "AT", "=", "A=", "TA=", "AA=", "TT=", "ANc", "AT&", "AT=&",
                              "AT=AT=", "AT=A&", "AT==", "A!", "!", "AT=T", "AT=AT=&&"}) {
        PredicateBuilder builder;
        for (const char* part = order; *part != '\0'; part++) {
            switch (*part) {
            case 'A':
                builder.PushAttribute("a");
                break;
            case 'T':
                builder.PushValue(std::string("t"), kSensitive);
                break;
            case 'N':
                builder.PushValue(std::int64_t(1), kSensitive);
                break;
            case '=':
                EXPECT_EQ(builder.PushOperator(B_EQ), B_OK);
                break;
            case 'c':
                EXPECT_EQ(builder.PushOperator(B_CONTAINS), B_OK);
                break;
            case '&':
                EXPECT_EQ(builder.PushOperator(B_AND), B_OK);
                break;
            default:
                EXPECT_EQ(builder.PushOperator(B_NOT), B_OK);
                break;
            }
        }
        EXPECT_EQ(BuildStatus(builder), B_BAD_VALUE) << order;
    }
}

TEST(PredicateBuilder, WhatIsNoOperatorIsRefusedAtOnce) {
    PredicateBuilder builder;
    EXPECT_EQ(builder.PushOperator(B_INVALID_OP), B_BAD_VALUE);
    EXPECT_EQ(builder.PushOperator(_B_RESERVED_OP_), B_BAD_VALUE);
    EXPECT_TRUE(builder.IsEmpty());
}

TEST(PredicateBuilder, DepthIsBounded) {
    PredicateBuilder builder;
    PushComparison(builder, "a", "x", B_EQ);
    for (int i = 0; i < kMaxPredicateDepth; i++)
        EXPECT_EQ(builder.PushOperator(B_NOT), B_OK);
    EXPECT_EQ(BuildStatus(builder), B_OK);
    EXPECT_EQ(builder.PushOperator(B_NOT), B_OK);
    EXPECT_EQ(BuildStatus(builder), B_BAD_VALUE);
}

TEST(PredicateBuilder, MadeEmptyItStartsAnew) {
    PredicateBuilder builder;
    PushComparison(builder, "a", "x", B_EQ);
    builder.MakeEmpty();
    PushComparison(builder, "b", "y", B_NE);
    EXPECT_EQ(Printed(builder), "(b!=\"y\")");
}
