#include "key_file.h"

#include "descriptor.h"
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace host {

namespace {

constexpr off_t largest_file = off_t{1} << 20;

std::string_view without_blanks(std::string_view text) {
    constexpr std::string_view blanks = " \t\r";
    const std::size_t first = text.find_first_not_of(blanks);
    if (first == std::string_view::npos)
        return {};
    return text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

} // namespace

KeyFile::KeyFile(std::string_view text) {
    std::map<std::string, std::string>* group = nullptr;
    while (!text.empty()) {
        const std::size_t end = text.find('\n');
        const std::string_view line = without_blanks(text.substr(0, end));
        text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
        if (line.size() > 2 && line.front() == '[' && line.back() == ']') {
            group = &groups_[std::string(line.substr(1, line.size() - 2))];
            continue;
        }
        const std::size_t equals = line.find('=');
        if (group == nullptr || line.empty() || line.front() == '#' || equals == std::string_view::npos)
            continue;
        group->emplace(without_blanks(line.substr(0, equals)), without_blanks(line.substr(equals + 1)));
    }
}

std::optional<KeyFile> KeyFile::read(const std::string& path) {
    // Not to wait for whoever writes into a pipe that stands in the file's place.
    const Descriptor file(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
    struct stat status = {};
    if (!file.valid() || ::fstat(file.get(), &status) != 0 || !S_ISREG(status.st_mode) ||
        status.st_size > largest_file)
        return std::nullopt;
    std::string text(static_cast<std::size_t>(status.st_size), '\0');
    std::size_t filled = 0;
    while (filled < text.size()) {
        const ssize_t count = ::read(file.get(), text.data() + filled, text.size() - filled);
        if (count < 0)
            return std::nullopt;
        if (count == 0)
            break;
        filled += static_cast<std::size_t>(count);
    }
    text.resize(filled);
    return KeyFile(text);
}

std::string KeyFile::raw(const std::string& group, const std::string& key) const {
    const auto found = groups_.find(group);
    if (found == groups_.end())
        return {};
    const auto value = found->second.find(key);
    return value != found->second.end() ? value->second : std::string();
}

std::string KeyFile::text(const std::string& group, const std::string& key) const {
    const std::string value = raw(group, key);
    std::string text;
    for (std::size_t at = 0; at < value.size(); ++at) {
        if (value[at] != '\\' || at + 1 == value.size()) {
            text += value[at];
            continue;
        }
        switch (value[++at]) {
        case 's':
            text += ' ';
            break;
        case 'n':
            text += '\n';
            break;
        case 't':
            text += '\t';
            break;
        case 'r':
            text += '\r';
            break;
        case '\\':
            text += '\\';
            break;
        default:
            // Other escapes are for whoever reads the value on.
            text += '\\';
            text += value[at];
        }
    }
    return text;
}

bool KeyFile::flag(const std::string& group, const std::string& key) const {
    return raw(group, key) == "true";
}

bool KeyFile::has_group(const std::string& group) const {
    return groups_.count(group) != 0;
}

} // namespace host
