#pragma once

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <sys/stat.h>

namespace bench {

/// A folder of the benchmark's own, removed at its end, with the user's base directories in it, so that
/// nothing of the user's is read or written.
class Surroundings {
  public:
    /// Below `parent`, or below the temporary directory. Ends the program when it cannot be made.
    explicit Surroundings(const char* parent = nullptr) {
        const std::filesystem::path above = parent ? parent : std::filesystem::temp_directory_path();
        std::string place = above / "quirnel-bench.XXXXXX";
        if (mkdtemp(place.data()) == nullptr) {
            std::perror(place.c_str());
            std::exit(1);
        }
        mFolder = place;
        for (const char* variable : {"XDG_CONFIG_HOME", "XDG_DATA_HOME", "XDG_CACHE_HOME", "XDG_RUNTIME_DIR"})
            setenv(variable, (mFolder / variable).c_str(), 1);
        std::filesystem::create_directory(mFolder / "XDG_RUNTIME_DIR");
        chmod((mFolder / "XDG_RUNTIME_DIR").c_str(), 0700);
    }
    ~Surroundings() {
        std::error_code ignored;
        std::filesystem::remove_all(mFolder, ignored);
    }
    Surroundings(const Surroundings&) = delete;
    Surroundings& operator=(const Surroundings&) = delete;

    const std::filesystem::path& Folder() const { return mFolder; }

  private:
    std::filesystem::path mFolder;
};

} // namespace bench
