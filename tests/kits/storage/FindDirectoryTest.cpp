#include <Directory.h>
#include <FindDirectory.h>
#include <Path.h>
#include <Volume.h>

#include "StorageTest.h"

#include <stdlib.h>

namespace {

class FindDirectory : public test::StorageTest {
  protected:
    static std::string ConfigHome() {
        const char* set = getenv("XDG_CONFIG_HOME");
        return set != nullptr && set[0] != '\0' ? set : Home() + "/.config";
    }
};

} // namespace

TEST_F(FindDirectory, SettingsAreNumber2010) {
    EXPECT_EQ(static_cast<int>(B_COMMON_SETTINGS_DIRECTORY), 2010);
    EXPECT_EQ(static_cast<int>(B_USER_SETTINGS_DIRECTORY), 3006);
    EXPECT_EQ(static_cast<int>(B_DESKTOP_DIRECTORY), 0);
}

TEST_F(FindDirectory, SettingsAreMadeOnlyWhenAsked) {
    const std::string expected = ConfigHome() + "/bekits/settings";
    std::filesystem::remove_all(expected);
    BPath path;
    EXPECT_EQ(find_directory(B_COMMON_SETTINGS_DIRECTORY, &path), B_ENTRY_NOT_FOUND);
    EXPECT_FALSE(std::filesystem::exists(expected));
    EXPECT_EQ(find_directory(B_COMMON_SETTINGS_DIRECTORY, &path, true), B_OK);
    EXPECT_EQ(path.Path(), expected);
    EXPECT_TRUE(std::filesystem::is_directory(expected));
    EXPECT_EQ(find_directory(B_COMMON_SETTINGS_DIRECTORY, &path), B_OK);
    BVolume volume;
    EXPECT_EQ(find_directory(B_USER_SETTINGS_DIRECTORY, &path, false, &volume), B_OK);
    EXPECT_EQ(path.Path(), expected);
}

TEST_F(FindDirectory, AFileInItsPlaceIsNoDirectory) {
    const std::string settings = ConfigHome() + "/bekits/settings";
    std::filesystem::remove_all(settings);
    std::filesystem::create_directories(ConfigHome() + "/bekits");
    test::write_file(settings, "in the way");
    BPath path;
    EXPECT_EQ(find_directory(B_COMMON_SETTINGS_DIRECTORY, &path), B_NOT_A_DIRECTORY);
    EXPECT_NE(find_directory(B_COMMON_SETTINGS_DIRECTORY, &path, true), B_OK);
    std::filesystem::remove(settings);
}

TEST_F(FindDirectory, AnswersAsText) {
    char text[B_PATH_NAME_LENGTH];
    EXPECT_EQ(find_directory(B_USER_DIRECTORY, 0, false, text, sizeof(text)), B_OK);
    EXPECT_EQ(text, Home());
    EXPECT_EQ(find_directory(B_USER_DIRECTORY, 0, false, text, 5), B_BAD_VALUE);
    EXPECT_EQ(find_directory(B_USER_DIRECTORY, 0, false, nullptr, 5), B_BAD_VALUE);
}

TEST_F(FindDirectory, RefusesNumbersWithoutADirectory) {
    BPath path;
    EXPECT_EQ(find_directory(B_COMMON_SETTINGS_DIRECTORY, nullptr), B_BAD_VALUE);
    EXPECT_EQ(find_directory(static_cast<directory_which>(500), &path), B_BAD_VALUE);
    EXPECT_EQ(find_directory(static_cast<directory_which>(9999), &path), B_BAD_VALUE);
    EXPECT_EQ(find_directory(static_cast<directory_which>(1001), &path), B_BAD_VALUE);
    EXPECT_EQ(find_directory(B_APPS_DIRECTORY, &path), B_UNSUPPORTED);
}

TEST_F(FindDirectory, MostOfTheUsersDirectoriesCanBeMade) {
    for (directory_which which :
         {B_DESKTOP_DIRECTORY, B_TRASH_DIRECTORY, B_COMMON_DIRECTORY, B_COMMON_ADDONS_DIRECTORY,
          B_COMMON_TRANSLATORS_DIRECTORY, B_COMMON_FONTS_DIRECTORY, B_COMMON_SOUNDS_DIRECTORY,
          B_COMMON_VAR_DIRECTORY, B_COMMON_LOG_DIRECTORY, B_COMMON_SPOOL_DIRECTORY, B_COMMON_TEMP_DIRECTORY,
          B_USER_DIRECTORY, B_USER_CONFIG_DIRECTORY}) {
        BPath path;
        EXPECT_EQ(find_directory(which, &path, true), B_OK) << which;
        EXPECT_EQ(BDirectory(path.Path()).InitCheck(), B_OK) << which;
    }
}
