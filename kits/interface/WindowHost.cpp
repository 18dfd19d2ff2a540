#include "WindowHost.h"

#include <View.h>

#include <algorithm>
#include <cmath>

// The view that all others of the window lie in. Its white shows where no view is.
class WindowHost::RootFiller : public BView {
  public:
    explicit RootFiller(BRect bounds) : BView(bounds, "window content", B_FOLLOW_ALL, 0) {}
};

namespace {

constexpr int32 kMaxPixelSide = 16384;

int PixelsOf(float extent) {
    return static_cast<int>(extent) + 1;
}

host::Area AreaOf(const BRect& frame) {
    return {static_cast<int>(frame.left), static_cast<int>(frame.top), PixelsOf(frame.Width()),
            PixelsOf(frame.Height())};
}

BRect FrameOf(const host::Area& area) {
    const auto left = static_cast<float>(area.left);
    const auto top = static_cast<float>(area.top);
    return {left, top, left + static_cast<float>(area.width) - 1, top + static_cast<float>(area.height) - 1};
}

double MainScale() {
    const std::vector<host::ScreenFacts> screens = host::screens();
    return screens.empty() ? 1.0 : screens.front().scale;
}

} // namespace

WindowHost::WindowHost(BWindow& window, BRect frame, WindowTraits traits)
    : mWindow(window), mGeometry(frame), mTraits(std::move(traits)),
      mEvents(std::make_shared<WindowEvents>(&window)),
      mPeer(host::make_window(mTraits.Options(mGeometry), AreaOf(mGeometry.Frame()), mEvents)), mWishes(1),
      mScale(MainScale()) {
    ResizePixels();
    mRoot = new RootFiller(mGeometry.Bounds());
    mRoot->AttachToHost(this);
}

WindowHost::~WindowHost() {
    mPeer->close();
    BView* const root = mRoot;
    delete root;
}

bool WindowHost::IsLocked() const {
    return mWindow.IsLocked();
}

PixelSurface WindowHost::Surface() const {
    PixelSurface surface;
    if (mPixelSize.width > 0 && mPixelSize.height > 0) {
        surface.bits = const_cast<uint8*>(reinterpret_cast<const uint8*>(mPixels.data()));
        surface.bytesPerRow = mPixelSize.width * static_cast<int32>(sizeof(uint32));
        surface.width = mPixelSize.width;
        surface.height = mPixelSize.height;
        surface.scale = mScale;
    }
    return surface;
}

void WindowHost::ResizePixels() {
    const auto device = [this](float extent) {
        return static_cast<int>(std::clamp<long>(std::lround(PixelsOf(extent) * mScale), 1, kMaxPixelSide));
    };
    const host::Size size{device(mGeometry.Frame().Width()), device(mGeometry.Frame().Height())};
    if (size == mPixelSize) {
        return;
    }
    constexpr uint32 kWhite = 0xffffffffU;
    const auto width = static_cast<size_t>(size.width);
    std::vector<uint32> pixels(width * static_cast<size_t>(size.height), kWhite);
    const int rows = std::min(size.height, mPixelSize.height);
    const auto kept = static_cast<size_t>(std::min(size.width, mPixelSize.width));
    for (int y = 0; y < rows; ++y) {
        std::copy_n(mPixels.begin() + static_cast<ptrdiff_t>(y) * mPixelSize.width, kept,
                    pixels.begin() + static_cast<ptrdiff_t>(y) * size.width);
    }
    mPixels = std::move(pixels);
    mPixelSize = size;
    mUpdates.Drawn(Surface().LogicalBounds());
}

WindowGeometry::Margins WindowHost::Margins() const {
    const host::FrameMargins margins = mEvents->Margins();
    return {static_cast<float>(margins.left), static_cast<float>(margins.top),
            static_cast<float>(margins.right), static_cast<float>(margins.bottom)};
}

void WindowHost::TraitsChanged() {
    mPeer->set_options(mTraits.Options(mGeometry));
}

