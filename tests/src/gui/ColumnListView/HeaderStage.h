// A list with its header on a stage whose pointer is the test's, and which notes what its header asks for.
#pragma once

#include "gui/ColumnListView/CLVColumn.h"
#include "gui/ColumnListView/CLVColumnLabelView.h"
#include "gui/ColumnListView/CLVContainerView.h"
#include "gui/ColumnListView/CLVEasyItem.h"
#include "gui/ColumnListView/ColumnListView.h"
#include "gui/ColumnListView/MouseWatcher.h"

#include "kits/interface/ViewStage.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

class NotingList : public ColumnListView {
  public:
    NotingList(BRect frame, CLVContainerView** container, bool hierarchical)
        : ColumnListView(frame, container, "list", B_FOLLOW_ALL, B_WILL_DRAW | B_FRAME_EVENTS,
                         B_SINGLE_SELECTION_LIST, hierarchical) {}
    void ColumnWidthChanged(int32 index, float width) override {
        notes.push_back("width " + std::to_string(index) + " " + std::to_string(static_cast<int>(width)));
        ColumnListView::ColumnWidthChanged(index, width);
        if (onWidthChanged) {
            onWidthChanged();
        }
    }
    void DisplayOrderChanged(const int32* order) override {
        std::string note = "order";
        for (int32 i = 0; i < CountColumns(); ++i) {
            note += " " + std::to_string(order[i]);
        }
        notes.push_back(note);
        ColumnListView::DisplayOrderChanged(order);
        if (onOrderChanged) {
            onOrderChanged();
        }
    }
    void SetSortKey(int32 index) override {
        notes.push_back("key " + std::to_string(index));
        ColumnListView::SetSortKey(index);
    }
    void AddSortKey(int32 index) override {
        notes.push_back("add key " + std::to_string(index));
        ColumnListView::AddSortKey(index);
    }
    void SetSortMode(int32 index, CLVSortMode mode) override {
        notes.push_back("mode " + std::to_string(index) + " " + std::to_string(mode));
        ColumnListView::SetSortMode(index, mode);
    }

    std::vector<std::string> notes;
    std::function<void()> onOrderChanged;
    std::function<void()> onWidthChanged;
};

typedef std::vector<std::string> Notes;

// Everything is called by the test's thread, which gets the lock where it is needed.
class HeaderStage : public ViewStage {
  public:
    HeaderStage(int32 width, int32 height, bool hierarchical = false)
        : ViewStage(width + 20, height + 20),
          list(new NotingList(BRect(0, 0, static_cast<float>(width - 1), static_cast<float>(height - 1)),
                              &container, hierarchical)),
          header(list->HeaderView()) {
        Add(container);
    }
    // A watcher may still look.
    ~HeaderStage() override { Close(); }
    // The list deletes it.
    CLVColumn* AddColumn(const char* label, float width, unsigned long flags = 0) {
        auto* const column = new CLVColumn(label, width, flags, 10);
        Locked([&] { EXPECT_TRUE(list->AddColumn(column)); });
        return column;
    }
    void AddRow(uint32 level, const std::vector<std::string>& texts) {
        rows.push_back(std::make_unique<CLVEasyItem>(level, true, true, 11.0F));
        for (size_t i = 0; i < texts.size(); ++i) {
            rows.back()->SetColumnContent(static_cast<int>(i), texts[i].c_str(), true);
        }
        Locked([&] { list->AddItem(rows.back().get()); });
    }
    // What the watchers see.
    void SetPointer(float x, uint32 buttons) {
        Locked([&] {
            mLooks = 0;
            mPointer = header->ConvertToSurface(BPoint(x, 5));
            mButtons = buttons;
        });
    }
    // Until one has seen that, after a press: where a watcher looks first is where its watch begins.
    void WaitForWatcher() {
        for (int i = 0; i < 1000; ++i) {
            int looks = 0;
            Locked([&] { looks = mLooks; });
            // The first look is that of the press itself.
            if (looks > 1) {
                return;
            }
            snooze(5000);
        }
        ADD_FAILURE() << "no watcher has looked";
    }
    void DrawAll() {
        Locked([&] { InvalidateTree(container); });
        Redraw();
    }
    // All pixels, after what is damaged has been drawn.
    std::vector<uint32> Picture() {
        Redraw();
        std::vector<uint32> pixels;
        Locked([&] {
            const BRect frame = container->Frame();
            for (int32 y = 0; y <= static_cast<int32>(frame.bottom); ++y) {
                for (int32 x = 0; x <= static_cast<int32>(frame.right); ++x) {
                    pixels.push_back(At(x, y));
                }
            }
        });
        return pixels;
    }
    std::vector<uint32> PictureDrawnAnew() {
        DrawAll();
        return Picture();
    }

    // The messages of a watcher, as if there were one. The real one sees a button that is held, and is
    // silent.
    void Press(float x) {
        SetPointer(x, B_PRIMARY_MOUSE_BUTTON);
        MouseDown(header, BPoint(x, 5));
    }
    void Watch(uint32 what, float x, int32 buttons, int32 modifierKeys = 0) {
        BMessage message(what);
        message.AddPoint("where", BPoint(x, 5));
        message.AddInt32("buttons", buttons);
        message.AddInt32("modifiers", modifierKeys);
        Locked([&] { header->MessageReceived(&message); });
    }
    void MoveTo(float x) { Watch(MW_MOUSE_MOVED, x, 1); }
    void Release(float x, int32 modifierKeys = 0) { Watch(MW_MOUSE_UP, x, 0, modifierKeys); }
    void Click(float x, int32 modifierKeys = 0) {
        Press(x);
        Release(x, modifierKeys);
    }
    void Drag(float from, float to) {
        Press(from);
        MoveTo(to);
        Release(to);
    }
    // The labels from left to right.
    std::string Labels() {
        std::string labels;
        Locked([&] {
            const BList& order = list->ColumnsInDisplayOrder();
            for (int32 i = 0; i < order.CountItems(); ++i) {
                labels += static_cast<const CLVColumn*>(order.ItemAt(i))->GetLabel();
            }
        });
        return labels;
    }
    Notes TakeNotes() {
        Notes notes;
        Locked([&] { notes.swap(list->notes); });
        return notes;
    }

    std::vector<std::unique_ptr<CLVEasyItem>> rows;
    CLVContainerView* container = nullptr;
    NotingList* const list;
    CLVColumnLabelView* const header;

  private:
    bool GetMouse(BView* /*view*/, BPoint* surfacePoint, uint32* buttons, bool /*queue*/) override {
        *surfacePoint = mPointer;
        *buttons = mButtons;
        ++mLooks;
        return true;
    }
    static void InvalidateTree(BView* view) {
        view->Invalidate();
        for (int32 i = 0; i < view->CountChildren(); ++i) {
            InvalidateTree(view->ChildAt(i));
        }
    }

    BPoint mPointer;
    uint32 mButtons = 0;
    int mLooks = 0;
};
