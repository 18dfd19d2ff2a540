#include "gui/ColumnListView/gallery/GalleryWindow.h"

#include "gui/ColumnListView/CLVContainerView.h"
#include "gui/ColumnListView/gallery/GalleryApp.h"
#include "gui/ColumnListView/gallery/GalleryList.h"
#include "gui/ColumnListView/gallery/GalleryPages.h"
#include "gui/ColumnListView/gallery/GalleryStock.h"

#include <Application.h>
#include <Menu.h>
#include <MenuBar.h>
#include <MenuItem.h>
#include <Message.h>
#include <StringView.h>

#include <cmath>

namespace {

enum : uint32 {
    kToggleColumn = 'tgcl', // "column" (int32)
    kAddRow = 'adrw',
    kDeleteRows = 'dlrw',
    kSelectAll = 'slal',
    kExpandAll = 'exal',
    kCollapseAll = 'coal',
    kSortByNothing = 'srno'
};

constexpr float kInset = 7;
constexpr float kBorder = 2;
constexpr float kMinWidth = 200;
constexpr float kMinHeight = 150;
constexpr float kNoLimit = 32767;
// Different from all that a page starts with.
constexpr int32 kFirstAddedItem = 1000000;

BMenuItem* ItemFor(const char* label, uint32 code, char shortcut = 0) {
    return new BMenuItem(label, new BMessage(code), shortcut);
}

} // namespace

GalleryWindow::GalleryWindow(BPoint leftTop, const GalleryPage& page)
    : BWindow(BRect(leftTop.x, leftTop.y, leftTop.x + page.width, leftTop.y + page.height), page.title,
              B_TITLED_WINDOW, 0) {
    SetSizeLimits(kMinWidth, kNoLimit, kMinHeight, kNoLimit);
    const BRect bounds = Bounds();
    auto* const back = new BView(bounds, "back", B_FOLLOW_ALL_SIDES, B_WILL_DRAW);
    back->SetViewColor(ui_color(B_PANEL_BACKGROUND_COLOR));
    AddChild(back);
    auto* const bar = new BMenuBar(BRect(0, 0, bounds.right, 20), "menubar");
    back->AddChild(bar);
    // An empty bar has no height yet.
    bar->AddItem(MakePageMenu());

    font_height height;
    be_plain_font->GetHeight(&height);
    BRect line = bounds.InsetByCopy(kInset, kInset);
    line.top = line.bottom - std::ceil(height.ascent + height.descent) - 1;
    mSummary = new BStringView(line, "summary", "", B_FOLLOW_LEFT_RIGHT | B_FOLLOW_BOTTOM,
                               B_WILL_DRAW | B_FRAME_EVENTS);

    BRect frame = bounds.InsetByCopy(kInset, kInset);
    frame.top = bar->Frame().bottom + 1 + kInset;
    frame.bottom = line.top - 1 - kInset;
    AddList(page, frame);
    back->AddChild(mList->Container());
    back->AddChild(mSummary);
    AddMenus(bar);
    mList->MakeFocus();
    mList->SetChangeHandler([this] { ShowSummary(); });
    ShowSummary();
}

GalleryWindow::~GalleryWindow() {
    mList->SetChangeHandler(nullptr);
    be_app->PostMessage(kGalleryWindowClosed);
}

void GalleryWindow::AddList(const GalleryPage& page, BRect frame) {
    frame.InsetBy(kBorder, kBorder);
    frame.right -= B_V_SCROLL_BAR_WIDTH;
    frame.bottom -= B_H_SCROLL_BAR_HEIGHT;
    CLVContainerView* container = nullptr;
    mList = new GalleryList(frame, &container, page.hierarchical);
    page.fill(*mList);
}

