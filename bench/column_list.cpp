// What the column list costs: appending, sorting, expanding, scrolling, resizing, memory.
//
// Usage: column_list [ROWS [SCROLLED [processor]]]     100000 rows; 1000000 rows to scroll in
// With "processor" times are those that the measuring thread had a processor, for machines that do other
// work.
#include "support/Figures.h"
#include "support/Frames.h"

#include "gui/ColumnListView/CLVContainerView.h"
#include "gui/ColumnListView/CLVEasyItem.h"
#include "gui/ColumnListView/ColumnListView.h"

#include <Application.h>
#include <Window.h>

#include <algorithm>
#include <cstdlib>
#include <malloc.h>
#include <memory>
#include <random>
#include <string>
#include <thread>
#include <vector>

namespace {

using bench::Better;

bench::Time timeKind = bench::Time::onTheClock;

// All that is measured happens in the thread that measures.
class Watch {
  public:
    double Milliseconds() const {
        return 1e3 * (timeKind == bench::Time::ofAProcessor ? mUsed.Seconds() : mPassed.Seconds());
    }

  private:
    bench::Stopwatch mPassed;
    bench::ProcessorStopwatch mUsed;
};

constexpr int kRounds = 5;
constexpr int kFrames = 600;
constexpr int32 kColumns = 6;
constexpr double kFrameAt60Hz = 1000.0 / 60;
typedef std::vector<std::unique_ptr<CLVEasyItem>> Rows;

// Counts the cells that it draws.
class Row : public CLVEasyItem {
  public:
    using CLVEasyItem::CLVEasyItem;
    void DrawItemColumn(BView* owner, BRect rect, int32 column, bool complete) override {
        ++drawn;
        CLVEasyItem::DrawItemColumn(owner, rect, column, complete);
    }
    static int drawn;
};
int Row::drawn = 0;

void SetTexts(CLVEasyItem& row, uint32 n) {
    const uint32 mixed = n * 2654435761U;
    row.SetColumnContent(1, ("Song number " + std::to_string(mixed % 100000)).c_str());
    row.SetColumnContent(2, ("Artist " + std::to_string(mixed % 997)).c_str());
    row.SetColumnContent(3, ("An album whose name is long, " + std::to_string(mixed % 3001)).c_str());
    row.SetColumnContent(4, std::to_string(mixed % 20).c_str());
    row.SetColumnContent(5, std::to_string(mixed % 1000).c_str());
    row.SetColumnContent(6, ("/music/folder/" + std::to_string(n)).c_str());
}

// Super-rows of 99 rows each, all at the top level where `group` is 0.
Rows MakeRows(int count, int group) {
    Rows rows;
    rows.reserve(static_cast<size_t>(count));
    for (int i = 0; i < count; ++i) {
        const bool super = group > 0 && i % group == 0;
        rows.push_back(std::make_unique<Row>(group > 0 && !super ? 1 : 0, super, true, 15.0F));
        SetTexts(*rows.back(), static_cast<uint32>(i));
    }
    return rows;
}

// A list that fills a window of 400 x 600, locked by this thread, with an expander and six columns of texts.
class ListInWindow {
  public:
    explicit ListInWindow(bool hierarchical)
        : mWindow(new BWindow(BRect(50, 50, 449, 649), "Column list", B_TITLED_WINDOW, 0)) {
        CLVContainerView* container = nullptr;
        BRect frame = mWindow->Bounds();
        frame.right -= B_V_SCROLL_BAR_WIDTH;
        frame.bottom -= B_H_SCROLL_BAR_HEIGHT;
        list = new ColumnListView(frame, &container, "list", B_FOLLOW_ALL_SIDES, B_WILL_DRAW | B_FRAME_EVENTS,
                                  B_SINGLE_SELECTION_LIST, hierarchical);
        const unsigned long expander = hierarchical ? CLV_COLUMN_EXPANDER : CLV_COLUMN_NOT_RESIZABLE;
        list->AddColumn(new CLVColumn("", 20, expander, 20));
        for (int32 i = 0; i < kColumns; ++i) {
            list->AddColumn(new CLVColumn(
                ("Column " + std::to_string(i)).c_str(), 60,
                CLV_COLUMN_SORTABLE | CLV_COLUMN_HEADER_TRUNCATE | CLV_COLUMN_TELL_ITEMS_WIDTH, 20));
        }
        list->SetSortFunction(CLVEasyItem::CompareItems);
        mWindow->AddChild(container);
        mWindow->Show();
        mWindow->Lock();
        mWindow->UpdateIfNeeded();
    }
    ~ListInWindow() {
        list->MakeEmpty();
        mWindow->Quit();
    }
    ListInWindow(const ListInWindow&) = delete;
    ListInWindow& operator=(const ListInWindow&) = delete;

