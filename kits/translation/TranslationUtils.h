// BTranslationUtils: pictures from files in one call.
#pragma once

#include <EntryRef.h>
#include <SupportDefs.h>

class BBitmap;
class BPositionIO;
class BTranslatorRoster;

// Any thread. The roster is the default one where null is given. The bitmaps are the caller's; null means
// that there is no such file, or that nobody can read it as a picture.
class BTranslationUtils {
  public:
    BTranslationUtils() = delete;

    // The whole stream, whatever its position.
    [[nodiscard]] static BBitmap* GetBitmap(BPositionIO* stream, BTranslatorRoster* roster = nullptr);
    [[nodiscard]] static BBitmap* GetBitmap(const entry_ref* ref, BTranslatorRoster* roster = nullptr);
    // A file's path; programs have no resources of pictures here.
    [[nodiscard]] static BBitmap* GetBitmap(const char* path, BTranslatorRoster* roster = nullptr);
    [[nodiscard]] static BBitmap* GetBitmapFile(const char* path, BTranslatorRoster* roster = nullptr);
};
