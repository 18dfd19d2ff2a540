// The names of data formats that translators know, and the common form of pictures.
#pragma once

#include <GraphicsDefs.h>
#include <Rect.h>
#include <SupportDefs.h>

// Groups of formats, which also name the one common form of each group.
enum TranslatorGroups {
    B_TRANSLATOR_BITMAP = 'bits',
    B_TRANSLATOR_PICTURE = 'pict',
    B_TRANSLATOR_TEXT = 'TEXT',
    B_TRANSLATOR_SOUND = 'nois',
    B_TRANSLATOR_MIDI = 'midi',
    B_TRANSLATOR_MEDIA = 'mhi!',
    B_TRANSLATOR_NONE = 'none'
};
inline constexpr uint32 B_TRANSLATOR_ANY_TYPE = 0;

enum TranslatorTypes {
    B_GIF_FORMAT = 'GIF ',
    B_JPEG_FORMAT = 'JPEG',
    B_PNG_FORMAT = 'PNG ',
    B_PPM_FORMAT = 'PPM ',
    B_TGA_FORMAT = 'TGA ',
    B_BMP_FORMAT = 'BMP ',
    B_TIFF_FORMAT = 'TIFF'
};

// What a picture in the common form begins with; 32 bytes, all fields with the most significant byte first.
// `dataSize` bytes of pixels follow, rows from the top.
struct TranslatorBitmap {
    uint32 magic; // B_TRANSLATOR_BITMAP
    BRect bounds;
    uint32 rowBytes;
    color_space colors;
    uint32 dataSize;
};
