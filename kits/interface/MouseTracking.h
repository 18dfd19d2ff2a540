// MouseTracking: which views hear of the pointer.
#pragma once

#include <InterfaceDefs.h>

#include <deque>
#include <utility>
#include <vector>

class BView;

// Bookkeeping alone: views are compared and never looked at. One thread at a time.
//
// The view under the pointer hears of everything. Beside it, those with B_POINTER_EVENTS in their event mask,
// and the one that asked for it while a button is down (SetPress()), until all are let go. With
// B_LOCK_WINDOW_FOCUS or B_SUSPEND_VIEW_FOCUS that one alone is told.
class MouseTracking {
  public:
    struct Visit {
        BView* view = nullptr;
        uint32 transit = B_OUTSIDE_VIEW;
    };

    void SetMask(BView* view, uint32 mask);
    void SetPress(BView* view, uint32 mask, uint32 options);
    // The view has gone.
    void Forget(BView* view);

    // Of a press or release: who is told, the first one in the first place. Null for nobody.
    std::vector<BView*> Audience(BView* under) const;
    // All buttons are up.
    void Released();

    // The pointer is over `under` now (null: over none, or outside of the window). Queues who is told of it,
    // the view that was left first.
    void Moved(BView* under);
    // The next one of the queue; false at its end. Views that have gone meanwhile are left out.
    bool NextVisit(Visit* visit);
    BView* LastUnder() const { return mUnder; }
    // For who has to name one view only: the view that is sure to hear of the next event.
    BView* Foremost(BView* under) const;
    // Views beside the focus that hear of keys.
    std::vector<BView*> KeyListeners() const;

  private:
    struct Masked {
        BView* view;
        uint32 mask;
    };
    bool PressIsExclusive() const;

    BView* mUnder = nullptr;
    BView* mPressView = nullptr;
    uint32 mPressMask = 0;
    uint32 mPressOptions = 0;
    std::vector<Masked> mMasked;
    std::deque<Visit> mVisits;
};
