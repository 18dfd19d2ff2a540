#include "mime_names.h"

#include "data_directories.h"

#include <algorithm>
#include <fstream>
#include <sstream>
#include <utility>

namespace host {

namespace {

using Pairs = std::vector<std::pair<std::string, std::string>>;

// Lines of two names.
Pairs read_pairs(const char* leaf) {
    Pairs pairs;
    for (const std::string& directory : data_directories()) {
        std::ifstream file(directory + "/mime/" + leaf);
        for (std::string line; std::getline(file, line);) {
            std::istringstream words(line);
            std::string first;
            std::string second;
            if (words >> first >> second)
                pairs.emplace_back(std::move(first), std::move(second));
        }
    }
    return pairs;
}

void add_once(std::vector<std::string>& names, const std::string& name) {
    if (std::find(names.begin(), names.end(), name) == names.end())
        names.push_back(name);
}

void add_with_aliases(std::vector<std::string>& names, const std::string& type, const Pairs& aliases) {
    add_once(names, type);
    std::string canonical = type;
    for (const auto& [alias, name] : aliases) {
        if (alias == type)
            canonical = name;
    }
    add_once(names, canonical);
    for (const auto& [alias, name] : aliases) {
        if (name == canonical)
            add_once(names, alias);
    }
}

} // namespace

std::vector<std::string> names_of_type(const std::string& type) {
    const Pairs aliases = read_pairs("aliases");
    const Pairs kinds = read_pairs("subclasses");
    std::vector<std::string> names;
    add_with_aliases(names, type, aliases);
    // Grows while it is walked; each name comes once, so it ends.
    for (std::size_t at = 0; at < names.size(); ++at) {
        const std::string name = names[at];
        for (const auto& [kind, of] : kinds) {
            if (kind == name)
                add_with_aliases(names, of, aliases);
        }
    }
    if (type.starts_with("text/"))
        add_with_aliases(names, "text/plain", aliases);
    if (!type.starts_with("inode/"))
        add_once(names, "application/octet-stream");
    return names;
}

} // namespace host
