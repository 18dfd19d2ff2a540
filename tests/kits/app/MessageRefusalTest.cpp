// Everything that the reader of flattened messages must refuse.
#include "MessageForms.h"

#include "support/random_seed.h"

#include <random>
#include <vector>

using namespace std::string_literals;

TEST(MessageRefusalTest, ABufferCutAnywhereIsRefused) {
    const std::string form = Flattened(MessageOfAllKinds());
    for (size_t length = 0; length < form.size(); length++) {
        // A copy of exactly that size, so that a reader that looks further is caught.
        const std::vector<char> cut(form.begin(), form.begin() + static_cast<std::ptrdiff_t>(length));
        BMessage read('old_');
        EXPECT_NE(read.Unflatten(cut.data(), cut.size()), B_OK) << length;
        EXPECT_TRUE(read.IsEmpty());
        EXPECT_EQ(read.what, 0U);
    }
}

TEST(MessageRefusalTest, ACoverCutAtTenThousandBytesIsRefused) {
    BMessage cover;
    cover.AddString("class", "BBitmap");
    const std::string pixels(12000, '\x55');
    cover.AddData("_data", B_RAW_TYPE, pixels.data(), static_cast<ssize_t>(pixels.size()));
    std::string form = Flattened(cover);
    ASSERT_GT(form.size(), 10000U);
    form.resize(10000);
    ExpectRefused(form, B_BAD_DATA, "cut at 10000 bytes");
}

TEST(MessageRefusalTest, BytesBehindTheMessageAreRefusedInABufferOfKnownSize) {
    ExpectRefused(Flattened(MessageOfAllKinds()) + '\0', B_BAD_DATA, "one byte too many");
}

TEST(MessageRefusalTest, WhatIsNoMessageIsSaidToBeNone) {
    ExpectRefused("", B_NOT_A_MESSAGE, "nothing");
    ExpectRefused("BKM", B_NOT_A_MESSAGE, "three bytes");
    ExpectRefused("# a text file of some length", B_NOT_A_MESSAGE, "text");
    ExpectRefused("BKM\x02\x10\0\0\0test\0\0\0\0"s, B_NOT_A_MESSAGE, "a later version");
    BMessage message('old_');
    EXPECT_EQ(message.Unflatten("not a message at all"), B_NOT_A_MESSAGE);
    EXPECT_EQ(message.what, 0U);
    EXPECT_EQ(message.Unflatten(static_cast<const char*>(nullptr)), B_BAD_VALUE);
    EXPECT_EQ(message.Unflatten(static_cast<BDataIO*>(nullptr)), B_BAD_VALUE);
    EXPECT_EQ(message.Unflatten(nullptr, 16), B_BAD_VALUE);
}

