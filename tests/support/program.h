#pragma once

#include <string>
#include <vector>

namespace test {

/// What a program left behind.
struct ProgramResult {
    int status = -1; ///< exit status, or -1 when a signal ended it
    int signal = 0;
    std::string output;
    std::string errors;
};

/// A program of the build, or one found by its name, started with arguments, its standard input empty and its
/// two outputs kept.
class Program {
  public:
    Program(const std::string& path, const std::vector<std::string>& arguments);
    ~Program();
    Program(const Program&) = delete;
    Program& operator=(const Program&) = delete;

    /// Its process, as long as wait() and running() have not found its end.
    int process() const { return process_; }
    void signal(int number);
    /// False once it has ended.
    bool running();
    /// Waits for its end.
    ProgramResult wait();

  private:
    int process_ = -1;
    int output_ = -1;
    int errors_ = -1;
    int status_ = 0;
    bool ended_ = false;
};

/// Starts it and waits for its end.
ProgramResult run_program(const std::string& path, const std::vector<std::string>& arguments);

std::vector<std::string> lines_of(const std::string& text);

} // namespace test
