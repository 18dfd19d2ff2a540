// All controls in one window on a desktop, worked by pointer and keys. With SCREENSHOTS set to a directory,
// each step leaves a picture there.
#include "desktop/WindowOnDesktop.h"

#include "host/api/display.h"

#include <Alert.h>
#include <Box.h>
#include <Button.h>
#include <CheckBox.h>
#include <ListItem.h>
#include <ListView.h>
#include <MenuField.h>
#include <MenuItem.h>
#include <PopUpMenu.h>
#include <RadioButton.h>
#include <ScrollBar.h>
#include <ScrollView.h>
#include <TextControl.h>

#include <cmath>
#include <cstdlib>
#include <memory>

namespace {

constexpr rgb_color kPanel = {216, 216, 216, 255};

class ControlsWindow : public BWindow {
  public:
    explicit ControlsWindow(Notes& notes)
        : BWindow(BRect(200, 150, 619, 499), "Controls", B_TITLED_WINDOW, 0), mNotes(notes) {
        auto* const panel = new BView(Bounds(), "panel", B_FOLLOW_ALL, B_WILL_DRAW);
        panel->SetViewColor(kPanel);
        AddChild(panel);
        panel->AddChild(button);
        panel->AddChild(disabled);
        disabled->SetEnabled(false);
        panel->AddChild(check);
        auto* const box = new BBox(BRect(10, 75, 200, 135), "box");
        box->SetLabel("Order");
        panel->AddChild(box);
        box->AddChild(one);
        box->AddChild(two);
        one->SetValue(B_CONTROL_ON);
        text->SetDivider(50);
        panel->AddChild(text);
        for (const char* label : {"Red", "Green", "Blue and a rather long one"}) {
            auto* const message = new BMessage('colr');
            message->AddString("label", label);
            colours->AddItem(new BMenuItem(label, message));
        }
        colours->ItemAt(1)->SetMarked(true);
        field = new BMenuField(BRect(10, 180, 200, 200), "field", "Colour:", colours);
        field->SetDivider(50);
        panel->AddChild(field);
        greyField->SetDivider(50);
        greyField->SetEnabled(false);
        panel->AddChild(greyField);
        panel->AddChild(ask);
        for (int i = 0; i < 60; ++i) {
            rows.push_back(std::make_unique<BStringItem>(("Row number " + std::to_string(i)).c_str()));
            list->AddItem(rows.back().get());
        }
        list->SetSelectionMessage(new BMessage('sele'));
        scroll = new BScrollView("scroll", list, B_FOLLOW_ALL, 0, false, true);
        panel->AddChild(scroll);
    }
    ~ControlsWindow() override {
        list->MakeEmpty();
        mNotes.Add("gone");
    }
    void WindowActivated(bool active) override { mNotes.Add(active ? "active" : "inactive"); }
    void MessageReceived(BMessage* message) override {
        switch (message->what) {
        case 'butn':
            mNotes.Add("button");
            break;
        case 'chck':
            mNotes.Add("check " + std::to_string(check->Value()));
            break;
        case 'radi':
            mNotes.Add(two->Value() != 0 ? "radio two" : "radio one");
            break;
        case 'text':
            mNotes.Add(std::string("text ") + text->Text());
            break;
        case 'sele':
            mNotes.Add("selected " + std::to_string(list->CurrentSelection()));
            break;
        case 'colr':
            mNotes.Add(std::string("colour ") + message->GetString("label", ""));
            break;
        case 'ask?': {
            auto* const alert = new BAlert("Alert",
                                           "Do you want to know whether all controls of this window "
                                           "look as they should, or shall we go on?",
                                           "Go on", "Look", nullptr, B_WIDTH_AS_USUAL, B_WARNING_ALERT);
            alert->SetShortcut(0, B_ESCAPE);
            mNotes.Add("answer " + std::to_string(alert->Go()));
            break;
        }
        default:
            BWindow::MessageReceived(message);
        }
    }

