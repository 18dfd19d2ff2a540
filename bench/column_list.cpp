// What the column list costs: appending, sorting, expanding, scrolling, resizing, memory.
//
// Usage: column_list [ROWS [SCROLLED [processor]]]     100000 rows; 1000000 rows to scroll in
// With "processor" times are those that the measuring thread had a processor, for machines that do other
// work.
#include "support/Figures.h"

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
#include <time.h>
#include <vector>

namespace {

using bench::Better;

bool processorTime = false;

// All that is measured happens in the thread that measures.
class Watch {
  public:
    double Milliseconds() const { return (Now() - mStart) * 1e3; }

  private:
    static double Now() {
        timespec now;
        clock_gettime(processorTime ? CLOCK_THREAD_CPUTIME_ID : CLOCK_MONOTONIC, &now);
        return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) * 1e-9;
    }
    double mStart = Now();
};

constexpr int kRounds = 5;
constexpr int kFrames = 600;
constexpr int32 kColumns = 6;
constexpr double kFrameAt60Hz = 1000.0 / 60;
typedef std::vector<std::unique_ptr<CLVEasyItem>> Rows;

double PartAt(std::vector<double> values, double part) {
    std::sort(values.begin(), values.end());
    return values[static_cast<size_t>(part * static_cast<double>(values.size() - 1))];
}

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
    const auto frames = [&](const auto& nextTop) {
        std::vector<double> times;
        for (int i = 0; i < kFrames; ++i) {
            const float top = nextTop();
            const Watch watch;
            window.list->ScrollTo(BPoint(0, top));
            window.Update();
            times.push_back(watch.Milliseconds());
        }
        return times;
    };
    std::uniform_real_distribution<float> anywhere(0, height);
    const std::vector<double> jumps = frames([&] { return std::floor(anywhere(random)); });
    float top = std::floor(height / 2);
    const std::vector<double> steps = frames([&] { return top += 48; });
    const std::string where = " in " + std::to_string(count) + " rows, ";
    bool reached = bench::Report("scroll anywhere" + where + "95 %", PartAt(jumps, 0.95), "ms", "limit", 8, 1,
                                 Better::lower);
    reached &= bench::Report("scroll anywhere" + where + "slowest", PartAt(jumps, 1), "ms", "limit", 16, 1,
                             Better::lower);
    reached &= bench::Report("scroll by 48 pixels" + where + "95 %", PartAt(steps, 0.95), "ms", "limit", 8, 1,
                             Better::lower);
    reached &= bench::Report("scroll by 48 pixels" + where + "slowest", PartAt(steps, 1), "ms", "limit", 16,
                             1, Better::lower);
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
    std::vector<double> times;
    std::vector<double> cells;
    CLVColumn* const column = window.list->ColumnAt(2);
    for (int i = 0; i < kFrames; ++i) {
        Row::drawn = 0;
        const Watch watch;
        column->SetWidth(column->Width() + (i / 60 % 2 == 0 ? 2.0F : -2.0F));
        window.Update();
        times.push_back(watch.Milliseconds());
        cells.push_back(Row::drawn);
    }
    const std::string what = "resize a column of " + std::to_string(count) + " rows, a step, ";
    bool reached = bench::Report(what + "95 %", PartAt(times, 0.95), "ms", "a frame at 60 Hz", kFrameAt60Hz,
                                 1, Better::lower);
    reached &= bench::Report(what + "slowest", PartAt(times, 1), "ms", "a frame at 60 Hz", kFrameAt60Hz, 1,
                             Better::lower);
    reached &= bench::Report("cells drawn in a step, median", bench::Median(cells), "cells",
                             "drawing the whole list", whole, 0.5, Better::lower);
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

} // namespace

int main(int count, char** words) {
    const int rows = count > 1 ? std::atoi(words[1]) : 100000;
    const int scrolled = count > 2 ? std::atoi(words[2]) : 1000000;
    processorTime = count > 3 && std::string(words[3]) == "processor";
    // A screen of its own is not needed: what is measured ends where the display's copy is made.
    setenv("QT_QPA_PLATFORM", "offscreen", 0);
    BApplication application("application/x-vnd.Quirnel-ColumnListBench");
    bool reached = true;
    std::thread measuring([&] {
        reached &= MeasureMemory(rows);
        reached &= MeasureAppending(rows);
        reached &= MeasureSorting(rows);
        reached &= MeasureExpanding(rows / 2 + 1);
        reached &= MeasureResizing(rows);
        reached &= MeasureScrolling(scrolled);
        application.PostMessage(B_QUIT_REQUESTED);
    });
    application.Run();
    measuring.join();
    return reached ? 0 : 1;
}
