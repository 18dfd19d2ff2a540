#include <Font.h>

#include "TextTruncation.h"
#include "Utf8Text.h"

#include <CopyText.h>
#include <String.h>
#include <ThreadSafety.h>

#include <algorithm>
#include <host/api/fonts.h>
#include <optional>
#include <stdio.h>
#include <string.h>
#include <vector>

namespace {

constexpr int kRegularWeight = 400;
constexpr int kBoldWeight = 700;
constexpr int kLeastBoldWeight = 600;
constexpr uint16 kStyleFaces = B_ITALIC_FACE | B_BOLD_FACE | B_REGULAR_FACE;

uint16 FaceOf(int weight, bool italic) {
    uint16 face = 0;
    if (weight >= kLeastBoldWeight) {
        face |= B_BOLD_FACE;
    }
    if (italic) {
        face |= B_ITALIC_FACE;
    }
    return face == 0 ? static_cast<uint16>(B_REGULAR_FACE) : face;
}

bool FamilyExists(const std::string& family) {
    return !host::font_styles(family).empty();
}

// The numbers that stand for family and style pairs in this process.
class FamilyCodes {
  public:
    struct Entry {
        std::string family;
        std::string style;
        int weight = kRegularWeight;
        bool italic = false;

        bool operator==(const Entry&) const = default;
    };

    uint32 CodeOf(const Entry& entry) {
        const GuardLock lock(mMutex);
        const auto found = std::find(mEntries.begin(), mEntries.end(), entry);
        if (found != mEntries.end()) {
            return static_cast<uint32>(found - mEntries.begin()) + 1;
        }
        mEntries.push_back(entry);
        return static_cast<uint32>(mEntries.size());
    }

    std::optional<Entry> EntryOf(uint32 code) {
        const GuardLock lock(mMutex);
        if (code == 0 || code > mEntries.size()) {
            return std::nullopt;
        }
        return mEntries[code - 1];
    }

  private:
    GuardMutex mMutex;
    std::vector<Entry> mEntries GUARDED_BY(mMutex);
};

FamilyCodes& Codes() {
    static auto* const codes = new FamilyCodes;
    return *codes;
}

std::string_view FirstBytes(const char* string, int32 length) {
    if (string == nullptr) {
        return {};
    }
    return length < 0 ? std::string_view(string)
                      : std::string_view(string, strnlen(string, static_cast<size_t>(length)));
}

// The first `count` characters of a text.
std::string_view FirstChars(const char* text, int32 count) {
    if (text == nullptr) {
        return {};
    }
    const std::string_view all(text);
    size_t length = 0;
    for (int32 i = 0; i < count && length < all.size(); ++i) {
        length += utf8_char_length(all.substr(length));
    }
    return all.substr(0, length);
}

} // namespace

// Makes the fonts that are there before main() and never go.
class SystemFonts {
  public:
    static const BFont* Make(std::string_view family, int weight) {
        auto* font = new BFont;
        font->mFamily = family;
        font->mWeight = weight;
        font->mFace = FaceOf(weight, false);
        return font;
    }
};

const BFont* const be_plain_font = SystemFonts::Make(host::default_sans_family, kRegularWeight);
const BFont* const be_bold_font = SystemFonts::Make(host::default_sans_family, kBoldWeight);
const BFont* const be_fixed_font = SystemFonts::Make(host::default_fixed_family, kRegularWeight);

BFont::BFont() = default;

BFont::BFont(const BFont* font) {
    if (font != nullptr) {
        *this = *font;
    }
}

BFont::~BFont() = default;

status_t BFont::SetFamilyAndStyle(const font_family family, const font_style style) {
    const std::string newFamily = family == nullptr ? mFamily : std::string(family);
    const std::vector<host::FontStyle> styles = host::font_styles(newFamily);
    if (styles.empty()) {
        return B_NAME_NOT_FOUND;
    }
    if (style == nullptr) {
        mFamily = newFamily;
        mStyle.clear();
        return B_OK;
    }
    const auto found = std::find_if(styles.begin(), styles.end(),
                                    [style](const host::FontStyle& known) { return known.name == style; });
    if (found == styles.end()) {
        return B_NAME_NOT_FOUND;
    }
    mFamily = newFamily;
    mStyle = found->name;
    mWeight = found->weight;
    mItalic = found->italic;
    mFace = static_cast<uint16>((mFace & ~kStyleFaces) | FaceOf(mWeight, mItalic));
    return B_OK;
}

