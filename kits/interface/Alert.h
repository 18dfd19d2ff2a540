// BAlert: a small window with a text and up to three buttons, which waits for an answer.
#pragma once

#include <InterfaceDefs.h>
#include <Window.h>

#include <array>
#include <memory>
#include <string>

class AlertAnswer;
class BButton;
class BInvoker;
class BTextView;

enum alert_type { B_EMPTY_ALERT = 0, B_INFO_ALERT, B_IDEA_ALERT, B_WARNING_ALERT, B_STOP_ALERT };

// Between three buttons, offset spacing leaves a gap behind the first one; with fewer it does the same as
// even spacing.
enum button_spacing { B_EVEN_SPACING = 0, B_OFFSET_SPACING };

// Made with new, and gone once it has been answered. The last button is the default one, which Return
// presses; Tab and the arrows lead to the others. The alert lies in the middle of the screen and is in the
// way of the program's other windows.
//
// Thread rule: as any window. Everything but Go() before Go() is called, or with the alert locked.
class BAlert : public BWindow {
  public:
    // A null label means no button; an empty one a button without label. The texts are copied. The width of
    // buttons: at least the usual one, all that of the widest label, or each that of its own.
    BAlert(const char* title, const char* text, const char* button0, const char* button1 = nullptr,
           const char* button2 = nullptr, button_width width = B_WIDTH_AS_USUAL,
           alert_type type = B_INFO_ALERT);
    BAlert(const char* title, const char* text, const char* button0, const char* button1, const char* button2,
           button_width width, button_spacing spacing, alert_type type = B_INFO_ALERT);
    explicit BAlert(BMessage* archive);
    ~BAlert() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_text", "_but_label" (strings), "_but_key", "_atype", "_but_width" and "_but_spacing" (int32) to
    // what a window adds.
    status_t Archive(BMessage* archive, bool deep = true) const override;

    // A key, as B_ESCAPE, that presses the button of that number; 0 for none, as at first.
    void SetShortcut(int32 index, char key);
    char Shortcut(int32 index) const;

    // Shows the alert and waits: the number of the button that was pressed, or B_ERROR when the alert was
    // closed some other way, or there is no display. In a window's thread it has that window draw meanwhile;
    // in the application's thread a request to quit closes it, so that it does not keep the program.
    int32 Go();
    // Shows the alert and returns at once. The answer is sent with the invoker's message, to which "which"
    // (int32), the number of the button, is added; nothing is sent for null, nor when the alert is closed
    // some other way. The invoker stays the caller's and must outlive the alert.
    status_t Go(BInvoker* invoker);

    // Null for a number of no button.
    BButton* ButtonAt(int32 index) const;
    // Shows the text; for changing its looks before Go(). The alert keeps the size that its first text asked
    // for.
    BTextView* TextView() const { return mTextView; }

    void MessageReceived(BMessage* message) override;
    void DispatchMessage(BMessage* message, BHandler* handler) override;

    // Where an alert of that size belongs on the main screen.
    static BPoint AlertPosition(float width, float height);

  private:
    static constexpr int32 kMaxButtons = 3;
    struct Parts {
        std::string text;
        std::vector<std::string> labels;
        button_width width = B_WIDTH_AS_USUAL;
        button_spacing spacing = B_EVEN_SPACING;
        alert_type type = B_INFO_ALERT;
    };

    static Parts PartsOf(const BMessage& archive);
    static Parts PartsOf(const char* text, std::initializer_list<const char*> labels, button_width width,
                         button_spacing spacing, alert_type type);
    BAlert(const char* title, Parts parts);
    void Build();
    bool PressByKey(const char* bytes);
    bool MoveByKey(const char* bytes);

    Parts mParts;
    // The window's.
    std::array<BButton*, kMaxButtons> mButtons = {};
    BTextView* mTextView = nullptr;
    std::array<char, kMaxButtons> mShortcuts = {};
    std::shared_ptr<AlertAnswer> mAnswer;
    BInvoker* mInvoker = nullptr;
};
