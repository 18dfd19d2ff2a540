#include <Control.h>

#include <PropertyInfo.h>
#include <Window.h>

#include <string_view>

namespace {

constexpr char kLabelField[] = "_label";
constexpr char kValueField[] = "_val";
constexpr char kMessageField[] = "_msg";
constexpr char kDisabledField[] = "_disable";

constexpr char kSuite[] = "suite/vnd.Be-control";

property_info kProperties[] = {
    {"Enabled",
     {B_GET_PROPERTY, B_SET_PROPERTY},
     {B_DIRECT_SPECIFIER},
     "whether the control can be used",
     0,
     {B_BOOL_TYPE}},
    {"Label",
     {B_GET_PROPERTY, B_SET_PROPERTY},
     {B_DIRECT_SPECIFIER},
     "the text on or beside the control",
     0,
     {B_STRING_TYPE}},
    {"Value",
     {B_GET_PROPERTY, B_SET_PROPERTY},
     {B_DIRECT_SPECIFIER},
     "the value, 0 and 1 for off and on",
     0,
     {B_INT32_TYPE}},
    {nullptr, {0}, {0}, nullptr, 0, {0}},
};

} // namespace

REGISTER_ARCHIVABLE(BControl);

BControl::BControl(BRect frame, const char* name, const char* label, BMessage* message, uint32 resizingMode,
                   uint32 flags)
    : BView(frame, name, resizingMode, flags), BInvoker(message, BMessenger()),
      mLabel(label == nullptr ? "" : label), mHasLabel(label != nullptr) {}

BControl::BControl(BMessage* archive) : BView(archive) {
    if (archive == nullptr) {
        return;
    }
    const char* label = nullptr;
    if (archive->FindString(kLabelField, &label) == B_OK) {
        mLabel = label;
        mHasLabel = true;
    }
    int32 value = 0;
    if (archive->FindInt32(kValueField, &value) == B_OK) {
        mValue = value;
    }
    bool disabled = false;
    if (archive->FindBool(kDisabledField, &disabled) == B_OK) {
        mEnabled = !disabled;
        mNavigableWhenEnabled = disabled;
    }
    BMessage message;
    if (archive->FindMessage(kMessageField, &message) == B_OK) {
        BInvoker::SetMessage(new BMessage(message));
    }
}

BControl::~BControl() = default;

BArchivable* BControl::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BControl") ? new BControl(archive) : nullptr;
}

status_t BControl::Archive(BMessage* archive, bool deep) const {
    status_t status = BView::Archive(archive, deep);
    if (status == B_OK && mHasLabel) {
        status = archive->AddString(kLabelField, mLabel.c_str());
    }
    if (status == B_OK) {
        status = archive->AddInt32(kValueField, mValue);
    }
    if (status == B_OK && !mEnabled) {
        status = archive->AddBool(kDisabledField, true);
    }
    if (status == B_OK && Message() != nullptr) {
        status = archive->AddMessage(kMessageField, Message());
    }
    return status;
}

void BControl::AttachedToWindow() {
    if (Parent() != nullptr) {
        SetViewColor(Parent()->ViewColor());
        SetLowColor(Parent()->ViewColor());
    }
    if (!Messenger().IsValid()) {
        BInvoker::SetTarget(Looper());
    }
    BView::AttachedToWindow();
}

void BControl::DetachedFromWindow() {
    mTracking = false;
    BView::DetachedFromWindow();
}

void BControl::WindowActivated(bool active) {
    BView::WindowActivated(active);
    if (IsFocus()) {
        Invalidate();
    }
}

bool BControl::ShowsFocus() const {
    return IsFocus() && (Window() == nullptr || Window()->IsActive());
}

void BControl::MakeFocus(bool focus) {
    const bool before = IsFocus();
    BView::MakeFocus(focus);
    if (IsFocus() != before) {
        mFocusChanging = true;
        Invalidate();
        mFocusChanging = false;
    }
}

void BControl::KeyDown(const char* bytes, int32 numBytes) {
    if (numBytes == 1 && (*bytes == B_RETURN || *bytes == B_SPACE)) {
        if (mEnabled) {
            SetValue(mValue == B_CONTROL_OFF ? B_CONTROL_ON : B_CONTROL_OFF);
            Invoke();
        }
        return;
    }
    BView::KeyDown(bytes, numBytes);
}

