#include <OS.h>

#include <algorithm>
#include <atomic>
#include <gtest/gtest.h>
#include <string>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <thread>
#include <unistd.h>
#include <vector>

namespace {

int32 answer_42(void*) {
    return 42;
}

int32 end_when_told(void* data) {
    auto* end = static_cast<std::atomic<bool>*>(data);
    while (!end->load())
        snooze(200);
    return 7;
}

int32 read_own_niceness(void* data) {
    *static_cast<int*>(data) = getpriority(PRIO_PROCESS, static_cast<id_t>(syscall(SYS_gettid)));
    return 0;
}

struct UnwindWitness {
    explicit UnwindWitness(bool* flag) : mFlag(flag) {}
    ~UnwindWitness() { *mFlag = true; }
    bool* mFlag;
};

int32 leave_early(void* data) {
    const UnwindWitness witness(static_cast<bool*>(data));
    exit_thread(-12);
}

} // namespace

TEST(ThreadTest, RunsItsFunctionAndAnswersItsReturnValue) {
    const thread_id thread = spawn_thread(answer_42, "answer", B_NORMAL_PRIORITY, nullptr);
    ASSERT_GT(thread, 0);
    EXPECT_EQ(resume_thread(thread), B_OK);
    status_t status = 0;
    EXPECT_EQ(wait_for_thread(thread, &status), B_OK);
    EXPECT_EQ(status, 42);
}

TEST(ThreadTest, DoesNothingBeforeItIsResumed) {
    std::atomic<bool> end{true};
    const thread_id thread = spawn_thread(end_when_told, "unresumed", B_NORMAL_PRIORITY, &end);
    thread_info info;
    ASSERT_EQ(get_thread_info(thread, &info), B_OK);
    EXPECT_EQ(info.state, B_THREAD_SUSPENDED);
    EXPECT_EQ(suspend_thread(thread), B_BAD_THREAD_STATE);
    EXPECT_EQ(kill_thread(thread), B_OK);
    EXPECT_EQ(resume_thread(thread), B_BAD_THREAD_ID);
}

TEST(ThreadTest, WaitingResumesAThreadThatWasNot) {
    const thread_id thread = spawn_thread(answer_42, "waited for", B_NORMAL_PRIORITY, nullptr);
    status_t status = 0;
    EXPECT_EQ(wait_for_thread(thread, &status), B_OK);
    EXPECT_EQ(status, 42);
}

TEST(ThreadTest, AnEndedThreadAnswersOnceAndIsThenUnknown) {
    const thread_id thread = spawn_thread(answer_42, "ended", B_NORMAL_PRIORITY, nullptr);
    resume_thread(thread);
    while (has_data(thread) != B_BAD_THREAD_ID)
        snooze(200);
    status_t status = 0;
    EXPECT_EQ(wait_for_thread(thread, &status), B_OK);
    EXPECT_EQ(status, 42);
    EXPECT_EQ(wait_for_thread(thread, &status), B_BAD_THREAD_ID);
    thread_info info;
    EXPECT_EQ(send_data(thread, 712, nullptr, 0), B_BAD_THREAD_ID);
    EXPECT_EQ(has_data(thread), B_BAD_THREAD_ID);
    EXPECT_EQ(resume_thread(thread), B_BAD_THREAD_ID);
    EXPECT_EQ(suspend_thread(thread), B_BAD_THREAD_ID);
    EXPECT_EQ(kill_thread(thread), B_BAD_THREAD_ID);
    EXPECT_EQ(rename_thread(thread, "x"), B_BAD_THREAD_ID);
    EXPECT_EQ(set_thread_priority(thread, 5), B_BAD_THREAD_ID);
    EXPECT_EQ(get_thread_info(thread, &info), B_BAD_THREAD_ID);
    EXPECT_EQ(find_thread("ended"), B_NAME_NOT_FOUND);
}

TEST(ThreadTest, OnlyTheLatestUnobservedStatusesAreKept) {
    std::vector<thread_id> threads;
    for (int number = 0; number < 258; number++) {
        threads.push_back(spawn_thread(answer_42, "forgotten", B_NORMAL_PRIORITY, nullptr));
        ASSERT_EQ(kill_thread(threads.back()), B_OK);
    }
    status_t status = 0;
    EXPECT_EQ(wait_for_thread(threads[0], &status), B_BAD_THREAD_ID);
    EXPECT_EQ(wait_for_thread(threads[1], &status), B_BAD_THREAD_ID);
    EXPECT_EQ(wait_for_thread(threads[2], &status), B_OK);
    EXPECT_EQ(status, B_CANCELED);
}

