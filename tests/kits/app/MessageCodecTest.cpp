// The flattened form of messages: its bytes, and everything that the reader must refuse.
#include <Message.h>

#include "support/random_seed.h"

#include <cstring>
#include <gtest/gtest.h>
#include <random>
#include <string>
#include <vector>

using namespace std::string_literals;

namespace {

std::string Flattened(const BMessage& message) {
    std::string form(static_cast<size_t>(message.FlattenedSize()), '\0');
    EXPECT_EQ(message.Flatten(form.data(), static_cast<ssize_t>(form.size())), B_OK);
    return form;
}

status_t Unflatten(BMessage& message, const std::string& form) {
    return message.Unflatten(form.data(), form.size());
}

std::string Number(uint32 value) {
    return {static_cast<char>(value), static_cast<char>(value >> 8), static_cast<char>(value >> 16),
            static_cast<char>(value >> 24)};
}

std::string ShortNumber(uint16 value) {
    return {static_cast<char>(value), static_cast<char>(value >> 8)};
}

// A form made by hand: the header around the fields.
std::string Form(uint32 fieldCount, const std::string& fields) {
    return "BKM\x01"s + Number(static_cast<uint32>(16 + fields.size())) + Number('test') +
           Number(fieldCount) + fields;
}

constexpr uint16 kFixed = 1;

std::string Field(uint32 type, uint16 flags, const std::string& name, uint32 count,
                  const std::string& items) {
    return Number(type) + ShortNumber(flags) + ShortNumber(static_cast<uint16>(name.size())) + Number(count) +
           Number(static_cast<uint32>(items.size())) + name + items;
}

// A form whose messages lie `depth` deep, made from the inside out.
std::string NestedForm(int depth) {
    std::string form = Form(0, "");
    for (int level = 1; level < depth; level++)
        form = Form(1, Field('MSGG', 0, "m", 1, Number(static_cast<uint32>(form.size())) + form));
    return form;
}

BMessage MessageOfAllKinds() {
    BMessage inner('innr');
    inner.AddFloat("winX", 10.5F);
    inner.AddFloat("winY", -3);
    BMessage message('full');
    message.AddString("Audio:Songname", "A song");
    message.AddString("Audio:Songname", "");
    message.AddInt64("Audio:LengthUsec", 185000000);
    message.AddBool("IsValid", true);
    message.AddRect("frame", BRect(1, 2, 3, 4));
    const entry_ref ref(1, 2, "leaf");
    message.AddRef("refs", &ref);
    message.AddRef("refs", &ref);
    message.AddMessage("window", &inner);
    message.AddMessage("window", &inner);
    message.AddData("raw", B_RAW_TYPE, "\0\1\2\3\4", 5, false);
    message.AddInt8("", 1);
    return message;
}

void ExpectAllKinds(const BMessage& message) {
    EXPECT_EQ(message.what, uint32{'full'});
    EXPECT_EQ(message.CountNames(B_ANY_TYPE), 8);
    EXPECT_STREQ(message.GetString("Audio:Songname", 0, nullptr), "A song");
    EXPECT_STREQ(message.GetString("Audio:Songname", 1, nullptr), "");
    EXPECT_EQ(message.GetInt64("Audio:LengthUsec", 0), 185000000);
    EXPECT_TRUE(message.GetBool("IsValid", false));
    EXPECT_EQ(message.GetRect("frame", BRect()), BRect(1, 2, 3, 4));
    entry_ref ref;
    EXPECT_EQ(message.FindRef("refs", 1, &ref), B_OK);
    EXPECT_EQ(ref, entry_ref(1, 2, "leaf"));
    BMessage inner;
    EXPECT_EQ(message.FindMessage("window", 1, &inner), B_OK);
    EXPECT_EQ(inner.what, uint32{'innr'});
    EXPECT_EQ(inner.GetFloat("winX", 0), 10.5F);
    EXPECT_EQ(inner.GetFloat("winY", 0), -3.0F);
    const void* data = nullptr;
    ssize_t size = 0;
    EXPECT_EQ(message.FindData("raw", B_RAW_TYPE, &data, &size), B_OK);
    ASSERT_EQ(size, 5);
    EXPECT_EQ(std::memcmp(data, "\0\1\2\3\4", 5), 0);
    EXPECT_EQ(message.GetInt8("", 0), 1);
}

void ExpectRefused(const std::string& form, status_t answer, const char* why) {
    BMessage message('old_');
    message.AddInt32("old", 1);
    EXPECT_EQ(Unflatten(message, form), answer) << why;
    EXPECT_TRUE(message.IsEmpty()) << why;
    EXPECT_EQ(message.what, 0U) << why;
}

// A stream that answers a few bytes at a time, and counts them.
class Trickle : public BDataIO {
  public:
    Trickle(const std::string& bytes, size_t atATime) : mBytes(bytes), mAtATime(atATime) {}
    ssize_t Read(void* buffer, size_t size) override {
        const size_t count = std::min({size, mAtATime, mBytes.size() - mRead});
        std::memcpy(buffer, mBytes.data() + mRead, count);
        mRead += count;
        return static_cast<ssize_t>(count);
    }
    size_t BytesRead() const { return mRead; }

