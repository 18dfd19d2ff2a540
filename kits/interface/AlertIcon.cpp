#include "AlertIcon.h"

#include <Bitmap.h>
#include <View.h>

#include <cstring>

namespace {

constexpr float kSide = 128;
constexpr rgb_color kOutline = {40, 40, 40, 255};
constexpr rgb_color kWhite = {255, 255, 255, 255};
constexpr rgb_color kBlack = {0, 0, 0, 255};

class Sign {
  public:
    explicit Sign(BView& view) : mView(view) {}

    void Disc(BPoint center, float radius, rgb_color color) {
        mView.SetHighColor(color);
        mView.FillEllipse(center, radius, radius);
    }
    void Polygon(std::initializer_list<BPoint> points, rgb_color color) {
        mView.SetHighColor(color);
        mView.FillPolygon(points.begin(), static_cast<int32>(points.size()));
    }
    void Bar(BRect rect, rgb_color color, float radius = 4) {
        mView.SetHighColor(color);
        mView.FillRoundRect(rect, radius, radius);
    }

  private:
    BView& mView;
};

void DrawInfo(Sign& sign) {
    sign.Disc(BPoint(64, 64), 60, kOutline);
    sign.Disc(BPoint(64, 64), 55, make_color(52, 104, 190));
    sign.Disc(BPoint(64, 34), 10, kWhite);
    sign.Bar(BRect(48, 52, 72, 60), kWhite);
    sign.Bar(BRect(56, 52, 72, 96), kWhite);
    sign.Bar(BRect(46, 90, 82, 98), kWhite);
}

// A bulb with its light around it.
void DrawIdea(Sign& sign) {
    const rgb_color light = make_color(255, 190, 0);
    sign.Polygon({BPoint(4, 48), BPoint(24, 46), BPoint(24, 54)}, light);
    sign.Polygon({BPoint(124, 48), BPoint(104, 46), BPoint(104, 54)}, light);
    sign.Polygon({BPoint(20, 8), BPoint(36, 22), BPoint(30, 28)}, light);
    sign.Polygon({BPoint(108, 8), BPoint(92, 22), BPoint(98, 28)}, light);
    sign.Disc(BPoint(64, 52), 40, kOutline);
    sign.Bar(BRect(42, 70, 86, 100), kOutline);
    sign.Disc(BPoint(64, 52), 35, make_color(255, 224, 90));
    sign.Bar(BRect(47, 70, 81, 98), make_color(255, 224, 90));
    sign.Disc(BPoint(52, 40), 10, make_color(255, 246, 200));
    sign.Bar(BRect(44, 98, 84, 106), make_color(120, 120, 120));
    sign.Bar(BRect(46, 108, 82, 115), make_color(90, 90, 90));
    sign.Bar(BRect(52, 117, 76, 124), kOutline);
}

void DrawWarning(Sign& sign) {
    sign.Polygon({BPoint(64, 3), BPoint(126, 118), BPoint(2, 118)}, kOutline);
    sign.Polygon({BPoint(64, 14), BPoint(117, 113), BPoint(11, 113)}, make_color(255, 203, 0));
    sign.Polygon({BPoint(54, 44), BPoint(74, 44), BPoint(69, 84), BPoint(59, 84)}, kBlack);
    sign.Disc(BPoint(64, 97), 9, kBlack);
}

void DrawStop(Sign& sign) {
    sign.Polygon({BPoint(39, 3), BPoint(89, 3), BPoint(125, 39), BPoint(125, 89), BPoint(89, 125),
                  BPoint(39, 125), BPoint(3, 89), BPoint(3, 39)},
                 kOutline);
    sign.Polygon({BPoint(41, 8), BPoint(87, 8), BPoint(120, 41), BPoint(120, 87), BPoint(87, 120),
                  BPoint(41, 120), BPoint(8, 87), BPoint(8, 41)},
                 make_color(205, 30, 30));
    sign.Bar(BRect(28, 53, 100, 75), kWhite, 2);
}

} // namespace

std::unique_ptr<BBitmap> alert_icon(alert_type type) {
    if (type < B_INFO_ALERT || type > B_STOP_ALERT) {
        return nullptr;
    }
    auto icon = std::make_unique<BBitmap>(BRect(0, 0, kSide - 1, kSide - 1), B_RGBA32, true);
    if (!icon->Lock()) {
        return nullptr;
    }
    std::memset(icon->Bits(), 0, static_cast<size_t>(icon->BitsLength()));
    auto* const view = new BView(icon->Bounds(), "sign", B_FOLLOW_NONE, B_WILL_DRAW);
    icon->AddChild(view);
    Sign sign(*view);
    switch (type) {
    case B_INFO_ALERT:
        DrawInfo(sign);
        break;
    case B_IDEA_ALERT:
        DrawIdea(sign);
        break;
    case B_WARNING_ALERT:
        DrawWarning(sign);
        break;
    default:
        DrawStop(sign);
        break;
    }
    icon->Unlock();
    return icon;
}
