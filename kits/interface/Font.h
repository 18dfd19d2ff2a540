// BFont: a typeface at a size, and measuring text in it.
#pragma once

#include <InterfaceDefs.h>
#include <Rect.h>
#include <SupportDefs.h>

#include <string>

class BString;

namespace host {
struct FontSpec;
}

inline constexpr size_t B_FONT_FAMILY_LENGTH = 63;
inline constexpr size_t B_FONT_STYLE_LENGTH = 63;

typedef char font_family[B_FONT_FAMILY_LENGTH + 1];
typedef char font_style[B_FONT_STYLE_LENGTH + 1];

enum { B_CHAR_SPACING = 0, B_STRING_SPACING = 1, B_BITMAP_SPACING = 2, B_FIXED_SPACING = 3 };

enum font_direction { B_FONT_LEFT_TO_RIGHT = 0, B_FONT_RIGHT_TO_LEFT = 1 };

// Font flags.
enum { B_DISABLE_ANTIALIASING = 0x00000001, B_FORCE_ANTIALIASING = 0x00000002 };

enum { B_TRUNCATE_END = 0, B_TRUNCATE_BEGINNING = 1, B_TRUNCATE_MIDDLE = 2, B_TRUNCATE_SMART = 3 };

enum { B_UNICODE_UTF8 = 0, B_ISO_8859_1 = 1 };

// Faces.
enum {
    B_ITALIC_FACE = 0x0001,
    B_UNDERSCORE_FACE = 0x0002,
    B_NEGATIVE_FACE = 0x0004,
    B_OUTLINED_FACE = 0x0008,
    B_STRIKEOUT_FACE = 0x0010,
    B_BOLD_FACE = 0x0020,
    B_REGULAR_FACE = 0x0040
};

enum font_metric_mode { B_SCREEN_METRIC = 0, B_PRINTING_METRIC = 1 };

enum font_file_format { B_TRUETYPE_WINDOWS = 0, B_POSTSCRIPT_TYPE1_WINDOWS = 1 };

// Flags of get_font_family() and get_font_style().
enum { B_IS_FIXED = 0x0001, B_HAS_TUNED_FONT = 0x0002 };

// In units of the font's size.
struct edge_info {
    float left;
    float right;
};

struct escapement_delta {
    float nonspace;
    float space;
};

// Distances from the baseline, in pixels.
struct font_height {
    float ascent;
    float descent;
    float leading;
};

// A plain value; const methods may be called from any thread. The default is be_plain_font. Texts are UTF-8;
// a byte that is not part of valid UTF-8 counts as a character of its own and is measured as the replacement
// character that is drawn for it. Widths are in pixels. Shear, rotation and the underscore, negative,
// outlined and strikeout faces are kept but not drawn.
class BFont {
  public:
    BFont();
    BFont(const BFont& font) = default;
    explicit BFont(const BFont* font);
    virtual ~BFont();
    BFont& operator=(const BFont& font) = default;
    bool operator==(const BFont& font) const = default;

    // B_NAME_NOT_FOUND, and no change, for a family that is not installed or has no such style. A null family
    // keeps the family; a null style takes the one nearest to the present face.
    status_t SetFamilyAndStyle(const font_family family, const font_style style);
    // By the code that FamilyAndStyle() gave in this process.
    void SetFamilyAndStyle(uint32 code);
    // Also chooses a bold, italic or regular style of the family.
    status_t SetFamilyAndFace(const font_family family, uint16 face);
    void SetSize(float size);
    void SetShear(float shear);
    void SetRotation(float rotation);
    void SetSpacing(uint8 spacing);
    void SetEncoding(uint8 encoding);
    void SetFace(uint16 face);
    void SetFlags(uint32 flags);

    void GetFamilyAndStyle(font_family* family, font_style* style) const;
    uint32 FamilyAndStyle() const;
    float Size() const { return mSize; }
    float Shear() const { return mShear; }
    float Rotation() const { return mRotation; }
    uint8 Spacing() const { return mSpacing; }
    uint8 Encoding() const { return mEncoding; }
    uint16 Face() const { return mFace; }
    uint32 Flags() const { return mFlags; }

    font_direction Direction() const { return B_FONT_LEFT_TO_RIGHT; }
    bool IsFixed() const;
    BRect BoundingBox() const;
    font_file_format FileFormat() const { return B_TRUETYPE_WINDOWS; }

    // Cuts the text, with an ellipsis in place of what is left out, so that it is at most `width` wide. A
    // width that not even the ellipsis fits in leaves an empty text.
    void TruncateString(BString* inOut, uint32 mode, float width) const;
    // The result buffers hold the longest text, an ellipsis more (3 bytes) and the terminator.
    void GetTruncatedStrings(const char* stringArray[], int32 numStrings, uint32 mode, float width,
                             char* resultArray[]) const;
    void GetTruncatedStrings(const char* stringArray[], int32 numStrings, uint32 mode, float width,
                             BString resultArray[]) const;

    float StringWidth(const char* string) const;
    // The first `length` bytes; a negative length takes all.
    float StringWidth(const char* string, int32 length) const;
    void GetStringWidths(const char* stringArray[], const int32 lengthArray[], int32 numStrings,
                         float widthArray[]) const;

    // The advance of each of the first `numChars` characters, in units of the size.
    void GetEscapements(const char charArray[], int32 numChars, float escapementArray[]) const;
    void GetEscapements(const char charArray[], int32 numChars, escapement_delta* delta,
                        float escapementArray[]) const;
    void GetEscapements(const char charArray[], int32 numChars, escapement_delta* delta,
                        BPoint escapementArray[]) const;
    // No side bearings are known here: all zero.
    void GetEdges(const char charArray[], int32 numChars, edge_info edgeArray[]) const;
    void GetHeight(font_height* height) const;
    // True for every character: missing ones are taken from other fonts.
    void GetHasGlyphs(const char charArray[], int32 numChars, bool hasArray[]) const;

    // Ascent to descent, and the pen's way, as a rectangle around the text drawn at (0, 0).
    void GetBoundingBoxesForStrings(const char* stringArray[], int32 numStrings, font_metric_mode mode,
                                    escapement_delta deltas[], BRect boundingBoxArray[]) const;

    // Prints family, style and size on standard output.
    void PrintToStream() const;

    // What the text machinery is asked for; for this kit's own use.
    host::FontSpec Spec() const;

  private:
    friend class SystemFonts;
    std::string mFamily; // as host::FontSpec has it
    std::string mStyle;  // empty: whatever the face says
    int mWeight = 400;
    bool mItalic = false;
    float mSize = 12.0F;
    float mShear = 90.0F;
    float mRotation = 0.0F;
    uint8 mSpacing = B_CHAR_SPACING;
    uint8 mEncoding = B_UNICODE_UTF8;
    uint16 mFace = B_REGULAR_FACE;
    uint32 mFlags = 0;
};

// The desktop's sans family, plain and bold, and its fixed-width family, all 12 pixels. Ready before main();
// nobody deletes them.
extern const BFont* const be_plain_font;
extern const BFont* const be_bold_font;
extern const BFont* const be_fixed_font;

int32 count_font_families();
// B_BAD_INDEX or B_ERROR for an index out of range.
[[nodiscard]] status_t get_font_family(int32 index, font_family* name, uint32* flags = nullptr);
int32 count_font_styles(const font_family name);
[[nodiscard]] status_t get_font_style(font_family family, int32 index, font_style* name,
                                      uint32* flags = nullptr);
[[nodiscard]] status_t get_font_style(font_family family, int32 index, font_style* name, uint16* face,
                                      uint32* flags = nullptr);
