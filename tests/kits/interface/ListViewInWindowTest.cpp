// Lists in a window: what has them drawn anew.
#include "WindowWithApplication.h"

#include "support/temporary_environment.h"

#include <ListView.h>
#include <gtest/gtest.h>

namespace {

// A row that counts how often it is drawn, and learns of fonts.
class CountingRow : public BListItem {
  public:
    CountingRow(float fontSize, std::atomic<int>& drawn) : mFontSize(fontSize), mDrawn(drawn) {}

    void DrawItem(BView* owner, BRect frame, bool /*complete*/) override {
        ++mDrawn;
        owner->PushState();
        owner->SetFontSize(mFontSize);
        owner->DrawString("row", BPoint(frame.left + 2, frame.bottom - 3));
        owner->PopState();
    }
    void Update(BView* owner, const BFont* font) override {
        BListItem::Update(owner, font);
        ++mUpdated;
    }
    int Updated() const { return mUpdated; }

  private:
    const float mFontSize;
    std::atomic<int>& mDrawn;
    int mUpdated = 0;
};

} // namespace

TEST(ListViewInWindow, RowsThatDrawInFontsOfTheirOwnAreDrawnOnce) {
    const test::TemporaryEnvironment environment;
    RunApplication([] {
        std::atomic<int> drawn = 0;
        // Rows belong to whoever made them.
        CountingRow small(9, drawn);
        CountingRow large(20, drawn);
        auto* const window =
            new BWindow(BRect(100, 100, 299, 299), "list", B_TITLED_WINDOW, B_ASYNCHRONOUS_CONTROLS);
        auto* const list = new BListView(window->Bounds(), "list");
        list->AddItem(&small);
        list->AddItem(&large);
        window->AddChild(list);
        window->Show();
        ASSERT_TRUE(window->Lock());
        window->UpdateIfNeeded();
        const int before = drawn;
        list->Invalidate();
        for (int i = 0; i < 5; ++i) {
            window->UpdateIfNeeded();
        }
        EXPECT_EQ(drawn - before, 2);
        window->Quit();
    });
}

TEST(ListViewInWindow, RowsLearnOfANewFontButNotOfTheSameOneAgain) {
    const test::TemporaryEnvironment environment;
    RunApplication([] {
        std::atomic<int> drawn = 0;
        CountingRow row(9, drawn);
        auto* const window =
            new BWindow(BRect(100, 100, 299, 299), "list", B_TITLED_WINDOW, B_ASYNCHRONOUS_CONTROLS);
        auto* const list = new BListView(window->Bounds(), "list");
        list->AddItem(&row);
        window->AddChild(list);
        window->Show();
        ASSERT_TRUE(window->Lock());
        const int before = row.Updated();
        const float low = row.Height();
        list->SetFontSize(30);
        EXPECT_EQ(row.Updated() - before, 1);
        EXPECT_GT(row.Height(), low);
        list->SetFontSize(30);
        EXPECT_EQ(row.Updated() - before, 1);
        window->Quit();
    });
}
