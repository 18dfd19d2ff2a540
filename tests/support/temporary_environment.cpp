#include "support/temporary_environment.h"

#include <climits>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

namespace test {

namespace {

bool holds_attributes(const std::string& directory) {
    return ::setxattr(directory.c_str(), "user.quirnel.test", "1", 1, 0) == 0 &&
           ::removexattr(directory.c_str(), "user.quirnel.test") == 0;
}

std::string make_below(const char* base) {
    if (base == nullptr || base[0] == '\0')
        return {};
    char resolved[PATH_MAX];
    if (::realpath(base, resolved) == nullptr)
        return {};
    std::string pattern = std::string(resolved) + "/quirnel-test-XXXXXX";
    if (::mkdtemp(pattern.data()) == nullptr)
        return {};
    if (holds_attributes(pattern))
        return pattern;
    ::rmdir(pattern.c_str());
    return {};
}

} // namespace

std::string make_directory_with_attributes() {
    for (const char* base : {static_cast<const char*>(std::getenv("QUIRNEL_TEST_DIR")),
                             static_cast<const char*>(std::getenv("TMPDIR")), "/tmp", "/var/tmp", "."}) {
        const std::string directory = make_below(base);
        if (!directory.empty())
            return directory;
    }
    std::fprintf(stderr, "no directory that holds user attributes; set QUIRNEL_TEST_DIR to one\n");
    std::exit(2);
}

void remove_tree(const std::string& path) {
    std::error_code ignored;
    std::filesystem::remove_all(path, ignored);
}

void write_file(const std::string& path, const std::string& content) {
    std::ofstream(path, std::ios::binary | std::ios::trunc) << content;
}

std::string read_file(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

TemporaryEnvironment::TemporaryEnvironment(DeclaredVolume declared)
    : root_(make_directory_with_attributes()) {
    ::mkdir(home().c_str(), 0700);
    ::mkdir(volume().c_str(), 0755);
    ::mkdir((root_ + "/runtime").c_str(), 0700);
    ::mkdir((root_ + "/temporary").c_str(), 0700);
    set("HOME", home());
    set("XDG_CONFIG_HOME", home() + "/.config");
    set("XDG_DATA_HOME", home() + "/.local/share");
    set("XDG_CACHE_HOME", home() + "/.cache");
    set("XDG_RUNTIME_DIR", root_ + "/runtime");
    set("TMPDIR", root_ + "/temporary");
    if (declared == DeclaredVolume::one)
        declare_volumes(volume());
    else
        unset("BEKITS_VOLUMES");
}

TemporaryEnvironment::~TemporaryEnvironment() {
    for (const auto& [name, value] : kept_) {
        if (value)
            ::setenv(name.c_str(), value->c_str(), 1);
        else
            ::unsetenv(name.c_str());
    }
    remove_tree(root_);
}

void TemporaryEnvironment::keep(const std::string& name) {
    const char* value = std::getenv(name.c_str());
    kept_.try_emplace(name, value == nullptr ? std::nullopt : std::optional<std::string>(value));
}

void TemporaryEnvironment::set(const std::string& name, const std::string& value) {
    keep(name);
    ::setenv(name.c_str(), value.c_str(), 1);
}

void TemporaryEnvironment::unset(const std::string& name) {
    keep(name);
    ::unsetenv(name.c_str());
}

} // namespace test
