#pragma once

#include <string>

namespace bench {

/// A Music Player Daemon of the benchmark's own, started and stopped by bench/peers/mpd, and one connection
/// to it.
class MpdClient {
  public:
    MpdClient(std::string script, std::string folder);
    ~MpdClient();
    MpdClient(const MpdClient&) = delete;
    MpdClient& operator=(const MpdClient&) = delete;

    /// Starts it on the library and waits for its first update. An empty text, or why there is none.
    std::string Start(const std::string& library);
    double FirstUpdateSeconds() const { return mSeconds; }

    /// The answer to count "(any contains 'TEXT')" over the connection; TEXT without quotes and backslashes.
    std::size_t CountSongs(const std::string& text);
    /// The same by search, which answers with all that is known of each song.
    std::size_t SearchSongs(const std::string& text);

  private:
    /// The answer to a command with its newline, whole, or what came before the connection broke.
    std::string Ask(const std::string& command);

    const std::string mScript;
    const std::string mFolder;
    double mSeconds = 0;
    int mConnection = -1;
};

} // namespace bench
