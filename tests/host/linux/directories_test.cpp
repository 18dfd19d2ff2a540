#include "host/api/directories.h"

#include "support/temporary_environment.h"
#include <gtest/gtest.h>
#include <sys/stat.h>

namespace host {
namespace {

class Directories : public testing::Test {
  protected:
    test::TemporaryEnvironment environment_;
};

TEST_F(Directories, FollowTheVariables) {
    environment_.set("XDG_CONFIG_HOME", "/c/");
    environment_.set("XDG_DATA_HOME", "/d");
    environment_.set("XDG_CACHE_HOME", "/e");
    environment_.set("XDG_RUNTIME_DIR", "/r");

    EXPECT_EQ(config_directory(), "/c/bekits");
    EXPECT_EQ(data_directory(), "/d/bekits");
    EXPECT_EQ(cache_directory(), "/e/bekits");
    EXPECT_EQ(runtime_directory(), "/r/bekits");
    EXPECT_EQ(trash_directory(), "/d/Trash");
}

TEST_F(Directories, HaveTheirPlacesBelowHomeWhereVariablesAreUnsetOrRelative) {
    environment_.set("HOME", "/h");
    environment_.unset("XDG_CONFIG_HOME");
    environment_.set("XDG_DATA_HOME", "relative");
    environment_.set("XDG_CACHE_HOME", "");

    EXPECT_EQ(home_directory(), "/h");
    EXPECT_EQ(config_directory(), "/h/.config/bekits");
    EXPECT_EQ(data_directory(), "/h/.local/share/bekits");
    EXPECT_EQ(cache_directory(), "/h/.cache/bekits");
}

TEST_F(Directories, MakeAPrivateRuntimeDirectoryWhereTheSessionHasNone) {
    environment_.unset("XDG_RUNTIME_DIR");

    const std::string path = runtime_directory();
    struct stat status = {};
    ASSERT_EQ(::stat(path.c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777u, 0700u);
    EXPECT_TRUE(path.starts_with(environment_.root() + "/temporary/")) << path;
}

TEST_F(Directories, DoNotTrustARuntimeDirectoryThatOthersMayEnter) {
    environment_.unset("XDG_RUNTIME_DIR");
    ::chmod(runtime_directory().c_str(), 0755);

    EXPECT_EQ(runtime_directory(), environment_.home() + "/.cache/bekits/run");
}

TEST_F(Directories, FindTheMusicDirectoryThatTheUserChose) {
    ::mkdir((environment_.home() + "/My \"Tunes\"").c_str(), 0700);
    ASSERT_TRUE(make_directories(environment_.home() + "/.config").ok());
    test::write_file(
        environment_.home() + "/.config/user-dirs.dirs",
        "# comment\nXDG_DESKTOP_DIR=\"/somewhere\"\n  XDG_MUSIC_DIR=\"$HOME/My \\\"Tunes\\\"/\"\n");

    EXPECT_EQ(music_directory(), environment_.home() + "/My \"Tunes\"");
    EXPECT_EQ(desktop_directory(), "/somewhere");
}

TEST_F(Directories, HaveNoMusicDirectoryWhereItDoesNotExistOrIsHomeItself) {
    EXPECT_EQ(music_directory(), "");
    ASSERT_TRUE(make_directories(environment_.home() + "/.config").ok());
    test::write_file(environment_.home() + "/.config/user-dirs.dirs", "XDG_MUSIC_DIR=\"$HOME/\"\n");
    ::mkdir((environment_.home() + "/Music").c_str(), 0700);
    EXPECT_EQ(music_directory(), "");
}

TEST_F(Directories, AreMadeWithThoseAbove) {
    const std::string path = environment_.root() + "/a/b/c";
    EXPECT_TRUE(make_directories(path).ok());
    EXPECT_TRUE(make_directories(path).ok());
    struct stat status = {};
    ASSERT_EQ(::stat((environment_.root() + "/a").c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777u, 0700u);

    test::write_file(environment_.root() + "/file", "");
    EXPECT_EQ(make_directories(environment_.root() + "/file/x").error(), ENOTDIR);
    EXPECT_EQ(make_directories("relative").error(), EINVAL);
}

} // namespace
} // namespace host
