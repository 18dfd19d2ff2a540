// The forms in which dragged things come and go.
#include "DragSession.h"

#include "support/temporary_environment.h"

#include <Entry.h>
#include <gtest/gtest.h>

namespace {

entry_ref RefOf(const std::string& path) {
    entry_ref ref;
    EXPECT_EQ(get_ref_for_path(path.c_str(), &ref), B_OK);
    return ref;
}

} // namespace

TEST(DragSession, FileAddressesBecomePathsByteForByte) {
    EXPECT_EQ(PathOfUri("file:///tmp/a%20b.mp3"), "/tmp/a b.mp3");
    EXPECT_EQ(PathOfUri("file://localhost/x"), "/x");
    EXPECT_EQ(PathOfUri("file:///%C3%A9%ff"), "/\xC3\xA9\xFF");
    EXPECT_EQ(UriOfPath("/tmp/a b\xC3\xA9#?.mp3"), "file:///tmp/a%20b%C3%A9%23%3F.mp3");
}

TEST(DragSession, OtherAddressesAreNoPaths) {
    EXPECT_EQ(PathOfUri("http://example.org/x"), std::nullopt);
    EXPECT_EQ(PathOfUri("file://elsewhere/x"), std::nullopt);
    EXPECT_EQ(PathOfUri("file:///cut%2"), std::nullopt);
    EXPECT_EQ(PathOfUri("file:///nul%00"), std::nullopt);
    EXPECT_EQ(PathOfUri(""), std::nullopt);
}

TEST(DragSession, AListOfFilesBecomesRefsInOrder) {
    const test::TemporaryEnvironment environment;
    const std::string first = environment.volume() + "/b c.mp3";
    const std::string second = environment.volume() + "/a.mp3";
    test::write_file(first, "");
    test::write_file(second, "");
    host::DataFormats data;
    data.set("text/uri-list",
             "# a remark\r\n" + UriOfPath(first) + "\r\nfile:///not/there\r\n" + UriOfPath(second) + "\n");
    const std::unique_ptr<BMessage> message = MessageOf(data);
    ASSERT_NE(message, nullptr);
    EXPECT_EQ(message->what, static_cast<uint32>(B_SIMPLE_DATA));
    entry_ref ref;
    ASSERT_EQ(message->FindRef("refs", 0, &ref), B_OK);
    EXPECT_EQ(ref, RefOf(first));
    ASSERT_EQ(message->FindRef("refs", 1, &ref), B_OK);
    EXPECT_EQ(ref, RefOf(second));
    EXPECT_EQ(message->FindRef("refs", 2, &ref), B_BAD_INDEX);
}

TEST(DragSession, AMessageIsOfferedWholeAndAsFiles) {
    const test::TemporaryEnvironment environment;
    const std::string path = environment.volume() + "/a b.mp3";
    test::write_file(path, "");
    const entry_ref ref = RefOf(path);
    BMessage message(B_SIMPLE_DATA);
    message.AddRef("refs", &ref);
    message.AddInt32("more", 7);
    const host::DataFormats data = FormatsOf(message);
    ASSERT_NE(data.find("text/uri-list"), nullptr);
    EXPECT_EQ(*data.find("text/uri-list"), UriOfPath(path) + "\r\n");
    const std::unique_ptr<BMessage> back = MessageOf(data);
    ASSERT_NE(back, nullptr);
    EXPECT_EQ(back->GetInt32("more", 0), 7);
    entry_ref found;
    ASSERT_EQ(back->FindRef("refs", &found), B_OK);
    EXPECT_EQ(found, ref);
}

TEST(DragSession, BytesThatAreNoMessageAreNothing) {
    host::DataFormats data;
    data.set("application/x-vnd.bekits-message", "these are no message");
    EXPECT_EQ(MessageOf(data), nullptr);
    EXPECT_EQ(MessageOf({}), nullptr);
}

TEST(DragSession, TextAloneArrivesAsText) {
    host::DataFormats data;
    data.set("text/plain", "Some words");
    const std::unique_ptr<BMessage> message = MessageOf(data);
    ASSERT_NE(message, nullptr);
    EXPECT_EQ(message->what, static_cast<uint32>(B_MIME_DATA));
    const void* bytes = nullptr;
    ssize_t size = 0;
    ASSERT_EQ(message->FindData("text/plain", B_MIME_TYPE, &bytes, &size), B_OK);
    EXPECT_EQ(std::string(static_cast<const char*>(bytes), static_cast<size_t>(size)), "Some words");
}
