#include "host/sqlite/index_files.h"
#include "host/api/directories.h"
#include <cerrno>
#include <cstdio>
#include <fstream>
#include <sstream>
#include <sys/stat.h>
#include <unistd.h>

namespace host {

IndexFiles::IndexFiles(const std::string& stable_key)
    : directory_(data_directory() + "/index"), database_(directory_ + "/" + stable_key + ".db"),
      list_(directory_ + "/" + stable_key + ".attributes"), slots_(directory_ + "/" + stable_key + ".slots") {
}

bool IndexFiles::exist() const {
    return access(database_.c_str(), F_OK) == 0 || access(list_.c_str(), F_OK) == 0;
}

bool IndexFiles::can_be_kept() const {
    // The directory itself is made with the first index.
    const std::string above = data_directory();
    if (!make_directories(above).ok())
        return false;
    struct stat status = {};
    const bool made = stat(directory_.c_str(), &status) == 0;
    if (made ? !S_ISDIR(status.st_mode) : errno != ENOENT)
        return false;
    if (access((made ? directory_ : above).c_str(), W_OK | X_OK) != 0)
        return false;
    for (const std::string& file : {database_, list_, slots_}) {
        const bool there = stat(file.c_str(), &status) == 0;
        if (there ? !S_ISREG(status.st_mode) || access(file.c_str(), R_OK | W_OK) != 0 : errno != ENOENT)
            return false;
    }
    return true;
}

Status IndexFiles::make_directory() const {
    return make_directories(directory_);
}

void IndexFiles::discard_database() const {
    for (const char* suffix : {"", "-wal", "-shm", "-journal"})
        unlink((database_ + suffix).c_str());
}

std::uint64_t IndexFiles::database_inode() const {
    struct stat status = {};
    return stat(database_.c_str(), &status) == 0 ? status.st_ino : 0;
}

std::int64_t IndexFiles::database_size() const {
    struct stat status = {};
    return stat(database_.c_str(), &status) == 0 ? status.st_size : 0;
}

void IndexFiles::protect() const {
    for (const char* suffix : {"", "-wal", "-shm"})
        chmod((database_ + suffix).c_str(), S_IRUSR | S_IWUSR);
}

std::vector<ListedIndex> IndexFiles::read_list() const {
    std::vector<ListedIndex> list;
    std::ifstream file(list_, std::ios::binary);
    std::string line;
    while (std::getline(file, line)) {
        std::istringstream fields(line);
        ListedIndex index;
        fields >> index.type >> index.created;
        if (fields && fields.get() == '\t' && std::getline(fields, index.attribute) &&
            !index.attribute.empty())
            list.push_back(index);
    }
    return list;
}

Status IndexFiles::write_list(const std::vector<ListedIndex>& list) const {
    const std::string temporary = list_ + "." + std::to_string(getpid());
    {
        std::ofstream file(temporary, std::ios::binary | std::ios::trunc);
        chmod(temporary.c_str(), S_IRUSR | S_IWUSR);
        for (const ListedIndex& index : list)
            file << index.type << '\t' << index.created << '\t' << index.attribute << '\n';
        if (!file.flush()) {
            unlink(temporary.c_str());
            return EIO;
        }
    }
    return std::rename(temporary.c_str(), list_.c_str()) == 0 ? Status() : Status(errno);
}

} // namespace host
