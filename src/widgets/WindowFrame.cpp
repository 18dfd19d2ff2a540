#include "widgets/WindowFrame.h"

#include <Message.h>

namespace {

constexpr char kX[] = "winX";
constexpr char kY[] = "winY";
constexpr char kWidth[] = "winWidth";
constexpr char kHeight[] = "winHeight";

constexpr float kDefaultWidth = 400;
constexpr float kDefaultHeight = 150;

} // namespace

void AddWindowFrame(BMessage* settings, BRect frame) {
    if (settings == nullptr)
        return;
    settings->AddFloat(kX, frame.left);
    settings->AddFloat(kY, frame.top);
    settings->AddFloat(kWidth, frame.Width());
    settings->AddFloat(kHeight, frame.Height());
}

BRect WindowFrameOf(const BMessage& settings, BRect screen) {
    float x = 0;
    float y = 0;
    float width = kDefaultWidth;
    float height = kDefaultHeight;
    // What is missing, or of another type, keeps its default.
    settings.FindFloat(kX, &x);
    settings.FindFloat(kY, &y);
    settings.FindFloat(kWidth, &width);
    settings.FindFloat(kHeight, &height);
    const BRect frame(x, y, x + width, y + height);
    // A rectangle inside out would count as lying on the screen.
    return frame.IsValid() && screen.Contains(frame) ? frame : BRect(0, 0, kDefaultWidth, kDefaultHeight);
}
