// How long a window takes to draw a list of text rows anew, and to hand it to the display.
#include "support/Figures.h"

#include <Application.h>
#include <Font.h>
#include <View.h>
#include <Window.h>

#include <algorithm>
#include <cstdlib>
#include <string>
#include <vector>

namespace {

constexpr float kRowHeight = 15;
constexpr int kRounds = 300;

// 400 x 600 pixels of rows with so many texts each. New texts are drawn for the first time whenever the rows
// are drawn; the others are the same each time.
class Rows : public BView {
  public:
    Rows(BRect frame, int cells, bool newTexts)
        : BView(frame, "rows", B_FOLLOW_ALL, B_WILL_DRAW), mCells(cells), mNewTexts(newTexts) {
        SetLowColor(255, 255, 255);
    }
    void Draw(BRect update) override {
        const int first = static_cast<int>(update.top / kRowHeight);
        const int last = static_cast<int>(update.bottom / kRowHeight);
        SetHighColor(0, 0, 0);
        for (int row = first; row <= last; ++row) {
            DrawRow(row);
        }
        mTurn += mNewTexts ? 1 : 0;
        mRowsDrawn += last - first + 1;
    }
    int RowsDrawn() const { return mRowsDrawn; }

  private:
    void DrawRow(int row) {
        const float baseline = static_cast<float>(row) * kRowHeight + 12;
        const float width = 396.0F / static_cast<float>(mCells);
        const std::string number = std::to_string(row + 1000 * mTurn);
        for (int cell = 0; cell < mCells; ++cell) {
            const std::string text = (cell == 0 ? "Song number " : "Artist ") + number + ' ' +
                                     static_cast<char>('a' + cell) + (mCells <= 2 ? " of the list" : "");
            DrawString(text.c_str(), BPoint(4 + static_cast<float>(cell) * width, baseline));
        }
    }

    const int mCells;
    const bool mNewTexts;
    int mTurn = 0;
    int mRowsDrawn = 0;
};

double PartAt(std::vector<double> values, double part) {
    std::sort(values.begin(), values.end());
    return values[static_cast<size_t>(part * static_cast<double>(values.size() - 1))];
}

// Milliseconds of each of the rounds: what passed, and what the drawing thread used of it.
struct Times {
    std::vector<double> passed;
    std::vector<double> used;
};

Times TimesOf(BWindow& window, BRect damage) {
    Times times;
    for (int round = 0; round < kRounds; ++round) {
        const bench::Stopwatch watch;
        const bench::ProcessorStopwatch processor;
        window.ChildAt(0)->Invalidate(damage);
        window.UpdateIfNeeded();
        times.passed.push_back(watch.Seconds() * 1e3);
        times.used.push_back(processor.Seconds() * 1e3);
    }
    return times;
}

bool Measure(int cells, bool newTexts) {
    auto* const window = new BWindow(BRect(50, 50, 449, 649), "Redraw", B_TITLED_WINDOW, 0);
    auto* const rows = new Rows(window->Bounds(), cells, newTexts);
    window->AddChild(rows);
    window->Show();
    window->Lock();
    window->UpdateIfNeeded();
    const Times whole = TimesOf(*window, window->Bounds());
    const int drawnBefore = rows->RowsDrawn();
    const Times row = TimesOf(*window, BRect(0, 30, 399, 44));
    const double rowsForOne = static_cast<double>(rows->RowsDrawn() - drawnBefore) / kRounds;
    window->Quit();

    const std::string what = "40 rows of " + std::to_string(cells) + (newTexts ? " new texts" : " texts");
    bool reached = true;
    const auto report = [&reached](const std::string& name, double figure, const char* unit, double limit) {
        reached &= bench::Report(name, figure, unit, "limit", limit, 1, bench::Better::lower);
    };
    // Two texts a row are a plain list, six are a list of columns.
    report(what + ", median", bench::Median(whole.passed), "ms", cells <= 2 ? 4 : 8);
    report(what + ", 95th percentile", PartAt(whole.passed, 0.95), "ms", 8);
    report(what + ", processor time, median", bench::Median(whole.used), "ms", cells <= 2 ? 4 : 8);
    report(what + ", processor, 95th p.", PartAt(whole.used, 0.95), "ms", 8);
    report("one row of it, median", bench::Median(row.passed), "ms", 0.4);
    report("rows drawn for one that is damaged", rowsForOne, "", 1);
    return reached;
}

// The windows are made where a program makes them, in the application's thread, with the display connected.
class Measuring : public BApplication {
  public:
    Measuring() : BApplication("application/x-vnd.Quirnel-Redraw") {}

    void ReadyToRun() override {
        for (const int cells : {2, 6}) {
            for (const bool newTexts : {true, false}) {
                mReached &= Measure(cells, newTexts);
            }
        }
        PostMessage(B_QUIT_REQUESTED);
    }
    bool Reached() const { return mReached; }

  private:
    bool mReached = true;
};

} // namespace

int main() {
    // A screen is not needed: what is measured ends where the display's copy is made.
    setenv("QT_QPA_PLATFORM", "offscreen", 0);
    Measuring application;
    application.Run();
    return application.Reached() ? 0 : 1;
}
