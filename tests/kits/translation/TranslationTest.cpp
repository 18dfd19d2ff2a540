#include <Bitmap.h>
#include <BitmapStream.h>
#include <DataIO.h>
#include <Entry.h>
#include <TranslationErrors.h>
#include <TranslationUtils.h>
#include <Translator.h>
#include <TranslatorRoster.h>

#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <memory>
#include <stdlib.h>
#include <string.h>
#include <string>
#include <thread>

namespace fs = std::filesystem;

namespace {

uint32* PixelsOf(const BBitmap& bitmap) {
    return static_cast<uint32*>(bitmap.Bits());
}

// Two pixels, red and blue.
std::unique_ptr<BBitmap> RedAndBlue() {
    auto bitmap = std::make_unique<BBitmap>(BRect(0, 0, 1, 0), B_RGB32);
    PixelsOf(*bitmap)[0] = 0xFFFF0000;
    PixelsOf(*bitmap)[1] = 0xFF0000FF;
    return bitmap;
}

// The picture as a file of that type.
void Encode(uint32 type, BMallocIO& file) {
    BBitmapStream stream(RedAndBlue().release());
    ASSERT_EQ(BTranslatorRoster::Default()->Translate(&stream, nullptr, nullptr, &file, type), B_OK);
}

TEST(BitmapStream, GivesHeaderAndPixels) {
    BBitmapStream stream(RedAndBlue().release());
    off_t size = 0;
    EXPECT_EQ(stream.GetSize(&size), B_OK);
    EXPECT_EQ(size, 40);
    uint8 bytes[50] = {};
    EXPECT_EQ(stream.Read(bytes, sizeof(bytes)), 40);
    EXPECT_EQ(memcmp(bytes, "bits", 4), 0);
    EXPECT_EQ(bytes[12], 0x3F) << "right, 1.0, most significant byte first";
    EXPECT_EQ(bytes[23], 8) << "bytes a row";
    EXPECT_EQ(bytes[27], 8) << "B_RGB32";
    EXPECT_EQ(bytes[31], 8) << "bytes in all";
    EXPECT_EQ(bytes[34], 255);
    EXPECT_EQ(stream.Position(), 40);
    EXPECT_EQ(stream.Read(bytes, 1), 0);
    EXPECT_EQ(stream.Seek(-8, SEEK_END), 32);
    EXPECT_EQ(stream.Read(bytes, 3), 3);
    EXPECT_EQ(stream.Seek(-100, SEEK_CUR), B_BAD_VALUE);
    EXPECT_EQ(stream.Seek(0, 77), B_BAD_VALUE);
}

TEST(BitmapStream, MakesABitmapOfWhatIsWrittenInAnyPieces) {
    BBitmapStream source(RedAndBlue().release());
    for (const size_t piece : {size_t{1}, size_t{7}, size_t{40}}) {
        BBitmapStream stream;
        uint8 bytes[40];
        ASSERT_EQ(source.ReadAt(0, bytes, 40), 40);
        for (size_t at = 0; at < 40; at += piece) {
            const size_t count = std::min(piece, 40 - at);
            ASSERT_EQ(stream.Write(bytes + at, count), static_cast<ssize_t>(count));
        }
        EXPECT_EQ(stream.Write("x", 1), B_BAD_VALUE) << "beyond the end";
        BBitmap* bitmap = nullptr;
        ASSERT_EQ(stream.DetachBitmap(&bitmap), B_OK);
        EXPECT_EQ(PixelsOf(*bitmap)[1], 0xFF0000FFU);
        delete bitmap;
        EXPECT_EQ(stream.DetachBitmap(&bitmap), B_ERROR);
        EXPECT_EQ(bitmap, nullptr);
    }
}

TEST(BitmapStream, RefusesHeadersThatMakeNoBitmap) {
    BBitmapStream source(RedAndBlue().release());
    uint8 good[32];
    ASSERT_EQ(source.ReadAt(0, good, 32), 32);
    // Magic, right edge (NaN), bytes a row, colour space, data size; one after the other.
    const std::pair<size_t, uint8> damages[] = {{0, 'B'}, {12, 0x7F}, {20, 0x7F}, {23, 5},
                                                {27, 99}, {31, 9},    {28, 0xFF}};
    for (const auto& [at, value] : damages) {
        uint8 header[32];
        memcpy(header, good, sizeof(header));
        header[at] = value;
        if (at == 12) {
            header[13] = 0xC0;
        }
        BBitmapStream stream;
        EXPECT_EQ(stream.WriteAt(0, header, 32), B_ILLEGAL_DATA) << at;
        BBitmap* bitmap = nullptr;
        EXPECT_EQ(stream.DetachBitmap(&bitmap), B_ERROR) << at;
    }
    BBitmapStream empty;
    uint8 byte = 0;
    EXPECT_EQ(empty.WriteAt(5, &byte, 1), B_BAD_VALUE) << "not from its beginning";
    EXPECT_EQ(empty.ReadAt(0, &byte, 1), 0);
    EXPECT_EQ(empty.ReadAt(-1, &byte, 1), B_BAD_VALUE);
}

TEST(TranslatorRoster, KnowsPicturesByTheirContents) {
    for (const uint32 type : {static_cast<uint32>(B_PNG_FORMAT), static_cast<uint32>(B_BMP_FORMAT),
                              static_cast<uint32>(B_JPEG_FORMAT), static_cast<uint32>(B_TRANSLATOR_BITMAP)}) {
        BMallocIO file;
        Encode(type, file);
        translator_info info;
        ASSERT_EQ(BTranslatorRoster::Default()->Identify(&file, nullptr, &info), B_OK);
        EXPECT_EQ(info.type, type);
        EXPECT_EQ(info.group, static_cast<uint32>(B_TRANSLATOR_BITMAP));
        EXPECT_GT(info.quality, 0);
        EXPECT_GT(strlen(info.MIME), 6U);
        EXPECT_EQ(BTranslatorRoster::Default()->Identify(&file, nullptr, &info, 0, nullptr, 'none'),
                  B_NO_TRANSLATOR);
    }
    BMemoryIO text("this is only a text", 19);
    translator_info info;
    EXPECT_EQ(BTranslatorRoster::Default()->Identify(&text, nullptr, &info), B_NO_TRANSLATOR);
    EXPECT_EQ(BTranslatorRoster::Default()->Identify(nullptr, nullptr, &info), B_BAD_VALUE);
}

TEST(TranslatorRoster, TranslatesThereAndBack) {
    BMallocIO file;
    Encode(B_PNG_FORMAT, file);
    // Wherever the stream stands.
    file.Seek(5, SEEK_SET);
    BBitmapStream stream;
    ASSERT_EQ(BTranslatorRoster::Default()->Translate(&file, nullptr, nullptr, &stream, B_TRANSLATOR_BITMAP),
              B_OK);
    BBitmap* bitmap = nullptr;
    ASSERT_EQ(stream.DetachBitmap(&bitmap), B_OK);
    const std::unique_ptr<BBitmap> owned(bitmap);
    EXPECT_EQ(bitmap->Bounds(), BRect(0, 0, 1, 0));
    EXPECT_EQ(bitmap->ColorSpace(), B_RGB32);
    EXPECT_EQ(PixelsOf(*bitmap)[0], 0xFFFF0000U);
    EXPECT_EQ(PixelsOf(*bitmap)[1], 0xFF0000FFU);
}

TEST(TranslatorRoster, DamagedPicturesAreSaidToBeSo) {
    BMallocIO file;
    Encode(B_PNG_FORMAT, file);
    BMemoryIO cut(file.Buffer(), 40);
    BBitmapStream stream;
    EXPECT_EQ(BTranslatorRoster::Default()->Translate(&cut, nullptr, nullptr, &stream, B_TRANSLATOR_BITMAP),
              B_ILLEGAL_DATA);
    EXPECT_EQ(BTranslatorRoster::Default()->Translate(99, &file, nullptr, &stream, B_TRANSLATOR_BITMAP),
              B_NO_TRANSLATOR);
    EXPECT_EQ(BTranslatorRoster::Default()->Translate(1, &file, nullptr, &stream, B_TRANSLATOR_BITMAP), B_OK);
}

TEST(TranslatorRoster, ListsItsTranslatorsAndTheirFormats) {
    translator_id* ids = nullptr;
    int32 count = 0;
    ASSERT_EQ(BTranslatorRoster::Default()->GetAllTranslators(&ids, &count), B_OK);
    ASSERT_GE(count, 1);
    const char* name = nullptr;
    int32 version = 0;
    EXPECT_EQ(BTranslatorRoster::Default()->GetTranslatorInfo(ids[0], &name, nullptr, &version), B_OK);
    EXPECT_STREQ(name, "Picture files");
    const translation_format* formats = nullptr;
    int32 formatCount = 0;
    EXPECT_EQ(BTranslatorRoster::Default()->GetInputFormats(ids[0], &formats, &formatCount), B_OK);
    EXPECT_GT(formatCount, 3);
    EXPECT_EQ(formats[0].type, static_cast<uint32>(B_TRANSLATOR_BITMAP));
    EXPECT_EQ(BTranslatorRoster::Default()->GetOutputFormats(0, &formats, &formatCount), B_NO_TRANSLATOR);
    delete[] ids;
}

// Knows data that begins with "mine".
class OwnTranslator : public BTranslator {
  public:
    explicit OwnTranslator(bool* deleted) : mDeleted(deleted) {}
    const char* TranslatorName() const override { return "Own"; }
    const char* TranslatorInfo() const override { return "Own"; }
    int32 TranslatorVersion() const override { return 7; }
    const translation_format* InputFormats(int32* count) const override {
        *count = 0;
        return nullptr;
    }
    const translation_format* OutputFormats(int32* count) const override { return InputFormats(count); }
    status_t Identify(BPositionIO* source, const translation_format* format, BMessage*, translator_info* info,
                      uint32) override {
        char start[4] = {};
        source->ReadAt(0, start, 4);
        if (memcmp(start, "mine", 4) != 0) {
            return B_NO_TRANSLATOR;
        }
        info->type = format == nullptr ? 'mine' : format->type;
        return B_OK;
    }
    status_t Translate(BPositionIO*, const translator_info*, BMessage*, uint32,
                       BPositionIO* destination) override {
        return destination->WriteAt(0, "done", 4) == 4 ? B_OK : B_ERROR;
    }

