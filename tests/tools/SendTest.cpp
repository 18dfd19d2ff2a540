// quirnelctl send: a message code for a program in another process.
#include "support/program.h"
#include "support/temporary_environment.h"

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <gtest/gtest.h>
#include <memory>
#include <thread>

namespace {

constexpr const char* kQuirnel = "application/x-vnd.vorn-quirnel";
constexpr const char* kOther = "application/x-vnd.Test-Other";

class SendTest : public testing::Test {
  protected:
    SendTest() { environment_.set("TEST_PEER_LOG", environment_.root() + "/log"); }

    /// A program that stands in for the one of that signature.
    std::unique_ptr<test::Program> start(const char* signature) {
        environment_.set("TEST_PEER_SIGNATURE", signature);
        auto program = std::make_unique<test::Program>(TEST_PEER, std::vector<std::string>{});
        EXPECT_TRUE(logs("ready"));
        return program;
    }
    void install(const std::string& signature, std::string leaf) {
        const std::string directory = environment_.home() + "/.local/share/bekits/applications";
        std::filesystem::create_directories(directory);
        test::write_file(directory + "/" + leaf, "[Application]\nSignature=" + signature +
                                                     "\nExecutable=" + TEST_PEER + "\nLaunch=exclusive\n");
    }
    bool logs(const std::string& text) {
        for (int round = 0; round < 1000; ++round) {
            if (test::read_file(environment_.root() + "/log").find(text + "\n") != std::string::npos)
                return true;
            std::this_thread::sleep_for(std::chrono::milliseconds(20));
        }
        return false;
    }
    static test::ProgramResult send(std::vector<std::string> arguments) {
        arguments.insert(arguments.begin(), "send");
        return test::run_program(QUIRNELCTL, arguments);
    }
    static void expect_failure(const test::ProgramResult& result, const std::string& line) {
        EXPECT_EQ(result.status, 1);
        EXPECT_EQ(result.output, "");
        EXPECT_EQ(result.errors, line);
    }

    test::TemporaryEnvironment environment_;
};

} // namespace

TEST_F(SendTest, ACodeReachesTheRunningProgram) {
    const auto quirnel = start(kQuirnel);
    const auto other = start(kOther);
    EXPECT_EQ(send({"103"}).status, 0);
    EXPECT_TRUE(logs("code 103"));
    EXPECT_EQ(send({"'ABCD'", "--to", kOther}).status, 0);
    EXPECT_TRUE(logs("code 1094861636"));
    // The request to quit, by its letters.
    EXPECT_EQ(send({"_QRQ", "--to", kOther}).status, 0);
    EXPECT_EQ(other->wait().status, 0);
    EXPECT_TRUE(quirnel->running());
}

TEST_F(SendTest, JsonTellsWhoGotWhat) {
    const auto quirnel = start(kQuirnel);
    const test::ProgramResult result = send({"--json", "103"});
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.output.find("{\"to\":\"application/x-vnd.vorn-quirnel\",\"team\":"), 0u)
        << result.output;
    EXPECT_NE(result.output.find(",\"what\":103,\"launched\":false}\n"), std::string::npos) << result.output;
}

TEST_F(SendTest, AProgramThatDoesNotRunIsAnErrorAndNotStarted) {
    install(kQuirnel, "application,x-vnd.vorn-quirnel.app");
    expect_failure(send({"103"}), "quirnelctl: application/x-vnd.vorn-quirnel is not running\n");
    expect_failure(send({"103", "--to", kOther}),
                   "quirnelctl: application/x-vnd.Test-Other is not running\n");
    EXPECT_EQ(test::read_file(environment_.root() + "/log"), "");
}

TEST_F(SendTest, WithLaunchItIsStartedFirst) {
    install(kQuirnel, "application,x-vnd.vorn-quirnel.app");
    environment_.set("TEST_PEER_SIGNATURE", kQuirnel);
    const test::ProgramResult first = send({"--launch", "--json", "105"});
    EXPECT_EQ(first.status, 0) << first.errors;
    EXPECT_NE(first.output.find("\"launched\":true"), std::string::npos) << first.output;
    EXPECT_TRUE(logs("code 105"));
    // The code comes when the program is ready.
    const std::string log = test::read_file(environment_.root() + "/log");
    EXPECT_LT(log.find("ready"), log.find("code 105"));
    EXPECT_EQ(send({"--launch", "107"}).status, 0);
    EXPECT_TRUE(logs("code 107"));
    EXPECT_EQ(send({"_QRQ"}).status, 0);
    EXPECT_TRUE(logs("ended"));
}

TEST_F(SendTest, WhatIsNotInstalledCannotBeLaunched) {
    expect_failure(send({"--launch", "103", "--to", kOther}),
                   "quirnelctl: application/x-vnd.Test-Other is not installed\n");
}

TEST_F(SendTest, WrongArgumentsAreSaid) {
    expect_failure(send({}), "quirnelctl: send takes one message code, such as 103 or 'ABCD'\n");
    expect_failure(send({"1", "2"}), "quirnelctl: send takes one message code, such as 103 or 'ABCD'\n");
    expect_failure(send({"ABCDE"}),
                   "quirnelctl: no message code: ABCDE; give a decimal number or four letters\n");
    expect_failure(send({"4294967296"}),
                   "quirnelctl: no message code: 4294967296; give a decimal number or four letters\n");
    expect_failure(send({"103", "--to"}), "quirnelctl: --to wants the signature of a program\n");
}
