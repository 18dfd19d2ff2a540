#include <Errors.h>

#include <cerrno>
#include <gtest/gtest.h>
#include <set>
#include <string>

TEST(ErrorsTest, CodesHaveThePlatformsValues) {
    struct Case {
        status_t code;
        uint32_t value;
    };
    const Case cases[] = {
        {B_NO_MEMORY, 0x80000000},
        {B_BAD_VALUE, 0x80000005},
        {B_NAME_NOT_FOUND, 0x80000007},
        {B_TIMED_OUT, 0x80000009},
        {B_INTERRUPTED, 0x8000000A},
        {B_WOULD_BLOCK, 0x8000000B},
        {B_NO_INIT, 0x8000000D},
        {B_NOT_ALLOWED, 0x8000000F},
        {B_BAD_DATA, 0x80000010},
        {B_BAD_SEM_ID, 0x80001000},
        {B_BAD_THREAD_ID, 0x80001100},
        {B_BAD_THREAD_STATE, 0x80001102},
        {B_BAD_TEAM_ID, 0x80001103},
        {B_BAD_PORT_ID, 0x80001200},
        {B_BAD_REPLY, 0x80002000},
        {B_BAD_HANDLER, 0x80002003},
        {B_ALREADY_RUNNING, 0x80002004},
        {B_LAUNCH_FAILED, 0x80002005},
        {B_BAD_SCRIPT_SYNTAX, 0x80002008},
        {B_NO_TRANSLATOR, 0x80004800},
        {B_FILE_ERROR, 0x80006000},
        {B_FILE_EXISTS, 0x80006002},
        {B_ENTRY_NOT_FOUND, 0x80006003},
        {B_NAME_TOO_LONG, 0x80006004},
        {B_DEVICE_FULL, 0x80006007},
        {B_READ_ONLY_DEVICE, 0x80006008},
        {B_UNSUPPORTED, 0x8000600E},
        {B_POSIX_E2BIG, 0x80007001},
        {B_ERROR, 0xFFFFFFFF},
        {B_OK, 0},
    };
    for (const Case& testCase : cases)
        EXPECT_EQ(static_cast<uint32_t>(testCase.code), testCase.value);
}

TEST(ErrorsTest, StrerrorAnswersReadablyForNegativeCodes) {
    EXPECT_STREQ(strerror(B_ENTRY_NOT_FOUND), "No such file or folder");
    EXPECT_STREQ(strerror(B_NO_MEMORY), "Out of memory");
    EXPECT_STREQ(strerror(B_BAD_THREAD_ID), "No such thread");
    EXPECT_STREQ(strerror(B_ERROR), "General error");
    EXPECT_STREQ(strerror(B_OK), "No error");
}

TEST(ErrorsTest, StrerrorStillKnowsTheHostsNumbers) {
    EXPECT_STREQ(strerror(ENOENT), "No such file or directory");
    EXPECT_STREQ(strerror(EACCES), "Permission denied");
}

TEST(ErrorsTest, StatusCodesWithoutATextOfTheirOwnTakeTheSystems) {
    EXPECT_STREQ(strerror(B_POSIX_ETXTBSY), "Text file busy");
    EXPECT_STREQ(strerror(B_POSIX_EOPNOTSUPP), "Operation not supported");
}

TEST(ErrorsTest, UnknownCodesAreNamedByFamilyAndNumber) {
    EXPECT_STREQ(strerror(B_STORAGE_ERROR_BASE + 0x99), "Storage kit error 0x80006099");
    EXPECT_STREQ(strerror(B_ERRORS_END + 1), "Error -2147418112");
    EXPECT_STREQ(strerror(-2), "Error -2");
}

TEST(ErrorsTest, NoNamedCodeReadsAsUnknown) {
    struct Range {
        status_t first;
        int count;
    };
    const Range ranges[] = {{B_NO_MEMORY, 18},    {B_BAD_SEM_ID, 2},          {B_BAD_THREAD_ID, 5},
                            {B_BAD_PORT_ID, 2},   {B_BAD_IMAGE_ID, 5},        {B_BAD_REPLY, 19},
                            {B_NO_TRANSLATOR, 2}, {B_FILE_ERROR, 18},         {B_POSIX_E2BIG, 13},
                            {B_POSIX_EDOM, 4},    {B_POSIX_EAFNOSUPPORT, 10}, {B_POSIX_ECONNREFUSED, 13}};
    for (const Range& range : ranges) {
        for (int offset = 0; offset < range.count; offset++) {
            const std::string text = strerror(range.first + offset);
            EXPECT_EQ(text.find("0x"), std::string::npos) << text;
            EXPECT_EQ(text.find("Unknown"), std::string::npos) << text;
            EXPECT_FALSE(text.empty());
        }
    }
}

TEST(ErrorsTest, HostErrorsBecomeStatusCodes) {
    struct Case {
        int errorNumber;
        status_t code;
    };
    const Case cases[] = {
        {ENOENT, B_ENTRY_NOT_FOUND},
        {EEXIST, B_FILE_EXISTS},
        {EACCES, B_PERMISSION_DENIED},
        {EPERM, B_NOT_ALLOWED},
        {ENOSPC, B_DEVICE_FULL},
        {EROFS, B_READ_ONLY_DEVICE},
        {ENOTDIR, B_NOT_A_DIRECTORY},
        {EISDIR, B_IS_A_DIRECTORY},
        {EINVAL, B_BAD_VALUE},
        {EBADF, B_FILE_ERROR},
        {EMFILE, B_NO_MORE_FDS},
        {ENAMETOOLONG, B_NAME_TOO_LONG},
        {EXDEV, B_CROSS_DEVICE_LINK},
        {ELOOP, B_LINK_LIMIT},
        {ENOTEMPTY, B_DIRECTORY_NOT_EMPTY},
        {EAGAIN, B_WOULD_BLOCK},
        {EINTR, B_INTERRUPTED},
        {ENOMEM, B_NO_MEMORY},
        {ENOTSUP, B_UNSUPPORTED},
        {EDQUOT, B_POSIX_EDQUOT},
        {ENODATA, B_POSIX_ENODATA},
        {ERANGE, B_POSIX_ERANGE},
        {0, B_OK},
        {99999, B_ERROR},
        {B_BAD_VALUE, B_BAD_VALUE},
    };
    for (const Case& testCase : cases)
        EXPECT_EQ(status_from_errno(testCase.errorNumber), testCase.code) << testCase.errorNumber;
}