void BFont::SetFamilyAndStyle(uint32 code) {
    if (const std::optional<FamilyCodes::Entry> entry = Codes().EntryOf(code)) {
        mFamily = entry->family;
        mStyle = entry->style;
        mWeight = entry->weight;
        mItalic = entry->italic;
        mFace = static_cast<uint16>((mFace & ~kStyleFaces) | FaceOf(mWeight, mItalic));
    }
}

status_t BFont::SetFamilyAndFace(const font_family family, uint16 face) {
    if (family != nullptr) {
        if (!FamilyExists(family)) {
            return B_NAME_NOT_FOUND;
        }
        mFamily = family;
    }
    SetFace(face);
    return B_OK;
}

void BFont::SetSize(float size) {
    mSize = size;
}

void BFont::SetShear(float shear) {
    mShear = shear;
}

void BFont::SetRotation(float rotation) {
    mRotation = rotation;
}

void BFont::SetSpacing(uint8 spacing) {
    mSpacing = spacing;
}

void BFont::SetEncoding(uint8 encoding) {
    mEncoding = encoding;
}

void BFont::SetFace(uint16 face) {
    mFace = face;
    mStyle.clear();
    mWeight = (face & B_BOLD_FACE) != 0 ? kBoldWeight : kRegularWeight;
    mItalic = (face & B_ITALIC_FACE) != 0;
}

void BFont::SetFlags(uint32 flags) {
    mFlags = flags;
}

void BFont::GetFamilyAndStyle(font_family* family, font_style* style) const {
    if (family != nullptr) {
        CopyText(*family, host::resolve_family(mFamily).c_str());
    }
    if (style == nullptr) {
        return;
    }
    std::string name = mStyle;
    if (name.empty()) {
        for (const host::FontStyle& known : host::font_styles(mFamily)) {
            if (known.weight == mWeight && known.italic == mItalic &&
                (name.empty() || known.name.size() < name.size())) {
                name = known.name;
            }
        }
    }
    CopyText(*style, name.c_str());
}

uint32 BFont::FamilyAndStyle() const {
    return Codes().CodeOf({mFamily, mStyle, mWeight, mItalic});
}

bool BFont::IsFixed() const {
    return mFamily == host::default_fixed_family || host::family_is_fixed_width(mFamily);
}

BRect BFont::BoundingBox() const {
    const host::FontHeight height = host::font_height(Spec());
    const float widest = host::text_width(Spec(), "W") * 2;
    return {0, -height.ascent, widest, height.descent};
}

void BFont::TruncateString(BString* inOut, uint32 mode, float width) const {
    if (inOut == nullptr) {
        return;
    }
    const std::string_view text(inOut->String(), static_cast<size_t>(inOut->Length()));
    const host::FontSpec spec = Spec();
    const std::string result = truncated_text(text, host::text_advances(spec, text),
                                              host::text_width(spec, B_UTF8_ELLIPSIS), mode, width);
    if (result != text) {
        inOut->SetTo(result.c_str());
    }
}

void BFont::GetTruncatedStrings(const char* stringArray[], int32 numStrings, uint32 mode, float width,
                                char* resultArray[]) const {
    for (int32 i = 0; i < numStrings; ++i) {
        BString text(stringArray[i]);
        TruncateString(&text, mode, width);
        memcpy(resultArray[i], text.String(), static_cast<size_t>(text.Length()) + 1);
    }
}

void BFont::GetTruncatedStrings(const char* stringArray[], int32 numStrings, uint32 mode, float width,
                                BString resultArray[]) const {
    for (int32 i = 0; i < numStrings; ++i) {
        resultArray[i].SetTo(stringArray[i]);
        TruncateString(&resultArray[i], mode, width);
    }
}

float BFont::StringWidth(const char* string) const {
    return StringWidth(string, -1);
}

float BFont::StringWidth(const char* string, int32 length) const {
    return host::text_width(Spec(), FirstBytes(string, length));
}

void BFont::GetStringWidths(const char* stringArray[], const int32 lengthArray[], int32 numStrings,
                            float widthArray[]) const {
    for (int32 i = 0; i < numStrings; ++i) {
        widthArray[i] = StringWidth(stringArray[i], lengthArray == nullptr ? -1 : lengthArray[i]);
    }
}

void BFont::GetEscapements(const char charArray[], int32 numChars, float escapementArray[]) const {
    GetEscapements(charArray, numChars, nullptr, escapementArray);
}

