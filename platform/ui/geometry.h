// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// Points of the screen model; one point is one pixel on a 1x screen. The origin is the top left corner.
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

struct Rect {
  Point origin;
  Size size;
  double maxX() const { return origin.x + size.width; }
  double maxY() const { return origin.y + size.height; }
  double midY() const { return origin.y + size.height / 2; }
  friend bool operator==(const Rect&, const Rect&) = default;
};

struct EdgeInsets {
  double top = 0;
  double left = 0;
  double bottom = 0;
  double right = 0;
  friend bool operator==(const EdgeInsets&, const EdgeInsets&) = default;
};

/// Components from 0 to 1.
struct Color {
  double red = 0;
  double green = 0;
  double blue = 0;
  double alpha = 1;
  static Color white() { return {1, 1, 1, 1}; }
  static Color black() { return {0, 0, 0, 1}; }
  friend bool operator==(const Color&, const Color&) = default;
};

}  // namespace vaelo
