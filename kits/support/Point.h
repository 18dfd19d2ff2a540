// BPoint: a position or a distance on a surface.
#pragma once

#include <SupportDefs.h>

class BRect;

// A plain value. x grows to the right, y downwards; whole numbers are the centres of pixels.
class BPoint {
  public:
    constexpr BPoint() = default;
    constexpr BPoint(float pointX, float pointY) : x(pointX), y(pointY) {}

    void Set(float newX, float newY) {
        x = newX;
        y = newY;
    }
    // Moves the point to the nearest one inside the rectangle.
    void ConstrainTo(BRect rect);
    // Prints "BPoint(x:..., y:...)" on standard output.
    void PrintToStream() const;

    constexpr BPoint operator-() const { return {-x, -y}; }
    constexpr BPoint operator+(const BPoint& other) const { return {x + other.x, y + other.y}; }
    constexpr BPoint operator-(const BPoint& other) const { return {x - other.x, y - other.y}; }
    BPoint& operator+=(const BPoint& other) {
        x += other.x;
        y += other.y;
        return *this;
    }
    BPoint& operator-=(const BPoint& other) {
        x -= other.x;
        y -= other.y;
        return *this;
    }
    constexpr bool operator==(const BPoint& other) const { return x == other.x && y == other.y; }
    constexpr bool operator!=(const BPoint& other) const { return !(*this == other); }

    float x = 0;
    float y = 0;
};

inline constexpr BPoint B_ORIGIN;
