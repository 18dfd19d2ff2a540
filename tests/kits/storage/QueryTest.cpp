#include <AppDefs.h>
#include <Entry.h>
#include <Looper.h>
#include <Message.h>
#include <Messenger.h>
#include <Node.h>
#include <NodeMonitor.h>
#include <OS.h>
#include <Query.h>
#include <String.h>
#include <TypeConstants.h>
#include <Volume.h>
#include <fs_index.h>
#include <fs_info.h>

#include "StorageTest.h"

#include <errno.h>
#include <filesystem>
#include <math.h>
#include <mutex>
#include <set>
#include <string.h>

namespace {

using Names = std::set<std::string>;

class Query : public test::StorageTest {
  protected:
    void SetUp() override {
        StorageTest::SetUp();
        fs_create_index(Device(), "Test:Title", B_STRING_TYPE, 0);
    }

    static dev_t Device() { return dev_for_path(Volume().c_str()); }

    void MakeTagged(const std::string& leaf, const std::string& title) const {
        BNode node(MakeFile(leaf).c_str());
        EXPECT_GT(node.WriteAttr("Test:Title", B_STRING_TYPE, 0, title.c_str(), title.size() + 1), 0);
    }

    static Names Hits(BQuery& query) {
        BVolume volume(Device());
        EXPECT_EQ(query.SetVolume(&volume), B_OK);
        EXPECT_EQ(query.Fetch(), B_OK);
        Names names;
        entry_ref ref;
        while (query.GetNextRef(&ref) == B_OK)
            EXPECT_TRUE(names.insert(ref.name).second) << ref.name;
        return names;
    }
    static Names Matching(const char* attribute, const char* text, query_op op, bool ignoreCase = false) {
        BQuery query;
        EXPECT_EQ(query.PushAttr(attribute), B_OK);
        EXPECT_EQ(query.PushString(text, ignoreCase), B_OK);
        EXPECT_EQ(query.PushOp(op), B_OK);
        return Hits(query);
    }
    static Names Matching(const char* predicate) {
        BQuery query;
        EXPECT_EQ(query.SetPredicate(predicate), B_OK);
        return Hits(query);
    }
};

} // namespace

TEST_F(Query, BeforeFetchThereAreNoEntries) {
    BQuery query;
    entry_ref ref;
    BEntry entry;
    struct dirent record;
    EXPECT_EQ(query.GetNextRef(&ref), B_FILE_ERROR);
    EXPECT_EQ(query.GetNextEntry(&entry), B_FILE_ERROR);
    EXPECT_EQ(query.GetNextDirents(&record, sizeof(record)), B_FILE_ERROR);
    EXPECT_EQ(query.Rewind(), B_FILE_ERROR);
    EXPECT_EQ(query.CountEntries(), B_ERROR);
    EXPECT_EQ(query.TargetDevice(), static_cast<dev_t>(-1));
    EXPECT_FALSE(query.IsLive());
}

TEST_F(Query, FetchNeedsConditionAndVolume) {
    BQuery query;
    BVolume volume(Device());
    BVolume unset;
    EXPECT_EQ(query.Fetch(), B_NO_INIT);
    EXPECT_EQ(query.SetVolume(&volume), B_OK);
    EXPECT_EQ(query.TargetDevice(), Device());
    EXPECT_EQ(query.Fetch(), B_NO_INIT);
    EXPECT_EQ(query.SetVolume(&unset), B_BAD_VALUE);
    EXPECT_EQ(query.SetVolume(nullptr), B_BAD_VALUE);
    BQuery second;
    EXPECT_EQ(second.SetPredicate("name==x"), B_OK);
    EXPECT_EQ(second.Fetch(), B_NO_INIT);
}

TEST_F(Query, MalformedConditionsAreBadValues) {
    BVolume volume(Device());
    BQuery text;
    text.SetVolume(&volume);
    EXPECT_EQ(text.SetPredicate("name=="), B_OK);
    EXPECT_EQ(text.Fetch(), B_BAD_VALUE);
    EXPECT_EQ(text.SetPredicate(nullptr), B_BAD_VALUE);
    BQuery pushed;
    pushed.SetVolume(&volume);
    EXPECT_EQ(pushed.PushAttr("a"), B_OK);
    EXPECT_EQ(pushed.PushOp(B_EQ), B_OK);
    EXPECT_EQ(pushed.Fetch(), B_BAD_VALUE);
    EXPECT_EQ(pushed.PredicateLength(), 0u);
    EXPECT_EQ(pushed.PushAttr(nullptr), B_BAD_VALUE);
    EXPECT_EQ(pushed.PushAttr(""), B_BAD_VALUE);
    EXPECT_EQ(pushed.PushString(nullptr), B_BAD_VALUE);
    EXPECT_EQ(pushed.PushOp(B_INVALID_OP), B_BAD_VALUE);
    EXPECT_EQ(pushed.PushDouble(static_cast<double>(INFINITY)), B_BAD_VALUE);
    EXPECT_EQ(pushed.PushDate("nonsense"), B_BAD_VALUE);
    EXPECT_EQ(pushed.PushDate(nullptr), B_BAD_VALUE);
}

