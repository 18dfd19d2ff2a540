#include "gui/ColumnListView/gallery/GalleryPages.h"

#include "gui/ColumnListView/gallery/GalleryList.h"
#include "gui/ColumnListView/gallery/GalleryPictures.h"
#include "gui/ColumnListView/gallery/GalleryStock.h"

#include <Bitmap.h>

#include <array>

namespace {

// What most columns are.
constexpr unsigned long kUsual =
    CLV_COLUMN_SORTABLE | CLV_COLUMN_HEADER_TRUNCATE | CLV_COLUMN_TELL_ITEMS_WIDTH;

void AddStockColumns(GalleryList& list, unsigned long partFlags = 0) {
    list.MakeColumn("Part", 130, kUsual | partFlags);
    list.MakeColumn("Maker", 100, kUsual);
    list.MakeColumn("Shelf", 50, kUsual);
    list.MakeColumn("Count", 60, kUsual);
    list.MakeColumn("Price", 60, kUsual);
    list.MakeColumn("Note", 200, kUsual);
}

void FillFlat(GalleryList& list) {
    AddStockColumns(list);
    for (int32 i = 0; i < 40; ++i) {
        const StockItem item(i);
        list.AppendRow(0, false, {item.part, item.maker, item.shelf, item.count, item.price, item.note});
    }
}

void FillOutline(GalleryList& list) {
    list.MakeColumn(nullptr, 20, CLV_COLUMN_EXPANDER | CLV_COLUMN_NOT_MOVABLE | CLV_COLUMN_LOCK_AT_START);
    AddStockColumns(list, CLV_COLUMN_PUSH_PASS);
    int32 number = 0;
    for (const char* const room : {"Cellar", "Shop", "Workshop", "Yard"}) {
        list.AppendRow(0, true, {room}, room[0] != 'Y');
        for (int32 part = 0; part < 4; ++part) {
            list.AppendRow(1, true, {StockPart(number / 3), "", "", "", "", "all makers"}, part % 2 == 0);
            for (int32 i = 0; i < 3; ++i) {
                const StockItem item(number++);
                list.AppendRow(2, false,
                               {item.part, item.maker, item.shelf, item.count, item.price, item.note});
            }
        }
    }
}

void FillTexts(GalleryList& list) {
    list.MakeColumn("Shortened with an ellipsis", 120, kUsual);
    list.MakeColumn("Cut off at the edge", 120, CLV_COLUMN_SORTABLE | CLV_COLUMN_TELL_ITEMS_WIDTH);
    list.MakeColumn("Shortened, and rows not told", 120, CLV_COLUMN_HEADER_TRUNCATE);
    const std::array<const char*, 10> texts = {
        "Short",
        "A text that is a good deal longer than its cell is wide",
        "Blanks   before   the   ellipsis   are   dropped",
        "W",
        "Grüße aus Köln, Åse und Øyvind",
        "Ωμέγα και άλφα, το αλφάβητο όλο",
        "Чайник на плите закипает",
        "自転車の部品とその在庫一覧表",
        "no_blank_in_this_one_at_all_but_long_enough",
        "Ends with a full stop.",
    };
    for (const char* const text : texts) {
        CLVEasyItem* const row = list.MakeRow(0, false, true);
        row->SetColumnContent(0, text, true);
        row->SetColumnContent(1, text, false);
        row->SetColumnContent(2, text, true);
        list.AddItem(row);
    }
}

void FillPictures(GalleryList& list) {
    list.MakeColumn("", 24, CLV_COLUMN_NOT_RESIZABLE, 24);
    list.MakeColumn("Part", 120, kUsual);
    list.MakeColumn("Colour", 70, 0);
    list.MakeColumn("Far in", 70, 0);
    list.MakeColumn("Taller than its row", 120, CLV_COLUMN_HEADER_TRUNCATE);
    constexpr std::array<uint8, 6> kDiscColors = {247, 248, 249, 250, 254, 63};
    for (int32 i = 0; i < 24; ++i) {
        const auto shade = static_cast<uint8>(10 * i);
        CLVEasyItem* const row = list.MakeRow(0, false, true);
        const std::unique_ptr<BBitmap> disc = MakeDisc(kDiscColors[static_cast<size_t>(i) % 6]);
        const std::unique_ptr<BBitmap> swatch =
            MakeSwatch(40, 11, make_color(255, shade, static_cast<uint8>(255 - shade)));
        row->SetColumnContent(0, disc.get(), 4);
        row->SetColumnContent(1, StockItem(i).part.c_str());
        row->SetColumnContent(2, swatch.get());
        row->SetColumnContent(3, disc.get(), 40);
        if (i % 4 == 0) {
            row->SetColumnContent(4, MakeSwatch(60, 30, make_color(120, 180, shade)).get(), 10);
        }
        list.AddItem(row);
    }
}

void FillColumns(GalleryList& list) {
    list.MakeColumn("At start", 80, kUsual | CLV_COLUMN_LOCK_AT_START);
    list.MakeColumn("Merged", 90, CLV_COLUMN_MERGE_WITH_RIGHT | CLV_COLUMN_LOCK_WITH_RIGHT);
    list.MakeColumn("and bound", 90, kUsual);
    list.MakeColumn("Free", 80, kUsual);
    list.MakeColumn("Hidden", 80, kUsual | CLV_COLUMN_HIDDEN);
    list.MakeColumn("Not movable", 100, kUsual | CLV_COLUMN_NOT_MOVABLE);
    list.MakeColumn("Not resizable", 110, kUsual | CLV_COLUMN_NOT_RESIZABLE);
    list.MakeColumn("At end", 80, kUsual | CLV_COLUMN_LOCK_AT_END);
    for (int32 i = 0; i < 30; ++i) {
        const StockItem item(i);
        list.AppendRow(0, false,
                       {item.shelf, item.part, item.maker, item.count, "was hidden", item.price, item.maker,
                        item.shelf});
    }
}

void FillSorting(GalleryList& list) {
    AddStockColumns(list);
    for (int32 i = 0; i < 200; ++i) {
        const StockItem item(i);
        list.AppendRow(0, false, {item.part, item.maker, item.shelf, item.count, item.price, item.note});
    }
    int32 keys[] = {1, 0, 4};
    CLVSortMode modes[] = {CLV_SORT_ASCENDING, CLV_SORT_DESCENDING, CLV_SORT_ASCENDING};
    list.SetSorting(3, keys, modes);
}

void FillMany(GalleryList& list) {
    list.MakeColumn(nullptr, 20, CLV_COLUMN_EXPANDER | CLV_COLUMN_NOT_MOVABLE | CLV_COLUMN_LOCK_AT_START);
    AddStockColumns(list);
    for (int32 i = 0; i < 50000; ++i) {
        const StockItem item(i);
        if (i % 100 == 0) {
            list.AppendRow(0, true, {"Delivery " + std::to_string(1 + i / 100)});
        } else {
            list.AppendRow(1, false, {item.part, item.maker, item.shelf, item.count, item.price, item.note});
        }
    }
}

constexpr std::array<GalleryPage, 7> kPages = {{
    {"flat", "A flat list", 560, 380, false, FillFlat},
    {"outline", "An outline of three levels", 640, 460, true, FillOutline},
    {"texts", "Texts longer than their cells", 460, 280, false, FillTexts},
    {"pictures", "Pictures in cells", 460, 380, false, FillPictures},
    {"columns", "Columns of all kinds", 720, 380, false, FillColumns},
    {"sorting", "Sorted by several keys", 640, 460, false, FillSorting},
    {"many", "Fifty thousand rows", 640, 460, true, FillMany},
}};

} // namespace

int32 CountGalleryPages() {
    return static_cast<int32>(kPages.size());
}

const GalleryPage& GalleryPageAt(int32 index) {
    return kPages[static_cast<size_t>(index)];
}

const GalleryPage* FindGalleryPage(std::string_view name) {
    for (const GalleryPage& page : kPages) {
        if (name == page.name) {
            return &page;
        }
    }
    return nullptr;
}
