// BTranslator: something that turns data of one format into another.
#pragma once

#include <Archivable.h>
#include <TranslationDefs.h>

#include <atomic>

class BMessage;
class BPositionIO;
class BView;

// Counted: begins with one user, its maker; the last Release() deletes it. Any thread may translate, several
// at once.
class BTranslator : public BArchivable {
  public:
    BTranslator();
    BTranslator(const BTranslator&) = delete;
    BTranslator& operator=(const BTranslator&) = delete;

    BTranslator* Acquire();
    // Null when that was the last user.
    BTranslator* Release();
    int32 ReferenceCount() const { return mUsers.load(); }

    virtual const char* TranslatorName() const = 0;
    virtual const char* TranslatorInfo() const = 0;
    virtual int32 TranslatorVersion() const = 0;

    // Arrays owned by the translator, valid as long as it is.
    virtual const translation_format* InputFormats(int32* count) const = 0;
    virtual const translation_format* OutputFormats(int32* count) const = 0;

    // B_OK, with what the data is in `info`, when this translator can turn it into `outType` (0: anything);
    // B_NO_TRANSLATOR otherwise. `format` is a guess of the caller's, or null.
    virtual status_t Identify(BPositionIO* source, const translation_format* format, BMessage* settings,
                              translator_info* info, uint32 outType) = 0;
    // Writes the whole of `source` as `outType` (0: the group's common form). B_NO_TRANSLATOR,
    // B_ILLEGAL_DATA, B_NO_MEMORY or an error of the streams.
    virtual status_t Translate(BPositionIO* source, const translator_info* info, BMessage* settings,
                               uint32 outType, BPositionIO* destination) = 0;
    // Translators without settings have no view: B_NOT_ALLOWED.
    virtual status_t MakeConfigurationView(BMessage* settings, BView** view, BRect* extent);
    virtual status_t GetConfigurationMessage(BMessage* settings);

  protected:
    ~BTranslator() override;

  private:
    std::atomic<int32> mUsers{1};
};
