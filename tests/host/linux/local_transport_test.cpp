// The listening side of the transport, against peers that do not keep to the rules.
#include "host/api/local_transport.h"
#include "host/api/running_applications.h"
#include "host/api/threads.h"
#include "host/linux/frame.h"
#include "host/linux/local_peers.h"
#include "host/linux/runtime_files.h"
#include "support/temporary_environment.h"

#include <atomic>
#include <csignal>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <gtest/gtest.h>
#include <poll.h>
#include <string>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

constexpr std::int64_t second = 1'000'000'000;

// Answers with the size of the request. Lives as long as the process, as receivers must.
class CountingReceiver : public host::LocalReceiver {
  public:
    std::int32_t received(std::int32_t, std::span<const char> request) override {
        return static_cast<std::int32_t>(request.size());
    }
    void gone(std::int32_t) override {}
};

CountingReceiver& receiver() {
    static CountingReceiver* const kept = new CountingReceiver;
    return *kept;
}

class LocalTransportTest : public testing::Test {
  protected:
    std::string directory() const { return environment_.root() + "/runtime/bekits"; }
    std::string socket_name() const { return directory() + "/" + std::to_string(process_) + ".socket"; }

    // -1 when that is refused.
    host::Descriptor connect_raw() const {
        host::Descriptor socket(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0));
        sockaddr_un address = {};
        address.sun_family = AF_UNIX;
        std::strncpy(address.sun_path, socket_name().c_str(), sizeof(address.sun_path) - 1);
        if (connect(socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof(address)) != 0)
            return {};
        return socket;
    }
    // True when the other side closes within five seconds.
    static bool is_closed(const host::Descriptor& socket) {
        pollfd waited = {socket.get(), POLLIN, 0};
        char byte = 0;
        return poll(&waited, 1, 5000) == 1 && recv(socket.get(), &byte, 1, 0) <= 0;
    }
    static std::string request(const std::string& body, std::uint32_t size) {
        char header[host::frame_header_size];
        host::write_frame_header({host::FrameKind::request, 1, size}, header);
        return std::string(header, sizeof(header)) + body;
    }
    static void send_all(const host::Descriptor& socket, const std::string& bytes) {
        EXPECT_EQ(send(socket.get(), bytes.data(), bytes.size(), MSG_NOSIGNAL),
                  static_cast<ssize_t>(bytes.size()));
    }
    // A well-behaved request, from this process to itself.
    static int served() {
        const auto answer =
            host::send_local_request(getpid(), std::string("hello"), host::uptime_nanoseconds() + 5 * second);
        return answer ? *answer : -answer.error();
    }

    test::TemporaryEnvironment environment_;
    /// Also in a child.
    const pid_t process_ = getpid();
};

} // namespace

