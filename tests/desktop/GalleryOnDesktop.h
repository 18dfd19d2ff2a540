// A window of the column list's gallery under a window manager, with the hands to use it.
#pragma once

#include "desktop/WindowOnDesktop.h"

#include "gui/ColumnListView/CLVColumnLabelView.h"
#include "gui/ColumnListView/CLVContainerView.h"
#include "gui/ColumnListView/CLVEasyItem.h"
#include "gui/ColumnListView/gallery/GalleryList.h"
#include "gui/ColumnListView/gallery/GalleryPages.h"
#include "gui/ColumnListView/gallery/GalleryWindow.h"
#include "support/program.h"

#include <ScrollBar.h>

#include <cmath>
#include <filesystem>

class GalleryOnDesktop : public WindowOnDesktop {
  protected:
    typedef std::vector<int32> Numbers;
    typedef std::vector<std::string> Texts;

    // Runs `body` beside the main thread, with this page open and at rest.
    void With(const char* page, const std::function<void()>& body) {
        RunApplication([&] {
            const GalleryPage* const found = FindGalleryPage(page);
            ASSERT_NE(nullptr, found);
            // Before the display is there, texts would be measured without it.
            while (be_app->IsLaunching()) {
                snooze(1000);
            }
            mWindow = new GalleryWindow(BPoint(200, 150), *found);
            mList = mWindow->List();
            mWindow->Show();
            ASSERT_NE("", TheDesktop().window(found->title));
            TheDesktop().tool({"windowactivate", "--sync", TheDesktop().window(found->title)});
            snooze(400000);
            body();
            ASSERT_TRUE(mWindow->Lock());
            mWindow->Quit();
        });
    }

    template <typename Function>
    auto Read(Function function) {
        const BAutolock lock(mWindow);
        return function();
    }
    // Waits for it, half a minute at most.
    template <typename Function>
    bool Comes(Function condition) {
        for (int i = 0; i < 600 && !Read(condition); ++i) {
            snooze(50000);
        }
        return Read(condition);
    }

    // Where things are on the screen.
    BPoint OnLabel(int32 column) {
        return Read([&] {
            const CLVColumn* const which = mList->ColumnAt(column);
            BView* const header = mList->HeaderView();
            return header->ConvertToScreen(BPoint(std::floor((which->ColumnBegin() + which->ColumnEnd()) / 2),
                                                  std::floor(header->Bounds().Height() / 2)));
        });
    }
    BPoint OnBorder(int32 column) {
        return Read([&] {
            BView* const header = mList->HeaderView();
            return header->ConvertToScreen(
                BPoint(mList->ColumnAt(column)->ColumnEnd(), std::floor(header->Bounds().Height() / 2)));
        });
    }
    BPoint OnRow(int32 visible, float x = 100) {
        return Read([&] { return mList->ConvertToScreen(BPoint(x, mList->ItemFrame(visible).top + 8)); });
    }
    BPoint OnArrow(int32 visible) {
        return Read([&] {
            const BRect arrow = static_cast<CLVListItem*>(mList->ItemAt(visible))->ExpanderButtonRect();
            return mList->ConvertToScreen(BPoint(arrow.left + 5, arrow.top + 5));
        });
    }

    static void Click(BPoint where, int button = 1) {
        TheDesktop().click(static_cast<int>(where.x), static_cast<int>(where.y), button);
        snooze(250000);
    }
    static void ClickWith(const char* key, BPoint where) {
        TheDesktop().tool({"keydown", key});
        Click(where);
        TheDesktop().tool({"keyup", key});
        snooze(100000);
    }
    static void Move(BPoint where) {
        TheDesktop().move_pointer(static_cast<int>(where.x), static_cast<int>(where.y));
        snooze(120000);
    }
    // Sideways, with a look, and a picture, before the button is let go.
    void Drag(BPoint from, float distance, const char* picture = nullptr) {
        Move(from);
        TheDesktop().press();
        for (int i = 1; i <= 10; ++i) {
            Move(BPoint(from.x + std::round(distance * static_cast<float>(i) / 10), from.y));
        }
        if (picture != nullptr) {
            KeepPicture(picture);
        }
        EXPECT_TRUE(IsDrawnAsAnew()) << "with the button held";
        TheDesktop().release();
        snooze(250000);
    }
    static void Key(const char* name) {
        TheDesktop().key(name);
        snooze(200000);
    }