TEST_F(Query, ThePredicateIsReadBack) {
    BQuery query;
    char buffer[255];
    BString text;
    EXPECT_EQ(query.GetPredicate(buffer, sizeof(buffer)), B_NO_INIT);
    for (const char* ending : {".mp3", ".MP3"}) {
        query.PushAttr("name");
        query.PushString(ending);
        query.PushOp(B_ENDS_WITH);
    }
    query.PushOp(B_OR);
    EXPECT_EQ(query.GetPredicate(buffer, sizeof(buffer)), B_OK);
    EXPECT_STREQ(buffer, "((name==\"*.mp3\")||(name==\"*.MP3\"))");
    EXPECT_EQ(query.PredicateLength(), strlen(buffer) + 1);
    EXPECT_EQ(query.GetPredicate(buffer, query.PredicateLength()), B_OK);
    EXPECT_EQ(query.GetPredicate(buffer, query.PredicateLength() - 1), B_BAD_VALUE);
    EXPECT_EQ(query.GetPredicate(nullptr, 5), B_BAD_VALUE);
    EXPECT_EQ(query.GetPredicate(&text), B_OK);
    EXPECT_EQ(query.SetPredicate("size>5"), B_OK);
    EXPECT_EQ(query.GetPredicate(&text), B_OK);
    EXPECT_STREQ(text.String(), "size>5");
}

TEST_F(Query, AfterFetchAllIsSettledUntilClear) {
    BQuery query;
    BVolume volume(Device());
    query.SetVolume(&volume);
    query.SetPredicate("name==\"nothing-of-that-name\"");
    ASSERT_EQ(query.Fetch(), B_OK);
    EXPECT_EQ(query.Fetch(), B_NOT_ALLOWED);
    EXPECT_EQ(query.SetVolume(&volume), B_NOT_ALLOWED);
    EXPECT_EQ(query.SetPredicate("a==1"), B_NOT_ALLOWED);
    EXPECT_EQ(query.PushAttr("a"), B_NOT_ALLOWED);
    EXPECT_EQ(query.PushInt32(1), B_NOT_ALLOWED);
    EXPECT_EQ(query.PushUInt32(1), B_NOT_ALLOWED);
    EXPECT_EQ(query.PushInt64(1), B_NOT_ALLOWED);
    EXPECT_EQ(query.PushUInt64(1), B_NOT_ALLOWED);
    EXPECT_EQ(query.PushFloat(1), B_NOT_ALLOWED);
    EXPECT_EQ(query.PushString("x"), B_NOT_ALLOWED);
    EXPECT_EQ(query.PushDate("now"), B_NOT_ALLOWED);
    EXPECT_EQ(query.PushOp(B_EQ), B_NOT_ALLOWED);
    EXPECT_EQ(query.SetTarget(BMessenger()), B_NOT_ALLOWED);
    EXPECT_EQ(query.Clear(), B_OK);
    EXPECT_EQ(query.TargetDevice(), static_cast<dev_t>(-1));
    EXPECT_EQ(query.PushAttr("a"), B_OK);
}

TEST_F(Query, NamesAreFoundWithoutAnIndex) {
    MakeFile("one.mp3");
    MakeFile("two.MP3");
    MakeFile("three.Mp3");
    MakeFile("four.txt");
    BQuery query;
    for (const char* ending : {".mp3", ".MP3"}) {
        query.PushAttr("name");
        query.PushString(ending);
        query.PushOp(B_ENDS_WITH);
    }
    query.PushOp(B_OR);
    EXPECT_EQ(Hits(query), (Names{"one.mp3", "two.MP3"}));
}

