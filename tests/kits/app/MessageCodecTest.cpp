// The flattened form of messages: its bytes, and what comes back from them.
#include "MessageForms.h"

#include "support/random_seed.h"

#include <random>
#include <vector>

using namespace std::string_literals;

namespace {

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
