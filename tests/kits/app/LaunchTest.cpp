// Launching applications: on demand, once or often, with what they are given, and who is told.
#include "AppFiles.h"
#include "PeerProgram.h"

#include <Application.h>
#include <List.h>
#include <algorithm>

#include <csignal>
#include <fstream>
#include <mutex>
#include <set>
#include <sys/stat.h>

namespace {

constexpr const char* kPeer = "application/x-vnd.Test-Launched";
using Lines = std::vector<std::string>;
using test::Eventually;
using test::PeerProgram;

class LaunchTest : public test::PeerTest {
  protected:
    LaunchTest() : PeerTest(kPeer) {}

    // A program that writes down its arguments, each ended by a zero byte.
    std::string RecordingProgram() {
        const std::string path = mEnvironment.root() + "/recorder";
        test::write_file(path, "#!/bin/sh\nprintf '%s\\0' \"$@\" > '" + mEnvironment.root() +
                                   "/recording'\nmv '" + mEnvironment.root() + "/recording' '" +
                                   mEnvironment.root() + "/recorded'\n");
        chmod(path.c_str(), 0755);
        return path;
    }
    Lines Recorded() {
        const std::string path = mEnvironment.root() + "/recorded";
        EXPECT_TRUE(Eventually([&] { return std::filesystem::exists(path); }));
        Lines arguments;
        std::ifstream file(path, std::ios::binary);
        for (std::string argument; std::getline(file, argument, '\0');)
            arguments.push_back(argument);
        return arguments;
    }
    // The entry of a program that opens `type`.
    void InstallDesktopEntry(const std::string& exec, const std::string& type) {
        const std::string directory = mEnvironment.home() + "/.local/share/applications";
        std::filesystem::create_directories(directory);
        test::write_file(directory + "/test-opener.desktop",
                         "[Desktop Entry]\nType=Application\nName=Opener\nExec=" + exec +
                             "\nMimeType=" + type + ";\n");
    }
    entry_ref MakeFile(const std::string& leaf, const std::string& content = "text\n") {
        test::write_file(mEnvironment.root() + "/" + leaf, content);
        entry_ref ref;
        EXPECT_TRUE(ref_of_path(mEnvironment.root() + "/" + leaf, &ref));
        return ref;
    }
    size_t RunningPeers() const {
        BList teams;
        be_roster->GetAppList(kPeer, &teams);
        return static_cast<size_t>(teams.CountItems());
    }
};

} // namespace

TEST_F(LaunchTest, ASignatureIsLaunchedAndCanBeSentMessagesAtOnce) {
    Install(kPeer, "multiple");
    team_id team = -1;
    ASSERT_EQ(be_roster->Launch(kPeer, static_cast<const BMessage*>(nullptr), &team), B_OK);
    EXPECT_GT(team, 0);
    EXPECT_EQ(be_roster->TeamFor("APPLICATION/x-vnd.test-LAUNCHED"), team);
    BMessage reply;
    EXPECT_EQ(BMessenger(kPeer).SendMessage('echo', &reply), B_OK);
    EXPECT_EQ(reply.GetInt32("team", 0), team);
    app_info info;
    ASSERT_EQ(be_roster->GetRunningAppInfo(team, &info), B_OK);
    EXPECT_EQ(info.team, team);
    EXPECT_STREQ(info.signature, kPeer);
    EXPECT_GT(info.thread, 0);
    EXPECT_STREQ(info.ref.name, "test-peer");
    EXPECT_TRUE(be_roster->IsRunning(&info.ref));
}

TEST_F(LaunchTest, MessagesComeBeforeReadyToRun) {
    Install(kPeer, "multiple");
    BMessage first('text');
    first.AddString("text", "one");
    BMessage refs(B_REFS_RECEIVED);
    const entry_ref ref = MakeFile("song.mp3");
    refs.AddRef("refs", &ref);
    BList messages;
    messages.AddItem(&first);
    messages.AddItem(&refs);
    ASSERT_EQ(be_roster->Launch(kPeer, &messages), B_OK);
    EXPECT_TRUE(Eventually([&] { return HasLogged("ready"); }));
    EXPECT_EQ(Logged(), (Lines{"text one", "refs song.mp3", "ready"}));
}

TEST_F(LaunchTest, ArgumentsReachArgvReceivedAsTheyAre) {
    Install(kPeer, "multiple");
    const char* arguments[] = {"--option", "a b", "it's \"$HOME\""};
    ASSERT_EQ(be_roster->Launch(kPeer, 3, arguments), B_OK);
    EXPECT_TRUE(Eventually([&] { return HasLogged("ready"); }));
    EXPECT_EQ(Logged(), (Lines{"argv --option a b it's \"$HOME\"", "ready"}));
}

