#include <TranslatorRoster.h>

#include "ImageTranslator.h"

#include <algorithm>
#include <new>
#include <string.h>

namespace {

// The caller's guess about the data, as translators take it; null where there is none.
class Hint {
  public:
    Hint(uint32 type, const char* mime) : mGiven(type != 0 || mime != nullptr) {
        mFormat.type = type;
        if (mime != nullptr) {
            strncpy(mFormat.MIME, mime, sizeof(mFormat.MIME) - 1);
        }
    }
    const translation_format* Format() const { return mGiven ? &mFormat : nullptr; }

  private:
    translation_format mFormat = {};
    bool mGiven;
};

} // namespace

BTranslatorRoster::BTranslatorRoster() = default;

BTranslatorRoster::~BTranslatorRoster() {
    const GuardLock lock(mMutex);
    for (BTranslator* const translator : mTranslators) {
        translator->Release();
    }
}

BTranslatorRoster* BTranslatorRoster::Default() {
    static BTranslatorRoster* const roster = [] {
        auto* const made = new BTranslatorRoster;
        auto* const pictures = new ImageTranslator;
        made->AddTranslator(pictures);
        pictures->Release();
        return made;
    }();
    return roster;
}

status_t BTranslatorRoster::AddTranslators(const char* /*loadPath*/) {
    return B_UNSUPPORTED;
}

status_t BTranslatorRoster::AddTranslator(BTranslator* translator) {
    const GuardLock lock(mMutex);
    if (translator == nullptr ||
        std::find(mTranslators.begin(), mTranslators.end(), translator) != mTranslators.end()) {
        return B_BAD_VALUE;
    }
    mTranslators.push_back(translator->Acquire());
    return B_OK;
}

BTranslator* BTranslatorRoster::TranslatorFor(translator_id id) {
    const GuardLock lock(mMutex);
    if (id < 1 || static_cast<size_t>(id) > mTranslators.size()) {
        return nullptr;
    }
    return mTranslators[static_cast<size_t>(id - 1)]->Acquire();
}

std::vector<BTranslator*> BTranslatorRoster::AcquireAll() {
    const GuardLock lock(mMutex);
    for (BTranslator* const translator : mTranslators) {
        translator->Acquire();
    }
    return mTranslators;
}

status_t BTranslatorRoster::Identify(BPositionIO* source, BMessage* settings, translator_info* info,
                                     uint32 hintType, const char* hintMime, uint32 wantType) {
    if (info == nullptr) {
        return B_BAD_VALUE;
    }
    translator_info* all = nullptr;
    int32 count = 0;
    const status_t status = GetTranslators(source, settings, &all, &count, hintType, hintMime, wantType);
    if (status == B_OK) {
        *info = all[0];
    }
    delete[] all;
    return status;
}

status_t BTranslatorRoster::GetTranslators(BPositionIO* source, BMessage* settings, translator_info** info,
                                           int32* numInfo, uint32 hintType, const char* hintMime,
                                           uint32 wantType) {
    if (source == nullptr || info == nullptr || numInfo == nullptr) {
        return B_BAD_VALUE;
    }
    *info = nullptr;
    *numInfo = 0;
    const Hint hint(hintType, hintMime);
    std::vector<translator_info> found;
    translator_id id = 0;
    // Translators run without the lock: they read files, and may take their time.
    for (BTranslator* const translator : AcquireAll()) {
        ++id;
        translator_info one = {};
        if (translator->Identify(source, hint.Format(), settings, &one, wantType) == B_OK) {
            one.translator = id;
            found.push_back(one);
        }
        translator->Release();
    }
    if (found.empty()) {
        return B_NO_TRANSLATOR;
    }
    std::stable_sort(found.begin(), found.end(), [](const translator_info& a, const translator_info& b) {
        return a.quality * a.capability > b.quality * b.capability;
    });
    *info = new (std::nothrow) translator_info[found.size()];
    if (*info == nullptr) {
        return B_NO_MEMORY;
    }
    std::copy(found.begin(), found.end(), *info);
    *numInfo = static_cast<int32>(found.size());
    return B_OK;
}

