#include <Alert.h>

#include "AlertView.h"
#include "ControlLook.h"
#include "host/api/display.h"

#include <Application.h>
#include <Button.h>
#include <Invoker.h>
#include <MessageQueue.h>
#include <Screen.h>
#include <TextView.h>
#include <ThreadSafety.h>

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstring>
#include <optional>
#include <utility>

namespace {

constexpr char kTextField[] = "_text";
constexpr char kLabelField[] = "_but_label";
constexpr char kKeyField[] = "_but_key";
constexpr char kTypeField[] = "_atype";
constexpr char kWidthField[] = "_but_width";
constexpr char kSpacingField[] = "_but_spacing";

// Sent by the buttons, with their number as "which".
constexpr uint32 kPressed = 'ALTB';
constexpr char kWhichField[] = "which";

// How often a window that waits for its alert is asked whether it has something to draw.
constexpr bigtime_t kUpdateInterval = 25000;

bool IsAskedToQuit(const BLooper& looper) {
    return looper.MessageQueue()->FindMessage(B_QUIT_REQUESTED) != nullptr;
}

std::string Joined(const std::vector<std::string>& lines) {
    std::string text;
    for (const std::string& line : lines) {
        text += (&line == &lines.front() ? "" : "\n") + line;
    }
    return text;
}

} // namespace

// Where the answer is waited for. Outlives the alert. Any thread.
class AlertAnswer {
  public:
    // The first one counts.
    void Set(int32 answer) {
        GuardLock guard(mMutex);
        if (!mAnswer) {
            mAnswer = answer;
            mAnswered.notify_all();
        }
    }
    std::optional<int32> Wait(bigtime_t timeout) {
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::microseconds(timeout);
        GuardLock guard(mMutex);
        while (!mAnswer && mAnswered.wait_until(guard.Native(), deadline) != std::cv_status::timeout) {
        }
        return mAnswer;
    }

  private:
    GuardMutex mMutex;
    std::condition_variable mAnswered;
    std::optional<int32> mAnswer GUARDED_BY(mMutex);
};

REGISTER_ARCHIVABLE(BAlert);

BAlert::BAlert(const char* title, Parts parts)
    : BWindow(BRect(0, 0, 0, 0), title, B_MODAL_WINDOW_LOOK, B_MODAL_APP_WINDOW_FEEL,
              B_NOT_CLOSABLE | B_NOT_RESIZABLE | B_NOT_ZOOMABLE | B_NOT_MINIMIZABLE),
      mParts(std::move(parts)), mAnswer(std::make_shared<AlertAnswer>()) {
    Build();
}

BAlert::BAlert(const char* title, const char* text, const char* button0, const char* button1,
               const char* button2, button_width width, alert_type type)
    : BAlert(title, PartsOf(text, {button0, button1, button2}, width, B_EVEN_SPACING, type)) {}

BAlert::BAlert(const char* title, const char* text, const char* button0, const char* button1,
               const char* button2, button_width width, button_spacing spacing, alert_type type)
    : BAlert(title, PartsOf(text, {button0, button1, button2}, width, spacing, type)) {}

BAlert::BAlert(BMessage* archive)
    : BAlert(archive == nullptr ? "" : archive->GetString("_title", ""),
             archive == nullptr ? Parts() : PartsOf(*archive)) {
    for (int32 i = 0; archive != nullptr && i < kMaxButtons; ++i) {
        SetShortcut(i, static_cast<char>(archive->GetInt32(kKeyField, i, 0)));
    }
}

BAlert::~BAlert() {
    // Whoever waits gets to know when nobody has pressed anything.
    mAnswer->Set(B_ERROR);
}

BArchivable* BAlert::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BAlert") ? new BAlert(archive) : nullptr;
}

status_t BAlert::Archive(BMessage* archive, bool /*deep*/) const {
    // The views are made anew from the texts.
    status_t status = BWindow::Archive(archive, false);
    if (status == B_OK) {
        status = archive->AddString(kTextField, mParts.text.c_str());
    }
    for (size_t i = 0; i < mParts.labels.size(); ++i) {
        if (status == B_OK) {
            status = archive->AddString(kLabelField, mParts.labels[i].c_str());
        }
        if (status == B_OK) {
            status = archive->AddInt32(kKeyField, mShortcuts[i]);
        }
    }
    const std::pair<const char*, int32> numbers[] = {
        {kTypeField, mParts.type}, {kWidthField, mParts.width}, {kSpacingField, mParts.spacing}};
    for (const auto& [field, number] : numbers) {
        if (status == B_OK) {
            status = archive->AddInt32(field, number);
        }
    }
    return status;
}

