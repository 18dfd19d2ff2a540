#pragma once

#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace host {

/// Files of "[Group]" and "Key=Value" lines, as the desktop's own are (Desktop Entry Specification 1.5).
/// Comments and lines that are neither are passed over; of a key that comes twice the first counts. A plain
/// value.
class KeyFile {
  public:
    KeyFile() = default;
    /// Any bytes.
    explicit KeyFile(std::string_view text);
    /// Nothing when the file cannot be read or is larger than a megabyte.
    static std::optional<KeyFile> read(const std::string& path);

    /// As it stands, blanks around it removed; empty when it is missing.
    std::string raw(const std::string& group, const std::string& key) const;
    /// With the escapes \s \n \t \r \\ replaced.
    std::string text(const std::string& group, const std::string& key) const;
    bool flag(const std::string& group, const std::string& key) const;
    bool has_group(const std::string& group) const;

  private:
    std::map<std::string, std::map<std::string, std::string>> groups_;
};

} // namespace host
