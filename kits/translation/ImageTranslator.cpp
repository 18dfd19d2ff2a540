#include "ImageTranslator.h"

#include <Bitmap.h>
#include <BitmapStream.h>
#include <CopyText.h>
#include <DataIO.h>
#include <TranslationErrors.h>

#include <algorithm>
#include <host/api/image_decoder.h>
#include <memory>
#include <new>
#include <string.h>

namespace {

constexpr size_t kIdentifySize = 4096;
constexpr size_t kReadStep = size_t{1} << 20;
constexpr float kFileQuality = 0.7F;
constexpr float kCommonQuality = 0.3F;
constexpr float kCapability = 0.8F;
constexpr char kCommonMime[] = "image/x-be-bitmap";

// Known formats have the API's numbers; others are numbered by the first letters of their names.
uint32 TypeOfFormat(const std::string& name) {
    static const struct {
        const char* name;
        uint32 type;
    } known[] = {{"gif", B_GIF_FORMAT}, {"jpeg", B_JPEG_FORMAT}, {"jpg", B_JPEG_FORMAT},
                 {"png", B_PNG_FORMAT}, {"ppm", B_PPM_FORMAT},   {"tga", B_TGA_FORMAT},
                 {"bmp", B_BMP_FORMAT}, {"tif", B_TIFF_FORMAT},  {"tiff", B_TIFF_FORMAT}};
    for (const auto& entry : known) {
        if (name == entry.name) {
            return entry.type;
        }
    }
    uint32 type = 0;
    for (size_t i = 0; i < 4; ++i) {
        type = (type << 8) | static_cast<uint8>(i < name.size() ? name[i] : ' ');
    }
    return type;
}

translation_format MakeFormat(uint32 type, float quality, const char* mime, const std::string& name) {
    translation_format format = {};
    format.type = type;
    format.group = B_TRANSLATOR_BITMAP;
    format.quality = quality;
    format.capability = kCapability;
    CopyText(format.MIME, mime);
    CopyText(format.name, name.c_str());
    return format;
}

// The whole stream, whatever its position.
status_t ReadAll(BPositionIO& source, std::vector<std::byte>& data) {
    off_t position = 0;
    for (;;) {
        const size_t start = data.size();
        if (start > host::max_image_file_size) {
            return B_ILLEGAL_DATA;
        }
        try {
            data.resize(start + kReadStep);
        } catch (const std::bad_alloc&) {
            return B_NO_MEMORY;
        }
        const ssize_t got = source.ReadAt(position, data.data() + start, kReadStep);
        data.resize(start + static_cast<size_t>(std::max<ssize_t>(got, 0)));
        if (got < 0) {
            return static_cast<status_t>(got);
        }
        if (got == 0) {
            return B_OK;
        }
        position += got;
    }
}

bool IsCommonForm(const std::byte* data, size_t size) {
    static constexpr unsigned char kMagic[] = {'b', 'i', 't', 's'};
    return size >= sizeof(TranslatorBitmap) && memcmp(data, kMagic, sizeof(kMagic)) == 0;
}

status_t StatusOf(host::ImageStatus status) {
    switch (status) {
    case host::ImageStatus::ok:
        return B_OK;
    case host::ImageStatus::unknown_format:
        return B_NO_TRANSLATOR;
    case host::ImageStatus::no_memory:
        return B_NO_MEMORY;
    case host::ImageStatus::damaged:
    case host::ImageStatus::too_large:
        break;
    }
    return B_ILLEGAL_DATA;
}

status_t LoadBitmap(const std::vector<std::byte>& data, std::unique_ptr<BBitmap>& bitmap) {
    if (IsCommonForm(data.data(), data.size())) {
        BBitmapStream stream;
        const ssize_t written = stream.WriteAt(0, data.data(), data.size());
        if (written < 0) {
            return static_cast<status_t>(written);
        }
        BBitmap* detached = nullptr;
        const status_t status = stream.DetachBitmap(&detached);
        bitmap.reset(detached);
        return status;
    }
    const host::DecodedImage image = host::decode_image(data);
    if (image.status != host::ImageStatus::ok) {
        return StatusOf(image.status);
    }
    const BRect bounds(0, 0, static_cast<float>(image.width - 1), static_cast<float>(image.height - 1));
    bitmap = std::make_unique<BBitmap>(bounds, image.has_alpha ? B_RGBA32 : B_RGB32);
    if (!bitmap->IsValid()) {
        return bitmap->InitCheck() == B_NO_MEMORY ? B_NO_MEMORY : B_ILLEGAL_DATA;
    }
    memcpy(bitmap->Bits(), image.pixels.data(), image.pixels.size() * sizeof(uint32));
    return B_OK;
}

// Pixels of any bitmap as the host takes them.
status_t PixelsOf(const BBitmap& bitmap, std::vector<uint32>& pixels, bool& hasAlpha) {
    const color_space space = bitmap.ColorSpace();
    hasAlpha = space == B_RGBA32 || space == B_RGBA32_BIG || space == B_RGBA15 || space == B_RGBA15_BIG ||
               space == B_CMAP8;
    BBitmap converted(bitmap.Bounds(), B_RGBA32);
    if (!converted.IsValid()) {
        return B_NO_MEMORY;
    }
    const status_t status = converted.ImportBits(&bitmap);
    if (status == B_OK) {
        const auto* const first = static_cast<const uint32*>(converted.Bits());
        pixels.assign(first, first + converted.BitsLength() / 4);
    }
    return status;
}

status_t WriteAll(BPositionIO& destination, off_t position, const void* data, size_t size) {
    return destination.WriteAtExactly(position, data, size);
}

status_t WriteCommonForm(std::unique_ptr<BBitmap> bitmap, BPositionIO& destination) {
    const void* const bits = bitmap->Bits();
    const auto length = static_cast<size_t>(bitmap->BitsLength());
    BBitmapStream stream(bitmap.release());
    uint8 header[sizeof(TranslatorBitmap)];
    status_t status = stream.ReadAtExactly(0, header, sizeof(header));
    if (status == B_OK) {
        status = WriteAll(destination, 0, header, sizeof(header));
    }
    return status == B_OK ? WriteAll(destination, sizeof(header), bits, length) : status;
}

} // namespace