  protected:
    ~OwnTranslator() override { *mDeleted = true; }

  private:
    bool* mDeleted;
};

TEST(TranslatorRoster, UsesTranslatorsThatAreAddedAndLetsThemGo) {
    bool deleted = false;
    {
        BTranslatorRoster roster;
        auto* const translator = new OwnTranslator(&deleted);
        EXPECT_EQ(roster.AddTranslator(translator), B_OK);
        EXPECT_EQ(roster.AddTranslator(translator), B_BAD_VALUE);
        EXPECT_EQ(translator->ReferenceCount(), 2);
        EXPECT_NE(translator->Release(), nullptr);
        BMemoryIO source("mine, all mine", 14);
        translator_info info;
        EXPECT_EQ(roster.Identify(&source, nullptr, &info), B_OK);
        EXPECT_EQ(info.type, static_cast<uint32>('mine'));
        EXPECT_EQ(info.translator, 1);
        EXPECT_EQ(roster.Identify(&source, nullptr, &info, 'hint'), B_OK);
        EXPECT_EQ(info.type, static_cast<uint32>('hint'));
        BMallocIO result;
        EXPECT_EQ(roster.Translate(&source, nullptr, nullptr, &result, 0), B_OK);
        EXPECT_EQ(memcmp(result.Buffer(), "done", 4), 0);
        EXPECT_FALSE(deleted);
    }
    EXPECT_TRUE(deleted);
}

class PictureFiles : public ::testing::Test {
  protected:
    void SetUp() override {
        std::string pattern = (fs::temp_directory_path() / "pictures-XXXXXX").string();
        ASSERT_NE(mkdtemp(pattern.data()), nullptr);
        mFolder = pattern;
        BMallocIO file;
        Encode(B_PNG_FORMAT, file);
        mPath = (mFolder / "cover").string();
        std::ofstream(mPath, std::ios::binary)
            .write(static_cast<const char*>(file.Buffer()),
                   static_cast<std::streamsize>(file.BufferLength()));
    }
    void TearDown() override { fs::remove_all(mFolder); }

