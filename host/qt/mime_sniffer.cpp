#include "host/api/mime_sniffer.h"

#include <QMimeDatabase>
#include <QMimeType>

#include <array>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <utility>
#include <vector>

namespace host {

namespace {

// The kits' names for types that the desktop's database calls otherwise: desktop's name, kits' name.
constexpr std::array<std::pair<std::string_view, std::string_view>, 1> aliases = {{
    {"audio/mpeg", "audio/x-mpeg"},
}};

QString to_qstring(std::string_view text) {
    return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

QByteArray borrow(std::span<const std::byte> data) {
    return QByteArray::fromRawData(reinterpret_cast<const char*>(data.data()),
                                   static_cast<qsizetype>(data.size()));
}

std::string kit_name(const QMimeType& type) {
    const std::string name = type.name().toStdString();
    return name.empty() ? std::string(unknown_type) : std::string(kit_type_of(name));
}

std::vector<std::byte> read_start(const std::string& path) {
    std::vector<std::byte> bytes(sniff_size);
    const int file = open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK);
    if (file < 0) {
        return {};
    }
    std::size_t filled = 0;
    while (filled < bytes.size()) {
        const ssize_t got = read(file, bytes.data() + filled, bytes.size() - filled);
        if (got <= 0) {
            break;
        }
        filled += static_cast<std::size_t>(got);
    }
    close(file);
    bytes.resize(filled);
    return bytes;
}

std::string type_of_folder(const std::string& path, dev_t device) {
    struct stat parent {};
    if (stat((path + "/..").c_str(), &parent) == 0 && parent.st_dev != device) {
        return "inode/mount-point";
    }
    return "inode/directory";
}

} // namespace

std::string type_of_file(std::string_view leaf, std::span<const std::byte> first_bytes) {
    return kit_name(QMimeDatabase().mimeTypeForFileNameAndData(to_qstring(leaf), borrow(first_bytes)));
}

std::string type_of_path(const std::string& path) {
    struct stat found {};
    if (path.find('\0') != std::string::npos || stat(path.c_str(), &found) != 0) {
        return {};
    }
    switch (found.st_mode & S_IFMT) {
    case S_IFDIR:
        return type_of_folder(path, found.st_dev);
    case S_IFCHR:
        return "inode/chardevice";
    case S_IFBLK:
        return "inode/blockdevice";
    case S_IFIFO:
        return "inode/fifo";
    case S_IFSOCK:
        return "inode/socket";
    default:
        break;
    }
    const std::size_t slash = path.rfind('/');
    const QString leaf =
        to_qstring(std::string_view(path).substr(slash == std::string::npos ? 0 : slash + 1));
    const QMimeDatabase database;
    if (const QList<QMimeType> named = database.mimeTypesForFileName(leaf); named.size() == 1) {
        return kit_name(named.front());
    }
    const std::vector<std::byte> bytes = read_start(path);
    return kit_name(database.mimeTypeForFileNameAndData(leaf, borrow(bytes)));
}

std::string type_of_name(std::string_view leaf) {
    return kit_name(QMimeDatabase().mimeTypeForFile(to_qstring(leaf), QMimeDatabase::MatchExtension));
}

std::string type_of_data(std::span<const std::byte> first_bytes) {
    return kit_name(QMimeDatabase().mimeTypeForData(borrow(first_bytes)));
}

std::string_view kit_type_of(std::string_view desktop_type) {
    for (const auto& [desktop, kit] : aliases) {
        if (desktop_type == desktop) {
            return kit;
        }
    }
    return desktop_type;
}

std::string_view desktop_type_of(std::string_view kit_type) {
    for (const auto& [desktop, kit] : aliases) {
        if (kit_type == kit) {
            return desktop;
        }
    }
    return kit_type;
}

std::string describe_type(std::string_view type) {
    const QMimeType found = QMimeDatabase().mimeTypeForName(to_qstring(desktop_type_of(type)));
    return found.isValid() ? found.comment().toStdString() : std::string();
}

} // namespace host