ImageTranslator::ImageTranslator() {
    const translation_format common = MakeFormat(B_TRANSLATOR_BITMAP, kCommonQuality, kCommonMime, "Bitmap");
    mInputs.push_back(common);
    mOutputs.push_back(common);
    for (const host::ImageFormat& format : host::image_formats()) {
        const translation_format described = MakeFormat(TypeOfFormat(format.name), kFileQuality,
                                                        format.mime_type.c_str(), format.name + " picture");
        if (format.can_read) {
            mInputs.push_back(described);
        }
        if (format.can_write) {
            mOutputs.push_back(described);
        }
    }
}

ImageTranslator::~ImageTranslator() = default;

const translation_format* ImageTranslator::InputFormats(int32* count) const {
    *count = static_cast<int32>(mInputs.size());
    return mInputs.data();
}

const translation_format* ImageTranslator::OutputFormats(int32* count) const {
    *count = static_cast<int32>(mOutputs.size());
    return mOutputs.data();
}

bool ImageTranslator::CanWrite(uint32 type) const {
    return type == 0 || std::any_of(mOutputs.begin(), mOutputs.end(),
                                    [type](const translation_format& format) { return format.type == type; });
}

status_t ImageTranslator::Identify(BPositionIO* source, const translation_format* /*format*/,
                                   BMessage* /*settings*/, translator_info* info, uint32 outType) {
    if (source == nullptr || info == nullptr || !CanWrite(outType)) {
        return B_NO_TRANSLATOR;
    }
    std::vector<std::byte> start(kIdentifySize);
    const ssize_t got = source->ReadAt(0, start.data(), start.size());
    if (got < 0) {
        return static_cast<status_t>(got);
    }
    start.resize(static_cast<size_t>(got));
    const translation_format* found = nullptr;
    if (IsCommonForm(start.data(), start.size())) {
        found = &mInputs.front();
    } else if (const std::string name = host::identify_image(start); !name.empty()) {
        const uint32 type = TypeOfFormat(name);
        for (const translation_format& format : mInputs) {
            if (format.type == type) {
                found = &format;
                break;
            }
        }
    }
    if (found == nullptr) {
        return B_NO_TRANSLATOR;
    }
    info->type = found->type;
    info->translator = 0;
    info->group = found->group;
    info->quality = found->quality;
    info->capability = found->capability;
    CopyText(info->name, found->name);
    CopyText(info->MIME, found->MIME);
    return B_OK;
}

status_t ImageTranslator::Translate(BPositionIO* source, const translator_info* /*info*/,
                                    BMessage* /*settings*/, uint32 outType, BPositionIO* destination) {
    if (source == nullptr || destination == nullptr) {
        return B_BAD_VALUE;
    }
    if (!CanWrite(outType)) {
        return B_NO_TRANSLATOR;
    }
    std::vector<std::byte> data;
    if (const status_t status = ReadAll(*source, data); status != B_OK) {
        return status;
    }
    std::unique_ptr<BBitmap> bitmap;
    if (const status_t status = LoadBitmap(data, bitmap); status != B_OK) {
        return status;
    }
    data.clear();
    data.shrink_to_fit();
    if (outType == 0 || outType == B_TRANSLATOR_BITMAP) {
        return WriteCommonForm(std::move(bitmap), *destination);
    }
    std::vector<uint32> pixels;
    bool hasAlpha = false;
    if (const status_t status = PixelsOf(*bitmap, pixels, hasAlpha); status != B_OK) {
        return status;
    }
    for (const host::ImageFormat& format : host::image_formats()) {
        if (format.can_write && TypeOfFormat(format.name) == outType) {
            const int width = bitmap->Bounds().IntegerWidth() + 1;
            const int height = bitmap->Bounds().IntegerHeight() + 1;
            const host::EncodedImage file = host::encode_image(format.name, width, height, hasAlpha, pixels);
            if (file.status != host::ImageStatus::ok) {
                return StatusOf(file.status);
            }
            return WriteAll(*destination, 0, file.data.data(), file.data.size());
        }
    }
    return B_NO_TRANSLATOR;
}
