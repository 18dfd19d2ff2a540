#include "MouseTracking.h"

#include <algorithm>

void MouseTracking::SetMask(BView* view, uint32 mask) {
    const auto found = std::find_if(mMasked.begin(), mMasked.end(),
                                    [view](const Masked& masked) { return masked.view == view; });
    if (found != mMasked.end()) {
        found->mask = mask;
        if (mask == 0) {
            mMasked.erase(found);
        }
    } else if (mask != 0) {
        mMasked.push_back({view, mask});
    }
}

void MouseTracking::SetPress(BView* view, uint32 mask, uint32 options) {
    mPressView = view;
    mPressMask = mask;
    mPressOptions = options;
}

void MouseTracking::Forget(BView* view) {
    SetMask(view, 0);
    if (mPressView == view) {
        Released();
    }
    if (mUnder == view) {
        mUnder = nullptr;
    }
    for (Visit& visit : mVisits) {
        if (visit.view == view) {
            visit.view = nullptr;
        }
    }
}

bool MouseTracking::PressIsExclusive() const {
    return mPressView != nullptr && (mPressMask & B_POINTER_EVENTS) != 0 &&
           (mPressOptions & (B_LOCK_WINDOW_FOCUS | B_SUSPEND_VIEW_FOCUS)) != 0;
}

BView* MouseTracking::Foremost(BView* under) const {
    return mPressView != nullptr && (mPressMask & B_POINTER_EVENTS) != 0 ? mPressView : under;
}

std::vector<BView*> MouseTracking::Audience(BView* under) const {
    std::vector<BView*> audience = {Foremost(under)};
    if (PressIsExclusive()) {
        return audience;
    }
    const auto include = [&audience](BView* view) {
        if (view != nullptr && std::find(audience.begin(), audience.end(), view) == audience.end()) {
            audience.push_back(view);
        }
    };
    include(under);
    for (const Masked& masked : mMasked) {
        if ((masked.mask & B_POINTER_EVENTS) != 0) {
            include(masked.view);
        }
    }
    return audience;
}

void MouseTracking::Released() {
    mPressView = nullptr;
    mPressMask = 0;
    mPressOptions = 0;
}

void MouseTracking::Moved(BView* under) {
    BView* const before = mUnder;
    mUnder = under;
    std::vector<BView*> audience = Audience(under);
    if (!PressIsExclusive() && before != nullptr && before != under) {
        mVisits.push_back({before, B_EXITED_VIEW});
        audience.erase(std::remove(audience.begin(), audience.end(), before), audience.end());
    }
    for (BView* view : audience) {
        if (view == nullptr) {
            continue;
        }
        uint32 transit = B_OUTSIDE_VIEW;
        if (view == under) {
            transit = view == before ? B_INSIDE_VIEW : B_ENTERED_VIEW;
        } else if (view == before) {
            transit = B_EXITED_VIEW;
        }
        mVisits.push_back({view, transit});
    }
}

bool MouseTracking::NextVisit(Visit* visit) {
    while (!mVisits.empty()) {
        *visit = mVisits.front();
        mVisits.pop_front();
        if (visit->view != nullptr) {
            return true;
        }
    }
    return false;
}

std::vector<BView*> MouseTracking::KeyListeners() const {
    std::vector<BView*> listeners;
    for (const Masked& masked : mMasked) {
        if ((masked.mask & B_KEYBOARD_EVENTS) != 0) {
            listeners.push_back(masked.view);
        }
    }
    return listeners;
}
