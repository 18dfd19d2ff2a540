#pragma once

#include <cstdio>
#include <cstdlib>
#include <string>
#include <unistd.h>

/// Catches what the process writes to standard output, byte for byte, from construction to text() or
/// destruction. One at a time.
class CapturedOutput {
  public:
    CapturedOutput() : file_(std::tmpfile()) {
        if (!file_)
            std::abort();
        std::fflush(stdout);
        saved_ = dup(STDOUT_FILENO);
        dup2(fileno(file_), STDOUT_FILENO);
    }
    ~CapturedOutput() {
        release();
        std::fclose(file_);
    }
    CapturedOutput(const CapturedOutput&) = delete;
    CapturedOutput& operator=(const CapturedOutput&) = delete;

    /// Ends the capture and answers what was written.
    std::string text() {
        release();
        std::string written;
        std::rewind(file_);
        char part[4096];
        for (size_t count; (count = std::fread(part, 1, sizeof(part), file_)) > 0;)
            written.append(part, count);
        return written;
    }

  private:
    void release() {
        if (saved_ < 0)
            return;
        std::fflush(stdout);
        dup2(saved_, STDOUT_FILENO);
        close(saved_);
        saved_ = -1;
    }

    std::FILE* file_;
    int saved_ = -1;
};
