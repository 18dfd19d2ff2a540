#include "BitmapViews.h"

#include <View.h>

#include <algorithm>

BitmapViews::BitmapViews(const BBitmap& bitmap) : mBitmap(bitmap) {}

BitmapViews::~BitmapViews() {
    while (!mChildren.empty()) {
        // Deleting a view takes it off the list.
        delete mChildren.back();
    }
}

void BitmapViews::AddChild(BView* view) {
    if (view == nullptr || view->Parent() != nullptr || view->Host() != nullptr) {
        return;
    }
    mChildren.push_back(view);
    view->AttachToHost(this);
}

bool BitmapViews::RemoveChild(BView* view) {
    if (std::find(mChildren.begin(), mChildren.end(), view) == mChildren.end()) {
        return false;
    }
    view->DetachFromHost();
    return true;
}

void BitmapViews::ViewRemoved(BView* view) {
    // Also called for views further down, which are not on the list.
    mChildren.erase(std::remove(mChildren.begin(), mChildren.end(), view), mChildren.end());
}
