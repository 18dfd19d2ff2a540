#include "team_file.h"

#include <algorithm>
#include <charconv>

namespace host {

namespace {

constexpr std::string_view first_line = "bekits-application 1";
constexpr std::string_view last_line = "end";
constexpr std::size_t thread_digits = 10;

std::string escaped(std::string_view value) {
    std::string text;
    for (const char byte : value) {
        if (byte == '\n')
            text += "\\n";
        else if (byte == '\\')
            text += "\\\\";
        else
            text += byte;
    }
    return text;
}

std::string unescaped(std::string_view text) {
    std::string value;
    for (std::size_t at = 0; at < text.size(); ++at) {
        if (text[at] == '\\' && at + 1 < text.size())
            value += text[++at] == 'n' ? '\n' : text[at];
        else
            value += text[at];
    }
    return value;
}

template <typename Number>
bool read_number(std::string_view text, Number& number) {
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    return error == std::errc() && end == text.data() + text.size();
}

// False for a value that is none of its key's.
bool set_value(RunningApplication& application, std::string_view key, std::string_view value) {
    if (key == "process")
        return read_number(value, application.process);
    if (key == "flags")
        return read_number(value, application.flags);
    if (key == "token")
        return read_number(value, application.token);
    if (key == "thread")
        return read_number(value, application.thread);
    if (key == "began")
        return read_number(value, application.began);
    if (key == "signature")
        application.signature = unescaped(value);
    if (key == "executable")
        application.executable = unescaped(value);
    return true;
}

} // namespace

std::string team_file_text(const RunningApplication& application) {
    std::string text(first_line);
    const auto line = [&text](const char* key, const std::string& value) {
        text += std::string("\n") + key + " " + value;
    };
    line("process", std::to_string(application.process));
    line("signature", escaped(application.signature));
    line("executable", escaped(application.executable));
    line("flags", std::to_string(application.flags));
    line("token", std::to_string(application.token));
    // Written later than the rest, over what stood there: of a fixed width, so that nothing else moves.
    std::string thread = std::to_string(std::max(application.thread, 0));
    thread.insert(0, thread_digits - thread.size(), '0');
    line("thread", thread);
    line("began", std::to_string(application.began));
    return text + "\n" + std::string(last_line) + "\n";
}

std::optional<RunningApplication> read_team_file(std::string_view text) {
    RunningApplication application;
    bool begun = false;
    for (;;) {
        const std::size_t end = text.find('\n');
        if (end == std::string_view::npos)
            return std::nullopt;
        const std::string_view line = text.substr(0, end);
        text.remove_prefix(end + 1);
        if (!begun) {
            if (line != first_line)
                return std::nullopt;
            begun = true;
            continue;
        }
        if (line == last_line)
            return !application.signature.empty() ? std::optional(application) : std::nullopt;
        const std::size_t blank = line.find(' ');
        if (blank == std::string_view::npos ||
            !set_value(application, line.substr(0, blank), line.substr(blank + 1)))
            return std::nullopt;
    }
}

} // namespace host