TEST_F(Query, PushedTextsAreLiteral) {
    const std::string titles[] = {"a*b", "a?b", "[x]", "\"q\"", "back\\slash", "\xFF\xFE", "axb"};
    int number = 0;
    for (const std::string& title : titles)
        MakeTagged(std::to_string(number++), title);
    for (int i = 0; i < 7; i++) {
        const Names only = {std::to_string(i)};
        EXPECT_EQ(Matching("Test:Title", titles[i].c_str(), B_CONTAINS), only) << titles[i];
        EXPECT_EQ(Matching("Test:Title", titles[i].c_str(), B_BEGINS_WITH), only) << titles[i];
        EXPECT_EQ(Matching("Test:Title", titles[i].c_str(), B_ENDS_WITH), only) << titles[i];
        EXPECT_EQ(Matching("Test:Title", titles[i].c_str(), B_EQ), only) << titles[i];
    }
    EXPECT_EQ(Matching("Test:Title", "", B_CONTAINS).size(), 7u);
}

TEST_F(Query, WildcardsOfTheTextFormMatch) {
    MakeTagged("one", "Love me do");
    MakeTagged("two", "Lovely");
    MakeTagged("three", "glove");
    EXPECT_EQ(Matching("Test:Title==\"Love*\""), (Names{"one", "two"}));
    EXPECT_EQ(Matching("Test:Title==\"*l[ov]ve*\""), (Names{"three"}));
    EXPECT_EQ(Matching("Test:Title==~\"*LOVE\""), (Names{"three"}));
    EXPECT_EQ(Matching("Test:Title!=\"Love*\""), (Names{"three"}));
    EXPECT_EQ(Matching("Test:Title==\"L?vely\"&&!(name==one)"), (Names{"two"}));
}

TEST_F(Query, CaseCountsUnlessAskedOtherwise) {
    MakeTagged("one", "\xC3\x89toile");
    EXPECT_EQ(Matching("Test:Title", "\xC3\xA9TOI", B_CONTAINS), Names());
    EXPECT_EQ(Matching("Test:Title", "\xC3\xA9TOI", B_CONTAINS, true), (Names{"one"}));
}