TEST_F(LaunchTest, AnExclusiveApplicationIsLaunchedOnce) {
    Install(kPeer, "exclusive");
    team_id first = -1;
    team_id second = -1;
    ASSERT_EQ(be_roster->Launch(kPeer, static_cast<const BMessage*>(nullptr), &first), B_OK);
    EXPECT_EQ(be_roster->Launch(kPeer, static_cast<const BMessage*>(nullptr), &second), B_ALREADY_RUNNING);
    EXPECT_EQ(second, first);
    EXPECT_EQ(RunningPeers(), 1u);
    EXPECT_TRUE(Eventually([&] { return HasLogged("activated"); }));
    EXPECT_EQ(Logged(), (Lines{"ready", "relaunched", "activated"}));
    BMessage text('text');
    text.AddString("text", "for the running one");
    EXPECT_EQ(be_roster->Launch(kPeer, &text), B_ALREADY_RUNNING);
    const char* arguments[] = {"again"};
    EXPECT_EQ(be_roster->Launch(kPeer, 1, arguments), B_ALREADY_RUNNING);
    EXPECT_TRUE(Eventually([&] { return Logged().size() == 7; }));
    EXPECT_EQ(Logged(), (Lines{"ready", "relaunched", "activated", "text for the running one", "activated",
                               "argv again", "activated"}));
}

TEST_F(LaunchTest, ABackgroundApplicationIsNotActivated) {
    Install(kPeer, "exclusive", "Background=true\n");
    ASSERT_EQ(be_roster->Launch(kPeer), B_OK);
    EXPECT_EQ(be_roster->Launch(kPeer), B_ALREADY_RUNNING);
    BMessage reply;
    ASSERT_EQ(BMessenger(kPeer).SendMessage('echo', &reply), B_OK);
    EXPECT_EQ(Logged(), (Lines{"ready", "relaunched"}));
}

TEST_F(LaunchTest, AMultipleApplicationIsLaunchedAgainAndAgain) {
    Install(kPeer, "multiple");
    team_id first = -1;
    team_id second = -1;
    ASSERT_EQ(be_roster->Launch(kPeer, static_cast<const BMessage*>(nullptr), &first), B_OK);
    ASSERT_EQ(be_roster->Launch(kPeer, static_cast<const BMessage*>(nullptr), &second), B_OK);
    EXPECT_NE(first, second);
    EXPECT_EQ(RunningPeers(), 2u);
    EXPECT_EQ(be_roster->TeamFor(kPeer), first);
}

TEST_F(LaunchTest, ASingleApplicationRunsOnceForEachExecutable) {
    const std::string copy = mEnvironment.root() + "/copy-of-peer";
    std::filesystem::copy_file(TEST_PEER, copy);
    Install(kPeer, "single");
    PeerProgram first(kPeer);
    test::Program other(copy, {});
    EXPECT_TRUE(Eventually([&] { return RunningPeers() == 2; }));
    EXPECT_EQ(test::run_program(TEST_PEER, {}).status, 0);
    EXPECT_EQ(RunningPeers(), 2u);
}

TEST_F(LaunchTest, AnApplicationOfCommandLinesGetsNoMessages) {
    Install(kPeer, "multiple", "ArgumentsOnly=true\n");
    BMessage text('text');
    text.AddString("text", "unwanted");
    ASSERT_EQ(be_roster->Launch(kPeer, &text), B_OK);
    EXPECT_TRUE(Eventually([&] { return HasLogged("ready"); }));
    EXPECT_EQ(Logged(), (Lines{"ready"}));
}

TEST_F(LaunchTest, ASecondStartHandsItsArgumentsOverAndEndsWell) {
    Install(kPeer, "exclusive");
    PeerProgram first(kPeer);
    EXPECT_TRUE(Eventually([&] { return HasLogged("ready"); }));
    const test::ProgramResult second = test::run_program(TEST_PEER, {"-x", "two words"});
    EXPECT_EQ(second.status, 0);
    EXPECT_EQ(second.errors, "");
    EXPECT_EQ(test::run_program(TEST_PEER, {}).status, 0);
    BMessage reply;
    ASSERT_EQ(first.Messenger().SendMessage('echo', &reply), B_OK);
    // What the second one says of itself, it says while the first one hears of it.
    Lines firstSays = Logged();
    const auto ofSecond = std::remove(firstSays.begin(), firstSays.end(), "runs already");
    EXPECT_EQ(firstSays.end() - ofSecond, 2);
    firstSays.erase(ofSecond, firstSays.end());
    EXPECT_EQ(firstSays, (Lines{"ready", "argv -x two words", "activated", "relaunched", "activated"}));
    EXPECT_EQ(be_roster->TeamFor(kPeer), first.Team());
}

