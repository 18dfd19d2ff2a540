// Clipboards: the desktop's and the program's own.
#include "WindowWithApplication.h"

#include "host/api/clipboard.h"
#include "support/temporary_environment.h"

#include <Clipboard.h>
#include <gtest/gtest.h>

namespace {

class ClipboardTest : public testing::Test {
  protected:
    static void Put(BClipboard& clipboard, const std::string& text, int32 number) {
        ASSERT_TRUE(clipboard.Lock());
        EXPECT_EQ(clipboard.Clear(), B_OK);
        clipboard.Data()->AddData("text/plain", B_MIME_TYPE, text.data(), static_cast<ssize_t>(text.size()));
        clipboard.Data()->AddInt32("number", number);
        EXPECT_EQ(clipboard.Commit(), B_OK);
        clipboard.Unlock();
    }
    static std::string TextOf(const BMessage& data) {
        const void* bytes = nullptr;
        ssize_t size = 0;
        if (data.FindData("text/plain", B_MIME_TYPE, &bytes, &size) != B_OK) {
            return "";
        }
        return {static_cast<const char*>(bytes), static_cast<size_t>(size)};
    }

    test::TemporaryEnvironment mEnvironment;
};

} // namespace

TEST_F(ClipboardTest, WhatIsCommittedIsFoundByOthersWithAllItsFields) {
    RunApplication([] {
        BClipboard first("system");
        BClipboard second("system");
        Put(first, "words \xC3\xA9", 7);
        ASSERT_TRUE(second.Lock());
        EXPECT_EQ(TextOf(*second.Data()), "words \xC3\xA9");
        EXPECT_EQ(second.Data()->GetInt32("number", 0), 7);
        EXPECT_EQ(second.Data()->CountNames(B_ANY_TYPE), 2);
        EXPECT_EQ(second.DataSource(), be_app_messenger);
        second.Unlock();
    });
}

TEST_F(ClipboardTest, TextOfOtherProgramsArrivesAsText) {
    RunApplication([] {
        host::DataFormats contents;
        contents.set("text/plain", "from elsewhere");
        host::write_clipboard(host::ClipboardName::clipboard, contents);
        ASSERT_TRUE(be_clipboard->Lock());
        EXPECT_EQ(TextOf(*be_clipboard->Data()), "from elsewhere");
        EXPECT_FALSE(be_clipboard->DataSource().IsValid());
        be_clipboard->Unlock();
        Put(*be_clipboard, "from here", 1);
        const host::DataFormats found = host::read_clipboard(host::ClipboardName::clipboard, {"text/plain"});
        ASSERT_NE(found.find("text/plain"), nullptr);
        EXPECT_EQ(*found.find("text/plain"), "from here");
    });
}

TEST_F(ClipboardTest, WithoutTheLockNothingIsDone) {
    BClipboard clipboard("private");
    EXPECT_EQ(clipboard.Clear(), B_NOT_ALLOWED);
    EXPECT_EQ(clipboard.Commit(), B_NOT_ALLOWED);
    EXPECT_EQ(clipboard.Revert(), B_NOT_ALLOWED);
    EXPECT_EQ(clipboard.Data(), nullptr);
}

TEST_F(ClipboardTest, ClipboardsOfOtherNamesAreTheProgramsOwn) {
    BClipboard first("recent");
    BClipboard second("recent");
    BClipboard other("other");
    Put(first, "one", 1);
    ASSERT_TRUE(second.Lock());
    EXPECT_EQ(TextOf(*second.Data()), "one");
    const uint32 count = second.LocalCount();
    Put(first, "two", 2);
    EXPECT_EQ(second.SystemCount(), count + 1);
    EXPECT_EQ(second.Commit(true), B_ERROR) << "somebody else was faster";
    EXPECT_EQ(second.Revert(), B_OK);
    EXPECT_EQ(TextOf(*second.Data()), "two");
    second.Unlock();
    ASSERT_TRUE(other.Lock());
    EXPECT_EQ(TextOf(*other.Data()), "");
    other.Unlock();
}

TEST_F(ClipboardTest, WatchersHearOfCommits) {
    Notes notes;
    class Watcher : public BLooper {
      public:
        explicit Watcher(Notes& notes) : BLooper("watcher"), mNotes(notes) {}
        void MessageReceived(BMessage* message) override {
            if (message->what == B_CLIPBOARD_CHANGED) {
                mNotes.Add("changed");
            }
        }

      private:
        Notes& mNotes;
    };
    RunApplication([&notes] {
        auto* const watcher = new Watcher(notes);
        watcher->Run();
        const BMessenger target(watcher);
        EXPECT_EQ(be_clipboard->StartWatching(target), B_OK);
        Put(*be_clipboard, "news", 1);
        EXPECT_TRUE(notes.WaitFor("changed"));
        EXPECT_EQ(be_clipboard->StopWatching(target), B_OK);
        EXPECT_EQ(be_clipboard->StopWatching(target), B_BAD_VALUE);
        ASSERT_TRUE(watcher->Lock());
        watcher->Quit();
    });
}
