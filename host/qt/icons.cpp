#include "host/api/icons.h"

#include "host/api/image_decoder.h"
#include "host/api/mime_sniffer.h"
#include "host/api/raster.h"
#include "host/api/thread_safety.h"
#include "icon_theme.h"

#include <QMimeDatabase>
#include <QMimeType>

#include <algorithm>
#include <fstream>
#include <map>
#include <optional>
#include <string>

namespace host {

namespace {

constexpr std::size_t max_icon_file_size = std::size_t{4} << 20;
constexpr std::size_t max_cached_icons = 1024;

std::vector<std::string> theme_names(std::string_view mime_type) {
    if (mime_type == "inode/directory") {
        return {"folder", "inode-directory"};
    }
    if (mime_type == "inode/mount-point") {
        return {"drive-harddisk", "drive-removable-media", "inode-mount-point"};
    }
    std::vector<std::string> names;
    const std::string desktop_type(desktop_type_of(mime_type));
    const QMimeType known = QMimeDatabase().mimeTypeForName(QString::fromStdString(desktop_type));
    if (known.isValid()) {
        names.push_back(known.iconName().toStdString());
        names.push_back(known.genericIconName().toStdString());
    }
    std::string dashed = desktop_type;
    std::replace(dashed.begin(), dashed.end(), '/', '-');
    names.push_back(dashed);
    if (const std::size_t slash = desktop_type.find('/'); slash != std::string::npos) {
        names.push_back(desktop_type.substr(0, slash) + "-x-generic");
    }
    names.emplace_back("unknown");
    return names;
}

std::vector<std::byte> read_file(const std::string& path) {
    std::ifstream in(path, std::ios::binary | std::ios::ate);
    const std::streamoff size = in ? static_cast<std::streamoff>(in.tellg()) : -1;
    if (size <= 0 || static_cast<std::size_t>(size) > max_icon_file_size) {
        return {};
    }
    std::vector<std::byte> bytes(static_cast<std::size_t>(size));
    in.seekg(0);
    in.read(reinterpret_cast<char*>(bytes.data()), static_cast<std::streamsize>(size));
    return in ? bytes : std::vector<std::byte>();
}

std::optional<IconPixels> load_icon(const std::string& path, int size) {
    const DecodedImage image = decode_image(read_file(path));
    if (image.status != ImageStatus::ok) {
        return std::nullopt;
    }
    IconPixels icon;
    icon.size = size;
    icon.from_theme = true;
    icon.pixels.resize(static_cast<std::size_t>(size) * static_cast<std::size_t>(size));
    const PixelView source{image.pixels.data(), image.width, image.height,
                           static_cast<std::size_t>(image.width)};
    const MutablePixelView target{icon.pixels.data(), size, size, static_cast<std::size_t>(size)};
    if (image.width == size && image.height == size) {
        icon.pixels = image.pixels;
    } else if (!scale_smoothly(source, target)) {
        return std::nullopt;
    }
    return icon;
}

// The icons of this process, each made once.
class IconCache {
  public:
    std::shared_ptr<const IconPixels> get(const std::string& mime_type, int size) {
        const MutexLock lock(mutex_);
        const std::pair key(mime_type, size);
        if (const auto found = icons_.find(key); found != icons_.end()) {
            return found->second;
        }
        if (icons_.size() >= max_cached_icons) {
            icons_.clear();
        }
        auto icon = std::make_shared<const IconPixels>(make(mime_type, size));
        icons_.emplace(key, icon);
        return icon;
    }

  private:
    IconPixels make(const std::string& mime_type, int size) REQUIRES(mutex_) {
        if (!theme_) {
            theme_.emplace(IconTheme::places_of_desktop());
        }
        if (const std::string path = theme_->find(theme_names(mime_type), size); !path.empty()) {
            if (std::optional<IconPixels> icon = load_icon(path, size)) {
                return *std::move(icon);
            }
        }
        return draw_builtin_icon(icon_kind_of_type(mime_type), size);
    }

    Mutex mutex_;
    std::optional<IconTheme> theme_ GUARDED_BY(mutex_);
    std::map<std::pair<std::string, int>, std::shared_ptr<const IconPixels>> icons_ GUARDED_BY(mutex_);
};

bool starts_with(std::string_view text, std::string_view start) {
    return text.substr(0, start.size()) == start;
}

} // namespace

IconKind icon_kind_of_type(std::string_view mime_type) {
    if (mime_type == "inode/directory") {
        return IconKind::folder;
    }
    if (mime_type == "inode/mount-point" || mime_type == "inode/blockdevice") {
        return IconKind::volume;
    }
    if (starts_with(mime_type, "audio/")) {
        return IconKind::audio;
    }
    if (starts_with(mime_type, "image/")) {
        return IconKind::image;
    }
    if (mime_type == "application/x-executable" || mime_type == "application/x-pie-executable" ||
        mime_type == "application/x-shellscript" || mime_type == "application/x-desktop") {
        return IconKind::program;
    }
    return IconKind::document;
}

std::shared_ptr<const IconPixels> icon_for_type(std::string_view mime_type, int size) {
    // Outlives every thread that may still ask while the process ends.
    static auto* const cache = new IconCache;
    return cache->get(std::string(mime_type), std::clamp(size, 8, 512));
}

} // namespace host