TEST(ThreadTest, RefusesWhatMakesNoSense) {
    EXPECT_EQ(spawn_thread(nullptr, "none", B_NORMAL_PRIORITY, nullptr), B_BAD_VALUE);
    EXPECT_EQ(wait_for_thread(0, nullptr), B_BAD_THREAD_ID);
    EXPECT_EQ(wait_for_thread(-1, nullptr), B_BAD_THREAD_ID);
    EXPECT_EQ(wait_for_thread(find_thread(nullptr), nullptr), B_BAD_THREAD_ID);
    EXPECT_EQ(resume_thread(find_thread(nullptr)), B_BAD_THREAD_STATE);
    EXPECT_EQ(on_exit_thread(nullptr, nullptr), B_BAD_VALUE);
    EXPECT_EQ(rename_thread(find_thread(nullptr), nullptr), B_BAD_VALUE);
    thread_info info;
    int32 cookie = 0;
    EXPECT_EQ(get_thread_info(find_thread(nullptr), nullptr), B_BAD_VALUE);
    EXPECT_EQ(get_next_thread_info(0, nullptr, &info), B_BAD_VALUE);
    EXPECT_EQ(get_next_thread_info(getpid() + 1, &cookie, &info), B_BAD_TEAM_ID);
}

TEST(ThreadTest, ARunningThreadCannotBeStoppedFromOutside) {
    std::atomic<bool> end{false};
    const thread_id thread = spawn_thread(end_when_told, "running", B_NORMAL_PRIORITY, &end);
    EXPECT_EQ(resume_thread(thread), B_OK);
    EXPECT_EQ(resume_thread(thread), B_BAD_THREAD_STATE);
    EXPECT_EQ(suspend_thread(thread), B_UNSUPPORTED);
    EXPECT_EQ(kill_thread(thread), B_UNSUPPORTED);
    end = true;
    status_t status = 0;
    EXPECT_EQ(wait_for_thread(thread, &status), B_OK);
    EXPECT_EQ(status, 7);
}

TEST(ThreadTest, SeveralMayWaitForOne) {
    std::atomic<bool> end{false};
    const thread_id thread = spawn_thread(end_when_told, "popular", B_NORMAL_PRIORITY, &end);
    std::atomic<int> sum{0};
    std::atomic<int> begun{0};
    std::vector<std::thread> waiting;
    for (int number = 0; number < 4; number++) {
        waiting.emplace_back([&sum, &begun, thread] {
            status_t status = 0;
            begun++;
            if (wait_for_thread(thread, &status) == B_OK)
                sum += status;
        });
    }
    while (begun < 4)
        snooze(100);
    snooze(100000);
    end = true;
    for (std::thread& waiter : waiting)
        waiter.join();
    EXPECT_EQ(sum, 28);
}

TEST(ThreadTest, ExitThreadUnwindsAndGivesTheStatus) {
    bool unwound = false;
    const thread_id thread = spawn_thread(leave_early, "early", B_NORMAL_PRIORITY, &unwound);
    status_t status = 0;
    EXPECT_EQ(wait_for_thread(thread, &status), B_OK);
    EXPECT_EQ(status, -12);
    EXPECT_TRUE(unwound);
}

TEST(ThreadTest, ExitThreadEndsAThreadOfOthersToo) {
    bool unwound = false;
    std::thread foreign([&unwound] { leave_early(&unwound); });
    foreign.join();
    EXPECT_TRUE(unwound);
}

TEST(ThreadDeathTest, ExitThreadInTheMainThreadEndsTheProcess) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(exit_thread(3), testing::ExitedWithCode(3), "");
}

TEST(ThreadTest, KillingItselfIsExiting) {
    const thread_id thread = spawn_thread(
        [](void*) -> int32 {
            kill_thread(find_thread(nullptr));
            return 1;
        },
        "suicidal", B_NORMAL_PRIORITY, nullptr);
    status_t status = 0;
    EXPECT_EQ(wait_for_thread(thread, &status), B_OK);
    EXPECT_EQ(status, B_ERROR);
}

TEST(ThreadTest, ExitFunctionsRunInTheEndingThreadLastOneFirst) {
    struct Log {
        std::string text;
        thread_id thread = 0;
    } log;
    const auto body = [](void* data) -> int32 {
        on_exit_thread([](void* entry) { static_cast<Log*>(entry)->text += "a"; }, data);
        on_exit_thread(
            [](void* entry) {
                static_cast<Log*>(entry)->text += "b";
                static_cast<Log*>(entry)->thread = find_thread(nullptr);
            },
            data);
        return 0;
    };
    const thread_id thread = spawn_thread(body, "hooks", B_NORMAL_PRIORITY, &log);
    wait_for_thread(thread, nullptr);
    EXPECT_EQ(log.text, "ba");
    EXPECT_EQ(log.thread, thread);

    log.text.clear();
    std::thread foreign([&log, body] { body(&log); });
    foreign.join();
    EXPECT_EQ(log.text, "ba");
}

