// The gallery of the column list: column_list_gallery [--window NAME]
#include "gui/ColumnListView/gallery/GalleryApp.h"
#include "gui/ColumnListView/gallery/GalleryPages.h"

#include <stdio.h>
#include <string_view>

namespace {

int Usage() {
    fprintf(stderr, "usage: column_list_gallery [--window NAME]\nnames:");
    for (int32 i = 0; i < CountGalleryPages(); ++i) {
        fprintf(stderr, " %s", GalleryPageAt(i).name);
    }
    fprintf(stderr, "\n");
    return 1;
}

} // namespace

int main(int count, char** words) {
    const GalleryPage* only = nullptr;
    if (count == 3 && std::string_view(words[1]) == "--window") {
        only = FindGalleryPage(words[2]);
    }
    if (count != 1 && only == nullptr) {
        return Usage();
    }
    GalleryApp application(only);
    application.Run();
    return 0;
}
