#include "data_directories.h"

#include "host/api/directories.h"
#include <cstdlib>
#include <string_view>

namespace host {

namespace {

// "…/bekits" is how the kits' own directory is called there.
std::string above(const std::string& path) {
    return path.substr(0, path.rfind('/'));
}

std::vector<std::string> with_system(const std::string& own, const char* variable, const char* usual) {
    std::vector<std::string> all = {own};
    const char* value = std::getenv(variable);
    const std::vector<std::string> system =
        directories_of(value != nullptr && value[0] != '\0' ? value : usual);
    all.insert(all.end(), system.begin(), system.end());
    return all;
}

} // namespace

std::vector<std::string> directories_of(const char* list) {
    std::vector<std::string> directories;
    std::string_view rest = list;
    while (!rest.empty()) {
        const std::size_t end = rest.find(':');
        std::string_view directory = rest.substr(0, end);
        rest.remove_prefix(end == std::string_view::npos ? rest.size() : end + 1);
        while (directory.size() > 1 && directory.back() == '/')
            directory.remove_suffix(1);
        if (!directory.empty() && directory.front() == '/')
            directories.emplace_back(directory);
    }
    return directories;
}

std::vector<std::string> data_directories() {
    return with_system(above(data_directory()), "XDG_DATA_DIRS", "/usr/local/share:/usr/share");
}

std::vector<std::string> config_directories() {
    return with_system(above(config_directory()), "XDG_CONFIG_DIRS", "/etc/xdg");
}

} // namespace host