  private:
    const std::string& mBytes;
    size_t mAtATime;
    size_t mRead = 0;
};

} // namespace

TEST(MessageCodecTest, TheFormIsTheDocumentedOneByteForByte) {
    BMessage message('test');
    message.AddInt32("n", 1);
    message.AddInt32("n", -2);
    message.AddString("s", "ab");
    message.AddString("s", "");
    const std::string expected = "BKM\x01"
                                 "\x46\0\0\0"
                                 "tset"
                                 "\x02\0\0\0"
                                 "GNOL"
                                 "\x01\0\x01\0\x02\0\0\0\x08\0\0\0n"
                                 "\x01\0\0\0\xfe\xff\xff\xff"
                                 "RTSC"
                                 "\0\0\x01\0\x02\0\0\0\x0c\0\0\0s"
                                 "\x03\0\0\0ab\0\x01\0\0\0\0"s;
    ASSERT_EQ(expected.size(), 70U);
    EXPECT_EQ(Flattened(message), expected);
    BMessage read;
    ASSERT_EQ(Unflatten(read, expected), B_OK);
    EXPECT_EQ(read.GetInt32("n", 1, 0), -2);
    EXPECT_STREQ(read.GetString("s", 0, nullptr), "ab");
    EXPECT_STREQ(read.GetString("s", 1, nullptr), "");
}

TEST(MessageCodecTest, AnEmptyMessageTakesSixteenBytes) {
    const BMessage message('what');
    EXPECT_EQ(message.FlattenedSize(), 16);
    EXPECT_EQ(Flattened(message), "BKM\x01\x10\0\0\0tahw\0\0\0\0"s);
}

TEST(MessageCodecTest, EveryKindOfFieldComesBackInOrder) {
    const std::string form = Flattened(MessageOfAllKinds());
    BMessage read;
    ASSERT_EQ(Unflatten(read, form), B_OK);
    ExpectAllKinds(read);
    EXPECT_EQ(Flattened(read), form);
    BMessage trusting;
    ASSERT_EQ(trusting.Unflatten(form.data()), B_OK);
    EXPECT_EQ(Flattened(trusting), form);
}

TEST(MessageCodecTest, AStreamIsReadForExactlyTheMessage) {
    const std::string form = Flattened(MessageOfAllKinds());
    BMallocIO stream;
    ssize_t size = 0;
    ASSERT_EQ(MessageOfAllKinds().Flatten(&stream, &size), B_OK);
    EXPECT_EQ(size, static_cast<ssize_t>(form.size()));
    ASSERT_EQ(BMessage('next').Flatten(&stream), B_OK);
    ASSERT_EQ(stream.WriteExactly("rest", 4), B_OK);
    ASSERT_EQ(stream.Seek(0, SEEK_SET), 0);
    BMessage read;
    ASSERT_EQ(read.Unflatten(&stream), B_OK);
    ExpectAllKinds(read);
    EXPECT_EQ(stream.Position(), static_cast<off_t>(form.size()));
    ASSERT_EQ(read.Unflatten(&stream), B_OK);
    EXPECT_EQ(read.what, uint32{'next'});
    EXPECT_EQ(stream.Position(), static_cast<off_t>(form.size() + 16));
    EXPECT_NE(read.Unflatten(&stream), B_OK);
    EXPECT_TRUE(read.IsEmpty());
    EXPECT_EQ(read.what, 0U);
}

