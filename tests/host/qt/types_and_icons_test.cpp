// Runs in a program of its own that must never make a graphical application object.
#include "host/api/icons.h"
#include "host/api/image_decoder.h"
#include "host/api/mime_sniffer.h"
#include "host/qt/icon_theme.h"

#include <QCoreApplication>
#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <string>
#include <thread>
#include <unistd.h>

namespace fs = std::filesystem;

namespace {

class TypesAndIcons : public ::testing::Test {
  protected:
    void SetUp() override {
        std::string pattern = (fs::temp_directory_path() / "types-XXXXXX").string();
        ASSERT_NE(mkdtemp(pattern.data()), nullptr);
        folder_ = pattern;
    }
    void TearDown() override {
        EXPECT_EQ(QCoreApplication::instance(), nullptr) << "nothing here may need an application object";
        fs::remove_all(folder_);
    }

    std::string write(const std::string& name, const std::string& contents) const {
        const fs::path path = folder_ / name;
        fs::create_directories(path.parent_path());
        std::ofstream(path, std::ios::binary) << contents;
        return path.string();
    }
    void write_png(const std::string& name, int side, std::uint32_t color) const {
        const std::vector<std::uint32_t> pixels(static_cast<std::size_t>(side * side), color);
        const host::EncodedImage file = host::encode_image("png", side, side, true, pixels);
        write(name, std::string(reinterpret_cast<const char*>(file.data.data()), file.data.size()));
    }