TEST(MessageRefusalTest, EveryBrokenRuleOfTheFormIsRefused) {
    const std::string goodNumber = Field('LONG', kFixed, "n", 1, "1234");
    const std::string inner = Form(1, goodNumber);
    struct Case {
        const char* why;
        std::string form;
    };
    const Case cases[] = {
        {"total size smaller than the header", "BKM\x01\x0f\0\0\0test\0\0\0\0"s},
        {"total size zero", "BKM\x01\0\0\0\0test\0\0\0\0"s},
        {"total size past 2 GB", "BKM\x01\0\0\0\x80test\0\0\0\0"s},
        {"fewer fields than promised", Form(2, goodNumber)},
        {"more fields than promised", Form(0, goodNumber)},
        {"bytes behind the last field", Form(1, goodNumber + "x")},
        {"half a field header", Form(1, goodNumber.substr(0, 8))},
        {"unknown flag", Form(1, Field('LONG', 3, "n", 1, "1234"))},
        {"name longer than 255", Form(1, Field('LONG', kFixed, std::string(256, 'n'), 1, "1234"))},
        {"name with a zero in it", Form(1, Field('LONG', kFixed, "a\0b"s, 1, "1234"))},
        {"name past the end",
         Form(1, Number('LONG') + ShortNumber(1) + ShortNumber(200) + Number(1) + Number(0) + "n")},
        {"name twice", Form(2, goodNumber + Field('CSTR', 0, "n", 1, Number(1) + "\0"s))},
        {"no items of fixed size", Form(1, Field('LONG', kFixed, "n", 0, ""))},
        {"no items of varying size", Form(1, Field('CSTR', 0, "n", 0, ""))},
        {"items of fixed size that do not divide", Form(1, Field('LONG', kFixed, "n", 3, "1234"))},
        {"empty items of fixed size", Form(1, Field('LONG', kFixed, "n", 3, ""))},
        {"an empty item of varying size", Form(1, Field('CSTR', 0, "n", 1, Number(0) + "x"))},
        {"an item longer than its block", Form(1, Field('CSTR', 0, "n", 1, Number(9) + "abc"))},
        {"an item of 4 GB", Form(1, Field('CSTR', 0, "n", 1, Number(0xffffffff) + "abc"))},
        {"an item shorter than its block", Form(1, Field('CSTR', 0, "n", 1, Number(2) + "abc"))},
        {"a block that ends within a length", Form(1, Field('CSTR', 0, "n", 2, Number(3) + "abc" + "\1\0"s))},
        {"a nested message that is none", Form(1, Field('MSGG', 0, "m", 1, Number(4) + "nope"))},
        {"a nested message cut short",
         Form(1, Field('MSGG', 0, "m", 1,
                       Number(static_cast<uint32>(inner.size() - 1)) + inner.substr(0, inner.size() - 1)))},
        {"a nested message with bytes behind it",
         Form(1, Field('MSGG', 0, "m", 1, Number(static_cast<uint32>(inner.size() + 1)) + inner + "x"))},
        {"the second of two nested messages broken",
         Form(1,
              Field('MSGG', 0, "m", 2, Number(static_cast<uint32>(inner.size())) + inner + Number(1) + "x"))},
        {"a nested message of fixed size broken", Form(1, Field('MSGG', kFixed, "m", 1, "not a message!!!"))},
    };
    for (const Case& broken : cases)
        ExpectRefused(broken.form, B_BAD_DATA, broken.why);
    BMessage good;
    EXPECT_EQ(Unflatten(good, Form(1, goodNumber)), B_OK);
    EXPECT_EQ(Unflatten(good, Form(1, Field('MSGG', kFixed, "m", 1, inner))), B_OK);
}

TEST(MessageRefusalTest, ABlockThatEndsBeyondTheFormIsRefused) {
    std::string field = Field('RAWT', kFixed, "n", 1, "1234");
    field[12] = 5;
    ExpectRefused(Form(1, field), B_BAD_DATA, "one byte beyond");
    field[12] = field[13] = field[14] = field[15] = '\xff';
    ExpectRefused(Form(1, field), B_BAD_DATA, "4 GB beyond");
}

TEST(MessageRefusalTest, MessagesNestedMoreThanSixtyFourDeepAreRefused) {
    BMessage read;
    ASSERT_EQ(Unflatten(read, NestedForm(64)), B_OK);
    EXPECT_TRUE(read.HasMessage("m"));
    ExpectRefused(NestedForm(65), B_BAD_DATA, "65 deep");
    ExpectRefused(NestedForm(1000), B_BAD_DATA, "a thousand deep");
}

TEST(MessageRefusalTest, DamagedFormsAreRefusedOrReadAsWholeMessages) {
    std::mt19937_64 random(RandomSeed());
    const std::string good = Flattened(MessageOfAllKinds());
    for (int round = 0; round < 20000; round++) {
        std::string form = good;
        const int changes = 1 + static_cast<int>(random() % 4);
        for (int change = 0; change < changes; change++) {
            const size_t place = random() % form.size();
            switch (random() % 4) {
            case 0:
                form[place] = static_cast<char>(random());
                break;
            case 1:
                form[place] = static_cast<char>(form[place] ^ (1 << (random() % 8)));
                break;
            case 2:
                form.erase(place, 1 + random() % 8);
                break;
            default:
                form.insert(place, form.substr(random() % form.size(), 1 + random() % 16));
            }
            if (form.empty())
                break;
        }
        if (random() % 2 == 0 && form.size() >= 8)
            form.replace(4, 4, Number(static_cast<uint32>(form.size())));
        BMessage read;
        if (Unflatten(read, form) == B_OK)
            ASSERT_EQ(Flattened(read), form);
        else
            ASSERT_TRUE(read.IsEmpty());
    }
}
