#pragma once

#include <map>
#include <optional>
#include <string>

namespace test {

/// A user's surroundings of a test's own: a fresh home with the XDG base directories in it, and one or no
/// declared volume, all on a file system that holds attributes. Everything is removed, and the environment
/// put back, at the end. One at a time; made before other threads run, because the environment is not
/// guarded.
class TemporaryEnvironment {
  public:
    enum class DeclaredVolume { none, one };

    /// With `one`, BEKITS_VOLUMES names volume(); with `none` it is unset.
    explicit TemporaryEnvironment(DeclaredVolume declared = DeclaredVolume::one);
    ~TemporaryEnvironment();
    TemporaryEnvironment(const TemporaryEnvironment&) = delete;
    TemporaryEnvironment& operator=(const TemporaryEnvironment&) = delete;

    /// Absolute paths without symbolic links. home() and volume() lie in root().
    const std::string& root() const { return root_; }
    std::string home() const { return root_ + "/home"; }
    std::string volume() const { return root_ + "/volume"; }

    /// Sets a variable until the end of this environment.
    void set(const std::string& name, const std::string& value);
    void unset(const std::string& name);
    /// The declared volumes, separated by colons.
    void declare_volumes(const std::string& directories) { set("BEKITS_VOLUMES", directories); }

  private:
    void keep(const std::string& name);

    std::string root_;
    std::map<std::string, std::optional<std::string>> kept_;
};

/// A fresh directory on a file system that holds user attributes: below QUIRNEL_TEST_DIR, else the temporary
/// directories, else the current one. Ends the program when there is none.
std::string make_directory_with_attributes();

/// Removes a directory with all that is in it.
void remove_tree(const std::string& path);

/// Writes a whole file, replacing it.
void write_file(const std::string& path, const std::string& content);
/// A whole file; empty when it cannot be read.
std::string read_file(const std::string& path);

} // namespace test