    fs::path folder_;
};

using Sniffer = TypesAndIcons;
using Icons = TypesAndIcons;

std::span<const std::byte> bytes_of(const std::string& text) {
    return std::as_bytes(std::span(text.data(), text.size()));
}

TEST_F(Sniffer, MusicFilesHaveTheKitsName) {
    EXPECT_EQ(host::type_of_name("Song.mp3"), "audio/x-mpeg");
    EXPECT_EQ(host::type_of_name("SONG.MP3"), "audio/x-mpeg");
    EXPECT_EQ(host::type_of_file("Song.mp3", {}), "audio/x-mpeg");
    EXPECT_EQ(host::type_of_path(write("Song.mp3", "not really music")), "audio/x-mpeg");
    EXPECT_EQ(host::kit_type_of("audio/mpeg"), "audio/x-mpeg");
    EXPECT_EQ(host::desktop_type_of("audio/x-mpeg"), "audio/mpeg");
    EXPECT_EQ(host::kit_type_of("image/png"), "image/png");
}

TEST_F(Sniffer, ContentsDecideWhereTheNameSaysNothing) {
    const std::string png = "\x89PNG\r\n\x1a\n and so on";
    EXPECT_EQ(host::type_of_file("picture", bytes_of(png)), "image/png");
    EXPECT_EQ(host::type_of_data(bytes_of(png)), "image/png");
    EXPECT_EQ(host::type_of_path(write("picture", png)), "image/png");
    EXPECT_EQ(host::type_of_path(write("words", "plain words\n")), "text/plain");
    EXPECT_EQ(host::type_of_name("nothing-known"), "application/octet-stream");
}

TEST_F(Sniffer, OtherThingsThanFilesHaveTypesToo) {
    EXPECT_EQ(host::type_of_path(folder_.string()), "inode/directory");
    EXPECT_EQ(host::type_of_path("/dev/null"), "inode/chardevice");
    EXPECT_EQ(host::type_of_path("/proc"), "inode/mount-point");
    EXPECT_EQ(host::type_of_path((folder_ / "missing").string()), "");
}

TEST_F(Sniffer, NamesThatAreNotTextAreNoTrouble) {
    EXPECT_EQ(host::type_of_name("\xFF\xFE\x80.mp3"), "audio/x-mpeg");
    EXPECT_EQ(host::type_of_name(""), "application/octet-stream");
}

TEST_F(Sniffer, DescribesTypesInWords) {
    EXPECT_FALSE(host::describe_type("audio/x-mpeg").empty());
    EXPECT_EQ(host::describe_type("no/such-type-at-all"), "");
}

TEST_F(Sniffer, WorksInSeveralThreads) {
    std::vector<int> good(4, 0);
    std::vector<std::thread> threads;
    for (std::size_t t = 0; t < good.size(); ++t) {
        threads.emplace_back([&, t] {
            for (int i = 0; i < 50; ++i) {
                good[t] += host::type_of_name("a.png") == "image/png";
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(good, std::vector<int>(4, 50));
}

TEST_F(Icons, BuiltinDrawingsDiffer) {
    std::vector<std::vector<std::uint32_t>> seen;
    for (const host::IconKind kind :
         {host::IconKind::document, host::IconKind::audio, host::IconKind::image, host::IconKind::folder,
          host::IconKind::volume, host::IconKind::program}) {
        const host::IconPixels icon = host::draw_builtin_icon(kind, 16);
        EXPECT_EQ(icon.size, 16);
        ASSERT_EQ(icon.pixels.size(), 256U);
        EXPECT_EQ(icon.pixels[0] >> 24, 0U) << "corners are transparent";
        EXPECT_EQ(std::find(seen.begin(), seen.end(), icon.pixels), seen.end());
        EXPECT_GT(
            std::count_if(icon.pixels.begin(), icon.pixels.end(), [](auto p) { return p >> 24 == 255U; }),
            60);
        seen.push_back(icon.pixels);
    }
}

TEST_F(Icons, KindsFollowFromTypes) {
    EXPECT_EQ(host::icon_kind_of_type("audio/x-mpeg"), host::IconKind::audio);
    EXPECT_EQ(host::icon_kind_of_type("inode/directory"), host::IconKind::folder);
    EXPECT_EQ(host::icon_kind_of_type("inode/mount-point"), host::IconKind::volume);
    EXPECT_EQ(host::icon_kind_of_type("image/png"), host::IconKind::image);
    EXPECT_EQ(host::icon_kind_of_type("text/plain"), host::IconKind::document);
    EXPECT_EQ(host::icon_kind_of_type(""), host::IconKind::document);
}

TEST_F(Icons, EveryTypeHasOneAndItIsMadeOnce) {
    const auto first = host::icon_for_type("audio/x-mpeg", 16);
    ASSERT_NE(first, nullptr);
    EXPECT_EQ(first->size, 16);
    EXPECT_EQ(first->pixels.size(), 256U);
    EXPECT_EQ(host::icon_for_type("audio/x-mpeg", 16), first);
    EXPECT_NE(host::icon_for_type("audio/x-mpeg", 32), first);
    EXPECT_EQ(host::icon_for_type("no/such", 100000)->size, 512);
    EXPECT_EQ(host::icon_for_type("no/such", -1)->size, 8);
}

TEST_F(Icons, ThemesAreSearchedByNameSizeAndAncestry) {
    write("icons/Mine/index.theme",
          "[Icon Theme]\nName=Mine\nInherits=Base,hicolor\nDirectories=16/types,32/types\n"
          "[16/types]\nSize=16\nType=Fixed\n[32/types]\nSize=32\nType=Fixed\n");
    write("icons/Base/index.theme", "[Icon Theme]\nDirectories=48/types\n[48/types]\nSize=48\n");
    write("icons/hicolor/index.theme", "[Icon Theme]\nDirectories=48/types\n[48/types]\nSize=48\n");
    write_png("icons/Mine/16/types/note.png", 16, 0xFF0000FF);
    write_png("icons/Mine/32/types/note.png", 32, 0xFFFF0000);
    write_png("icons/Base/48/types/folder.png", 48, 0xFF00FF00);
    write_png("icons/hicolor/48/types/folder.png", 48, 0xFF00FF00);
    write_png("icons/hicolor/48/types/last.png", 48, 0xFF00FF00);
    const std::string base = (folder_ / "icons").string();
    const host::IconTheme theme({"Mine", {base, (folder_ / "elsewhere").string()}});
    EXPECT_EQ(theme.find({"note"}, 16), base + "/Mine/16/types/note.png");
    EXPECT_EQ(theme.find({"note"}, 20), base + "/Mine/32/types/note.png") << "a larger one shrinks";
    EXPECT_EQ(theme.find({"note"}, 64), base + "/Mine/32/types/note.png") << "the largest there is";
    EXPECT_EQ(theme.find({"folder"}, 16), base + "/Base/48/types/folder.png") << "before hicolor";
    EXPECT_EQ(theme.find({"last"}, 16), base + "/hicolor/48/types/last.png");
    EXPECT_EQ(theme.find({"special", "note"}, 16), base + "/Mine/16/types/note.png");
    EXPECT_EQ(theme.find({"missing"}, 16), "");
    EXPECT_EQ(theme.find({"../types/note"}, 16), "") << "names are no paths";
}

TEST_F(Icons, ThemesThatInheritFromEachOtherAreNoTrouble) {
    write("icons/A/index.theme", "[Icon Theme]\nInherits=B\nDirectories=16\n[16]\nSize=16\n");
    write("icons/B/index.theme",
          "[Icon Theme]\nInherits=A\nDirectories=16,missing\n[16]\nSize=99999999999999\n");
    write("icons/C/index.theme", "garbage\n[[]\n=\n\xFF\n");
    EXPECT_EQ(host::IconTheme({"A", {(folder_ / "icons").string()}}).find({"x"}, 16), "");
    EXPECT_EQ(host::IconTheme({"C", {(folder_ / "icons").string()}}).find({"x"}, 16), "");
    EXPECT_EQ(host::IconTheme({"../A", {(folder_ / "icons").string()}}).find({"x"}, 16), "");
}

} // namespace