    BButton* const button = new BButton(BRect(10, 10, 95, 34), "button", "Press", new BMessage('butn'));
    BButton* const disabled = new BButton(BRect(110, 10, 195, 34), "disabled", "Disabled", nullptr);
    BCheckBox* const check = new BCheckBox(BRect(10, 45, 195, 65), "check", "Check", new BMessage('chck'));
    BRadioButton* const one = new BRadioButton(BRect(10, 15, 180, 33), "one", "One", new BMessage('radi'));
    BRadioButton* const two = new BRadioButton(BRect(10, 35, 180, 53), "two", "Two", new BMessage('radi'));
    BTextControl* const text =
        new BTextControl(BRect(10, 145, 200, 165), "text", "Name:", "", new BMessage('text'));
    BPopUpMenu* const colours = new BPopUpMenu("colours");
    BMenuField* field = nullptr;
    BMenuField* const greyField =
        new BMenuField(BRect(10, 210, 200, 230), "grey field", "Grey:", new BMenu("Nothing"));
    BButton* const ask = new BButton(BRect(10, 245, 95, 269), "ask", "Ask...", new BMessage('ask?'));
    BListView* const list =
        new BListView(BRect(215, 12, 390, 330), "list", B_MULTIPLE_SELECTION_LIST, B_FOLLOW_ALL);
    BScrollView* scroll = nullptr;
    std::vector<std::unique_ptr<BStringItem>> rows;

  private:
    Notes& mNotes;
};

class ControlsTest : public WindowOnDesktop {
  protected:
    void Work(const std::function<void()>& steps) {
        RunApplication([&] {
            while (!host::display_connected()) {
                snooze(1000);
            }
            mWindow = new ControlsWindow(mNotes);
            mWindow->Show();
            ASSERT_NE(TheDesktop().window("Controls"), "");
            ASSERT_TRUE(mNotes.WaitFor("active"));
            TheDesktop().move_pointer(900, 700);
            // The window manager has put its frame around it by then.
            snooze(300000);
            steps();
            Close(mWindow);
        });
    }
    struct Place {
        int x;
        int y;
    };
    // A point of the view, on the screen.
    Place On(BView* view, float x, float y) {
        const BAutolock lock(mWindow);
        const BPoint place = view->ConvertToScreen(BPoint(x, y) + view->Bounds().LeftTop());
        return {static_cast<int>(place.x), static_cast<int>(place.y)};
    }
    Place Middle(BView* view) {
        const BAutolock lock(mWindow);
        const BRect bounds = view->Bounds();
        return On(view, std::floor(bounds.Width() / 2), std::floor(bounds.Height() / 2));
    }
    static void Click(Place place, int button = 1) { TheDesktop().click(place.x, place.y, button); }
    static void Point(Place place) { TheDesktop().move_pointer(place.x, place.y); }
    void Focus(BView* view) {
        const BAutolock lock(mWindow);
        view->MakeFocus();
    }
    float Top() {
        const BAutolock lock(mWindow);
        return mWindow->list->Bounds().top;
    }
    template <typename Condition>
    static bool Comes(Condition condition) {
        for (int i = 0; i < 1000 && !condition(); ++i) {
            snooze(10000);
        }
        return condition();
    }
    static void Picture(const char* name) {
        if (const char* const directory = std::getenv("SCREENSHOTS"); directory != nullptr) {
            snooze(250000);
            TheDesktop().screenshot(std::string(directory) + "/" + name + ".png");
        }
    }

    ControlsWindow* mWindow = nullptr;
};

} // namespace

TEST_F(ControlsTest, ButtonsAndSwitches) {
    Work([this] {
        Picture("01-all");
        Point(Middle(mWindow->button));
        TheDesktop().press();
        Picture("02-button-pressed");
        TheDesktop().release();
        EXPECT_TRUE(mNotes.WaitFor("button", 1));
        Focus(mWindow->button);
        Picture("03-button-focused");
        TheDesktop().key("space");
        EXPECT_TRUE(mNotes.WaitFor("button", 2));
        TheDesktop().key("Return");
        EXPECT_TRUE(mNotes.WaitFor("button", 3));
        Click(Middle(mWindow->disabled));

        Click(On(mWindow->check, 8, 8));
        EXPECT_TRUE(mNotes.WaitFor("check 1"));
        Focus(mWindow->check);
        Picture("04-check-box-on-and-focused");
        TheDesktop().key("space");
        EXPECT_TRUE(mNotes.WaitFor("check 0"));

        Click(Middle(mWindow->two));
        EXPECT_TRUE(mNotes.WaitFor("radio two"));
        Focus(mWindow->one);
        Picture("05-radio-two-and-focus-on-one");
        TheDesktop().key("space");
        EXPECT_TRUE(mNotes.WaitFor("radio one"));
        EXPECT_EQ(mNotes.Count("button"), 3) << "the disabled one does nothing";
    });
}