BAlert::Parts BAlert::PartsOf(const BMessage& archive) {
    Parts parts;
    parts.text = archive.GetString(kTextField, "");
    const char* label = nullptr;
    for (int32 i = 0; i < kMaxButtons && archive.FindString(kLabelField, i, &label) == B_OK; ++i) {
        parts.labels.emplace_back(label);
    }
    parts.type = static_cast<alert_type>(
        std::clamp<int32>(archive.GetInt32(kTypeField, B_INFO_ALERT), B_EMPTY_ALERT, B_STOP_ALERT));
    parts.width = static_cast<button_width>(std::clamp<int32>(archive.GetInt32(kWidthField, B_WIDTH_AS_USUAL),
                                                              B_WIDTH_AS_USUAL, B_WIDTH_FROM_LABEL));
    parts.spacing = static_cast<button_spacing>(
        std::clamp<int32>(archive.GetInt32(kSpacingField, B_EVEN_SPACING), B_EVEN_SPACING, B_OFFSET_SPACING));
    return parts;
}

BAlert::Parts BAlert::PartsOf(const char* text, std::initializer_list<const char*> labels, button_width width,
                              button_spacing spacing, alert_type type) {
    Parts parts{text == nullptr ? "" : text, {}, width, spacing, type};
    for (const char* label : labels) {
        if (label != nullptr) {
            parts.labels.emplace_back(label);
        }
    }
    return parts;
}

void BAlert::Build() {
    const BFont font(be_plain_font);
    const auto widthOf = [&font](std::string_view line) {
        return font.StringWidth(line.data(), static_cast<int32>(line.size()));
    };
    std::vector<std::string> lines = wrapped_lines(mParts.text, kAlertTextWidth, widthOf);
    AlertContents contents;
    contents.hasIcon = mParts.type != B_EMPTY_ALERT;
    for (const std::string& line : lines) {
        contents.textWidth = std::max(contents.textWidth, widthOf(line));
    }
    contents.textHeight = ControlLook::LineHeight(font) * static_cast<float>(lines.size());
    contents.width = mParts.width;
    contents.offsetFirst = mParts.spacing == B_OFFSET_SPACING;
    std::vector<BButton*> buttons;
    for (size_t i = 0; i < mParts.labels.size(); ++i) {
        auto* const message = new BMessage(kPressed);
        message->AddInt32(kWhichField, static_cast<int32>(i));
        const std::string name = "button" + std::to_string(i);
        auto* const button = new BButton(BRect(0, 0, 0, 0), name.c_str(), mParts.labels[i].c_str(), message);
        float width = 0;
        button->GetPreferredSize(&width, &contents.buttonHeight);
        contents.labelWidths.push_back(width);
        mButtons[i] = button;
    }
    const AlertLayout layout = lay_out_alert(contents);
    auto* const view = new AlertView(layout, mParts.type);
    // The lines are broken already.
    BRect textRect = layout.text.OffsetToCopy(B_ORIGIN);
    mTextView = new BTextView(layout.text, "_tv_", textRect, B_FOLLOW_ALL, B_WILL_DRAW);
    mTextView->SetWordWrap(false);
    mTextView->SetText(Joined(lines).c_str());
    mTextView->MakeEditable(false);
    mTextView->MakeSelectable(false);
    mTextView->SetViewColor(ControlLook::kPanel);
    mTextView->SetLowColor(ControlLook::kPanel);
    view->AddChild(mTextView);
    for (size_t i = 0; i < mParts.labels.size(); ++i) {
        mButtons[i]->MoveTo(layout.buttons[i].LeftTop());
        mButtons[i]->ResizeTo(layout.buttons[i].Width(), layout.buttons[i].Height());
        view->AddChild(mButtons[i]);
    }
    ResizeTo(layout.bounds.Width(), layout.bounds.Height());
    MoveTo(AlertPosition(layout.bounds.Width(), layout.bounds.Height()));
    AddChild(view);
    if (!mParts.labels.empty()) {
        BButton* const last = mButtons[mParts.labels.size() - 1];
        SetDefaultButton(last);
        last->MakeFocus(true);
    }
}