    fs::path mFolder;
    std::string mPath;
};

TEST_F(PictureFiles, AreReadByPathAndByReference) {
    const std::unique_ptr<BBitmap> byPath(BTranslationUtils::GetBitmap(mPath.c_str()));
    ASSERT_NE(byPath, nullptr);
    EXPECT_EQ(PixelsOf(*byPath)[0], 0xFFFF0000U);
    entry_ref ref;
    ASSERT_EQ(get_ref_for_path(mPath.c_str(), &ref), B_OK);
    const std::unique_ptr<BBitmap> byRef(BTranslationUtils::GetBitmap(&ref));
    ASSERT_NE(byRef, nullptr);
    EXPECT_EQ(PixelsOf(*byRef)[1], 0xFF0000FFU);
}

TEST_F(PictureFiles, WhatIsNoPictureIsNull) {
    std::ofstream(mFolder / "text") << "no picture";
    EXPECT_EQ(BTranslationUtils::GetBitmap((mFolder / "text").c_str()), nullptr);
    EXPECT_EQ(BTranslationUtils::GetBitmap((mFolder / "missing").c_str()), nullptr);
    EXPECT_EQ(BTranslationUtils::GetBitmap(mFolder.c_str()), nullptr);
    EXPECT_EQ(BTranslationUtils::GetBitmap(static_cast<const char*>(nullptr)), nullptr);
    EXPECT_EQ(BTranslationUtils::GetBitmap(static_cast<const entry_ref*>(nullptr)), nullptr);
    EXPECT_EQ(BTranslationUtils::GetBitmap(static_cast<BPositionIO*>(nullptr)), nullptr);
    BMemoryIO empty("", 0);
    EXPECT_EQ(BTranslationUtils::GetBitmap(&empty), nullptr);
}

TEST_F(PictureFiles, AreReadBySeveralThreads) {
    std::vector<int> good(4, 0);
    std::vector<std::thread> threads;
    for (size_t t = 0; t < good.size(); ++t) {
        threads.emplace_back([&, t] {
            for (int i = 0; i < 10; ++i) {
                const std::unique_ptr<BBitmap> bitmap(BTranslationUtils::GetBitmap(mPath.c_str()));
                good[t] += bitmap != nullptr && PixelsOf(*bitmap)[0] == 0xFFFF0000U;
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(good, std::vector<int>(4, 10));
}

} // namespace