void BFont::GetEscapements(const char charArray[], int32 numChars, escapement_delta* delta,
                           float escapementArray[]) const {
    const std::string_view text = FirstChars(charArray, numChars);
    const std::vector<float> advances = host::text_advances(Spec(), text);
    const float unit = mSize > 0 ? mSize : 1.0F;
    size_t at = 0;
    for (size_t i = 0; i < static_cast<size_t>(std::max(numChars, 0)); ++i) {
        escapementArray[i] = i < advances.size() ? advances[i] / unit : 0;
        if (i < advances.size() && delta != nullptr) {
            escapementArray[i] += (text[at] == ' ' ? delta->space : delta->nonspace) / unit;
        }
        if (at < text.size()) {
            at += utf8_char_length(text.substr(at));
        }
    }
}

void BFont::GetEscapements(const char charArray[], int32 numChars, escapement_delta* delta,
                           BPoint escapementArray[]) const {
    std::vector<float> advances(static_cast<size_t>(std::max(numChars, 0)));
    GetEscapements(charArray, numChars, delta, advances.data());
    for (size_t i = 0; i < advances.size(); ++i) {
        escapementArray[i].Set(advances[i], 0);
    }
}

void BFont::GetEdges(const char* /*charArray*/, int32 numChars, edge_info edgeArray[]) const {
    std::fill_n(edgeArray, std::max(numChars, 0), edge_info{0, 0});
}

void BFont::GetHeight(font_height* height) const {
    const host::FontHeight found = host::font_height(Spec());
    *height = {found.ascent, found.descent, found.leading};
}

void BFont::GetHasGlyphs(const char* /*charArray*/, int32 numChars, bool hasArray[]) const {
    std::fill_n(hasArray, std::max(numChars, 0), true);
}

void BFont::GetBoundingBoxesForStrings(const char* stringArray[], int32 numStrings, font_metric_mode /*mode*/,
                                       escapement_delta* deltas, BRect boundingBoxArray[]) const {
    const host::FontHeight height = host::font_height(Spec());
    for (int32 i = 0; i < numStrings; ++i) {
        float width = StringWidth(stringArray[i]);
        if (deltas != nullptr && stringArray[i] != nullptr) {
            for (std::string_view rest = stringArray[i]; !rest.empty();
                 rest.remove_prefix(utf8_char_length(rest))) {
                width += rest.front() == ' ' ? deltas[i].space : deltas[i].nonspace;
            }
        }
        boundingBoxArray[i].Set(0, -height.ascent, width, height.descent);
    }
}

void BFont::PrintToStream() const {
    font_family family;
    font_style style;
    GetFamilyAndStyle(&family, &style);
    printf("BFont(%s, %s, %g)\n", family, style, static_cast<double>(mSize));
}

host::FontSpec BFont::Spec() const {
    host::FontSpec spec;
    spec.family = mFamily;
    spec.size = mSize;
    spec.weight = mWeight;
    spec.italic = mItalic;
    spec.antialiased = (mFlags & B_DISABLE_ANTIALIASING) == 0;
    return spec;
}

int32 count_font_families() {
    return static_cast<int32>(host::font_families().size());
}

status_t get_font_family(int32 index, font_family* name, uint32* flags) {
    const std::vector<std::string> families = host::font_families();
    if (index < 0 || static_cast<size_t>(index) >= families.size()) {
        return B_BAD_INDEX;
    }
    const std::string& family = families[static_cast<size_t>(index)];
    if (name != nullptr) {
        CopyText(*name, family.c_str());
    }
    if (flags != nullptr) {
        *flags = host::family_is_fixed_width(family) ? static_cast<uint32>(B_IS_FIXED) : 0U;
    }
    return B_OK;
}

int32 count_font_styles(const font_family name) {
    return static_cast<int32>(host::font_styles(name).size());
}

status_t get_font_style(font_family family, int32 index, font_style* name, uint32* flags) {
    return get_font_style(family, index, name, nullptr, flags);
}

status_t get_font_style(font_family family, int32 index, font_style* name, uint16* face, uint32* flags) {
    const std::vector<host::FontStyle> styles = host::font_styles(family);
    if (index < 0 || static_cast<size_t>(index) >= styles.size()) {
        return B_BAD_INDEX;
    }
    const host::FontStyle& style = styles[static_cast<size_t>(index)];
    if (name != nullptr) {
        CopyText(*name, style.name.c_str());
    }
    if (face != nullptr) {
        *face = FaceOf(style.weight, style.italic);
    }
    if (flags != nullptr) {
        *flags = host::family_is_fixed_width(family) ? static_cast<uint32>(B_IS_FIXED) : 0U;
    }
    return B_OK;
}