    // For eyes to look at.
    static void KeepPicture(const std::string& name) {
        std::filesystem::create_directories(GALLERY_PICTURES);
        TheDesktop().screenshot(std::string(GALLERY_PICTURES) + "/" + name + ".png");
    }
    // All that shows of the window.
    std::string WindowPixels() {
        const BRect frame = FrameOf(mWindow);
        const auto number = [](float value) { return std::to_string(static_cast<int>(value)); };
        const std::string place = number(frame.Width() + 1) + "x" + number(frame.Height() + 1) + "+" +
                                  number(frame.left) + "+" + number(frame.top);
        return test::run_program("/usr/bin/import",
                                 {"-silent", "-window", "root", "-crop", place, "-depth", "8", "rgb:-"})
            .output;
    }
    // That nothing would look different if the whole window were drawn anew.
    testing::AssertionResult IsDrawnAsAnew() {
        const std::string before = WindowPixels();
        Read([this] {
            mList->Container()->Invalidate();
            mList->HeaderView()->Invalidate();
            mList->Invalidate();
            return 0;
        });
        snooze(300000);
        const std::string after = WindowPixels();
        if (before.empty() || before.size() != after.size()) {
            return testing::AssertionFailure() << "no pictures";
        }
        size_t different = 0;
        size_t first = before.size();
        for (size_t i = 0; i < before.size(); ++i) {
            if (before[i] != after[i]) {
                ++different;
                first = std::min(first, i);
            }
        }
        if (different == 0) {
            return testing::AssertionSuccess();
        }
        const size_t width = static_cast<size_t>(FrameOf(mWindow).Width()) + 1;
        return testing::AssertionFailure() << different << " bytes differ, the first at " << first / 3 % width
                                           << "," << first / 3 / width;
    }

    Numbers Order() {
        return Read([this] {
            const std::unique_ptr<int32[]> order(mList->DisplayOrder());
            return Numbers(order.get(), order.get() + mList->CountColumns());
        });
    }
    // "Part up, Maker down"
    std::string Sorting() {
        return Read([this] {
            std::vector<int32> keys(static_cast<size_t>(mList->CountColumns()));
            std::vector<CLVSortMode> modes(keys.size());
            std::string text;
            for (int32 i = 0, count = mList->Sorting(keys.data(), modes.data()); i < count; ++i) {
                const auto at = static_cast<size_t>(i);
                text += std::string(i == 0 ? "" : ", ") + mList->ColumnAt(keys[at])->GetLabel() +
                        (modes[at] == CLV_SORT_DESCENDING ? " down" : " up");
            }
            return text;
        });
    }
    std::string TextAt(int32 visible, int32 column) {
        return Read([&]() -> std::string {
            const char* const text =
                static_cast<CLVEasyItem*>(mList->ItemAt(visible))->GetColumnContentText(column);
            return text == nullptr ? "" : text;
        });
    }
    int32 CountVisible() {
        return Read([this] { return mList->CountItems(); });
    }
    Numbers Selection() {
        return Read([this] {
            Numbers rows;
            for (int32 i = 0; mList->CurrentSelection(i) >= 0; ++i) {
                rows.push_back(mList->CurrentSelection(i));
            }
            return rows;
        });
    }
    float Width(int32 column) {
        return Read([&] { return mList->ColumnAt(column)->Width(); });
    }
    BPoint ScrolledTo() {
        return Read([this] { return mList->Bounds().LeftTop(); });
    }

    GalleryWindow* mWindow = nullptr; // deletes itself
    GalleryList* mList = nullptr;     // the window's
};
