// BTranslatorRoster: all translators, and asking the right one.
#pragma once

#include <Archivable.h>
#include <ThreadSafety.h>
#include <TranslationDefs.h>
#include <TranslationErrors.h>

#include <vector>

class BMessage;
class BPositionIO;
class BRect;
class BTranslator;
class BView;

// Any thread. Streams belong to the caller and are used by the calling thread alone.
class BTranslatorRoster : public BArchivable {
  public:
    // An empty one; Default() has the picture translator.
    BTranslatorRoster();
    ~BTranslatorRoster() override;
    BTranslatorRoster(const BTranslatorRoster&) = delete;
    BTranslatorRoster& operator=(const BTranslatorRoster&) = delete;

    // The one for the whole program; never deleted.
    static BTranslatorRoster* Default();

    // There are no translators to load from files here: always B_UNSUPPORTED.
    status_t AddTranslators(const char* loadPath = nullptr);
    // The roster becomes one more user of the translator. B_BAD_VALUE for null or one that it has.
    status_t AddTranslator(BTranslator* translator);

    // The translator that handles the data best and can turn it into `wantType` (0: anything). The hints are
    // for data that does not tell by itself. B_NO_TRANSLATOR when nobody knows it.
    [[nodiscard]] status_t Identify(BPositionIO* source, BMessage* settings, translator_info* info,
                                    uint32 hintType = 0, const char* hintMime = nullptr, uint32 wantType = 0);
    // All of them, the best first; the caller frees the array with delete[].
    [[nodiscard]] status_t GetTranslators(BPositionIO* source, BMessage* settings, translator_info** info,
                                          int32* numInfo, uint32 hintType = 0, const char* hintMime = nullptr,
                                          uint32 wantType = 0);
    // The caller frees the array with delete[].
    [[nodiscard]] status_t GetAllTranslators(translator_id** ids, int32* count);

    // Texts and arrays belong to the translator. B_NO_TRANSLATOR for an unknown number.
    status_t GetTranslatorInfo(translator_id id, const char** name, const char** info, int32* version);
    status_t GetInputFormats(translator_id id, const translation_format** formats, int32* count);
    status_t GetOutputFormats(translator_id id, const translation_format** formats, int32* count);

    // Identifies the data first where `info` is null. `wantOutType` 0 is the common form of the data's group.
    // What has been written to `destination` before an error is of no use.
    [[nodiscard]] status_t Translate(BPositionIO* source, const translator_info* info, BMessage* settings,
                                     BPositionIO* destination, uint32 wantOutType, uint32 hintType = 0,
                                     const char* hintMime = nullptr);
    [[nodiscard]] status_t Translate(translator_id id, BPositionIO* source, BMessage* settings,
                                     BPositionIO* destination, uint32 wantOutType);

    status_t MakeConfigurationView(translator_id id, BMessage* settings, BView** view, BRect* extent);
    status_t GetConfigurationMessage(translator_id id, BMessage* settings);

  private:
    // With one more user; null for an unknown number.
    BTranslator* TranslatorFor(translator_id id);
    std::vector<BTranslator*> AcquireAll();

    GuardMutex mMutex;
    // Numbered from 1 by their place.
    std::vector<BTranslator*> mTranslators GUARDED_BY(mMutex);
};
