#include <Screen.h>

#include <InterfaceDefs.h>
#include <OS.h>
#include <Window.h>

#include "host/api/display.h"

#include <algorithm>

namespace {

BRect RectOf(const host::Area& area) {
    return {static_cast<float>(area.left), static_cast<float>(area.top),
            static_cast<float>(area.left + area.width - 1), static_cast<float>(area.top + area.height - 1)};
}

float CommonArea(const BRect& a, const BRect& b) {
    const BRect common = a & b;
    return common.IsValid() ? (common.Width() + 1) * (common.Height() + 1) : 0;
}

bool FactsOf(screen_id id, host::ScreenFacts* facts) {
    const std::vector<host::ScreenFacts> all = host::screens();
    if (id.id < 0 || static_cast<size_t>(id.id) >= all.size()) {
        return false;
    }
    *facts = all[static_cast<size_t>(id.id)];
    return true;
}

} // namespace

BScreen::BScreen(screen_id id) : mId(id) {}

BScreen::BScreen(BWindow* window) : mId(B_MAIN_SCREEN_ID) {
    if (window == nullptr) {
        return;
    }
    const BRect frame = window->Frame();
    const std::vector<host::ScreenFacts> all = host::screens();
    float best = 0;
    for (size_t i = 0; i < all.size(); ++i) {
        if (const float common = CommonArea(frame, RectOf(all[i].area)); common > best) {
            best = common;
            mId.id = static_cast<int32>(i);
        }
    }
}

BScreen::~BScreen() = default;

bool BScreen::IsValid() const {
    host::ScreenFacts facts;
    return FactsOf(mId, &facts);
}

status_t BScreen::SetToNext() {
    host::ScreenFacts facts;
    if (!FactsOf({mId.id + 1}, &facts)) {
        return B_ERROR;
    }
    ++mId.id;
    return B_OK;
}

BRect BScreen::Frame() const {
    host::ScreenFacts facts;
    return FactsOf(mId, &facts) ? RectOf(facts.area) : BRect();
}

BRect BScreen::UsableFrame() const {
    host::ScreenFacts facts;
    return FactsOf(mId, &facts) ? RectOf(facts.usable) : BRect();
}

color_space BScreen::ColorSpace() const {
    return IsValid() ? B_RGB32 : B_NO_COLOR_SPACE;
}

status_t BScreen::WaitForRetrace() {
    return WaitForRetrace(B_INFINITE_TIMEOUT);
}

status_t BScreen::WaitForRetrace(bigtime_t timeout) {
    host::ScreenFacts facts;
    if (!FactsOf(mId, &facts)) {
        return B_ERROR;
    }
    const auto frame = static_cast<bigtime_t>(1000000.0 / std::max(facts.refresh_rate, 1.0));
    if (timeout < frame) {
        snooze(std::max(timeout, bigtime_t{0}));
        return B_TIMED_OUT;
    }
    return snooze(frame);
}

uint8 BScreen::IndexForColor(rgb_color color) {
    return IndexForColor(color.red, color.green, color.blue, color.alpha);
}

uint8 BScreen::IndexForColor(uint8 red, uint8 green, uint8 blue, uint8 alpha) {
    if (make_color(red, green, blue, alpha) == B_TRANSPARENT_COLOR) {
        return B_TRANSPARENT_8_BIT;
    }
    const auto index = static_cast<size_t>(((red & 0xf8) << 7) | ((green & 0xf8) << 2) | (blue >> 3));
    return system_colors()->index_map[index];
}

rgb_color BScreen::ColorForIndex(uint8 index) {
    return system_colors()->color_list[index];
}

uint8 BScreen::InvertIndex(uint8 index) {
    return system_colors()->inversion_map[index];
}

const color_map* BScreen::ColorMap() {
    return system_colors();
}
