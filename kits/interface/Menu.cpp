#include <Menu.h>

#include "LooperHold.h"
#include "MenuLayout.h"
#include "MenuPlacement.h"
#include "MenuWindow.h"

#include <MenuBar.h>
#include <MenuItem.h>

#include <algorithm>

namespace {

constexpr char kLayoutField[] = "_layout";
constexpr char kResizeField[] = "_rsize_to_fit";
constexpr char kDisabledField[] = "_disable";
constexpr char kRadioField[] = "_radio";
constexpr char kTriggersField[] = "_trig_disabled";
constexpr char kDynamicLabelField[] = "_dyn_label";
constexpr char kMaxWidthField[] = "_maxwidth";
constexpr char kItemsField[] = "_items";
constexpr char kItemFramesField[] = "_i_frames";

constexpr MenuMargins kUsualMargins = {14, 2, 20, 0};

} // namespace

REGISTER_ARCHIVABLE(BMenu);

BMenu::BMenu(const char* title, menu_layout layout)
    : BView(BRect(0, 0, 0, 0), title, B_FOLLOW_NONE, B_WILL_DRAW), mLayout(layout) {
    Initialise();
}

BMenu::BMenu(const char* title, float width, float height)
    : BView(BRect(0, 0, 0, 0), title, B_FOLLOW_NONE, B_WILL_DRAW), mLayout(B_ITEMS_IN_MATRIX),
      mMatrixWidth(width), mMatrixHeight(height) {
    Initialise();
}

BMenu::BMenu(BRect frame, const char* name, uint32 resizingMode, uint32 flags, menu_layout layout,
             bool resizeToFit)
    : BView(frame, name, resizingMode, flags), mLayout(layout), mResizeToFit(resizeToFit) {
    Initialise();
}

BMenu::BMenu(BMessage* archive) : BView(archive) {
    Initialise();
    if (archive != nullptr) {
        TakeArchive(*archive);
    }
}

BMenu::~BMenu() {
    mShownAlone.reset();
}

void BMenu::Initialise() {
    mMargins = std::make_unique<MenuMargins>(kUsualMargins);
    menu_info info;
    if (get_menu_info(&info) != B_OK) {
        return;
    }
    BFont font(be_plain_font);
    // A family that has been taken from the machine leaves the plain font's.
    (void)font.SetFamilyAndStyle(info.f_family, info.f_style);
    font.SetSize(info.font_size);
    SetFont(&font);
    SetViewColor(info.background_color);
    SetLowColor(info.background_color);
    mTriggersShown = info.triggers_always_shown;
}

BArchivable* BMenu::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BMenu") ? new BMenu(archive) : nullptr;
}

void BMenu::TakeArchive(const BMessage& archive) {
    const int32 layout = archive.GetInt32(kLayoutField, B_ITEMS_IN_COLUMN);
    if (layout >= B_ITEMS_IN_ROW && layout <= B_ITEMS_IN_MATRIX) {
        mLayout = static_cast<menu_layout>(layout);
    }
    mResizeToFit = archive.GetBool(kResizeField, true);
    mEnabled = !archive.GetBool(kDisabledField, false);
    mRadioMode = archive.GetBool(kRadioField, false);
    mTriggersEnabled = !archive.GetBool(kTriggersField, false);
    mLabelFromMarked = archive.GetBool(kDynamicLabelField, false);
    mMaxContentWidth = archive.GetFloat(kMaxWidthField, 0);
    BMessage itemArchive;
    for (int32 i = 0; archive.FindMessage(kItemsField, i, &itemArchive) == B_OK; ++i) {
        BArchivable* const object = instantiate_object(&itemArchive);
        auto* const item = dynamic_cast<BMenuItem*>(object);
        BRect frame;
        if (item == nullptr) {
            delete object;
        } else if (mLayout == B_ITEMS_IN_MATRIX && archive.FindRect(kItemFramesField, i, &frame) == B_OK) {
            AddItem(item, frame);
        } else {
            AddItem(item);
        }
    }
}

status_t BMenu::Archive(BMessage* archive, bool deep) const {
    status_t status = BView::Archive(archive, deep);
    const auto addWhereSet = [&](const char* field, bool set, bool value) {
        if (status == B_OK && set) {
            status = archive->AddBool(field, value);
        }
    };
    if (status == B_OK) {
        status = archive->AddInt32(kLayoutField, mLayout);
    }
    addWhereSet(kResizeField, !mResizeToFit, false);
    addWhereSet(kDisabledField, !mEnabled, true);
    addWhereSet(kRadioField, mRadioMode, true);
    addWhereSet(kTriggersField, !mTriggersEnabled, true);
    addWhereSet(kDynamicLabelField, mLabelFromMarked, true);
    if (status == B_OK && mMaxContentWidth > 0) {
        status = archive->AddFloat(kMaxWidthField, mMaxContentWidth);
    }
    for (size_t i = 0; deep && status == B_OK && i < mItems.size(); ++i) {
        BMessage itemArchive;
        status = mItems[i]->Archive(&itemArchive, true);
        if (status == B_OK) {
            status = archive->AddMessage(kItemsField, &itemArchive);
        }
        if (status == B_OK && mLayout == B_ITEMS_IN_MATRIX) {
            status = archive->AddRect(kItemFramesField, mItems[i]->mFrame);
        }
    }
    return status;
}

