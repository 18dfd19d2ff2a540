// How long a window takes to draw a list of text rows anew, and to hand it to the display.
#include "support/Figures.h"

#include <Application.h>
#include <Font.h>
#include <View.h>
#include <Window.h>

#include <algorithm>
#include <cstdlib>
#include <string>
#include <thread>
#include <vector>

namespace {

constexpr float kRowHeight = 15;
constexpr int kRounds = 300;

// 400 x 600 pixels of rows, each with its own text in two columns.
class Rows : public BView {
  public:
    explicit Rows(BRect frame) : BView(frame, "rows", B_FOLLOW_ALL, B_WILL_DRAW) {
        SetLowColor(255, 255, 255);
    }
    void Draw(BRect update) override {
        const int first = static_cast<int>(update.top / kRowHeight);
        const int last = static_cast<int>(update.bottom / kRowHeight);
        SetHighColor(0, 0, 0);
        for (int row = first; row <= last; ++row) {
            const float baseline = static_cast<float>(row) * kRowHeight + 12;
            const std::string number = std::to_string(row + mTurn);
            DrawString(("Song number " + number + " of the list").c_str(), BPoint(4, baseline));
            DrawString(("Artist " + number).c_str(), BPoint(260, baseline));
        }
        ++mTurn;
    }

  private:
    int mTurn = 0; // so that no text is drawn twice
};

double PartAt(std::vector<double> values, double part) {
    std::sort(values.begin(), values.end());
    return values[static_cast<size_t>(part * static_cast<double>(values.size() - 1))];
}

bool Measure() {
    auto* const window = new BWindow(BRect(50, 50, 449, 649), "Redraw", B_TITLED_WINDOW, 0);
    window->AddChild(new Rows(window->Bounds()));
    window->Show();
    std::vector<double> whole;
    std::vector<double> row;
    window->Lock();
    window->UpdateIfNeeded();
    for (int round = 0; round < kRounds; ++round) {
        const bench::Stopwatch all;
        window->ChildAt(0)->Invalidate();
        window->UpdateIfNeeded();
        whole.push_back(all.Seconds() * 1e3);
        const bench::Stopwatch one;
        window->ChildAt(0)->Invalidate(BRect(0, 30, 399, 44));
        window->UpdateIfNeeded();
        row.push_back(one.Seconds() * 1e3);
    }
    window->Quit();
    bool reached = bench::Report("redraw 400x600, 40 rows, median", bench::Median(whole), "ms", "limit", 4, 1,
                                 bench::Better::lower);
    reached &= bench::Report("redraw 400x600, 40 rows, 95th percentile", PartAt(whole, 0.95), "ms",
                             "a frame at 60 Hz", 16, 1, bench::Better::lower);
    reached &= bench::Report("redraw one row, median", bench::Median(row), "ms", "limit", 0.4, 1,
                             bench::Better::lower);
    return reached;
}

} // namespace

int main() {
    // A screen of its own is not needed: what is measured ends where the display's copy is made.
    setenv("QT_QPA_PLATFORM", "offscreen", 0);
    BApplication application("application/x-vnd.Quirnel-Redraw");
    bool reached = false;
    std::thread measuring([&] {
        reached = Measure();
        application.PostMessage(B_QUIT_REQUESTED);
    });
    application.Run();
    measuring.join();
    return reached ? 0 : 1;
}
