// The desktop's preferred programs, and what they are started with.
#include "host/api/desktop_programs.h"
#include "host/linux/exec_line.h"
#include "support/temporary_environment.h"

#include <filesystem>
#include <gtest/gtest.h>
#include <sys/stat.h>

namespace {

using Words = std::vector<std::string>;

class DesktopProgramsTest : public testing::Test {
  protected:
    DesktopProgramsTest() {
        environment_.set("XDG_DATA_DIRS", environment_.root() + "/system");
        environment_.set("XDG_CONFIG_DIRS", environment_.root() + "/system-config");
        environment_.unset("XDG_CURRENT_DESKTOP");
        std::filesystem::create_directories(user());
        std::filesystem::create_directories(system());
        std::filesystem::create_directories(environment_.home() + "/.config");
    }
    std::string user() const { return environment_.home() + "/.local/share/applications/"; }
    std::string system() const { return environment_.root() + "/system/applications/"; }
    void add(const std::string& file, const std::string& exec, const std::string& more) {
        test::write_file(file, "[Desktop Entry]\nType=Application\nName=Test\nExec=" + exec + "\n" + more);
    }
    void choose(const std::string& text) {
        test::write_file(environment_.home() + "/.config/mimeapps.list", text);
    }
    static std::string id_for(const std::string& type) {
        const auto program = host::preferred_program(type);
        return program ? program->id : "none";
    }

    test::TemporaryEnvironment environment_;
};

} // namespace

TEST_F(DesktopProgramsTest, TheUsersChoiceComesFirstAndOnlyWhatCanBeRunCounts) {
    add(system() + "a.desktop", "/bin/true %f", "MimeType=audio/mpeg;text/plain;\n");
    add(system() + "b.desktop", "/bin/true", "");
    add(system() + "gone.desktop", "/no/such/program", "MimeType=audio/mpeg;\n");
    EXPECT_EQ(id_for("audio/mpeg"), "a.desktop");
    EXPECT_EQ(id_for("image/png"), "none");
    choose("[Default Applications]\naudio/mpeg=gone.desktop;missing.desktop;b.desktop\n");
    EXPECT_EQ(id_for("audio/mpeg"), "b.desktop");
    choose("[Removed Associations]\naudio/mpeg=a.desktop\n");
    EXPECT_EQ(id_for("audio/mpeg"), "none");
    choose("[Added Associations]\nimage/png=b.desktop;\n");
    EXPECT_EQ(id_for("image/png"), "b.desktop");
    // The user's entry of the same name hides the system's.
    add(user() + "a.desktop", "/bin/true", "Hidden=true\n");
    EXPECT_EQ(id_for("text/plain"), "none");
}

TEST_F(DesktopProgramsTest, TheCacheOfAnInstalledSystemIsEnough) {
    add(system() + "c.desktop", "true", "");
    test::write_file(system() + "mimeinfo.cache", "[MIME Cache]\naudio/mpeg=c.desktop;\n");
    const auto program = host::preferred_program("audio/mpeg");
    ASSERT_TRUE(program.ok());
    EXPECT_EQ(std::filesystem::path(program->executable).filename(), "true");
}

TEST_F(DesktopProgramsTest, OtherNamesOfATypeAndWhatItIsAKindOfCount) {
    std::filesystem::create_directories(environment_.root() + "/system/mime");
    test::write_file(environment_.root() + "/system/mime/aliases", "audio/x-mpeg audio/mpeg\n");
    test::write_file(environment_.root() + "/system/mime/subclasses", "text/x-test text/plain\n");
    add(system() + "a.desktop", "/bin/true %f", "MimeType=audio/mpeg;text/plain;\n");
    EXPECT_EQ(id_for("audio/x-mpeg"), "a.desktop");
    EXPECT_EQ(id_for("text/x-test"), "a.desktop");
    EXPECT_EQ(id_for("text/x-unknown"), "a.desktop");
}

TEST_F(DesktopProgramsTest, FieldCodesAreReplaced) {
    struct Case {
        Words arguments;
        std::vector<Words> started;
    };
    const Words files = {"/a b", "/-c\n"};
    const Case cases[] = {
        {{"%F"}, {{"/a b", "/-c\n"}}},
        {{"%U"}, {{"file:///a%20b", "file:///-c%0A"}}},
        {{"-x", "%f"}, {{"-x", "/a b"}, {"-x", "/-c\n"}}},
        {{"--file=%u"}, {{"--file=file:///a%20b"}, {"--file=file:///-c%0A"}}},
        {{}, {{"/a b"}, {"/-c\n"}}},
        {{"%i", "%c", "100%%", "%F"}, {{"--icon", "picture", "Test Player", "100%", "/a b", "/-c\n"}}},
        {{"%d", "%F"}, {{"/a b", "/-c\n"}}},
    };
    for (const Case& tried : cases) {
        host::DesktopProgram program;
        program.name = "Test Player";
        program.icon = "picture";
        program.arguments = tried.arguments;
        EXPECT_EQ(host::arguments_for(program, files), tried.started);
    }
    host::DesktopProgram program;
    program.arguments = {"--new", "%U"};
    EXPECT_EQ(host::arguments_for(program, {}), (std::vector<Words>{{"--new"}}));
}

TEST_F(DesktopProgramsTest, ExecLinesAreTakenApartWithoutAShell) {
    EXPECT_EQ(host::split_exec_line("player --x %U"), (Words{"player", "--x", "%U"}));
    EXPECT_EQ(host::split_exec_line("\"/opt/my player/run\" \"a \\\"b\\\" \\$c\""),
              (Words{"/opt/my player/run", "a \"b\" $c"}));
    EXPECT_EQ(host::split_exec_line("run $(touch x);rm"), (Words{"run", "$(touch", "x);rm"}));
    EXPECT_EQ(host::split_exec_line("run \"\""), (Words{"run", ""}));
    EXPECT_FALSE(host::split_exec_line("run \"open"));
    EXPECT_FALSE(host::split_exec_line("  "));
}

TEST_F(DesktopProgramsTest, UrisHoldEveryByte) {
    EXPECT_EQ(host::file_uri("/M\xfcsic/it's \"1\" #?%\n.mp3"),
              "file:///M%FCsic/it%27s%20%221%22%20%23%3F%25%0A.mp3");
}
