#include <TranslationUtils.h>

#include <Bitmap.h>
#include <BitmapStream.h>
#include <File.h>
#include <TranslatorRoster.h>

BBitmap* BTranslationUtils::GetBitmap(BPositionIO* stream, BTranslatorRoster* roster) {
    if (stream == nullptr) {
        return nullptr;
    }
    if (roster == nullptr) {
        roster = BTranslatorRoster::Default();
    }
    BBitmapStream bitmapStream;
    if (roster->Translate(stream, nullptr, nullptr, &bitmapStream, B_TRANSLATOR_BITMAP) != B_OK) {
        return nullptr;
    }
    BBitmap* bitmap = nullptr;
    return bitmapStream.DetachBitmap(&bitmap) == B_OK ? bitmap : nullptr;
}

BBitmap* BTranslationUtils::GetBitmap(const entry_ref* ref, BTranslatorRoster* roster) {
    BFile file(ref, B_READ_ONLY);
    return file.InitCheck() == B_OK ? GetBitmap(&file, roster) : nullptr;
}

BBitmap* BTranslationUtils::GetBitmap(const char* path, BTranslatorRoster* roster) {
    return GetBitmapFile(path, roster);
}

BBitmap* BTranslationUtils::GetBitmapFile(const char* path, BTranslatorRoster* roster) {
    if (path == nullptr) {
        return nullptr;
    }
    BFile file(path, B_READ_ONLY);
    return file.InitCheck() == B_OK ? GetBitmap(&file, roster) : nullptr;
}
