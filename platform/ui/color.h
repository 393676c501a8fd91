// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// Red, green, blue and opacity, each from 0 to 1.
struct Color {
  double red = 0;
  double green = 0;
  double blue = 0;
  double alpha = 1;

  Color withAlpha(double value) const { return {red, green, blue, value}; }
  friend bool operator==(const Color&, const Color&) = default;

  static constexpr Color black();
  static constexpr Color white();
  static constexpr Color gray();
  static constexpr Color lightGray();
  static constexpr Color systemRed();
  static constexpr Color systemOrange();
  static constexpr Color systemYellow();
  static constexpr Color systemGreen();
  static constexpr Color systemBlue();
  static constexpr Color systemPurple();
  static constexpr Color systemGray();
  static constexpr Color clear();
  /// The thin shadow line under a bar.
  static constexpr Color barHairlineShadow();
};

constexpr Color Color::black() { return {0, 0, 0, 1}; }
constexpr Color Color::white() { return {1, 1, 1, 1}; }
constexpr Color Color::gray() { return {0.5, 0.5, 0.5, 1}; }
constexpr Color Color::lightGray() { return {2.0 / 3, 2.0 / 3, 2.0 / 3, 1}; }
constexpr Color Color::systemRed() { return {0.88, 0.11, 0.14, 1}; }
constexpr Color Color::systemOrange() { return {1.0, 0.47, 0.0, 1}; }
constexpr Color Color::systemYellow() { return {0.96, 0.76, 0.07, 1}; }
constexpr Color Color::systemGreen() { return {0.18, 0.76, 0.49, 1}; }
constexpr Color Color::systemBlue() { return {0.21, 0.52, 0.89, 1}; }
constexpr Color Color::systemPurple() { return {0.57, 0.25, 0.67, 1}; }
constexpr Color Color::systemGray() { return {0.56, 0.56, 0.58, 1}; }
constexpr Color Color::clear() { return {0, 0, 0, 0}; }
constexpr Color Color::barHairlineShadow() { return {0, 0, 0, 0.3}; }

}  // namespace vaelo
