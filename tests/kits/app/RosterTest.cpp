// The roster: which applications run.
#include "RunningApplication.h"
#include "SeenMessages.h"
#include "support/temporary_environment.h"

#include <Application.h>
#include <MessageQueue.h>
#include <Roster.h>

#include <gtest/gtest.h>
#include <unistd.h>

namespace {

constexpr const char* kSignature = "application/x-vnd.Test-Roster";

class RosterTest : public testing::Test {
  protected:
    test::TemporaryEnvironment mEnvironment;
};

} // namespace

TEST_F(RosterTest, WithoutAnApplicationNoneRuns) {
    EXPECT_FALSE(be_roster->IsRunning(kSignature));
    EXPECT_EQ(be_roster->TeamFor(kSignature), B_ERROR);
    BList teams;
    be_roster->GetAppList(&teams);
    EXPECT_EQ(teams.CountItems(), 0);
    app_info info;
    EXPECT_EQ(be_roster->GetAppInfo(kSignature, &info), B_ERROR);
    EXPECT_EQ(be_roster->GetRunningAppInfo(getpid(), &info), B_BAD_TEAM_ID);
    BMessage message('call');
    EXPECT_EQ(be_roster->Broadcast(&message), B_OK);
}

TEST_F(RosterTest, AnApplicationThatIsNotRunIsNotARunningOne) {
    BApplication application(kSignature);
    EXPECT_FALSE(be_roster->IsRunning(kSignature));
    BList teams;
    be_roster->GetAppList(&teams);
    EXPECT_EQ(teams.CountItems(), 0);
    status_t result = B_OK;
    EXPECT_FALSE(BMessenger(kSignature, -1, &result).IsValid());
    EXPECT_EQ(result, B_ERROR);
    EXPECT_FALSE(BMessenger(nullptr, getpid(), &result).IsValid());
    EXPECT_EQ(result, B_BAD_TEAM_ID);
}

TEST_F(RosterTest, TheRunningApplicationIsFoundWhateverTheCaseOfItsSignature) {
    test::RunningApplication application(kSignature);
    EXPECT_TRUE(be_roster->IsRunning("application/x-vnd.Test-Roster"));
    EXPECT_TRUE(be_roster->IsRunning("APPLICATION/X-VND.test-roster"));
    EXPECT_FALSE(be_roster->IsRunning("application/x-vnd.Test-Roster2"));
    EXPECT_FALSE(be_roster->IsRunning(static_cast<const char*>(nullptr)));
    EXPECT_EQ(be_roster->TeamFor(kSignature), getpid());
    BList teams;
    be_roster->GetAppList(kSignature, &teams);
    ASSERT_EQ(teams.CountItems(), 1);
    EXPECT_EQ(reinterpret_cast<intptr_t>(teams.ItemAt(0)), getpid());
    be_roster->GetAppList("application/x-vnd.Test-Nobody", &teams);
    EXPECT_EQ(teams.CountItems(), 1);
}

TEST_F(RosterTest, AnApplicationThatHasEndedDoesNotRun) {
    { test::RunningApplication application(kSignature); }
    EXPECT_FALSE(be_roster->IsRunning(kSignature));
}

TEST_F(RosterTest, InfoNamesTheTeamTheSignatureTheThreadAndTheExecutable) {
    test::RunningApplication application(kSignature);
    app_info info;
    ASSERT_EQ(be_roster->GetAppInfo(kSignature, &info), B_OK);
    EXPECT_EQ(info.team, getpid());
    EXPECT_STREQ(info.signature, "application/x-vnd.Test-Roster");
    EXPECT_GT(info.thread, 0);
    EXPECT_EQ(info.flags, B_MULTIPLE_LAUNCH);
    ASSERT_NE(info.ref.name, nullptr);
    EXPECT_STREQ(info.ref.name, "test_kits_app");
    EXPECT_EQ(be_roster->TeamFor(&info.ref), getpid());
    EXPECT_EQ(be_roster->GetAppInfo(kSignature, nullptr), B_BAD_VALUE);
    EXPECT_EQ(be_roster->GetRunningAppInfo(1, &info), B_BAD_TEAM_ID);
}

TEST_F(RosterTest, AMessengerFindsTheRunningApplication) {
    test::RunningApplication application(kSignature);
    status_t result = B_ERROR;
    EXPECT_TRUE(BMessenger(kSignature, -1, &result) == be_app_messenger);
    EXPECT_EQ(result, B_OK);
    EXPECT_TRUE(BMessenger(nullptr, getpid(), &result) == be_app_messenger);
    EXPECT_EQ(result, B_OK);
    EXPECT_TRUE(BMessenger("application/x-vnd.Test-Roster", getpid(), &result) == be_app_messenger);
    EXPECT_EQ(result, B_OK);
    EXPECT_FALSE(BMessenger("application/x-vnd.Test-Other", getpid(), &result).IsValid());
    EXPECT_EQ(result, B_MISMATCHED_VALUES);
    EXPECT_FALSE(BMessenger(nullptr, 1, &result).IsValid());
    EXPECT_EQ(result, B_BAD_TEAM_ID);
}

TEST_F(RosterTest, ABroadcastReachesTheApplication) {
    BApplication application(kSignature);
    Seen seen;
    BLooper* home = new CountingLooper(seen);
    BMessage message('call');
    ASSERT_EQ(be_roster->Broadcast(&message, BMessenger(home)), B_OK);
    const BMessage* sent = application.MessageQueue()->FindMessage(uint32{'call'});
    ASSERT_NE(sent, nullptr);
    EXPECT_TRUE(sent->ReturnAddress() == BMessenger(home));
    home->Quit();
}
