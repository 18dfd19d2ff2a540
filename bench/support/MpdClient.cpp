#include "support/MpdClient.h"

#include <array>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <sys/socket.h>
#include <sys/un.h>
#include <sys/wait.h>
#include <unistd.h>
#include <utility>

namespace bench {

MpdClient::MpdClient(std::string script, std::string folder)
    : mScript(std::move(script)), mFolder(std::move(folder)) {}

MpdClient::~MpdClient() {
    if (mConnection >= 0)
        close(mConnection);
    static_cast<void>(std::system((mScript + " stop '" + mFolder + "'").c_str()));
}

std::string MpdClient::Start(const std::string& library) {
    std::FILE* pipe =
        popen((mScript + " start '" + mFolder + "' '" + library + "' 2>/dev/null").c_str(), "r");
    if (pipe == nullptr)
        return "no shell";
    unsigned long long songs = 0;
    const bool answered = std::fscanf(pipe, "%lf %llu", &mSeconds, &songs) == 2;
    const int status = pclose(pipe);
    if (WEXITSTATUS(status) == 77)
        return "mpd is not installed (tools/install-dependencies bench)";
    if (!answered)
        return "mpd did not start";
    std::printf("(mpd knows %llu songs)\n", songs);

    mConnection = socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    std::snprintf(address.sun_path, sizeof(address.sun_path), "%s/socket", mFolder.c_str());
    std::array<char, 256> greeting{};
    if (connect(mConnection, reinterpret_cast<const sockaddr*>(&address), sizeof(address)) != 0 ||
        read(mConnection, greeting.data(), greeting.size() - 1) <= 0)
        return "mpd does not answer";
    return {};
}

std::string MpdClient::Ask(const std::string& command) {
    std::string answer;
    if (write(mConnection, command.data(), command.size()) != static_cast<ssize_t>(command.size()))
        return answer;
    std::array<char, 65536> part;
    while (answer != "OK\n" && !answer.ends_with("\nOK\n") && !answer.starts_with("ACK ")) {
        const ssize_t size = read(mConnection, part.data(), part.size());
        if (size <= 0)
            break;
        answer.append(part.data(), static_cast<std::size_t>(size));
    }
    return answer;
}

std::size_t MpdClient::CountSongs(const std::string& text) {
    const std::string answer = Ask("count \"(any contains '" + text + "')\"\n");
    const std::size_t songs = answer.find("songs: ");
    return songs == std::string::npos ? 0 : std::strtoull(answer.c_str() + songs + 7, nullptr, 10);
}

std::size_t MpdClient::SearchSongs(const std::string& text) {
    const std::string answer = Ask("search \"(any contains '" + text + "')\"\n");
    std::size_t songs = answer.starts_with("file: ") ? 1 : 0;
    for (std::size_t at = 0; (at = answer.find("\nfile: ", at)) != std::string::npos; ++at)
        ++songs;
    return songs;
}

} // namespace bench
