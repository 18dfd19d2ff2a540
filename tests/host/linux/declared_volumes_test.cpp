#include "host/linux/declared_volumes.h"

#include "host/api/directories.h"
#include "support/temporary_environment.h"
#include <gtest/gtest.h>
#include <sys/stat.h>

namespace host {
namespace {

class DeclaredVolumesTest : public testing::Test {
  protected:
    void write_volumes_file(const std::string& text) {
        ASSERT_TRUE(make_directories(config_directory()).ok());
        test::write_file(config_directory() + "/volumes", text);
    }

    test::TemporaryEnvironment environment_{test::TemporaryEnvironment::DeclaredVolume::none};
};

TEST_F(DeclaredVolumesTest, ComeFromTheVariableAlone) {
    write_volumes_file("/from/file\n");
    environment_.declare_volumes("/a/:relative::/b//:/c");

    const DeclaredVolumes declared = read_declared_volumes();
    EXPECT_TRUE(declared.exclusive);
    EXPECT_EQ(declared.paths, (std::vector<std::string>{"/a", "/b", "/c"}));
}

TEST_F(DeclaredVolumesTest, ComeFromTheFileOtherwise) {
    write_volumes_file("# comment\n/a b/\n\n~/Music\nrelative\n");

    const DeclaredVolumes declared = read_declared_volumes();
    EXPECT_FALSE(declared.exclusive);
    EXPECT_EQ(declared.paths, (std::vector<std::string>{"/a b", environment_.home() + "/Music"}));
}

TEST_F(DeclaredVolumesTest, BeginWithTheMusicDirectory) {
    ::mkdir((environment_.home() + "/Music").c_str(), 0700);
    make_volumes_file();

    EXPECT_EQ(read_declared_volumes().paths, (std::vector<std::string>{environment_.home() + "/Music"}));
}

TEST_F(DeclaredVolumesTest, LeaveAnExistingFileAlone) {
    ::mkdir((environment_.home() + "/Music").c_str(), 0700);
    write_volumes_file("");
    make_volumes_file();

    EXPECT_EQ(test::read_file(config_directory() + "/volumes"), "");
}

TEST_F(DeclaredVolumesTest, LeaveNoFileWhereThereIsNoMusic) {
    make_volumes_file();

    struct stat status = {};
    EXPECT_NE(::stat((config_directory() + "/volumes").c_str(), &status), 0);
}

} // namespace
} // namespace host
