#include "host/api/application_records.h"

#include "data_directories.h"
#include "host/api/processes.h"
#include "key_file.h"
#include <climits>

#include <algorithm>
#include <cctype>
#include <dirent.h>
#include <memory>
#include <optional>
#include <string_view>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace host {

namespace {

constexpr const char* group = "Application";
constexpr std::string_view suffix = ".app";
// Where records lie in a data directory, and a data directory below its prefix.
constexpr const char* records_directory = "/bekits/applications/";
constexpr const char* data_below_prefix = "/share";
// From the program's own directory upwards: build trees have it some levels up.
constexpr int most_prefixes = 6;

std::string file_name(const std::string& signature) {
    std::string name = signature;
    std::transform(name.begin(), name.end(), name.begin(), [](unsigned char letter) {
        return letter == '/' ? ',' : static_cast<char>(std::tolower(letter));
    });
    return name + std::string(suffix);
}

std::string parent(const std::string& path) {
    const std::size_t slash = path.rfind('/');
    return slash == std::string::npos ? std::string() : path.substr(0, slash);
}

std::vector<std::string> record_directories() {
    std::vector<std::string> data = data_directories();
    std::vector<std::string> directories = {data.front()};
    std::string prefix = parent(executable_path());
    for (int level = 0; level < most_prefixes && !prefix.empty(); ++level, prefix = parent(prefix))
        directories.push_back(prefix + data_below_prefix);
    directories.insert(directories.end(), data.begin() + 1, data.end());
    return directories;
}

std::optional<ApplicationRecord> read_record(const std::string& data_directory, const std::string& leaf) {
    const std::optional<KeyFile> file = KeyFile::read(data_directory + records_directory + leaf);
    if (!file)
        return std::nullopt;
    ApplicationRecord record;
    record.signature = file->text(group, "Signature");
    record.executable = file->text(group, "Executable");
    // A file that was renamed, or damaged.
    if (file_name(record.signature) != leaf || record.executable.empty())
        return std::nullopt;
    if (record.executable.front() != '/')
        record.executable = parent(data_directory) + "/" + record.executable;
    const std::string launch = file->raw(group, "Launch");
    if (launch == "single")
        record.instances = Instances::one_per_executable;
    else if (launch == "exclusive")
        record.instances = Instances::one_per_signature;
    record.background = file->flag(group, "Background");
    record.arguments_only = file->flag(group, "ArgumentsOnly");
    return record;
}

bool is_same_file(const std::string& a, const std::string& b) {
    struct stat status_of_a = {};
    struct stat status_of_b = {};
    return ::stat(a.c_str(), &status_of_a) == 0 && ::stat(b.c_str(), &status_of_b) == 0 &&
           status_of_a.st_dev == status_of_b.st_dev && status_of_a.st_ino == status_of_b.st_ino;
}

bool can_run(const std::string& path) {
    struct stat status = {};
    return ::stat(path.c_str(), &status) == 0 && S_ISREG(status.st_mode) && ::access(path.c_str(), X_OK) == 0;
}

} // namespace

Result<ApplicationRecord> find_application_record(const std::string& signature) {
    std::optional<ApplicationRecord> first;
    if (signature.size() > NAME_MAX - suffix.size())
        return Status(ENOENT);
    for (const std::string& directory : record_directories()) {
        std::optional<ApplicationRecord> record = read_record(directory, file_name(signature));
        if (!record)
            continue;
        if (can_run(record->executable))
            return *std::move(record);
        if (!first)
            first = std::move(record);
    }
    if (first)
        return *std::move(first);
    return Status(ENOENT);
}

Result<ApplicationRecord> find_application_record_of(const std::string& executable) {
    for (const std::string& directory : record_directories()) {
        const std::string path = directory + records_directory;
        const std::unique_ptr<DIR, int (*)(DIR*)> stream(::opendir(path.c_str()), ::closedir);
        while (const dirent* entry = stream != nullptr ? ::readdir(stream.get()) : nullptr) {
            const std::string leaf = entry->d_name;
            std::optional<ApplicationRecord> record =
                leaf.ends_with(suffix) ? read_record(directory, leaf) : std::nullopt;
            if (record && is_same_file(record->executable, executable))
                return *std::move(record);
        }
    }
    return Status(ENOENT);
}

} // namespace host