TEST_F(Query, RewindStartsAgainAndRecordsAreFilled) {
    MakeTagged("one", "same");
    MakeTagged("two", "same");
    BQuery query;
    query.SetPredicate("Test:Title==same");
    EXPECT_EQ(Hits(query), (Names{"one", "two"}));
    EXPECT_EQ(query.Rewind(), B_OK);
    BEntry entry;
    EXPECT_EQ(query.GetNextEntry(&entry), B_OK);
    EXPECT_TRUE(entry.IsFile());
    alignas(struct dirent) char buffer[512];
    auto* record = reinterpret_cast<struct dirent*>(buffer);
    EXPECT_EQ(query.GetNextDirents(record, sizeof(buffer)), 1);
    EXPECT_EQ(query.GetNextDirents(record, sizeof(buffer)), 0);
    EXPECT_EQ(query.GetNextEntry(&entry), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(query.GetNextRef(nullptr), B_BAD_VALUE);
    EXPECT_EQ(query.GetNextEntry(nullptr), B_BAD_VALUE);
}

TEST_F(Query, AnEntryWhoseDirectoryHasGoneDoesNotEndTheWalk) {
    MakeDirectory("a");
    MakeDirectory("b");
    MakeTagged("a/one", "same");
    MakeTagged("b/two", "same");
    BQuery query;
    query.SetPredicate("Test:Title==same");
    BVolume volume(Device());
    ASSERT_EQ(query.SetVolume(&volume), B_OK);
    ASSERT_EQ(query.Fetch(), B_OK);
    entry_ref first;
    ASSERT_EQ(query.GetNextRef(&first), B_OK);
    ASSERT_EQ(query.Rewind(), B_OK);
    // Too little room: the first one is found, and waits to be handed out.
    struct dirent record;
    ASSERT_EQ(query.GetNextDirents(&record, 1), B_BAD_VALUE);
    const std::string gone = first.name;
    std::filesystem::remove_all(At(gone == "one" ? "a" : "b"));

    BEntry entry;
    ASSERT_EQ(query.GetNextEntry(&entry), B_OK);

    char name[B_FILE_NAME_LENGTH];
    ASSERT_EQ(entry.GetName(name), B_OK);
    EXPECT_STREQ(name, gone == "one" ? "two" : "one");
    EXPECT_EQ(query.GetNextEntry(&entry), B_ENTRY_NOT_FOUND);
}

namespace {

class Listener : public BLooper {
  public:
    Listener() : BLooper("listener") {}

    void MessageReceived(BMessage* message) override {
        if (message->what != B_QUERY_UPDATE)
            return BLooper::MessageReceived(message);
        int32 opcode = 0;
        int64 number = 0;
        const char* name = "";
        EXPECT_EQ(message->FindInt32("opcode", &opcode), B_OK);
        EXPECT_EQ(message->FindString("name", &name), B_OK);
        for (const char* field : {"directory", "device", "node"})
            EXPECT_EQ(message->FindInt64(field, &number), B_OK) << field;
        std::lock_guard<std::mutex> lock(mMutex);
        mSeen.insert((opcode == B_ENTRY_CREATED ? "+" : "-") + std::string(name));
    }

    bool WaitFor(const std::string& update) {
        for (int i = 0; i < 1000; i++) {
            {
                std::lock_guard<std::mutex> lock(mMutex);
                if (mSeen.count(update) != 0)
                    return true;
            }
            snooze(10'000);
        }
        return false;
    }

  private:
    std::mutex mMutex;
    std::multiset<std::string> mSeen;
};

} // namespace

TEST_F(Query, ALiveQueryTellsOfFilesThatComeAndGo) {
    auto* listener = new Listener;
    listener->Run();
    {
        BQuery query;
        BVolume volume(Device());
        query.SetVolume(&volume);
        query.SetPredicate("Test:Title==live");
        EXPECT_EQ(query.SetTarget(BMessenger(listener)), B_OK);
        EXPECT_TRUE(query.IsLive());
        ASSERT_EQ(query.Fetch(), B_OK);
        MakeTagged("song", "live");
        EXPECT_TRUE(listener->WaitFor("+song"));
        MakeTagged("song", "dead");
        EXPECT_TRUE(listener->WaitFor("-song"));
    }
    listener->Lock();
    listener->Quit();
}

TEST_F(Query, IndicesAreMadeOnceListedAndRemoved) {
    EXPECT_EQ(fs_create_index(Device(), "Test:Extra", B_INT32_TYPE, 0), B_OK);
    EXPECT_EQ(fs_create_index(Device(), "Test:Extra", B_INT32_TYPE, 0), B_FILE_EXISTS);
    EXPECT_EQ(errno, EEXIST);
    index_info info;
    EXPECT_EQ(fs_stat_index(Device(), "Test:Extra", &info), B_OK);
    EXPECT_EQ(info.type, static_cast<uint32>(B_INT32_TYPE));
    Names names;
    DIR* listing = fs_open_index_dir(Device());
    ASSERT_NE(listing, nullptr);
    while (struct dirent* record = fs_read_index_dir(listing))
        names.insert(record->d_name);
    EXPECT_EQ(fs_close_index_dir(listing), B_OK);
    EXPECT_EQ(names, (Names{"name", "size", "last_modified", "Test:Title", "Test:Extra"}));
    EXPECT_EQ(fs_remove_index(Device(), "Test:Extra"), B_OK);
    EXPECT_EQ(fs_remove_index(Device(), "Test:Extra"), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(fs_stat_index(Device(), "Test:Extra", &info), B_ENTRY_NOT_FOUND);
}

TEST_F(Query, IndicesOfNoVolumeAreBadValues) {
    index_info info;
    EXPECT_EQ(fs_create_index(kNoDevice, "a", B_INT32_TYPE, 0), B_BAD_VALUE);
    EXPECT_EQ(fs_remove_index(kNoDevice, "a"), B_BAD_VALUE);
    EXPECT_EQ(fs_stat_index(kNoDevice, "a", &info), B_BAD_VALUE);
    EXPECT_EQ(fs_open_index_dir(kNoDevice), nullptr);
    EXPECT_EQ(fs_create_index(Device(), nullptr, B_INT32_TYPE, 0), B_BAD_VALUE);
    EXPECT_EQ(fs_create_index(Device(), "", B_INT32_TYPE, 0), B_BAD_VALUE);
    EXPECT_EQ(fs_create_index(Device(), "a", B_INT32_TYPE, 1), B_BAD_VALUE);
    EXPECT_EQ(fs_stat_index(Device(), "a", nullptr), B_BAD_VALUE);
    EXPECT_EQ(fs_close_index_dir(nullptr), B_BAD_VALUE);
    EXPECT_EQ(fs_read_index_dir(nullptr), nullptr);
}