TEST_F(LaunchTest, OfTwoThatStartAtOnceExactlyOneRuns) {
    Install(kPeer, "exclusive");
    for (int round = 0; round < 100; round++) {
        test::write_file(LogPath(), "");
        test::Program one(TEST_PEER, {});
        test::Program two(TEST_PEER, {});
        const auto logged = [&](const char* text) {
            const Lines lines = Logged();
            return std::count(lines.begin(), lines.end(), text);
        };
        ASSERT_TRUE(Eventually([&] { return logged("ready") == 1 && logged("runs already") == 1; }))
            << round << ": " << test::read_file(LogPath());
        ASSERT_EQ(RunningPeers(), 1u);
        ASSERT_EQ(BMessenger(kPeer).SendMessage(B_QUIT_REQUESTED), B_OK);
        ASSERT_EQ(one.wait().status, 0);
        ASSERT_EQ(two.wait().status, 0);
        ASSERT_EQ(logged("ready"), 1);
    }
}

TEST_F(LaunchTest, AStartWhileTheOtherEndsRuns) {
    Install(kPeer, "exclusive");
    for (int round = 0; round < 10; round++) {
        PeerProgram first(kPeer);
        // Handed over to one that quits, a start may be lost; begun after its end, it may not.
        first.Process().signal(SIGKILL);
        first.Process().wait();
        // What the first one has logged says nothing of the second.
        test::write_file(LogPath(), "");
        PeerProgram second(kPeer);
        EXPECT_TRUE(Eventually([&] { return HasLogged("ready"); }));
        EXPECT_EQ(second.Messenger().SendMessage(B_QUIT_REQUESTED), B_OK);
        EXPECT_EQ(second.Process().wait().status, 0);
    }
}

TEST_F(LaunchTest, AnApplicationObjectThatIsNotRunNeitherClaimsNorIsRefused) {
    Install(kPeer, "exclusive");
    PeerProgram running(kPeer);
    // As a command line program that only uses the application's classes.
    BApplication idle(kPeer);
    EXPECT_EQ(idle.InitCheck(), B_OK);
    EXPECT_EQ(be_roster->TeamFor(kPeer), running.Team());
    EXPECT_FALSE(BMessenger(kPeer).IsTargetLocal());
    EXPECT_EQ(RunningPeers(), 1u);
}

TEST_F(LaunchTest, WhatCannotBeFoundOrStartedSaysSo) {
    entry_ref ref;
    EXPECT_EQ(be_roster->Launch("application/x-vnd.Test-Nowhere"), B_LAUNCH_FAILED_APP_NOT_FOUND);
    EXPECT_EQ(be_roster->FindApp("application/x-vnd.Test-Nowhere", &ref), B_LAUNCH_FAILED_APP_NOT_FOUND);
    EXPECT_EQ(be_roster->Launch("no type"), B_BAD_VALUE);
    EXPECT_EQ(be_roster->FindApp(static_cast<const char*>(nullptr), &ref), B_BAD_VALUE);
    Install(kPeer, "multiple", "", mEnvironment.root() + "/gone");
    EXPECT_EQ(be_roster->Launch(kPeer), B_LAUNCH_FAILED_APP_NOT_FOUND);
    Install(kPeer, "multiple", "", "/bin/false");
    EXPECT_EQ(be_roster->Launch(kPeer), B_LAUNCH_FAILED);
    const entry_ref plain = MakeFile("not-a-program");
    Install(kPeer, "multiple", "", mEnvironment.root() + "/not-a-program");
    EXPECT_EQ(be_roster->Launch(kPeer), B_LAUNCH_FAILED_EXECUTABLE);
    EXPECT_EQ(be_roster->ActivateApp(1), B_BAD_TEAM_ID);
}

TEST_F(LaunchTest, AnExecutableIsLaunchedByItsRefAsTheApplicationOfItsRecord) {
    Install(kPeer, "exclusive");
    entry_ref found;
    ASSERT_EQ(be_roster->FindApp(kPeer, &found), B_OK);
    EXPECT_STREQ(found.name, "test-peer");
    EXPECT_FALSE(be_roster->IsRunning(&found));
    ASSERT_EQ(be_roster->Launch(&found), B_OK);
    EXPECT_TRUE(be_roster->IsRunning(kPeer));
    EXPECT_EQ(be_roster->Launch(&found), B_ALREADY_RUNNING);
    entry_ref itself;
    ASSERT_EQ(be_roster->FindApp(&found, &itself), B_OK);
    EXPECT_TRUE(itself == found);
}

