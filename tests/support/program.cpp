#include "support/program.h"

#include <array>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <sstream>
#include <sys/wait.h>
#include <unistd.h>

namespace test {
namespace {

/// A file without a name: outputs of any size, without a pipe that could fill up.
int nameless_file() {
    std::string pattern =
        (std::getenv("TMPDIR") ? std::string(std::getenv("TMPDIR")) : "/tmp") + "/output.XXXXXX";
    const int file = mkostemp(pattern.data(), O_CLOEXEC);
    unlink(pattern.c_str());
    return file;
}

std::string content_of(int file) {
    std::string text;
    std::array<char, 4096> part{};
    off_t at = 0;
    for (ssize_t size; (size = pread(file, part.data(), part.size(), at)) > 0; at += size)
        text.append(part.data(), static_cast<size_t>(size));
    return text;
}

} // namespace

Program::Program(const std::string& path, const std::vector<std::string>& arguments)
    : output_(nameless_file()), errors_(nameless_file()) {
    std::vector<char*> words = {const_cast<char*>(path.c_str())};
    for (const std::string& argument : arguments)
        words.push_back(const_cast<char*>(argument.c_str()));
    words.push_back(nullptr);
    process_ = fork();
    if (process_ == 0) {
        const int nothing = open("/dev/null", O_RDONLY | O_CLOEXEC);
        dup2(nothing, STDIN_FILENO);
        dup2(output_, STDOUT_FILENO);
        dup2(errors_, STDERR_FILENO);
        execvp(path.c_str(), words.data());
        _exit(127);
    }
}

Program::~Program() {
    if (!ended_ && process_ > 0) {
        kill(process_, SIGKILL);
        waitpid(process_, &status_, 0);
    }
    close(output_);
    close(errors_);
}

void Program::signal(int number) {
    if (!ended_)
        kill(process_, number);
}

bool Program::running() {
    if (!ended_)
        ended_ = waitpid(process_, &status_, WNOHANG) == process_;
    return !ended_;
}

ProgramResult Program::wait() {
    if (!ended_) {
        waitpid(process_, &status_, 0);
        ended_ = true;
    }
    ProgramResult result;
    result.status = WIFEXITED(status_) ? WEXITSTATUS(status_) : -1;
    result.signal = WIFSIGNALED(status_) ? WTERMSIG(status_) : 0;
    result.output = content_of(output_);
    result.errors = content_of(errors_);
    return result;
}

ProgramResult run_program(const std::string& path, const std::vector<std::string>& arguments) {
    return Program(path, arguments).wait();
}

std::vector<std::string> lines_of(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);)
        lines.push_back(line);
    return lines;
}

} // namespace test
