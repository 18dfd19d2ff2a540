#include "icon_theme.h"

#include <QImageReader>

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <map>
#include <sys/stat.h>

namespace host {

namespace {

constexpr int max_inheritance = 8;
constexpr std::size_t max_index_size = std::size_t{4} << 20;

using Section = std::map<std::string, std::string>;
using KeyFile = std::map<std::string, Section>;

std::string trimmed(const std::string& text) {
    const std::size_t first = text.find_first_not_of(" \t\r");
    if (first == std::string::npos) {
        return {};
    }
    return text.substr(first, text.find_last_not_of(" \t\r") - first + 1);
}

KeyFile read_key_file(const std::string& path) {
    KeyFile result;
    std::ifstream in(path);
    std::string line;
    std::string section;
    std::size_t size = 0;
    while (std::getline(in, line)) {
        size += line.size();
        if (size > max_index_size) {
            break;
        }
        line = trimmed(line);
        if (line.empty() || line[0] == '#') {
            continue;
        }
        if (line.front() == '[' && line.back() == ']') {
            section = line.substr(1, line.size() - 2);
        } else if (const std::size_t equals = line.find('='); equals != std::string::npos) {
            result[section][trimmed(line.substr(0, equals))] = trimmed(line.substr(equals + 1));
        }
    }
    return result;
}

std::string value_of(const Section& section, const std::string& key) {
    const auto found = section.find(key);
    return found == section.end() ? std::string() : found->second;
}

int number_of(const Section& section, const std::string& key, int fallback) {
    const std::string text = value_of(section, key);
    if (text.empty()) {
        return fallback;
    }
    const long value = std::strtol(text.c_str(), nullptr, 10);
    return static_cast<int>(std::clamp(value, 0L, 4096L));
}

std::vector<std::string> split(const std::string& text, char separator) {
    std::vector<std::string> parts;
    std::size_t start = 0;
    while (start <= text.size()) {
        const std::size_t end = std::min(text.find(separator, start), text.size());
        if (std::string part = trimmed(text.substr(start, end - start)); !part.empty()) {
            parts.push_back(std::move(part));
        }
        start = end + 1;
    }
    return parts;
}

std::string environment(const char* name) {
    const char* value = std::getenv(name);
    return value == nullptr ? std::string() : std::string(value);
}

bool is_file(const std::string& path) {
    struct stat found {};
    return stat(path.c_str(), &found) == 0 && S_ISREG(found.st_mode);
}

bool is_folder(const std::string& path) {
    struct stat found {};
    return stat(path.c_str(), &found) == 0 && S_ISDIR(found.st_mode);
}

// A theme's or an icon's name becomes part of a path.
bool is_plain_name(const std::string& name) {
    return !name.empty() && name.front() != '.' && name.find('/') == std::string::npos;
}

std::string unquoted(std::string text) {
    text.erase(std::remove(text.begin(), text.end(), '"'), text.end());
    return trimmed(text);
}

} // namespace

IconTheme::IconTheme(Places places) : base_folders_(std::move(places.base_folders)), extensions_{".png"} {
    if (QImageReader::supportedImageFormats().contains("svg")) {
        extensions_.emplace_back(".svg");
    }
    load(places.chosen_theme, 0);
    for (const char* name : {"Adwaita", "breeze", "hicolor"}) {
        load(name, 0);
    }
}

IconTheme::Places IconTheme::places_of_desktop() {
    Places places;
    const std::string home = environment("HOME");
    std::string config = environment("XDG_CONFIG_HOME");
    if (config.empty()) {
        config = home + "/.config";
    }
    std::string data = environment("XDG_DATA_HOME");
    if (data.empty()) {
        data = home + "/.local/share";
    }
    std::string shared = environment("XDG_DATA_DIRS");
    if (shared.empty()) {
        shared = "/usr/local/share:/usr/share";
    }
    if (!home.empty()) {
        places.base_folders.push_back(home + "/.icons");
    }
    places.base_folders.push_back(data + "/icons");
    for (const std::string& folder : split(shared, ':')) {
        places.base_folders.push_back(folder + "/icons");
    }
    static const struct {
        const char* file;
        const char* section;
        const char* key;
    } settings[] = {
        {"/gtk-4.0/settings.ini", "Settings", "gtk-icon-theme-name"},
        {"/gtk-3.0/settings.ini", "Settings", "gtk-icon-theme-name"},
        {"/kdeglobals", "Icons", "Theme"},
    };
    for (const auto& setting : settings) {
        KeyFile file = read_key_file(config + setting.file);
        places.chosen_theme = unquoted(value_of(file[setting.section], setting.key));
        if (!places.chosen_theme.empty()) {
            break;
        }
    }
    return places;
}

void IconTheme::load(const std::string& name, int depth) {
    if (!is_plain_name(name) || depth > max_inheritance ||
        std::find(loaded_.begin(), loaded_.end(), name) != loaded_.end()) {
        return;
    }
    loaded_.push_back(name);
    Theme theme;
    KeyFile index;
    for (const std::string& base : base_folders_) {
        const std::string root = base + "/" + name;
        if (!is_folder(root)) {
            continue;
        }
        theme.roots.push_back(root);
        if (index.empty()) {
            index = read_key_file(root + "/index.theme");
        }
    }
    if (theme.roots.empty() || index.empty()) {
        return;
    }
    const Section& header = index["Icon Theme"];
    for (const std::string& path : split(value_of(header, "Directories"), ',')) {
        const auto found = index.find(path);
        if (found == index.end() || path.find("..") != std::string::npos ||
            number_of(found->second, "Scale", 1) != 1) {
            continue;
        }
        const int size = number_of(found->second, "Size", 48);
        const std::string type = value_of(found->second, "Type");
        Folder folder{path, size, size};
        if (type == "Scalable") {
            folder.smallest = number_of(found->second, "MinSize", size);
            folder.largest = number_of(found->second, "MaxSize", size);
        } else if (type != "Fixed") {
            const int threshold = number_of(found->second, "Threshold", 2);
            folder.smallest = size - threshold;
            folder.largest = size + threshold;
        }
        theme.folders.push_back(folder);
    }
    themes_.push_back(std::move(theme));
    for (const std::string& parent : split(value_of(header, "Inherits"), ',')) {
        // Everything ends at hicolor, so it must not come before a theme's other ancestors.
        if (parent != "hicolor") {
            load(parent, depth + 1);
        }
    }
}

std::string IconTheme::find_in(const Theme& theme, const std::string& name, int size) const {
    // Shrinking a larger picture looks better than growing a smaller one, whatever the distance.
    const auto badness = [size](const Folder& folder) {
        if (size < folder.smallest) {
            return folder.smallest - size;
        }
        return size > folder.largest ? 100000 + size - folder.largest : 0;
    };
    std::string best;
    int best_badness = 0;
    for (const Folder& folder : theme.folders) {
        const int bad = badness(folder);
        if (!best.empty() && bad >= best_badness) {
            continue;
        }
        for (const std::string& root : theme.roots) {
            for (const std::string& extension : extensions_) {
                std::string path = root + "/" + folder.path + "/" + name + extension;
                if (is_file(path)) {
                    best = std::move(path);
                    best_badness = bad;
                    break;
                }
            }
            if (!best.empty() && best_badness == bad) {
                break;
            }
        }
    }
    return best;
}

std::string IconTheme::find(const std::vector<std::string>& names, int size) const {
    for (const Theme& theme : themes_) {
        for (const std::string& name : names) {
            if (!is_plain_name(name)) {
                continue;
            }
            if (std::string path = find_in(theme, name, size); !path.empty()) {
                return path;
            }
        }
    }
    return {};
}

} // namespace host
