#include <Window.h>

#include "WindowHost.h"
#include "WindowLoop.h"

#include <Application.h>
#include <Message.h>
#include <View.h>

#include <cmath>

namespace {

constexpr char kFrameField[] = "_frame";
constexpr char kTitleField[] = "_title";
constexpr char kLookField[] = "_wlook";
constexpr char kFeelField[] = "_wfeel";
constexpr char kFlagsField[] = "_flags";
constexpr char kSizeLimitsField[] = "_sizel";
constexpr char kZoomLimitsField[] = "_zooml";
constexpr char kPulseField[] = "_pulse";
constexpr char kViewsField[] = "_views";

} // namespace

BWindow::BWindow(BRect frame, const char* title, window_type type, uint32 flags, uint32 /*workspaces*/)
    : BLooper(title) {
    WindowTraits traits;
    // A number that is no type gives a titled window.
    (void)traits.SetType(type);
    Initialise(frame, title, traits.look, traits.feel, flags);
}

BWindow::BWindow(BRect frame, const char* title, window_look look, window_feel feel, uint32 flags,
                 uint32 /*workspaces*/)
    : BLooper(title) {
    Initialise(frame, title, look, feel, flags);
}

BWindow::BWindow(BMessage* archive) : BLooper(archive) {
    const BMessage empty;
    const BMessage& from = archive != nullptr ? *archive : empty;
    Initialise(from.GetRect(kFrameField, BRect(100, 100, 300, 200)), from.GetString(kTitleField, ""),
               static_cast<window_look>(from.GetInt32(kLookField, B_TITLED_WINDOW_LOOK)),
               static_cast<window_feel>(from.GetInt32(kFeelField, B_NORMAL_WINDOW_FEEL)),
               static_cast<uint32>(from.GetInt32(kFlagsField, 0)));
    if (from.HasFloat(kSizeLimitsField, 3)) {
        SetSizeLimits(from.GetFloat(kSizeLimitsField, 0, 0), from.GetFloat(kSizeLimitsField, 1, 32767),
                      from.GetFloat(kSizeLimitsField, 2, 0), from.GetFloat(kSizeLimitsField, 3, 32767));
    }
    if (from.HasFloat(kZoomLimitsField, 1)) {
        SetZoomLimits(from.GetFloat(kZoomLimitsField, 0, 0), from.GetFloat(kZoomLimitsField, 1, 0));
    }
    SetPulseRate(from.GetInt64(kPulseField, 500000));
    BMessage childArchive;
    for (int32 i = 0; from.FindMessage(kViewsField, i, &childArchive) == B_OK; ++i) {
        BArchivable* const object = instantiate_object(&childArchive);
        if (auto* const child = dynamic_cast<BView*>(object); child != nullptr) {
            AddChild(child);
        } else {
            delete object;
        }
    }
}

void BWindow::Initialise(BRect frame, const char* title, window_look look, window_feel feel, uint32 flags) {
    WindowLoop::Connect();
    WindowTraits traits;
    traits.title = title != nullptr ? title : "";
    traits.look = look;
    traits.feel = feel;
    traits.flags = flags;
    mHost = std::make_unique<WindowHost>(*this, frame, std::move(traits));
    mToldFrame = mHost->Geometry().Frame();
}

BWindow::~BWindow() {
    // The views go first: they are handlers of this looper, and draw through the host.
    mHost.reset();
}

BArchivable* BWindow::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BWindow") ? new BWindow(archive) : nullptr;
}

REGISTER_ARCHIVABLE(BWindow);

status_t BWindow::Archive(BMessage* archive, bool deep) const {
    status_t status = BLooper::Archive(archive, deep);
    const auto add = [&status](status_t added) { status = status == B_OK ? added : status; };
    const WindowGeometry::Limits& limits = mHost->Geometry().SizeLimits();
    add(archive->AddRect(kFrameField, Frame()));
    add(archive->AddString(kTitleField, Title()));
    add(archive->AddInt32(kLookField, Look()));
    add(archive->AddInt32(kFeelField, Feel()));
    add(archive->AddInt32(kFlagsField, static_cast<int32>(Flags())));
    for (const float limit : {limits.minWidth, limits.maxWidth, limits.minHeight, limits.maxHeight}) {
        add(archive->AddFloat(kSizeLimitsField, limit));
    }
    if (mHost->Geometry().HasZoomLimits()) {
        add(archive->AddFloat(kZoomLimitsField, mHost->Geometry().ZoomWidth()));
        add(archive->AddFloat(kZoomLimitsField, mHost->Geometry().ZoomHeight()));
    }
    add(archive->AddInt64(kPulseField, PulseRate()));
    for (int32 i = 0; deep && status == B_OK && i < CountChildren(); ++i) {
        BMessage child;
        add(ChildAt(i)->Archive(&child, deep));
        add(archive->AddMessage(kViewsField, &child));
    }
    return status;
}

thread_id BWindow::Run() {
    return BLooper::Run();
}