TEST(MessageCodecTest, AStreamMayAnswerInSmallPieces) {
    BMessage large('larg');
    const std::string data(300000, 'd');
    large.AddData("d", B_RAW_TYPE, data.data(), static_cast<ssize_t>(data.size()));
    const std::string form = Flattened(large) + "behind";
    Trickle stream(form, 7);
    BMessage read;
    ASSERT_EQ(read.Unflatten(&stream), B_OK);
    EXPECT_EQ(Flattened(read), Flattened(large));
    EXPECT_EQ(stream.BytesRead(), form.size() - 6);
}

TEST(MessageCodecTest, AStreamThatEndsEarlyIsRefusedWhereverItEnds) {
    const std::string form = Flattened(MessageOfAllKinds());
    for (size_t length = 0; length < form.size(); length++) {
        BMemoryIO stream(form.data(), length);
        BMessage read('old_');
        EXPECT_NE(read.Unflatten(&stream), B_OK) << length;
        EXPECT_TRUE(read.IsEmpty());
        EXPECT_EQ(read.what, 0U);
    }
}

TEST(MessageCodecTest, AHeaderThatPromisesGigabytesDoesNotMakeTheReaderAllocateThem) {
    // AddressSanitizer's allocator and the machine would both feel 2 GB; what shows here is the answer.
    const std::string header = "BKM\x01\xff\xff\xff\x7ftest\xff\xff\xff\xff"s;
    BMemoryIO stream(header.data(), header.size());
    BMessage read;
    EXPECT_NE(read.Unflatten(&stream), B_OK);
    ExpectRefused(header, B_BAD_DATA, "2 GB promised");
    ExpectRefused(Form(0xffffffff, ""), B_BAD_DATA, "4 billion fields promised");
    ExpectRefused(Form(1, Field('LONG', kFixed, "n", 0xffffffff, "1234")), B_BAD_DATA,
                  "4 billion items promised");
    ExpectRefused(Form(1, Field('CSTR', 0, "s", 0x7fffffff, Number(1) + "a")), B_BAD_DATA, "2 billion texts");
}