void BControl::MouseUp(BPoint where) {
    mTracking = false;
    BView::MouseUp(where);
}

void BControl::SetLabel(const char* label) {
    const char* const before = Label();
    const bool same = label == nullptr || before == nullptr ? label == before : mLabel == label;
    if (!same) {
        mHasLabel = label != nullptr;
        mLabel = label == nullptr ? "" : label;
        Invalidate();
    }
}

void BControl::SetValue(int32 value) {
    if (value != mValue) {
        mValue = value;
        Invalidate();
    }
}

void BControl::SetEnabled(bool enabled) {
    if (enabled == mEnabled) {
        return;
    }
    mEnabled = enabled;
    if (!enabled) {
        mNavigableWhenEnabled = (Flags() & B_NAVIGABLE) != 0;
        SetFlags(Flags() & ~B_NAVIGABLE);
        if (IsFocus()) {
            MakeFocus(false);
        }
    } else if (mNavigableWhenEnabled) {
        SetFlags(Flags() | B_NAVIGABLE);
    }
    Invalidate();
}

status_t BControl::Invoke(BMessage* message) {
    bool notifying = false;
    const uint32 kind = InvokeKind(&notifying);
    // InvokeNotify() without a message means to tell those who watch, and nobody else.
    const BMessage* const wanted = message == nullptr && !notifying ? Message() : message;
    BMessage copy(kind);
    if (wanted != nullptr) {
        copy = *wanted;
    }
    copy.AddPointer("source", this);
    copy.AddInt32("be:value", mValue);
    copy.AddMessenger("be:sender", BMessenger(this));
    SendNotices(kind, &copy);
    return wanted == nullptr ? B_BAD_VALUE : BInvoker::Invoke(&copy);
}

void BControl::MessageReceived(BMessage* message) {
    const bool isScript = message->what == B_GET_PROPERTY || message->what == B_SET_PROPERTY;
    if (isScript && message->HasSpecifiers()) {
        AnswerScript(message);
        return;
    }
    BView::MessageReceived(message);
}

void BControl::AnswerScript(BMessage* message) {
    BMessage specifier;
    const char* found = nullptr;
    if (message->GetCurrentSpecifier(nullptr, &specifier, nullptr, &found) != B_OK) {
        BView::MessageReceived(message);
        return;
    }
    const std::string_view property(found);
    const bool isGet = message->what == B_GET_PROPERTY;
    BMessage reply(B_REPLY);
    status_t status = B_OK;
    if (property == "Enabled") {
        bool enabled = mEnabled;
        if (isGet) {
            reply.AddBool("result", enabled);
        } else if ((status = message->FindBool("data", &enabled)) == B_OK) {
            SetEnabled(enabled);
        }
    } else if (property == "Label") {
        const char* label = nullptr;
        if (isGet) {
            reply.AddString("result", mLabel.c_str());
        } else if ((status = message->FindString("data", &label)) == B_OK) {
            SetLabel(label);
        }
    } else if (property == "Value") {
        int32 value = mValue;
        if (isGet) {
            reply.AddInt32("result", value);
        } else if ((status = message->FindInt32("data", &value)) == B_OK) {
            SetValue(value);
        }
    } else {
        BView::MessageReceived(message);
        return;
    }
    reply.AddInt32("error", status);
    message->SendReply(&reply);
}

BHandler* BControl::ResolveSpecifier(BMessage* message, int32 index, BMessage* specifier, int32 form,
                                     const char* property) {
    const BPropertyInfo info(kProperties);
    if (info.FindMatch(message, index, specifier, form, property) >= 0) {
        return this;
    }
    return BView::ResolveSpecifier(message, index, specifier, form, property);
}

status_t BControl::GetSupportedSuites(BMessage* data) {
    if (data == nullptr) {
        return B_BAD_VALUE;
    }
    BPropertyInfo info(kProperties);
    status_t status = data->AddString("suites", kSuite);
    if (status == B_OK) {
        status = data->AddFlat("messages", &info);
    }
    return status == B_OK ? BView::GetSupportedSuites(data) : status;
}