void BMenu::AttachedToWindow() {
    LayoutItems();
}

void BMenu::DetachedFromWindow() {}
void BMenu::AllAttached() {}
void BMenu::AllDetached() {}
void BMenu::FrameMoved(BPoint /*newPosition*/) {}
void BMenu::FrameResized(float /*newWidth*/, float /*newHeight*/) {}

void BMenu::MessageReceived(BMessage* message) {
    BView::MessageReceived(message);
}

void BMenu::MakeFocus(bool focus) {
    BView::MakeFocus(focus);
}

void BMenu::SetEnabled(bool enabled) {
    const LooperHold hold(this);
    if (enabled != mEnabled) {
        mEnabled = enabled;
        Invalidate();
        if (mSuperitem != nullptr) {
            const LooperHold superHold(Supermenu());
            mSuperitem->LooksChanged();
        }
    }
}

bool BMenu::IsEnabled() const {
    return mEnabled && (mSuperitem == nullptr || mSuperitem->IsEnabled());
}

void BMenu::SetRadioMode(bool radioMode) {
    const LooperHold hold(this);
    mRadioMode = radioMode;
    if (!radioMode) {
        mLabelFromMarked = false;
    } else if (BMenuItem* const marked = FindMarked(); marked != nullptr) {
        ItemMarked(marked);
    }
}

void BMenu::SetTriggersEnabled(bool enabled) {
    const LooperHold hold(this);
    mTriggersEnabled = enabled;
    InvalidateLayout();
}

void BMenu::SetMaxContentWidth(float maxWidth) {
    const LooperHold hold(this);
    mMaxContentWidth = maxWidth;
    InvalidateLayout();
}

void BMenu::SetLabelFromMarked(bool labelFromMarked) {
    const LooperHold hold(this);
    mLabelFromMarked = labelFromMarked;
    if (labelFromMarked) {
        mRadioMode = true;
    }
    BMenuItem* const marked = FindMarked();
    if (labelFromMarked && marked != nullptr && mSuperitem != nullptr) {
        mSuperitem->SetLabel(marked->Label());
    }
}

void BMenu::ItemMarked(BMenuItem* item) {
    if (mRadioMode) {
        for (const std::unique_ptr<BMenuItem>& other : mItems) {
            if (other.get() != item && other->mMarked) {
                other->SetMarked(false);
            }
        }
    }
    if (mLabelFromMarked && mSuperitem != nullptr) {
        mSuperitem->SetLabel(item->Label());
    }
}

BMenu* BMenu::Supermenu() const {
    return mSuperitem == nullptr ? nullptr : mSuperitem->Menu();
}

void BMenu::SetTrackingHook(menu_tracking_hook hook, void* state) {
    mTrackingHook = hook;
    mTrackingState = state;
}

bool BMenu::AddDynamicItem(add_state /*state*/) {
    return false;
}

bool BMenu::AddDynamicItems(const std::function<bool()>& userLeaves) {
    for (bool more = AddDynamicItem(B_INITIAL_ADD); more;) {
        if (userLeaves()) {
            AddDynamicItem(B_ABORT);
            return false;
        }
        more = AddDynamicItem(B_PROCESSING);
    }
    return true;
}

void BMenu::Show() {
    Show(false);
}

void BMenu::Show(bool selectFirst) {
    if (Host() != nullptr) {
        BView::Show();
        return;
    }
    (void)AddDynamicItems([] { return false; });
    LayoutItems();
    auto shown = std::make_unique<MenuWindows>(std::make_shared<MenuEvents>());
    const BPoint where = ScreenLocation();
    const MenuPane pane(pop_up_frame(where, MenuPane::OuterSide(mContentSize.x),
                                     MenuPane::OuterSide(mContentSize.y), shown->Screen(where)),
                        mContentSize.y);
    if (CountItems() == 0 || !shown->Show(this, pane)) {
        return;
    }
    mShownAlone = std::move(shown);
    const auto first =
        std::find_if(mItems.begin(), mItems.end(), [](const auto& item) { return item->IsEnabled(); });
    if (selectFirst && first != mItems.end()) {
        SelectItem(first->get());
    }
}

void BMenu::Hide() {
    if (mShownAlone == nullptr) {
        BView::Hide();
        return;
    }
    SelectItem(nullptr);
    mShownAlone.reset();
}

BPoint BMenu::ScreenLocation() {
    return mUsualLocation;
}
