// Starting tests' applications in processes of their own.
#pragma once

#include "support/program.h"
#include "support/temporary_environment.h"

#include <Messenger.h>
#include <OS.h>
#include <Roster.h>

#include <algorithm>
#include <filesystem>
#include <functional>
#include <gtest/gtest.h>
#include <string>
#include <unistd.h>
#include <vector>

namespace test {

// Generous: only a failing test waits for it.
inline bool Eventually(const std::function<bool()>& condition) {
    for (int round = 0; round < 1500; round++) {
        if (condition())
            return true;
        snooze(10'000);
    }
    return false;
}

// A process that runs TestPeer.cpp, from when its signature is found until the end of this object.
class PeerProgram {
  public:
    explicit PeerProgram(const char* signature, const std::vector<std::string>& arguments = {})
        : mProgram(TEST_PEER, arguments) {
        EXPECT_TRUE(Eventually([&] { return be_roster->IsRunning(signature); }));
        mMessenger = BMessenger(signature);
    }

    const BMessenger& Messenger() const { return mMessenger; }
    team_id Team() const { return mMessenger.Team(); }
    Program& Process() { return mProgram; }

  private:
    Program mProgram;
    BMessenger mMessenger;
};

// Gives each test surroundings of its own, with the peers' log in them.
class PeerTest : public testing::Test {
  protected:
    explicit PeerTest(const char* signature) {
        mEnvironment.set("TEST_PEER_LOG", LogPath());
        mEnvironment.set("TEST_PEER_SIGNATURE", signature);
    }
    // Peers that were launched are nobody's to stop but these tests'.
    ~PeerTest() override {
        BList teams;
        be_roster->GetAppList(&teams);
        for (int32 index = 0; index < teams.CountItems(); index++) {
            const team_id team = static_cast<team_id>(reinterpret_cast<intptr_t>(teams.ItemAt(index)));
            if (team == getpid())
                continue;
            BMessenger(nullptr, team).SendMessage(B_QUIT_REQUESTED);
            Eventually([team] { return !BMessenger(nullptr, team).IsValid(); });
        }
    }

    // Writes the record by which launching finds the peer. `launch` as in docs/applications.md.
    void Install(const std::string& signature, const std::string& launch, const std::string& more = {},
                 const std::string& executable = TEST_PEER) {
        const std::string directory = mEnvironment.home() + "/.local/share/bekits/applications";
        std::filesystem::create_directories(directory);
        std::string leaf = signature + ".app";
        std::transform(leaf.begin(), leaf.end(), leaf.begin(), [](unsigned char letter) {
            return letter == '/' ? ',' : static_cast<char>(std::tolower(letter));
        });
        write_file(directory + "/" + leaf, "[Application]\nSignature=" + signature + "\nExecutable=" +
                                               executable + "\nLaunch=" + launch + "\n" + more);
    }

    std::string LogPath() const { return mEnvironment.root() + "/log"; }
    // What the peers have logged, without their process numbers.
    std::vector<std::string> Logged() const {
        std::vector<std::string> texts;
        for (const std::string& line : lines_of(read_file(LogPath())))
            texts.push_back(line.substr(line.find(' ') + 1));
        return texts;
    }
    bool HasLogged(const std::string& text) const {
        const std::vector<std::string> texts = Logged();
        return std::find(texts.begin(), texts.end(), text) != texts.end();
    }

    TemporaryEnvironment mEnvironment;
};

} // namespace test