status_t BTranslatorRoster::GetAllTranslators(translator_id** ids, int32* count) {
    if (ids == nullptr || count == nullptr) {
        return B_BAD_VALUE;
    }
    const GuardLock lock(mMutex);
    *count = static_cast<int32>(mTranslators.size());
    *ids = new (std::nothrow) translator_id[mTranslators.size()];
    if (*ids == nullptr) {
        return B_NO_MEMORY;
    }
    for (int32 i = 0; i < *count; ++i) {
        (*ids)[i] = i + 1;
    }
    return B_OK;
}

status_t BTranslatorRoster::GetTranslatorInfo(translator_id id, const char** name, const char** info,
                                              int32* version) {
    BTranslator* const translator = TranslatorFor(id);
    if (translator == nullptr) {
        return B_NO_TRANSLATOR;
    }
    if (name != nullptr) {
        *name = translator->TranslatorName();
    }
    if (info != nullptr) {
        *info = translator->TranslatorInfo();
    }
    if (version != nullptr) {
        *version = translator->TranslatorVersion();
    }
    translator->Release();
    return B_OK;
}

status_t BTranslatorRoster::GetInputFormats(translator_id id, const translation_format** formats,
                                            int32* count) {
    BTranslator* const translator = TranslatorFor(id);
    if (translator == nullptr) {
        return B_NO_TRANSLATOR;
    }
    *formats = translator->InputFormats(count);
    translator->Release();
    return B_OK;
}

status_t BTranslatorRoster::GetOutputFormats(translator_id id, const translation_format** formats,
                                             int32* count) {
    BTranslator* const translator = TranslatorFor(id);
    if (translator == nullptr) {
        return B_NO_TRANSLATOR;
    }
    *formats = translator->OutputFormats(count);
    translator->Release();
    return B_OK;
}

status_t BTranslatorRoster::Translate(BPositionIO* source, const translator_info* info, BMessage* settings,
                                      BPositionIO* destination, uint32 wantOutType, uint32 hintType,
                                      const char* hintMime) {
    if (source == nullptr || destination == nullptr) {
        return B_BAD_VALUE;
    }
    translator_info identified = {};
    if (info == nullptr) {
        const status_t status = Identify(source, settings, &identified, hintType, hintMime, wantOutType);
        if (status != B_OK) {
            return status;
        }
        info = &identified;
    }
    BTranslator* const translator = TranslatorFor(info->translator);
    if (translator == nullptr) {
        return B_NO_TRANSLATOR;
    }
    const status_t status = translator->Translate(source, info, settings, wantOutType, destination);
    translator->Release();
    return status;
}

status_t BTranslatorRoster::Translate(translator_id id, BPositionIO* source, BMessage* settings,
                                      BPositionIO* destination, uint32 wantOutType) {
    if (source == nullptr || destination == nullptr) {
        return B_BAD_VALUE;
    }
    BTranslator* const translator = TranslatorFor(id);
    if (translator == nullptr) {
        return B_NO_TRANSLATOR;
    }
    translator_info info = {};
    status_t status = translator->Identify(source, nullptr, settings, &info, wantOutType);
    if (status == B_OK) {
        info.translator = id;
        status = translator->Translate(source, &info, settings, wantOutType, destination);
    }
    translator->Release();
    return status;
}

status_t BTranslatorRoster::MakeConfigurationView(translator_id id, BMessage* settings, BView** view,
                                                  BRect* extent) {
    BTranslator* const translator = TranslatorFor(id);
    if (translator == nullptr) {
        return B_NO_TRANSLATOR;
    }
    const status_t status = translator->MakeConfigurationView(settings, view, extent);
    translator->Release();
    return status;
}

status_t BTranslatorRoster::GetConfigurationMessage(translator_id id, BMessage* settings) {
    BTranslator* const translator = TranslatorFor(id);
    if (translator == nullptr) {
        return B_NO_TRANSLATOR;
    }
    const status_t status = translator->GetConfigurationMessage(settings);
    translator->Release();
    return status;
}
