#include "AppFiles.h"

#include "host/api/directories.h"
#include "host/api/file_system.h"
#include <Message.h>

#include <algorithm>
#include <cctype>
#include <cstring>

namespace {

constexpr const char* kTypeAttribute = "Node:Type";
constexpr const char* kPreferredAppAttribute = "Node:PreferredApp";
constexpr const char* kPreferredAppField = "preferred application";
constexpr const char* kApplicationPathField = "application path";
// A MIME record is small; anything larger is none.
constexpr std::int64_t kLargestRecord = 4 * 1024 * 1024;
constexpr size_t kLongestType = 256;

host::EntryRef HostRef(const entry_ref& ref) {
    return {ref.device, ref.directory, ref.name != nullptr ? ref.name : ""};
}

// One text of a type's record, read without a lock: a record is replaced whole.
std::string TextOfRecord(const std::string& type, const char* field) {
    std::string name = type;
    std::transform(name.begin(), name.end(), name.begin(), [](unsigned char letter) {
        return letter == '/' ? ',' : static_cast<char>(std::tolower(letter));
    });
    const auto ref =
        host::file_system().entry_of(host::config_directory() + "/mime/" + name + ".mime", host::Follow::no);
    if (!ref)
        return {};
    const auto node = host::file_system().open(*ref, host::OpenOptions());
    const auto stat = node ? (*node)->stat() : node.status();
    if (!stat || stat->kind != host::NodeKind::file || stat->size > kLargestRecord)
        return {};
    std::vector<char> bytes(static_cast<size_t>(stat->size));
    const auto count = (*node)->read_at(0, bytes.data(), bytes.size());
    BMessage record;
    if (!count || record.Unflatten(bytes.data(), *count) != B_OK)
        return {};
    return record.GetString(field, "");
}

std::string TextOfAttribute(const entry_ref& ref, const char* attribute) {
    const auto node = host::file_system().open(HostRef(ref), host::OpenOptions());
    char text[kLongestType] = {};
    if (!node || !(*node)->read_attribute(attribute, 0, text, sizeof(text) - 1))
        return {};
    return text;
}

} // namespace

std::string path_of_ref(const entry_ref& ref) {
    const auto path = host::file_system().path_of(HostRef(ref));
    if (!path)
        return {};
    const auto target = host::file_system().entry_of(*path, host::Follow::yes);
    if (!target || !host::file_system().stat(*target))
        return {};
    const auto resolved = host::file_system().path_of(*target);
    return resolved ? *resolved : std::string();
}

bool ref_of_path(const std::string& path, entry_ref* ref) {
    const auto found = host::file_system().entry_of(path, host::Follow::yes);
    if (!found || !host::file_system().stat(*found))
        return false;
    *ref = entry_ref(static_cast<dev_t>(found->device), static_cast<ino_t>(found->directory),
                     found->leaf.c_str());
    return true;
}

std::string preferred_app_of_type(const std::string& type) {
    std::string app = TextOfRecord(type, kPreferredAppField);
    return !app.empty() ? app : TextOfRecord(type.substr(0, type.find('/')), kPreferredAppField);
}

std::string application_path_of_type(const std::string& type) {
    return TextOfRecord(type, kApplicationPathField);
}

std::string preferred_app_of_file(const entry_ref& ref) {
    return TextOfAttribute(ref, kPreferredAppAttribute);
}

std::string own_type_of_file(const entry_ref& ref) {
    return TextOfAttribute(ref, kTypeAttribute);
}

bool is_program(const std::string& path) {
    constexpr char kMagic[4] = {0x7f, 'E', 'L', 'F'};
    const auto ref = host::file_system().entry_of(path, host::Follow::yes);
    const auto stat = ref ? host::file_system().stat(*ref) : host::Result<host::NodeStat>(ref.status());
    if (!stat || stat->kind != host::NodeKind::file || (stat->mode & 0111) == 0)
        return false;
    const auto node = host::file_system().open(*ref, host::OpenOptions());
    char first[sizeof(kMagic)] = {};
    const auto count =
        node ? (*node)->read_at(0, first, sizeof(first)) : host::Result<std::size_t>(node.status());
    return count && *count == sizeof(first) && std::memcmp(first, kMagic, sizeof(kMagic)) == 0;
}