TEST_F(LaunchTest, ATypesRecordNamesItsApplication) {
    Install(kPeer, "multiple");
    BMessage record('MIME');
    record.AddString("type", "audio/x-test");
    record.AddString("preferred application", kPeer);
    std::vector<char> form(static_cast<size_t>(record.FlattenedSize()));
    ASSERT_EQ(record.Flatten(form.data(), static_cast<ssize_t>(form.size())), B_OK);
    const std::string directory = mEnvironment.home() + "/.config/bekits/mime";
    std::filesystem::create_directories(directory);
    test::write_file(directory + "/audio,x-test.mime", std::string(form.data(), form.size()));
    entry_ref found;
    ASSERT_EQ(be_roster->FindApp("audio/x-test", &found), B_OK);
    EXPECT_STREQ(found.name, "test-peer");
    ASSERT_EQ(be_roster->Launch("audio/x-test"), B_OK);
    EXPECT_TRUE(be_roster->IsRunning(kPeer));
}

TEST_F(LaunchTest, ADocumentIsOpenedByTheDesktopsProgramForItsType) {
    InstallDesktopEntry(RecordingProgram() + " --open %f", "text/plain");
    const entry_ref document = MakeFile("it's \"a\"\n- song.txt");
    entry_ref found;
    ASSERT_EQ(be_roster->FindApp(&document, &found), B_OK);
    EXPECT_STREQ(found.name, "recorder");
    team_id team = -1;
    ASSERT_EQ(be_roster->Launch(&document, static_cast<const BMessage*>(nullptr), &team), B_OK);
    EXPECT_GT(team, 0);
    EXPECT_EQ(Recorded(), (Lines{"--open", mEnvironment.root() + "/it's \"a\"\n- song.txt"}));
}

TEST_F(LaunchTest, ADocumentWithoutAProgramIsNotOpened) {
    mEnvironment.set("XDG_DATA_DIRS", mEnvironment.root() + "/nothing");
    const entry_ref document = MakeFile("unknown.strange");
    EXPECT_EQ(be_roster->Launch(&document), B_LAUNCH_FAILED_NO_PREFERRED_APP);
    entry_ref gone = document;
    gone.set_name("not there");
    EXPECT_EQ(be_roster->Launch(&gone), B_ENTRY_NOT_FOUND);
}

TEST_F(LaunchTest, ALaunchedProcessThatEndsLeavesNoZombie) {
    Install(kPeer, "multiple");
    team_id team = -1;
    ASSERT_EQ(be_roster->Launch(kPeer, static_cast<const BMessage*>(nullptr), &team), B_OK);
    ASSERT_EQ(BMessenger(kPeer).SendMessage(B_QUIT_REQUESTED), B_OK);
    EXPECT_TRUE(Eventually([&] { return kill(team, 0) != 0; }));
}

TEST_F(LaunchTest, WatchersHearOfBeginningsAndEndsAlsoOfKilledOnes) {
    class Watcher : public BLooper {
      public:
        void MessageReceived(BMessage* message) override {
            std::lock_guard guard(mMutex);
            if (message->HasRef("be:ref") && std::string(message->GetString("be:signature")) == kPeer)
                mHeard.insert({message->what, message->GetInt32("be:team", 0)});
        }
        bool Heard(uint32 what, team_id team) {
            std::lock_guard guard(mMutex);
            return mHeard.count({what, team}) == 1;
        }

      private:
        std::mutex mMutex;
        std::multiset<std::pair<uint32, team_id>> mHeard;
    };
    auto* const watcher = new Watcher;
    watcher->Run();
    EXPECT_EQ(be_roster->StartWatching(BMessenger(watcher), 0x80), B_BAD_VALUE);
    ASSERT_EQ(be_roster->StartWatching(BMessenger(watcher)), B_OK);
    for (const int number : {SIGKILL, 0}) {
        PeerProgram peer(kPeer);
        EXPECT_TRUE(Eventually([&] { return watcher->Heard(B_SOME_APP_LAUNCHED, peer.Team()); }));
        if (number != 0)
            peer.Process().signal(number);
        else
            peer.Messenger().SendMessage(B_QUIT_REQUESTED);
        EXPECT_TRUE(Eventually([&] { return watcher->Heard(B_SOME_APP_QUIT, peer.Team()); }));
    }
    EXPECT_EQ(be_roster->StopWatching(BMessenger(watcher)), B_OK);
    EXPECT_EQ(be_roster->StopWatching(BMessenger(watcher)), B_BAD_VALUE);
    watcher->Lock();
    watcher->Quit();
}