BMenu* GalleryWindow::MakePageMenu() {
    auto* const menu = new BMenu("Gallery");
    for (int32 i = 0; i < CountGalleryPages(); ++i) {
        auto* const message = new BMessage(kOpenGalleryPage);
        message->AddString("page", GalleryPageAt(i).name);
        auto* const item = new BMenuItem(GalleryPageAt(i).title, message);
        item->SetTarget(be_app);
        menu->AddItem(item);
    }
    menu->AddSeparatorItem();
    menu->AddItem(ItemFor("Close", B_QUIT_REQUESTED, 'W'));
    BMenuItem* const quit = ItemFor("Quit", B_QUIT_REQUESTED, 'Q');
    quit->SetTarget(be_app);
    menu->AddItem(quit);
    return menu;
}

void GalleryWindow::AddMenus(BMenuBar* bar) {
    auto* const rows = new BMenu("Rows");
    rows->AddItem(ItemFor("Add one", kAddRow, 'N'));
    rows->AddItem(ItemFor("Delete what is selected", kDeleteRows, 'D'));
    rows->AddItem(ItemFor("Select all", kSelectAll, 'A'));
    rows->AddSeparatorItem();
    rows->AddItem(ItemFor("Expand all", kExpandAll, 'E'));
    rows->AddItem(ItemFor("Collapse all", kCollapseAll, 'L'));
    rows->AddSeparatorItem();
    rows->AddItem(ItemFor("Sort by nothing", kSortByNothing));
    for (const uint32 code : {kExpandAll, kCollapseAll}) {
        rows->FindItem(code)->SetEnabled(mList->IsHierarchical());
    }
    bar->AddItem(rows);
    mColumnMenu = MakeColumnMenu();
    bar->AddItem(mColumnMenu);
}

BMenu* GalleryWindow::MakeColumnMenu() {
    auto* const menu = new BMenu("Columns");
    for (int32 i = 0; i < mList->CountColumns(); ++i) {
        const CLVColumn* const column = mList->ColumnAt(i);
        const char* const label = column->IsExpander() ? "Arrows" : column->GetLabel();
        auto* const message = new BMessage(kToggleColumn);
        message->AddInt32("column", i);
        auto* const item = new BMenuItem(label == nullptr || label[0] == 0 ? "Unnamed" : label, message);
        item->SetMarked(column->IsShown());
        menu->AddItem(item);
    }
    return menu;
}

void GalleryWindow::MessageReceived(BMessage* message) {
    switch (message->what) {
    case kToggleColumn:
        ToggleColumn(message->GetInt32("column", -1));
        break;
    case kAddRow:
        AddRow();
        break;
    case kDeleteRows:
        mList->DeleteSelectedRows();
        break;
    case kSelectAll:
        mList->Select(0, mList->CountItems() - 1);
        break;
    case kExpandAll:
        mList->ExpandAll();
        break;
    case kCollapseAll:
        mList->CollapseAll();
        break;
    case kSortByNothing:
        mList->SetSortKey(-1);
        ShowSummary();
        break;
    default:
        BWindow::MessageReceived(message);
    }
}

void GalleryWindow::ToggleColumn(int32 column) {
    if (CLVColumn* const which = mList->ColumnAt(column); which != nullptr) {
        which->SetShown(!which->IsShown());
        mColumnMenu->ItemAt(column)->SetMarked(which->IsShown());
    }
}

void GalleryWindow::AddRow() {
    const StockItem item(kFirstAddedItem + mAddedRows++);
    const std::string texts[] = {item.part, item.maker, item.shelf, item.count, item.price, item.note};
    auto* const selected = static_cast<CLVListItem*>(mList->ItemAt(mList->CurrentSelection()));
    const bool below = mList->IsHierarchical() && selected != nullptr && selected->IsSuperItem();
    CLVEasyItem* const row = mList->MakeRow(0, false, true);
    int32 column = mList->IsHierarchical() ? 1 : 0;
    for (const std::string& text : texts) {
        row->SetColumnContent(column++, text.c_str());
    }
    if (below) {
        mList->AddUnder(row, selected);
    } else {
        mList->AddItem(row);
    }
    ShowSummary();
}

void GalleryWindow::ShowSummary() {
    mSummary->SetText(mList->Summary().c_str());
}