void WindowHost::FrameWanted() {
    if ((mTraits.flags & (B_NOT_RESIZABLE | B_NOT_H_RESIZABLE | B_NOT_V_RESIZABLE)) != 0) {
        // To the window manager a fixed size is a limit.
        TraitsChanged();
    }
    ++mWishes;
    mPeer->set_area(AreaOf(mGeometry.Frame()));
    ResizePixels();
    mRoot->ForgetClipping();
    mRoot->ResizeTo(mGeometry.Frame().Width(), mGeometry.Frame().Height());
}

bool WindowHost::TakeFrame() {
    const std::optional<WindowEvents::AreaNews> news = mEvents->TakeArea();
    if (!news || news->wishes < mWishes) {
        // Older than what the window has asked for since.
        return false;
    }
    const BRect frame = FrameOf(news->content);
    if (frame == mGeometry.Frame()) {
        return false;
    }
    mGeometry.Accept(frame);
    ResizePixels();
    mRoot->ForgetClipping();
    mRoot->ResizeTo(frame.Width(), frame.Height());
    return true;
}

void WindowHost::TakeScale() {
    const double scale = mEvents->Scale();
    if (scale == mScale) {
        return;
    }
    mScale = scale;
    mPixelSize = {};
    ResizePixels();
    mRoot->ForgetClipping();
    mRoot->Invalidate();
}

void WindowHost::SetShown(bool shown) {
    if (shown == mShown) {
        return;
    }
    mShown = shown;
    if (shown) {
        mPeer->show();
        mRoot->Invalidate();
        ScheduleUpdate();
    } else {
        mPeer->hide();
    }
    RefreshPulse();
}

bool WindowHost::IsKnown(BView* view) const {
    // Compared only: the view may be gone.
    return view != nullptr && mWindow.IndexOf(view) >= 0;
}

void WindowHost::ViewAdded(BView* view) {
    mWindow.AddHandler(view);
    if (BView* const parent = view->Parent(); parent != nullptr) {
        view->SetNextHandler(parent);
    }
    if (view->EventMask() != 0) {
        mMouse.SetMask(view, view->EventMask());
    }
    ViewFlagsChanged(view);
}

void WindowHost::ViewRemoved(BView* view) {
    mMouse.Forget(view);
    mCursors.erase(view);
    if (mCursorView == view) {
        mCursorView = nullptr;
    }
    if (mFocus == view) {
        mFocus = nullptr;
        mWindow.SetPreferredHandler(nullptr);
    }
    if (mDefaultButton == view) {
        mDefaultButton = nullptr;
    }
    if (mKeyMenuView == view) {
        SetKeyMenuBar(nullptr, nullptr, nullptr);
    }
    if (mRoot == view) {
        mRoot = nullptr;
    }
    mPulseViews.erase(std::remove(mPulseViews.begin(), mPulseViews.end(), view), mPulseViews.end());
    RefreshPulse();
    mWindow.RemoveHandler(view);
}

void WindowHost::ViewFlagsChanged(BView* view) {
    const auto found = std::find(mPulseViews.begin(), mPulseViews.end(), view);
    const bool wanted = (view->Flags() & B_PULSE_NEEDED) != 0;
    if (wanted && found == mPulseViews.end()) {
        mPulseViews.push_back(view);
    } else if (!wanted && found != mPulseViews.end()) {
        mPulseViews.erase(found);
    }
    RefreshPulse();
    if (view == mFocus) {
        RefreshTextInput();
    }
}

void WindowHost::SetPulseRate(bigtime_t rate) {
    mPulseRate = std::max(rate, bigtime_t{0});
    RefreshPulse();
}

void WindowHost::RefreshPulse() {
    const bigtime_t wanted = mShown && !mPulseViews.empty() ? mPulseRate : 0;
    if (wanted != mPulseAsked) {
        mPulseAsked = wanted;
        mPeer->set_pulse(wanted);
    }
}

void WindowHost::Pulse() {
    mEvents->PulseTaken();
    const std::vector<BView*> views = mPulseViews;
    for (BView* view : views) {
        // A pulse may take views away.
        if (std::find(mPulseViews.begin(), mPulseViews.end(), view) != mPulseViews.end()) {
            view->Pulse();
        }
    }
}
