#include "host/sqlite/attribute_record.h"
#include "host/sqlite/comparison.h"
#include "host/sqlite/condition.h"
#include "host/sqlite/letters.h"
#include "host/sqlite/wildcard.h"
#include <gtest/gtest.h>

namespace host {
namespace {

using Op = Predicate::Operator;

bool matches(const char* pattern, const char* text,
             Predicate::Case letter_case = Predicate::Case::sensitive) {
    return Wildcard(pattern, letter_case).matches(text);
}

TEST(Wildcard, TableOfCases) {
    const struct {
        const char* pattern;
        const char* text;
        bool expected;
    } cases[] = {
        {"", "", true},
        {"", "a", false},
        {"*", "", true},
        {"a*c", "abbc", true},
        {"a*c", "abbd", false},
        {"?", "\xc3\xa4", true},
        {"??", "\xc3\xa4", false},
        {"[a-c]x", "bx", true},
        {"[a-c]x", "dx", false},
        {"[^a-c]x", "dx", true},
        {"[!a-c]x", "ax", false},
        {"[]x]", "]", true},
        {"[a", "[a", true},
        {"\\*", "*", true},
        {"\\*", "a", false},
        {"[\\]]", "]", true},
        {"a\\", "a\\", true},
        {"*.mp3", "x.mp3", true},
        {"*.mp3", "x.mp3.", false},
        {"*a*b*c", "xaybzc", true},
        {"[a-]", "-", true},
        {"?", "\xff", true},
    };
    for (const auto& one : cases)
        EXPECT_EQ(matches(one.pattern, one.text), one.expected) << one.pattern << " / " << one.text;
    EXPECT_TRUE(matches("\xc3\x84*[A-C]", "\xc3\xa4xb", Predicate::Case::insensitive));
}

TEST(Wildcard, ManyStarsDoNotBacktrackExponentially) {
    std::string pattern;
    for (int i = 0; i < 100; ++i)
        pattern += "*a";
    EXPECT_FALSE(Wildcard(pattern + "b", Predicate::Case::sensitive).matches(std::string(5000, 'a')));
}

TEST(Letters, LowersEveryCharacterAndKeepsBadBytes) {
    EXPECT_EQ(lowered("\xc3\x84\xce\xa9Z\xff\xc3"), "\xc3\xa4\xcf\x89z\xff\xc3");
}

Comparison comparison(Op op, Predicate::Value value) {
    Predicate predicate;
    predicate.op = op;
    predicate.attribute = "A";
    predicate.value = std::move(value);
    return Comparison(predicate);
}

TEST(Comparison, LargeIntegersAndRealsCompareExactly) {
    AttributeValue large;
    large.kind = AttributeValue::Kind::unsigned_integer;
    large.unsigned_integer = 18446744073709551615U;
    EXPECT_TRUE(comparison(Op::greater, std::int64_t{-1}).holds(large));
    EXPECT_TRUE(comparison(Op::less, 18446744073709551616.0).holds(large));
    EXPECT_TRUE(
        comparison(Op::greater, 9007199254740992.0).holds(AttributeValue::of_integer(9007199254740993)));
    EXPECT_TRUE(comparison(Op::less, -0.5).holds(AttributeValue::of_integer(-1)));
    AttributeValue real;
    real.kind = AttributeValue::Kind::real;
    real.real = static_cast<double>(0.1F);
    EXPECT_TRUE(comparison(Op::equal, 0.1).holds(real));
}

TEST(Comparison, TextAndNumbersMeet) {
    EXPECT_TRUE(comparison(Op::equal, std::int64_t{7}).holds(AttributeValue::of_text("7")));
    EXPECT_TRUE(comparison(Op::less, std::string("10")).holds(AttributeValue::of_integer(9)));
    EXPECT_FALSE(comparison(Op::equal, std::string("ten")).holds(AttributeValue::of_integer(10)));
    EXPECT_FALSE(comparison(Op::not_equal, std::string("x")).holds(AttributeValue()));
}

TEST(Condition, NegationMovesDownToComparisons) {
    const auto a = std::make_shared<Predicate>(Predicate{Op::equal, "A", std::string("x"), {}, {}});
    const auto name = std::make_shared<Predicate>(Predicate{Op::equal, "name", std::string("x"), {}, {}});
    const auto negate = [](std::shared_ptr<const Predicate> one) {
        return std::make_shared<Predicate>(Predicate{Op::negate, "", std::string(), {}, {std::move(one)}});
    };
    const auto join = [](Op op, std::shared_ptr<const Predicate> left,
                         std::shared_ptr<const Predicate> right) {
        return Predicate{op, "", std::string(), {}, {std::move(left), std::move(right)}};
    };
    EXPECT_TRUE(Condition::compile(*a)->bound());
    EXPECT_FALSE(Condition::compile(*negate(a))->bound());
    EXPECT_TRUE(Condition::compile(*negate(negate(a)))->bound());
    EXPECT_TRUE(Condition::compile(join(Op::both, a, name))->bound());
    EXPECT_FALSE(Condition::compile(join(Op::either, a, name))->bound());
    EXPECT_TRUE(Condition::compile(join(Op::both, a, negate(a)))->bound());
    EXPECT_EQ(Condition::compile(Predicate{Op::both, "", std::string(), {}, {a}}), nullptr);
}

TEST(AttributeRecord, EntriesComeBackAndMalformedEndsAreIgnored) {
    const std::string text(255, 't');
    std::vector<std::byte> record;
    append_recorded_attribute(record, {3, false, std::as_bytes(std::span(text))});
    append_recorded_attribute(record, {70000, true, {}});
    RecordReader reader(record);
    RecordedAttribute attribute;
    ASSERT_TRUE(reader.next(attribute));
    EXPECT_EQ(attribute.id, 3U);
    EXPECT_FALSE(attribute.cut);
    EXPECT_EQ(attribute.bytes.size(), 255U);
    ASSERT_TRUE(reader.next(attribute));
    EXPECT_EQ(attribute.id, 70000U);
    EXPECT_TRUE(attribute.cut);
    EXPECT_FALSE(reader.next(attribute));
    for (std::size_t size = 0; size < record.size(); ++size) {
        const std::vector<std::byte> part(record.begin(), record.begin() + static_cast<std::ptrdiff_t>(size));
        RecordReader cut(part);
        while (cut.next(attribute)) {
        }
    }
}

} // namespace
} // namespace host