    void Append(const Rows& rows) const {
        for (const auto& row : rows) {
            list->AddItem(row.get());
        }
    }
    void Update() const { mWindow->UpdateIfNeeded(); }

    ColumnListView* list;

  private:
    BWindow* const mWindow;
};

// Milliseconds for appending so many rows, one AddItem() each, until they are drawn.
double AppendTime(int count, bool outline) {
    const Rows rows = MakeRows(count, outline ? 100 : 0);
    std::vector<double> times;
    for (int round = 0; round < kRounds; ++round) {
        const ListInWindow window(outline);
        const Watch watch;
        window.Append(rows);
        window.Update();
        times.push_back(watch.Milliseconds());
    }
    return bench::Median(times);
}

bool MeasureAppending(int count) {
    bool reached = true;
    for (const bool outline : {false, true}) {
        const std::string kind = outline ? ", outline" : ", flat";
        const double tenth = AppendTime(count / 10, outline);
        const double all = AppendTime(count, outline);
        reached &= bench::Report("append " + std::to_string(count) + " rows" + kind, all, "ms", "limit", 500,
                                 1, Better::lower);
        reached &= bench::Report("append, time per row" + kind, all * 1e6 / count, "ns",
                                 "with a tenth of the rows", tenth * 1e7 / count, 1.3, Better::lower);
    }
    return reached;
}

// By the texts of two columns, the second descending.
int CompareByTwoKeys(const CLVListItem* a, const CLVListItem* b) {
    const int first = CLVEasyItem::CompareItems(a, b, 2);
    return first != 0 ? first : -CLVEasyItem::CompareItems(a, b, 1);
}

bool MeasureSorting(int count) {
    bool reached = true;
    for (const bool outline : {false, true}) {
        const Rows rows = MakeRows(count, 0);
        std::vector<double> ours;
        std::vector<double> peer;
        for (int round = 0; round < kRounds; ++round) {
            std::vector<const CLVListItem*> bare;
            for (const auto& row : rows) {
                bare.push_back(row.get());
            }
            const Watch bareWatch;
            std::stable_sort(bare.begin(), bare.end(), [](const CLVListItem* a, const CLVListItem* b) {
                return CompareByTwoKeys(a, b) < 0;
            });
            peer.push_back(bareWatch.Milliseconds());

            const ListInWindow window(outline);
            int32 keys[] = {2, 1};
            CLVSortMode modes[] = {CLV_SORT_ASCENDING, CLV_SORT_DESCENDING};
            window.list->SetSorting(2, keys, modes);
            window.Append(rows);
            window.Update();
            const Watch watch;
            window.list->SortItems();
            ours.push_back(watch.Milliseconds());
            for (int32 i = 1; i < count; ++i) {
                if (CompareByTwoKeys(static_cast<CLVListItem*>(window.list->ItemAt(i - 1)),
                                     static_cast<CLVListItem*>(window.list->ItemAt(i))) > 0) {
                    std::printf("row %d is not sorted\n", i);
                    return false;
                }
            }
        }
        reached &= bench::Report(std::string("sort by two keys, ") + (outline ? "outline" : "flat"),
                                 bench::Median(ours), "ms", "std::stable_sort", bench::Median(peer), 2,
                                 Better::lower);
    }
    return reached;
}

bool MeasureExpanding(int count) {
    const Rows rows = MakeRows(count, count);
    const ListInWindow window(true);
    window.Append(rows);
    window.Update();
    std::vector<double> expand;
    std::vector<double> collapse;
    for (int round = 0; round < 2 * kRounds; ++round) {
        const Watch first;
        window.list->Collapse(rows.front().get());
        window.Update();
        collapse.push_back(first.Milliseconds());
        const Watch second;
        window.list->Expand(rows.front().get());
        window.Update();
        expand.push_back(second.Milliseconds());
    }
    const std::string what = " a row of " + std::to_string(count - 1) + " others, drawn";
    bool reached = bench::Report("expand" + what, bench::Median(expand), "ms", "limit", 30, 1, Better::lower);
    reached &= bench::Report("collapse" + what, bench::Median(collapse), "ms", "limit", 30, 1, Better::lower);
    return reached;
}

bool MeasureScrolling(int count) {
    const Rows rows = MakeRows(count, 100);
    const ListInWindow window(true);
    window.Append(rows);
    window.Update();
    std::mt19937 random(1);
    const float height = window.list->ItemFrame(count - 1).bottom - window.list->Bounds().Height();
    std::uniform_real_distribution<float> anywhere(0, height);
    std::vector<float> tops;
    for (int i = 0; i < kFrames; ++i) {
        tops.push_back(std::floor(anywhere(random)));
    }
    const auto jump = [&](int frame) {
        window.list->ScrollTo(BPoint(0, tops[static_cast<size_t>(frame)]));
        window.Update();
    };
    const float middle = std::floor(height / 2);
    const auto step = [&](int frame) {
        window.list->ScrollTo(BPoint(0, middle + 48.0F * static_cast<float>(frame + 1)));
        window.Update();
    };
    const bench::FrameLimits limits{8, 16, "limit"};
    const std::string where = " in " + std::to_string(count) + " rows, ";
    bool reached = bench::ReportFrames("scroll anywhere" + where, bench::MeasureFrames(kFrames, jump), limits,
                                       timeKind, jump);
    reached &= bench::ReportFrames("scroll by 48 pixels" + where, bench::MeasureFrames(kFrames, step), limits,
                                   timeKind, step);
    return reached;
}

bool MeasureResizing(int count) {
    const Rows rows = MakeRows(count, 100);
    const ListInWindow window(true);
    window.Append(rows);
    window.Update();
    Row::drawn = 0;
    window.list->Invalidate();
    window.Update();
    const int whole = Row::drawn;
    CLVColumn* const column = window.list->ColumnAt(2);
    const float narrow = column->Width();
    std::vector<double> cells;
    // By two pixels each, to and fro.
    const auto step = [&](int frame) {
        const int turn = frame % 120;
        Row::drawn = 0;
        column->SetWidth(narrow + 2.0F * static_cast<float>(turn < 60 ? turn + 1 : 119 - turn));
        window.Update();
        cells.push_back(Row::drawn);
    };
    const bench::FrameCosts costs = bench::MeasureFrames(kFrames, step);
    bool reached = bench::Report("cells drawn in a step, median", bench::Median(cells), "cells",
                                 "drawing the whole list", whole, 0.5, Better::lower);
    reached &= bench::ReportFrames("resize a column of " + std::to_string(count) + " rows, a step, ", costs,
                                   {kFrameAt60Hz, kFrameAt60Hz, "a frame at 60 Hz"}, timeKind, step);
    return reached;
}

double HeapBytes() {
    const struct mallinfo2 info = mallinfo2();
    return static_cast<double>(info.uordblks) + static_cast<double>(info.hblkhd);
}

bool MeasureMemory(int count) {
    bool reached = true;
    for (const bool outline : {false, true}) {
        const double before = HeapBytes();
        const Rows rows = MakeRows(count, outline ? 100 : 0);
        const double made = HeapBytes();
        const ListInWindow window(outline);
        const double empty = HeapBytes();
        window.Append(rows);
        const double each = (HeapBytes() - empty) / count;
        const std::string kind = outline ? ", outline" : ", flat";
        reached &= bench::Report("memory of the list for a row" + kind, each, "bytes", "limit", 200, 1,
                                 Better::lower);
        reached &= bench::Report("the same with a bare row, CLVListItem" + kind,
                                 each + static_cast<double>(sizeof(CLVListItem)), "bytes", "limit", 200, 1,
                                 Better::lower);
        std::printf("a CLVEasyItem with six texts takes %.0f bytes%s\n", (made - before) / count,
                    kind.c_str());
    }
    return reached;
}

// Measures in a thread of its own, from when the display is there.
class Measuring : public BApplication {
  public:
    Measuring(int rows, int scrolled)
        : BApplication("application/x-vnd.Quirnel-ColumnListBench"), mRows(rows), mScrolled(scrolled) {}

    void ReadyToRun() override {
        mThread = std::thread([this] {
            mReached &= MeasureMemory(mRows);
            mReached &= MeasureAppending(mRows);
            mReached &= MeasureSorting(mRows);
            mReached &= MeasureExpanding(mRows / 2 + 1);
            mReached &= MeasureResizing(mRows);
            mReached &= MeasureScrolling(mScrolled);
            PostMessage(B_QUIT_REQUESTED);
        });
    }
    // After Run().
    bool Reached() {
        mThread.join();
        return mReached;
    }

  private:
    const int mRows;
    const int mScrolled;
    std::thread mThread;
    bool mReached = true;
};

} // namespace

int main(int count, char** words) {
    const int rows = count > 1 ? std::atoi(words[1]) : 100000;
    const int scrolled = count > 2 ? std::atoi(words[2]) : 1000000;
    if (count > 3 && std::string(words[3]) == "processor") {
        timeKind = bench::Time::ofAProcessor;
    }
    // A screen of its own is not needed: what is measured ends where the display's copy is made.
    setenv("QT_QPA_PLATFORM", "offscreen", 0);
    Measuring application(rows, scrolled);
    application.Run();
    return application.Reached() ? 0 : 1;
}
