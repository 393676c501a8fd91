// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>

namespace vaelo {

/// Lengths are in points; y grows downwards.
struct Point {
  double x = 0;
  double y = 0;
  friend bool operator==(const Point&, const Point&) = default;
};

struct Size {
  double width = 0;
  double height = 0;
  friend bool operator==(const Size&, const Size&) = default;
};

/// Distances from the four edges of a rectangle inwards.
struct EdgeInsets {
  double top = 0;
  double left = 0;
  double bottom = 0;
  double right = 0;
  friend bool operator==(const EdgeInsets&, const EdgeInsets&) = default;
};

struct Rect {
  double x = 0;
  double y = 0;
  double width = 0;
  double height = 0;

  Point origin() const { return {x, y}; }
  Size size() const { return {width, height}; }
  Point center() const { return {x + width / 2, y + height / 2}; }
  double maxX() const { return x + width; }
  double maxY() const { return y + height; }
  double midY() const { return y + height / 2; }
  Rect offsetBy(double dx, double dy) const { return {x + dx, y + dy, width, height}; }
  /// Negative insets grow the rectangle; the size never falls below zero.
  Rect insetBy(const EdgeInsets& insets) const {
    return {x + insets.left, y + insets.top, std::max(0.0, width - insets.left - insets.right),
            std::max(0.0, height - insets.top - insets.bottom)};
  }
  Rect insetBy(double dx, double dy) const { return insetBy(EdgeInsets{dy, dx, dy, dx}); }
  bool contains(const Point& point) const { return point.x >= x && point.x < maxX() && point.y >= y && point.y < maxY(); }
  friend bool operator==(const Rect&, const Rect&) = default;
};

}  // namespace vaelo
