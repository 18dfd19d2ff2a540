// The part of BWindow that knows its default button and its menu bar.
#include <Window.h>

#include "WindowHost.h"

#include <Button.h>
#include <MenuBar.h>

BButton* BWindow::DefaultButton() const {
    return dynamic_cast<BButton*>(mHost->DefaultButton());
}

void BWindow::SetDefaultButton(BButton* button) {
    BButton* const before = DefaultButton();
    if (before == button) {
        return;
    }
    // Set first: MakeDefault() asks the window for it in turn.
    mHost->SetDefaultButton(button);
    if (before != nullptr) {
        before->MakeDefault(false);
    }
    if (button != nullptr) {
        button->MakeDefault(true);
    }
}

void BWindow::SetKeyMenuBar(BMenuBar* bar) {
    mHost->SetKeyMenuBar(bar, bar, bar);
}

BMenuBar* BWindow::KeyMenuBar() const {
    return mHost->KeyMenuBar();
}
