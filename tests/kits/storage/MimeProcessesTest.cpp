#include <Message.h>
#include <MimeDatabase.h>
#include <MimeType.h>

#include "StorageTest.h"

#include "host/api/directories.h"

#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

extern char** environ;

namespace {

// The program starts itself again for a second process: a fork of a program with threads may do too little.
constexpr const char* kChildVariable = "QUIRNEL_TEST_MIME_CHILD";
constexpr int kChanges = 25;

class MimeProcesses : public test::StorageTest {};

void AddNames(const std::string& prefix) {
    for (int i = 0; i < kChanges; i++) {
        status_t status = MimeDatabase::Change("audio/x-mpeg", [&](MimeRecord& record) {
            BMessage list;
            (void)record.GetList(MimeRecord::List::attributeInfo, list);
            list.AddString("attr:name", (prefix + std::to_string(i)).c_str());
            return record.SetList(MimeRecord::List::attributeInfo, &list);
        });
        if (status != B_OK)
            _exit(1);
    }
}

} // namespace

// Only does something in the processes that the test below starts.
TEST_F(MimeProcesses, DISABLED_Child) {
    const char* prefix = getenv(kChildVariable);
    if (prefix == nullptr)
        GTEST_SKIP() << "run by TwoProcessesChangeOneRecord";
    AddNames(prefix);
}

TEST_F(MimeProcesses, TwoProcessesChangeOneRecord) {
    std::filesystem::remove_all(host::config_directory() + "/mime");
    std::vector<pid_t> children;
    for (const char* prefix : {"one ", "two "}) {
        std::vector<std::string> variables = {
            std::string(kChildVariable) + "=" + prefix,
            "QUIRNEL_TEST_INHERIT_HOME=1",
        };
        for (char** variable = environ; *variable != nullptr; variable++)
            variables.emplace_back(*variable);
        pid_t child = fork();
        ASSERT_GE(child, 0);
        if (child == 0) {
            std::vector<char*> pointers;
            for (std::string& variable : variables)
                pointers.push_back(variable.data());
            pointers.push_back(nullptr);
            char program[] = "/proc/self/exe";
            char filter[] = "--gtest_filter=MimeProcesses.DISABLED_Child";
            char all[] = "--gtest_also_run_disabled_tests";
            char* arguments[] = {program, filter, all, nullptr};
            execve(program, arguments, pointers.data());
            _exit(127);
        }
        children.push_back(child);
    }
    // A reader meanwhile sees whole records only: what it reads never gets shorter.
    int32 seen = 0;
    int status = 0;
    for (size_t ended = 0; ended < children.size();) {
        BMessage info;
        if (BMimeType("audio/x-mpeg").GetAttrInfo(&info) == B_OK) {
            type_code type = 0;
            int32 count = 0;
            ASSERT_EQ(info.GetInfo("attr:name", &type, &count), B_OK);
            ASSERT_GE(count, seen);
            seen = count;
        }
        for (pid_t& child : children) {
            if (child > 0 && waitpid(child, &status, WNOHANG) == child) {
                EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << status;
                child = 0;
                ended++;
            }
        }
    }
    BMessage info;
    ASSERT_EQ(BMimeType("audio/x-mpeg").GetAttrInfo(&info), B_OK);
    type_code type = 0;
    int32 count = 0;
    EXPECT_EQ(info.GetInfo("attr:name", &type, &count), B_OK);
    EXPECT_EQ(count, 2 * kChanges);
}
