// The desktop's icon themes, as the freedesktop icon theme specification lays them out on disk.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace host {

// Finds theme files. Read once from disk, immutable afterwards; safe from any thread.
class IconTheme {
  public:
    struct Places {
        std::string chosen_theme;              // empty: none is configured
        std::vector<std::string> base_folders; // folders that hold theme folders, the most important first
    };

    explicit IconTheme(Places places);

    // The places that the environment and the user's desktop settings name.
    [[nodiscard]] static Places places_of_desktop();

    // The picture file for the first of the names that a theme has, best for this size: exact, else the next
    // larger one, else the largest. The chosen theme and its ancestors are asked before "hicolor". Empty when
    // no theme has any of them.
    [[nodiscard]] std::string find(const std::vector<std::string>& names, int size) const;

  private:
    struct Folder {
        std::string path; // within the theme: "16x16/mimetypes"
        int smallest = 0; // icon sizes that the folder stands for
        int largest = 0;
    };
    struct Theme {
        std::vector<std::string> roots; // the theme's folders on disk
        std::vector<Folder> folders;
    };

    void load(const std::string& name, int depth);
    [[nodiscard]] std::string find_in(const Theme& theme, const std::string& name, int size) const;

    std::vector<std::string> base_folders_;
    std::vector<std::string> loaded_;
    std::vector<Theme> themes_;
    std::vector<std::string> extensions_;
};

} // namespace host
