// What translators say about formats.
#pragma once

#include <SupportDefs.h>
#include <TranslatorFormats.h>

typedef int32 translator_id;

// One format that a translator reads or writes.
struct translation_format {
    uint32 type;      // B_PNG_FORMAT, ...
    uint32 group;     // B_TRANSLATOR_BITMAP, ...
    float quality;    // how well the format keeps its group's data, 0 .. 1
    float capability; // how well the translator handles the format, 0 .. 1
    char MIME[251];
    char name[251];
};

// What some data was found to be, and by whom.
struct translator_info {
    uint32 type;
    translator_id translator;
    uint32 group;
    float quality;
    float capability;
    char name[251];
    char MIME[251];
};
