#include <OS.h>

#include <gtest/gtest.h>
#include <string>
#include <unistd.h>

TEST(SystemTest, DescribesThisProcess) {
    team_info info;
    ASSERT_EQ(get_team_info(B_CURRENT_TEAM, &info), B_OK);
    EXPECT_EQ(info.team, getpid());
    EXPECT_EQ(info.uid, getuid());
    EXPECT_GE(info.argc, 1);
    EXPECT_NE(std::string(info.args), "");
    EXPECT_EQ(get_team_info(getpid(), &info), B_OK);
    EXPECT_EQ(get_team_info(getpid() + 1, &info), B_BAD_TEAM_ID);
    EXPECT_EQ(get_team_info(B_CURRENT_TEAM, nullptr), B_BAD_VALUE);
}

TEST(SystemTest, DescribesTheMachine) {
    system_info before;
    ASSERT_EQ(get_system_info(&before), B_OK);
    EXPECT_GE(before.cpu_count, 1U);
    EXPECT_GT(before.max_pages, before.used_pages);
    EXPECT_GT(before.used_pages, 0U);
    EXPECT_EQ(std::string(before.kernel_name).substr(0, 6), "Linux ");
    EXPECT_LT(before.boot_time, real_time_clock_usecs());

    const sem_id sem = create_sem(0, "counted");
    const port_id port = create_port(1, "counted");
    system_info after;
    ASSERT_EQ(get_system_info(&after), B_OK);
    EXPECT_EQ(after.used_sems, before.used_sems + 1);
    EXPECT_EQ(after.used_ports, before.used_ports + 1);
    delete_sem(sem);
    delete_port(port);
    EXPECT_EQ(get_system_info(nullptr), B_BAD_VALUE);
}

TEST(SystemDeathTest, TheDebuggerCallPrintsItsMessage) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_DEATH(debugger("The looper must be locked."), "The looper must be locked\\.");
}
