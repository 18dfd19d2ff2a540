// The windows of the gallery, each for one ability of the column list.
#pragma once

#include <SupportDefs.h>

#include <string_view>

class GalleryList;

struct GalleryPage {
    // As the command line has it.
    const char* name;
    // The window's, and in the menu.
    const char* title;
    float width;
    float height;
    bool hierarchical;
    // Gives an empty list its columns and rows.
    void (*fill)(GalleryList& list);
};

int32 CountGalleryPages();
const GalleryPage& GalleryPageAt(int32 index);
// Null when there is none of that name.
const GalleryPage* FindGalleryPage(std::string_view name);