TEST(MessageCodecTest, ABufferCutAnywhereIsRefused) {
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

TEST(MessageCodecTest, ACoverCutAtTenThousandBytesIsRefused) {
    BMessage cover;
    cover.AddString("class", "BBitmap");
    const std::string pixels(12000, '\x55');
    cover.AddData("_data", B_RAW_TYPE, pixels.data(), static_cast<ssize_t>(pixels.size()));
    std::string form = Flattened(cover);
    ASSERT_GT(form.size(), 10000U);
    form.resize(10000);
    ExpectRefused(form, B_BAD_DATA, "cut at 10000 bytes");
}

TEST(MessageCodecTest, BytesBehindTheMessageAreRefusedInABufferOfKnownSize) {
    ExpectRefused(Flattened(MessageOfAllKinds()) + '\0', B_BAD_DATA, "one byte too many");
}

TEST(MessageCodecTest, WhatIsNoMessageIsSaidToBeNone) {
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

TEST(MessageCodecTest, EveryBrokenRuleOfTheFormIsRefused) {
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

TEST(MessageCodecTest, ABlockThatEndsBeyondTheFormIsRefused) {
    std::string field = Field('RAWT', kFixed, "n", 1, "1234");
    field[12] = 5;
    ExpectRefused(Form(1, field), B_BAD_DATA, "one byte beyond");
    field[12] = field[13] = field[14] = field[15] = '\xff';
    ExpectRefused(Form(1, field), B_BAD_DATA, "4 GB beyond");
}

TEST(MessageCodecTest, MessagesNestedMoreThanSixtyFourDeepAreRefused) {
    BMessage read;
    ASSERT_EQ(Unflatten(read, NestedForm(64)), B_OK);
    EXPECT_TRUE(read.HasMessage("m"));
    ExpectRefused(NestedForm(65), B_BAD_DATA, "65 deep");
    ExpectRefused(NestedForm(1000), B_BAD_DATA, "a thousand deep");
}

TEST(MessageCodecTest, ManyFieldsAreReadWithTheirNamesCompared) {
    std::string fields;
    for (int index = 0; index < 20000; index++)
        fields += Field('BYTE', kFixed, std::to_string(index), 1, "x");
    BMessage read;
    ASSERT_EQ(Unflatten(read, Form(20000, fields)), B_OK);
    EXPECT_EQ(read.CountNames(B_ANY_TYPE), 20000);
    ExpectRefused(Form(20001, fields + Field('BYTE', kFixed, "19999", 1, "x")), B_BAD_DATA,
                  "the last name twice");
}

TEST(MessageCodecTest, FlatteningIntoTooLittleRoomWritesNothing) {
    const BMessage message = MessageOfAllKinds();
    const ssize_t size = message.FlattenedSize();
    std::vector<char> buffer(static_cast<size_t>(size), '~');
    EXPECT_NE(message.Flatten(buffer.data(), size - 1), B_OK);
    EXPECT_NE(message.Flatten(buffer.data(), -1), B_OK);
    EXPECT_EQ(buffer, std::vector<char>(static_cast<size_t>(size), '~'));
    EXPECT_EQ(message.Flatten(static_cast<char*>(nullptr), size), B_BAD_VALUE);
    EXPECT_EQ(message.Flatten(static_cast<BDataIO*>(nullptr)), B_BAD_VALUE);
    // Room to spare is left alone.
    std::vector<char> larger(static_cast<size_t>(size) + 8, '~');
    ASSERT_EQ(message.Flatten(larger.data(), size + 8), B_OK);
    EXPECT_EQ(std::string(larger.end() - 8, larger.end()), "~~~~~~~~");
}

TEST(MessageCodecTest, AStreamThatCannotBeWrittenSaysSo) {
    char room[20];
    BMemoryIO stream(room, sizeof(room));
    EXPECT_NE(MessageOfAllKinds().Flatten(&stream), B_OK);
}

TEST(MessageCodecTest, DamagedFormsAreRefusedOrReadAsWholeMessages) {
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

TEST(MessageCodecTest, RandomMessagesComeBackByteForByte) {
    std::mt19937_64 random(RandomSeed());
    for (int round = 0; round < 500; round++) {
        BMessage message(static_cast<uint32>(random()));
        for (uint64 step = random() % 40; step > 0; step--) {
            const std::string name = "field" + std::to_string(random() % 12);
            const std::string data(1 + random() % 40, static_cast<char>(random()));
            switch (random() % 6) {
            case 0:
                message.AddInt32(name.c_str(), static_cast<int32>(random()));
                break;
            case 1:
                message.AddString(name.c_str(), data.c_str());
                break;
            case 2:
                message.AddData(name.c_str(), 'rand', data.data(), static_cast<ssize_t>(data.size()), false);
                break;
            case 3:
                message.AddDouble(name.c_str(), static_cast<double>(random()));
                break;
            case 4:
                message.RemoveData(name.c_str(), static_cast<int32>(random() % 3));
                break;
            default:
                message.AddMessage(name.c_str(), &message);
            }
            if (message.FlattenedSize() > 100000)
                message.MakeEmpty();
        }
        const std::string form = Flattened(message);
        BMessage read;
        ASSERT_EQ(Unflatten(read, form), B_OK);
        ASSERT_EQ(read.what, message.what);
        ASSERT_EQ(Flattened(read), form);
    }
}