void BWindow::Quit() {
    // Without the lock the window may be gone; BLooper sees to that.
    if (IsLocked()) {
        mHost->Peer()->hide();
        if ((Flags() & B_QUIT_ON_WINDOW_CLOSE) != 0 && be_app != nullptr) {
            be_app->PostMessage(B_QUIT_REQUESTED);
        }
    }
    BLooper::Quit();
}

bool BWindow::QuitRequested() {
    return true;
}

void BWindow::AddChild(BView* child, BView* before) {
    mHost->Root().AddChild(child, before);
}

bool BWindow::RemoveChild(BView* child) {
    return mHost->Root().RemoveChild(child);
}

int32 BWindow::CountChildren() const {
    return mHost->Root().CountChildren();
}

BView* BWindow::ChildAt(int32 index) const {
    return mHost->Root().ChildAt(index);
}

BView* BWindow::FindView(const char* name) const {
    for (int32 i = 0; i < CountChildren(); ++i) {
        if (BView* const found = ChildAt(i)->FindView(name); found != nullptr) {
            return found;
        }
    }
    return nullptr;
}

BView* BWindow::FindView(BPoint point) const {
    return mHost->ViewAt(point);
}

BView* BWindow::CurrentFocus() const {
    return mHost->Focus();
}

BView* BWindow::LastMouseMovedView() const {
    return mHost->LastMouseMovedView();
}

void BWindow::Show() {
    if (++mShowLevel == 1) {
        mTitleToCheck = mHost->Margins() == WindowGeometry::Margins();
        if (!mTitleToCheck) {
            KeepTitleInReach();
        }
        mHost->SetShown(true);
    }
    if (!IsRunning()) {
        Run();
    }
}

void BWindow::Hide() {
    if (--mShowLevel == 0) {
        mHost->SetShown(false);
    }
}

bool BWindow::IsHidden() const {
    return mShowLevel <= 0;
}

bool BWindow::IsMinimized() const {
    return mMinimized;
}

void BWindow::Activate(bool active) {
    if (IsHidden()) {
        return;
    }
    if (active) {
        mMinimized = false;
        mHost->Peer()->activate();
    } else {
        mHost->Peer()->send_behind(nullptr);
    }
}

status_t BWindow::SendBehind(const BWindow* window) {
    if (window == this) {
        return B_BAD_VALUE;
    }
    mHost->Peer()->send_behind(window != nullptr ? window->mHost->Peer() : nullptr);
    return B_OK;
}

bool BWindow::IsFront() const {
    return mActive;
}

bool BWindow::IsActive() const {
    return mActive;
}

bool BWindow::IsModal() const {
    return mHost->Traits().IsModal();
}

bool BWindow::IsFloating() const {
    return mHost->Traits().IsFloating();
}

const char* BWindow::Title() const {
    return mHost->Traits().title.c_str();
}

void BWindow::SetTitle(const char* title) {
    mHost->Traits().title = title != nullptr ? title : "";
    mHost->TraitsChanged();
    SetName(title);
}

status_t BWindow::SetType(window_type type) {
    if (!mHost->Traits().SetType(type)) {
        return B_BAD_VALUE;
    }
    mHost->TraitsChanged();
    return B_OK;
}

window_type BWindow::Type() const {
    return mHost->Traits().Type();
}

status_t BWindow::SetLook(window_look look) {
    mHost->Traits().look = look;
    mHost->TraitsChanged();
    return B_OK;
}

window_look BWindow::Look() const {
    return mHost->Traits().look;
}

status_t BWindow::SetFeel(window_feel feel) {
    mHost->Traits().feel = feel;
    mHost->TraitsChanged();
    return B_OK;
}

window_feel BWindow::Feel() const {
    return mHost->Traits().feel;
}

status_t BWindow::SetFlags(uint32 flags) {
    mHost->Traits().flags = flags;
    mHost->TraitsChanged();
    return B_OK;
}

uint32 BWindow::Flags() const {
    return mHost->Traits().flags;
}

status_t BWindow::AddToSubset(BWindow* window) {
    if (window == nullptr ||
        (Feel() != B_MODAL_SUBSET_WINDOW_FEEL && Feel() != B_FLOATING_SUBSET_WINDOW_FEEL)) {
        return B_BAD_VALUE;
    }
    mHost->Peer()->set_parent(window->mHost->Peer());
    return B_OK;
}

status_t BWindow::RemoveFromSubset(BWindow* window) {
    if (window == nullptr ||
        (Feel() != B_MODAL_SUBSET_WINDOW_FEEL && Feel() != B_FLOATING_SUBSET_WINDOW_FEEL)) {
        return B_BAD_VALUE;
    }
    mHost->Peer()->set_parent(nullptr);
    return B_OK;
}

status_t BWindow::GetSupportedSuites(BMessage* data) {
    const status_t status = data != nullptr ? data->AddString("suites", "suite/vnd.Be-window") : B_BAD_VALUE;
    return status == B_OK ? BLooper::GetSupportedSuites(data) : status;
}