void BAlert::SetShortcut(int32 index, char key) {
    if (index >= 0 && index < kMaxButtons) {
        mShortcuts[static_cast<size_t>(index)] = key;
    }
}

char BAlert::Shortcut(int32 index) const {
    return index >= 0 && index < kMaxButtons ? mShortcuts[static_cast<size_t>(index)] : '\0';
}

BButton* BAlert::ButtonAt(int32 index) const {
    return index >= 0 && index < kMaxButtons ? mButtons[static_cast<size_t>(index)] : nullptr;
}

int32 BAlert::Go() {
    // The alert may be gone as soon as it is shown.
    const std::shared_ptr<AlertAnswer> answer = mAnswer;
    BLooper* const looper = BLooper::LooperForThread(find_thread(nullptr));
    auto* const caller = dynamic_cast<BWindow*>(looper);
    const BMessenger alert(this);
    if (!host::display_connected()) {
        Quit();
        return B_ERROR;
    }
    Show();
    for (;;) {
        if (const std::optional<int32> which = answer->Wait(kUpdateInterval)) {
            return *which;
        }
        if (caller != nullptr) {
            caller->UpdateIfNeeded();
        } else if (looper != nullptr && looper == be_app && IsAskedToQuit(*looper)) {
            (void)alert.SendMessage(B_QUIT_REQUESTED);
        }
    }
}

status_t BAlert::Go(BInvoker* invoker) {
    mInvoker = invoker;
    if (!host::display_connected()) {
        Quit();
        return B_ERROR;
    }
    Show();
    return B_OK;
}

void BAlert::MessageReceived(BMessage* message) {
    if (message->what != kPressed) {
        BWindow::MessageReceived(message);
        return;
    }
    const int32 which = message->GetInt32(kWhichField, 0);
    if (mInvoker != nullptr && mInvoker->Message() != nullptr) {
        BMessage answer(*mInvoker->Message());
        (void)answer.RemoveName(kWhichField);
        (void)answer.AddInt32(kWhichField, which);
        (void)mInvoker->Invoke(&answer);
    }
    mAnswer->Set(which);
    Quit();
}

void BAlert::DispatchMessage(BMessage* message, BHandler* handler) {
    if (message->what == B_KEY_DOWN) {
        const char* const bytes = message->GetString("bytes", "");
        if (PressByKey(bytes) || MoveByKey(bytes)) {
            return;
        }
    }
    BWindow::DispatchMessage(message, handler);
}

bool BAlert::PressByKey(const char* bytes) {
    for (size_t i = 0; i < mParts.labels.size(); ++i) {
        if (mShortcuts[i] != '\0' && bytes[0] == mShortcuts[i] && bytes[1] == '\0') {
            (void)mButtons[i]->Invoke();
            return true;
        }
    }
    const auto focus = std::find(mButtons.begin(), mButtons.end(), CurrentFocus());
    if (bytes[0] == B_ENTER && bytes[1] == '\0' && focus != mButtons.end() && *focus != nullptr) {
        // The window would press the default one.
        (void)(*focus)->Invoke();
        return true;
    }
    return false;
}

// Arrows lead from button to button, and stop at both ends.
bool BAlert::MoveByKey(const char* bytes) {
    const int32 step = bytes[0] == B_LEFT_ARROW ? -1 : 1;
    if ((bytes[0] != B_LEFT_ARROW && bytes[0] != B_RIGHT_ARROW) || bytes[1] != '\0') {
        return false;
    }
    const auto focus = std::find(mButtons.begin(), mButtons.end(), CurrentFocus());
    if (focus == mButtons.end() || *focus == nullptr) {
        return false;
    }
    const auto next = static_cast<int32>(focus - mButtons.begin()) + step;
    if (BButton* const button = ButtonAt(next); button != nullptr) {
        button->MakeFocus(true);
    }
    return true;
}

BPoint BAlert::AlertPosition(float width, float height) {
    const BRect screen = BScreen().Frame();
    if (!screen.IsValid()) {
        return B_ORIGIN;
    }
    return {std::floor((screen.left + screen.right - width) / 2),
            std::floor((screen.top + screen.bottom - height) / 2)};
}