TEST(ThreadTest, EveryThreadHasANumberOfItsOwn) {
    const thread_id own = find_thread(nullptr);
    EXPECT_GT(own, 0);
    EXPECT_EQ(find_thread(nullptr), own);
    thread_id foreign = 0;
    std::thread([&foreign] { foreign = find_thread(nullptr); }).join();
    EXPECT_GT(foreign, 0);
    EXPECT_NE(foreign, own);
    EXPECT_EQ(has_data(foreign), B_BAD_THREAD_ID);
    thread_id seen = 0;
    const auto body = [](void* data) -> int32 {
        *static_cast<thread_id*>(data) = find_thread(nullptr);
        return 0;
    };
    const thread_id spawned = spawn_thread(body, "self", B_NORMAL_PRIORITY, &seen);
    wait_for_thread(spawned, nullptr);
    EXPECT_EQ(seen, spawned);
}

TEST(ThreadTest, AThreadOfOthersCanBeWaitedFor) {
    std::atomic<thread_id> id{0};
    std::atomic<bool> end{false};
    std::thread foreign([&] {
        id = find_thread(nullptr);
        end_when_told(&end);
    });
    while (id == 0)
        snooze(100);
    std::thread ender([&end] {
        snooze(5000);
        end = true;
    });
    status_t status = -1;
    EXPECT_EQ(wait_for_thread(id, &status), B_OK);
    EXPECT_EQ(status, 0);
    EXPECT_EQ(wait_for_thread(id, &status), B_BAD_THREAD_ID);
    foreign.join();
    ender.join();
}

TEST(ThreadTest, NamesCanBeFoundAndChanged) {
    std::atomic<bool> end{false};
    const thread_id thread = spawn_thread(end_when_told, "first name", B_NORMAL_PRIORITY, &end);
    EXPECT_EQ(find_thread("first name"), thread);
    resume_thread(thread);
    EXPECT_EQ(rename_thread(thread, "a second name, far longer than the field"), B_OK);
    EXPECT_EQ(find_thread("first name"), B_NAME_NOT_FOUND);
    EXPECT_EQ(find_thread("a second name, far longer than "), thread);
    end = true;
    wait_for_thread(thread, nullptr);
}

TEST(ThreadTest, TellsAboutItself) {
    std::atomic<bool> end{false};
    const thread_id thread = spawn_thread(end_when_told, "described", B_LOW_PRIORITY, &end);
    resume_thread(thread);
    thread_info info;
    ASSERT_EQ(get_thread_info(thread, &info), B_OK);
    EXPECT_EQ(info.thread, thread);
    EXPECT_EQ(info.team, getpid());
    EXPECT_STREQ(info.name, "described");
    EXPECT_EQ(info.priority, 5);
    EXPECT_EQ(info.state, B_THREAD_RUNNING);
    EXPECT_GE(info.user_time, 0);
    end = true;
    wait_for_thread(thread, nullptr);
}

TEST(ThreadTest, AllThreadsAreVisitedOnce) {
    const thread_id first = spawn_thread(answer_42, "visited", B_NORMAL_PRIORITY, nullptr);
    const thread_id second = spawn_thread(answer_42, "visited", B_NORMAL_PRIORITY, nullptr);
    const thread_id own = find_thread(nullptr);
    int32 cookie = 0;
    thread_info info;
    std::vector<thread_id> visited;
    while (get_next_thread_info(0, &cookie, &info) == B_OK)
        visited.push_back(info.thread);
    EXPECT_EQ(std::count(visited.begin(), visited.end(), first), 1);
    EXPECT_EQ(std::count(visited.begin(), visited.end(), second), 1);
    EXPECT_EQ(std::count(visited.begin(), visited.end(), own), 1);
    EXPECT_TRUE(std::is_sorted(visited.begin(), visited.end()));
    kill_thread(first);
    kill_thread(second);
}

TEST(ThreadTest, LowPriorityMeansNicenessTen) {
    const int own = getpriority(PRIO_PROCESS, 0);
    if (own != 0)
        GTEST_SKIP() << "this process runs at niceness " << own << " itself";
    int niceness = -100;
    wait_for_thread(spawn_thread(read_own_niceness, "low", B_LOW_PRIORITY, &niceness), nullptr);
    EXPECT_EQ(niceness, 10);
    wait_for_thread(spawn_thread(read_own_niceness, "idle", B_IDLE_PRIORITY, &niceness), nullptr);
    EXPECT_EQ(niceness, 19);
    EXPECT_EQ(getpriority(PRIO_PROCESS, 0), own);
}

TEST(ThreadTest, ChangingThePriorityAnswersTheOldOne) {
    std::atomic<bool> end{false};
    const thread_id thread = spawn_thread(end_when_told, "changing", B_DISPLAY_PRIORITY, &end);
    EXPECT_EQ(set_thread_priority(thread, B_NORMAL_PRIORITY), 15);
    resume_thread(thread);
    EXPECT_EQ(set_thread_priority(thread, B_LOW_PRIORITY), 10);
    thread_info info;
    ASSERT_EQ(get_thread_info(thread, &info), B_OK);
    EXPECT_EQ(info.priority, 5);
    end = true;
    wait_for_thread(thread, nullptr);
}
