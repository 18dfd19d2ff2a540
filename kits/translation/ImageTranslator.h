// ImageTranslator: the picture formats that the host reads and writes.
#pragma once

#include <Translator.h>

#include <string>
#include <vector>

// Reads every picture file that the host knows, and the common form; writes the common form and the host's
// output formats. Pictures come out as B_RGBA32 where they have transparency, else as B_RGB32.
class ImageTranslator : public BTranslator {
  public:
    ImageTranslator();

    const char* TranslatorName() const override { return "Picture files"; }
    const char* TranslatorInfo() const override {
        return "Picture files, as far as this machine can read them";
    }
    int32 TranslatorVersion() const override { return 100; }
    const translation_format* InputFormats(int32* count) const override;
    const translation_format* OutputFormats(int32* count) const override;
    status_t Identify(BPositionIO* source, const translation_format* format, BMessage* settings,
                      translator_info* info, uint32 outType) override;
    status_t Translate(BPositionIO* source, const translator_info* info, BMessage* settings, uint32 outType,
                       BPositionIO* destination) override;

  protected:
    ~ImageTranslator() override;

  private:
    bool CanWrite(uint32 type) const;

    std::vector<translation_format> mInputs;
    std::vector<translation_format> mOutputs;
};
