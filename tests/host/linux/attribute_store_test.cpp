#include "host/linux/attribute_store.h"

#include "support/attribute_file.h"
#include <atomic>
#include <filesystem>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <thread>

namespace host {
namespace {

using test::noise;
using test::OpenFile;

class AttributeStore : public testing::Test {
  protected:
    std::string blob_directory() const { return environment_.volume() + "/.be-attributes"; }
    std::size_t blob_count() const {
        std::error_code error;
        std::size_t count = 0;
        for (const auto& entry : std::filesystem::directory_iterator(blob_directory(), error)) {
            EXPECT_EQ(entry.path().filename().string().size(), 64u);
            ++count;
        }
        return count;
    }
    std::string only_blob() const {
        return std::filesystem::directory_iterator(blob_directory())->path().string();
    }

    test::TemporaryEnvironment environment_;
    OpenFile file_{environment_.volume() + "/file"};
};

TEST_F(AttributeStore, LaysTypeAndDataIntoAnExtendedAttribute) {
    ASSERT_TRUE(file_.write("Audio:Artist", "Ella").ok());

    EXPECT_EQ(file_.raw("user.be.Audio:Artist"), "CSTRElla");
}

TEST_F(AttributeStore, ReadsWhatOtherProgramsSet) {
    ::setxattr(file_.path().c_str(), "user.be.Rating", "LONG\x05\0\0\0", 8, 0);

    const Result<AttributeInfo> info = attribute_info(file_.file(), "Rating");
    ASSERT_TRUE(info.ok());
    EXPECT_EQ(info->type, 0x4c4f4e47u);
    EXPECT_EQ(info->size, 4);
}

TEST_F(AttributeStore, SaysNotThereForAMissingAttribute) {
    char buffer = 0;
    EXPECT_EQ(attribute_info(file_.file(), "none").error(), ENOENT);
    EXPECT_EQ(read_attribute(file_.file(), "none", 0, &buffer, 1).error(), ENOENT);
    EXPECT_EQ(remove_attribute(file_.file(), "none").error(), ENOENT);
    EXPECT_EQ(rename_attribute(file_.file(), "none", "other").error(), ENOENT);
}

TEST_F(AttributeStore, TreatsAValueWithoutATypeAsMissing) {
    ::setxattr(file_.path().c_str(), "user.be.short", "abc", 3, 0);

    EXPECT_EQ(attribute_info(file_.file(), "short").error(), ENOENT);
}

TEST_F(AttributeStore, ListsOnlyItsOwnNames) {
    ::setxattr(file_.path().c_str(), "user.other", "x", 1, 0);
    ::setxattr(file_.path().c_str(), "user.be.", "x", 1, 0);
    ASSERT_TRUE(file_.write("a", "1").ok());
    ASSERT_TRUE(file_.write("b", "2").ok());

    const auto names = attribute_names(file_.file());
    ASSERT_TRUE(names.ok());
    EXPECT_EQ(*names, (std::vector<std::string>{"a", "b"}));
}

TEST_F(AttributeStore, KeepsEmptyValuesAndAnyBytesInNames) {
    const std::string odd = "two\nlines \xff\xfe end";
    ASSERT_TRUE(file_.write("empty", "").ok());
    ASSERT_TRUE(file_.write(odd, "odd").ok());

    EXPECT_EQ(file_.read("empty"), "");
    EXPECT_EQ(file_.read(odd), "odd");
}

TEST_F(AttributeStore, LimitsNamesToWhatTheSystemHolds) {
    const std::string longest(247, 'n');
    EXPECT_TRUE(file_.write(longest, "fits").ok());
    EXPECT_EQ(file_.read(longest), "fits");
    EXPECT_EQ(file_.write(longest + "n", "too long").error(), ENAMETOOLONG);
    EXPECT_EQ(attribute_info(file_.file(), (longest + "n").c_str()).error(), ENAMETOOLONG);
    EXPECT_EQ(file_.write("", "no name").error(), EINVAL);
}

TEST_F(AttributeStore, ReadsPartsOfAValue) {
    ASSERT_TRUE(file_.write("text", "0123456789").ok());
    char buffer[4] = {};

    EXPECT_EQ(*read_attribute(file_.file(), "text", 3, buffer, 4), 4u);
    EXPECT_EQ(std::string(buffer, 4), "3456");
    EXPECT_EQ(*read_attribute(file_.file(), "text", 8, buffer, 4), 2u);
    EXPECT_EQ(std::string(buffer, 2), "89");
    EXPECT_EQ(*read_attribute(file_.file(), "text", 10, buffer, 4), 0u);
    EXPECT_EQ(*read_attribute(file_.file(), "text", 1'000'000, buffer, 4), 0u);
    EXPECT_EQ(read_attribute(file_.file(), "text", -1, buffer, 4).error(), EINVAL);
}

TEST_F(AttributeStore, WritingFromAnOffsetKeepsTheStartAndCutsTheRest) {
    ASSERT_TRUE(file_.write("text", "0123456789").ok());
    ASSERT_TRUE(file_.write_at("text", 4, "ab").ok());
    EXPECT_EQ(file_.read("text"), "0123ab");

    ASSERT_TRUE(file_.write_at("text", 8, "z").ok());
    EXPECT_EQ(file_.read("text"), std::string("0123ab\0\0z", 9));
    ASSERT_TRUE(file_.write_at("new", 2, "x").ok());
    EXPECT_EQ(file_.read("new"), std::string("\0\0x", 3));
}

TEST_F(AttributeStore, RefusesSizesBeyondItsLimit) {
    EXPECT_EQ(file_.write_at("text", kLargestAttribute, "x").error(), EFBIG);
    EXPECT_EQ(file_.write_at("text", std::int64_t{1} << 62, "x").error(), EFBIG);
    EXPECT_EQ(file_.write_at("text", -1, "x").error(), EINVAL);
}

TEST_F(AttributeStore, KeepsValuesOfEverySizeAroundEveryLimit) {
    const std::size_t sizes[] = {0,     1,     1019,  1020,  1021,  3900,  3950,   3990,
                                 4000,  4020,  4040,  4060,  4080,  4090,  4096,   4100,
                                 16000, 16384, 16400, 65531, 65532, 65533, 1 << 20};
    for (const std::size_t size : sizes) {
        SCOPED_TRACE(size);
        const std::string value = noise(size, static_cast<unsigned>(size));
        ASSERT_TRUE(file_.write("value", value, test::kNumber).ok());
        EXPECT_EQ(file_.read("value"), value);
        EXPECT_EQ(attribute_info(file_.file(), "value")->type, test::kNumber);
        EXPECT_EQ(attribute_info(file_.file(), "value")->size, static_cast<std::int64_t>(size));
    }
}

TEST_F(AttributeStore, SpillsWhatTheSystemTakesNowhere) {
    const std::string value = noise(70'000, 1);
    ASSERT_TRUE(file_.write("cover", value).ok());

    EXPECT_TRUE(file_.is_spilled("cover"));
    EXPECT_EQ(blob_count(), 1u);
    EXPECT_EQ(test::read_file(only_blob()), value);
}

TEST_F(AttributeStore, WritesAndReadsPartsOfASpilledValue) {
    const std::string value = noise(70'000, 1);
    ASSERT_TRUE(file_.write("cover", value).ok());
    ASSERT_TRUE(file_.write_at("cover", 69'000, "tail").ok());

    EXPECT_EQ(file_.read("cover"), value.substr(0, 69'000) + "tail");
    char buffer[8] = {};
    EXPECT_EQ(*read_attribute(file_.file(), "cover", 68'998, buffer, 8), 6u);
    EXPECT_EQ(std::string(buffer, 6), value.substr(68'998, 2) + "tail");
}

TEST_F(AttributeStore, TakesThePlaceOfASpilledValueByASmallOne) {
    ASSERT_TRUE(file_.write("cover", noise(70'000, 1)).ok());
    ASSERT_TRUE(file_.write("cover", "small").ok());

    EXPECT_EQ(file_.read("cover"), "small");
    EXPECT_EQ(file_.raw("user.be.cover"), "CSTRsmall");
}

TEST_F(AttributeStore, SharesTheBlobOfEqualValuesAndOfCopies) {
    const std::string value = noise(70'000, 1);
    ASSERT_TRUE(file_.write("cover", value).ok());
    const OpenFile other(environment_.volume() + "/other");
    ASSERT_TRUE(other.write("picture", value).ok());
    const OpenFile copy(environment_.volume() + "/copy");
    const std::string marker = file_.raw("user.be.cover");
    ::setxattr(copy.path().c_str(), "user.be.cover", marker.data(), marker.size(), 0);

    EXPECT_EQ(blob_count(), 1u);
    EXPECT_EQ(other.read("picture"), value);
    EXPECT_EQ(copy.read("cover"), value);
}

TEST_F(AttributeStore, KeepsPlainBytesThatLookLikeAMarkerApart) {
    ASSERT_TRUE(file_.write("real", noise(70'000, 1)).ok());
    const std::string marker = file_.raw("user.be.real");
    ASSERT_TRUE(file_.write("fake", marker.substr(4), 0x00626c62).ok());

    EXPECT_EQ(file_.read("fake"), marker.substr(4));
    EXPECT_EQ(attribute_info(file_.file(), "fake")->type, 0x00626c62u);
}

TEST_F(AttributeStore, TreatsADamagedMarkerAsMissing) {
    ASSERT_TRUE(file_.write("cover", noise(70'000, 1)).ok());
    std::string marker = file_.raw("user.be.cover");
    marker.pop_back();
    ::setxattr(file_.path().c_str(), "user.be.cover", marker.data(), marker.size(), 0);

    EXPECT_EQ(attribute_info(file_.file(), "cover").error(), ENOENT);
}

TEST_F(AttributeStore, TreatsAMissingShortOrAlteredBlobAsAMissingAttribute) {
    const std::string value = noise(70'000, 1);
    char buffer = 0;
    ASSERT_TRUE(file_.write("cover", value).ok());
    EXPECT_EQ(file_.read("cover"), value);
    const std::string blob = only_blob();

    std::string altered = value;
    altered[35'000] ^= 1;
    ::chmod(blob.c_str(), 0644);
    test::write_file(blob, altered);
    EXPECT_EQ(attribute_info(file_.file(), "cover").error(), ENOENT);
    EXPECT_EQ(read_attribute(file_.file(), "cover", 0, &buffer, 1).error(), ENOENT);
    test::write_file(blob, value.substr(0, 69'999));
    EXPECT_EQ(attribute_info(file_.file(), "cover").error(), ENOENT);
    ::unlink(blob.c_str());
    EXPECT_EQ(attribute_info(file_.file(), "cover").error(), ENOENT);

    ASSERT_TRUE(file_.write("cover", value).ok()); // mends it
    EXPECT_EQ(file_.read("cover"), value);
}

TEST_F(AttributeStore, MendsADamagedBlobWhenTheValueIsWrittenAgain) {
    const std::string value = noise(70'000, 1);
    ASSERT_TRUE(file_.write("cover", value).ok());
    ::chmod(only_blob().c_str(), 0644);
    test::write_file(only_blob(), "rubbish");

    ASSERT_TRUE(file_.write("cover", value).ok());
    EXPECT_EQ(file_.read("cover"), value);
    EXPECT_EQ(blob_count(), 1u);
}

TEST_F(AttributeStore, KeepsBlobsFromBeingListedByOthersWhereOthersMayWrite) {
    ::chmod(environment_.volume().c_str(), 0777);
    ASSERT_TRUE(file_.write("cover", noise(70'000, 1)).ok());

    struct stat status = {};
    ASSERT_EQ(::stat(blob_directory().c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777u, 01733u);
    ASSERT_EQ(::stat(only_blob().c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777u, 0444u);
}

TEST_F(AttributeStore, NarrowsTheBlobDirectoryWhereOnlyTheOwnerMayWrite) {
    ASSERT_TRUE(file_.write("cover", noise(70'000, 1)).ok());

    struct stat status = {};
    ASSERT_EQ(::stat(blob_directory().c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777u, 0711u);
}

TEST_F(AttributeStore, FallsBackToTheUsersDirectoryWhereTheVolumeOffersNone) {
    test::write_file(blob_directory(), "a file in the way");
    const std::string value = noise(70'000, 1);

    ASSERT_TRUE(file_.write("cover", value).ok());
    EXPECT_EQ(file_.read("cover"), value);
    EXPECT_TRUE(std::filesystem::exists(environment_.home() + "/.local/share/bekits/blobs"));
}

TEST_F(AttributeStore, FindsABlobWhoseVolumeIsDeclaredNoMore) {
    const std::string value = noise(70'000, 1);
    ::mkdir((environment_.volume() + "/inner").c_str(), 0755);
    environment_.declare_volumes(environment_.volume() + "/inner");
    ASSERT_TRUE(OpenFile(environment_.volume() + "/inner/file").write("cover", value).ok());

    environment_.declare_volumes(environment_.volume());
    EXPECT_EQ(OpenFile(environment_.volume() + "/inner/file").read("cover"), value);
}

TEST_F(AttributeStore, FindsTheBlobOfACopyOnAnotherVolume) {
    const std::string value = noise(70'000, 1);
    ASSERT_TRUE(file_.write("cover", value).ok());
    const std::string second = environment_.root() + "/second";
    ::mkdir(second.c_str(), 0755);
    environment_.declare_volumes(environment_.volume() + ":" + second);
    const OpenFile copy(second + "/copy");
    const std::string marker = file_.raw("user.be.cover");
    ::setxattr(copy.path().c_str(), "user.be.cover", marker.data(), marker.size(), 0);

    EXPECT_EQ(copy.read("cover"), value);
}

TEST_F(AttributeStore, RenamesPlainAndSpilledAttributes) {
    const std::string value = noise(70'000, 1);
    ASSERT_TRUE(file_.write("a", "plain").ok());
    ASSERT_TRUE(file_.write("b", value).ok());
    ASSERT_TRUE(rename_attribute(file_.file(), "a", "c").ok());
    ASSERT_TRUE(rename_attribute(file_.file(), "b", "d").ok());
    ASSERT_TRUE(rename_attribute(file_.file(), "c", "c").ok());

    EXPECT_EQ(file_.read("a"), "<errno 2>");
    EXPECT_EQ(file_.read("c"), "plain");
    EXPECT_EQ(file_.read("d"), value);
}

TEST_F(AttributeStore, LeavesAFileAloneThatAlreadyHoldsTheBytes) {
    ASSERT_TRUE(file_.write("text", "same").ok());
    struct stat before = {};
    ::stat(file_.path().c_str(), &before);
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
    ASSERT_TRUE(file_.write("text", "same").ok());

    struct stat after = {};
    ::stat(file_.path().c_str(), &after);
    EXPECT_EQ(before.st_ctim.tv_sec, after.st_ctim.tv_sec);
    EXPECT_EQ(before.st_ctim.tv_nsec, after.st_ctim.tv_nsec);
}

TEST_F(AttributeStore, GivesReadersAWholeValueWhileEightThreadsWrite) {
    std::atomic<bool> writing{true};
    std::vector<std::thread> writers;
    for (int i = 0; i < 8; ++i) {
        writers.emplace_back([&, i] {
            const OpenFile file(file_.path());
            // Half of them spill.
            const std::string value(i % 2 == 0 ? 300u : 70'000u, static_cast<char>('a' + i));
            for (int round = 0; round < 20; ++round)
                EXPECT_TRUE(file.write("shared", value).ok());
        });
    }
    std::thread reader([&] {
        while (writing) {
            std::string value(70'000, '\0');
            const auto count = read_attribute(file_.file(), "shared", 0, value.data(), value.size());
            if (!count.ok())
                continue;
            EXPECT_TRUE(*count == 300 || *count == 70'000) << *count;
            EXPECT_EQ(value.substr(0, *count), std::string(*count, value[0]));
        }
    });
    for (std::thread& writer : writers)
        writer.join();
    writing = false;
    reader.join();
    EXPECT_EQ(blob_count(), 4u);
}

TEST_F(AttributeStore, LosesNoPartOfThreadsThatExtendOneValue) {
    ASSERT_TRUE(file_.write("log", std::string(64, '.')).ok());
    std::vector<std::thread> writers;
    for (int i = 0; i < 4; ++i) {
        writers.emplace_back([&, i] {
            const OpenFile file(file_.path());
            for (int round = 0; round < 50; ++round)
                EXPECT_TRUE(file.write_at("log", 64, std::string(10, static_cast<char>('a' + i))).ok());
        });
    }
    for (std::thread& writer : writers)
        writer.join();
    const std::string value = file_.read("log");
    ASSERT_EQ(value.size(), 74u);
    EXPECT_EQ(value.substr(0, 64), std::string(64, '.'));
    EXPECT_EQ(value.substr(64), std::string(10, value[64]));
}

} // namespace
} // namespace host
