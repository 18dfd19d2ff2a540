#pragma once

#include <cstdio>
#include <string>
#include <unistd.h>

/// One line on a terminal, written over itself; nothing where standard error is no terminal.
class ProgressLine {
  public:
    ~ProgressLine() { Clear(); }
    void Show(const std::string& text) {
        if (!mIsTerminal || text == mShown)
            return;
        std::fprintf(stderr, "\r\033[K%s", text.c_str());
        mShown = text;
    }
    void Clear() {
        if (!mShown.empty())
            std::fputs("\r\033[K", stderr);
        mShown.clear();
    }

  private:
    bool mIsTerminal = isatty(STDERR_FILENO) == 1;
    std::string mShown;
};