TEST_F(LocalTransportTest, ARequestIsAnswered) {
    ASSERT_TRUE(host::open_local_transport(receiver()).ok());
    EXPECT_EQ(served(), 5);
    struct stat status = {};
    ASSERT_EQ(stat(directory().c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777, 0700u);
}

TEST_F(LocalTransportTest, ADirectoryThatIsOpenToOthersIsClosedToThem) {
    mkdir(directory().c_str(), 0755);
    chmod(directory().c_str(), 0755);
    ASSERT_TRUE(host::open_local_transport(receiver()).ok());
    struct stat status = {};
    ASSERT_EQ(stat(directory().c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777, 0700u);
}

TEST_F(LocalTransportTest, ADirectoryOfSomebodyElseIsNotUsed) {
    if (geteuid() != 0)
        GTEST_SKIP() << "only root can make a directory that is somebody else's";
    mkdir(directory().c_str(), 0700);
    ASSERT_EQ(chown(directory().c_str(), 65534, 65534), 0);
    EXPECT_EQ(host::open_local_transport(receiver()).error(), EPERM);
}

TEST_F(LocalTransportTest, WhatIsNoFrameEndsItsOwnConnectionOnly) {
    ASSERT_TRUE(host::open_local_transport(receiver()).ok());
    const host::Descriptor garbage = connect_raw();
    const host::Descriptor too_large = connect_raw();
    const host::Descriptor answer = connect_raw();
    send_all(garbage, "GET / HTTP/1.1\r\n\r\n");
    send_all(too_large, request("", 67'112'961));
    char header[host::frame_header_size];
    host::write_frame_header({host::FrameKind::answer, 1, 4}, header);
    send_all(answer, std::string(header, sizeof(header)) + "1234");
    EXPECT_TRUE(is_closed(garbage));
    EXPECT_TRUE(is_closed(too_large));
    EXPECT_TRUE(is_closed(answer));
    EXPECT_EQ(served(), 5);
}

TEST_F(LocalTransportTest, AFrameThatIsNeverCompletedIsGivenUp) {
    host::LocalPeers::set_frame_time_limit(second / 5);
    ASSERT_TRUE(host::open_local_transport(receiver()).ok());
    const host::Descriptor stalled = connect_raw();
    const host::Descriptor idle = connect_raw();
    send_all(stalled, request("abc", 10));
    EXPECT_EQ(served(), 5);
    EXPECT_TRUE(is_closed(stalled));
    // Between frames there is no limit.
    send_all(idle, request("abc", 3));
    char answer[20];
    EXPECT_EQ(recv(idle.get(), answer, sizeof(answer), MSG_WAITALL), 20);
    host::LocalPeers::set_frame_time_limit(30 * second);
}

TEST_F(LocalTransportTest, APeerThatTakesNoAnswersIsNotReadAndHoldsNobodyUp) {
    ASSERT_TRUE(host::open_local_transport(receiver()).ok());
    const host::Descriptor deaf = connect_raw();
    std::string many;
    for (int count = 0; count < 1000; ++count)
        many += request("abc", 3);
    ssize_t sent = 0;
    for (ssize_t part = 0; part >= 0; sent += part) {
        pollfd waited = {deaf.get(), POLLOUT, 0};
        if (poll(&waited, 1, 500) != 1)
            break;
        part = send(deaf.get(), many.data(), many.size(), MSG_DONTWAIT | MSG_NOSIGNAL);
        ASSERT_LT(sent, 100'000'000);
    }
    EXPECT_EQ(served(), 5);
}

TEST_F(LocalTransportTest, OneProcessGetsEightConnectionsAndNoMore) {
    ASSERT_TRUE(host::open_local_transport(receiver()).ok());
    std::vector<host::Descriptor> sockets;
    char answer[20];
    for (int count = 0; count < 8; ++count) {
        sockets.push_back(connect_raw());
        send_all(sockets.back(), request("abc", 3));
        EXPECT_EQ(recv(sockets.back().get(), answer, sizeof(answer), MSG_WAITALL), 20);
    }
    const host::Descriptor refused = connect_raw();
    EXPECT_TRUE(is_closed(refused));
    sockets.clear();
    EXPECT_EQ(served(), 5);
}

TEST_F(LocalTransportTest, WhatADeadProcessLeftIsRemovedAndTheLivingStays) {
    // No process has this number: it is above what the system gives out.
    mkdir(directory().c_str(), 0700);
    test::write_file(directory() + "/99999999.team", "bekits-application 1\n");
    test::write_file(directory() + "/99999999.socket", "");
    test::write_file(directory() + "/other", "");
    ASSERT_TRUE(host::open_local_transport(receiver()).ok());
    EXPECT_FALSE(std::filesystem::exists(directory() + "/99999999.team"));
    EXPECT_FALSE(std::filesystem::exists(directory() + "/99999999.socket"));
    EXPECT_TRUE(std::filesystem::exists(directory() + "/other"));
    EXPECT_TRUE(std::filesystem::exists(socket_name()));
    EXPECT_EQ(served(), 5);
    EXPECT_EQ(host::send_local_request(99999999, {}, host::uptime_nanoseconds() + second).error(), ESRCH);
}

TEST_F(LocalTransportTest, AProcessLivesAsLongAsItHoldsItsFile) {
    mkdir(directory().c_str(), 0700);
    EXPECT_TRUE(host::process_lives(getpid()));
    // The parent takes no part, and nobody holds the file of the other.
    test::write_file(directory() + "/99999999.team", "bekits-application 1\n");
    EXPECT_FALSE(host::process_lives(getppid()));
    EXPECT_FALSE(host::process_lives(99999999));
    const pid_t child = fork();
    if (child == 0) {
        const int file =
            open((directory() + "/" + std::to_string(getpid()) + ".team").c_str(), O_RDWR | O_CREAT, 0600);
        struct flock lock = {};
        lock.l_type = F_WRLCK;
        lock.l_whence = SEEK_SET;
        fcntl(file, F_SETLK, &lock);
        pause();
        _exit(0);
    }
    for (int round = 0; round < 1000 && !host::process_lives(child); ++round)
        usleep(5000);
    EXPECT_TRUE(host::process_lives(child));
    kill(child, SIGKILL);
    waitpid(child, nullptr, 0);
    EXPECT_FALSE(host::process_lives(child));
}

TEST_F(LocalTransportTest, AnotherUserIsRefusedEvenWhereTheDirectoryIsOpen) {
    if (geteuid() != 0)
        GTEST_SKIP() << "only root can become another user";
    ASSERT_TRUE(host::open_local_transport(receiver()).ok());
    const auto closed_for_another_user = [&] {
        const pid_t child = fork();
        if (child == 0) {
            if (setgid(65534) != 0 || setuid(65534) != 0)
                _exit(3);
            const host::Descriptor socket = connect_raw();
            if (!socket.valid())
                _exit(errno == EACCES ? 0 : 2);
            _exit(is_closed(socket) ? 1 : 2);
        }
        int status = 0;
        waitpid(child, &status, 0);
        return WEXITSTATUS(status);
    };
    // Already the directory keeps others out.
    EXPECT_EQ(closed_for_another_user(), 0);
    for (const std::string& path : {environment_.root(), environment_.root() + "/runtime", directory()})
        chmod(path.c_str(), 0755);
    chmod(socket_name().c_str(), 0777);
    EXPECT_EQ(closed_for_another_user(), 1);
    EXPECT_EQ(served(), 5);
}