TEST_F(ControlsTest, TheTextField) {
    Work([this] {
        Click(On(mWindow->text, 100, 8));
        TheDesktop().tool({"type", "Hello World"});
        Picture("06-text-typed");
        TheDesktop().key("Home");
        TheDesktop().key("shift+End");
        Picture("07-text-selected");
        TheDesktop().key("ctrl+c");
        TheDesktop().key("End");
        TheDesktop().tool({"type", ", "});
        TheDesktop().key("ctrl+v");
        TheDesktop().key("Home");
        TheDesktop().tool({"type", ">"});
        Picture("08-text-pasted");
        TheDesktop().key("Return");
        EXPECT_TRUE(mNotes.WaitFor("text >Hello World, Hello World"));
        TheDesktop().key("ctrl+a");
        TheDesktop().key("ctrl+x");
        TheDesktop().tool({"type", "x"});
        TheDesktop().key("Return");
        EXPECT_TRUE(mNotes.WaitFor("text x"));
    });
}

TEST_F(ControlsTest, TheList) {
    Work([this] {
        Point(Middle(mWindow->list));
        TheDesktop().tool({"click", "--repeat", "3", "5"});
        EXPECT_TRUE(Comes([this] { return Top() > 0; }));
        Picture("09-list-wheel");
        TheDesktop().tool({"click", "--repeat", "3", "4"});
        EXPECT_TRUE(Comes([this] { return Top() == 0; }));

        BScrollBar* const bar = mWindow->scroll->ScrollBar(B_VERTICAL);
        const Place thumb = On(bar, 6, 40);
        TheDesktop().drag(thumb.x, thumb.y, thumb.x, thumb.y + 400);
        float most = 0;
        {
            const BAutolock lock(mWindow);
            bar->GetRange(nullptr, &most);
        }
        EXPECT_GT(most, 0);
        EXPECT_TRUE(Comes([&] { return Top() == most; }));
        Picture("10-list-bar-dragged");
        TheDesktop().drag(thumb.x, thumb.y + 260, thumb.x, thumb.y - 200);
        EXPECT_TRUE(Comes([this] { return Top() == 0; }));

        const Place row = On(mWindow->list, 40, 40);
        Point(row);
        TheDesktop().press();
        Point({row.x, row.y + 20});
        Picture("11-list-selection-follows");
        const Place below = On(mWindow->list, 40, 380);
        Point(below);
        EXPECT_TRUE(Comes([&] { return Top() == most; }));
        TheDesktop().release();
        Picture("12-list-autoscrolled");
        {
            const BAutolock lock(mWindow);
            EXPECT_GT(mWindow->list->CurrentSelection(0), 0);
            EXPECT_TRUE(mWindow->list->IsItemSelected(59));
        }
        TheDesktop().key("Home");
        EXPECT_TRUE(Comes([this] { return Top() == 0; }));
        TheDesktop().key("shift+Down");
        Picture("13-list-by-keys");
        const BAutolock lock(mWindow);
        EXPECT_TRUE(mWindow->list->IsItemSelected(0));
        EXPECT_FALSE(mWindow->list->IsItemSelected(5));
    });
}

TEST_F(ControlsTest, TheMenuField) {
    Work([this] {
        Click(On(mWindow->field, 80, 8));
        snooze(300000);
        Picture("14-menu-field-open");
        // The menu lies below the field: its third line.
        Place third = On(mWindow->field, 80, 28);
        third.y += 36;
        Point(third);
        Picture("15-menu-field-pointed");
        Click(third);
        EXPECT_TRUE(mNotes.WaitFor("colour Blue and a rather long one"));
        Picture("16-menu-field-chosen");
        Focus(mWindow->field);
        Picture("17-menu-field-focused");
        TheDesktop().key("space");
        snooze(300000);
        Picture("18-menu-field-by-key");
        TheDesktop().key("Return");
        EXPECT_TRUE(mNotes.WaitFor("colour Red"));
        Click(On(mWindow->greyField, 80, 8));
        snooze(200000);
        TheDesktop().key("Escape");
        const BAutolock lock(mWindow);
        EXPECT_STREQ(mWindow->field->MenuItem()->Label(), "Red");
        EXPECT_EQ(mWindow->KeyMenuBar(), nullptr);
    });
}

TEST_F(ControlsTest, TheAlert) {
    Work([this] {
        Click(Middle(mWindow->ask));
        ASSERT_NE(TheDesktop().window("Alert"), "");
        snooze(500000);
        Picture("19-alert");
        TheDesktop().key("Escape");
        EXPECT_TRUE(mNotes.WaitFor("answer 0"));
    });
}
