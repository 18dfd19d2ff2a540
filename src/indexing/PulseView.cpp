#include "indexing/PulseView.h"

#include "indexing/FileIndexWindow.h"

PulseView::PulseView(FileIndexWindow* window)
    : BView(BRect(0, 0, 0, 0), "pulse", 0, B_PULSE_NEEDED), mWindow(window) {}

void PulseView::Pulse() {
    mWindow->Pulse();
}
