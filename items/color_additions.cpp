// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/color_additions.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <map>

namespace vaelo {

namespace {

constexpr double Epsilon = std::numeric_limits<float>::epsilon();

bool isZero(double value) { return std::fabs(value) < Epsilon; }
double unit(double value) { return std::clamp(value, 0.0, 1.0); }

/// One channel of the result from that of the source and its alpha, and that of the backdrop and its alpha.
using Channel = double (*)(double s, double a, double d, double A);

double multiply(double s, double a, double d, double) { return a * (s * d) + (1 - a) * d; }

double screen(double s, double a, double d, double) { return (1 - a) * d + a * (1 - (1 - s) * (1 - d)); }

double overlay(double s, double a, double d, double) {
  const double f = d < 0.5 ? 2 * s * d : 1 - 2 * (1 - s) * (1 - d);
  return a * f + (1 - a) * d;
}

double darken(double s, double a, double d, double) { return a * std::min(s, d) + (1 - a) * d; }

double lighten(double s, double a, double d, double) { return a * std::max(s, d) + (1 - a) * d; }

// The guard looks at s, so that a source of 1 gives what the division gives.
double colorDodge(double s, double a, double d, double) {
  const double f = isZero(s) ? 1 : d / (1 - s);
  return a * f + (1 - a) * d;
}

double colorBurn(double s, double a, double d, double A) {
  const double f = isZero(s) ? 0 : 1 - (1 - d * A) / s;
  return a * f + (1 - a) * A * d;
}

double plusLighter(double s, double a, double d, double) { return (1 - a) * d + a * std::min(s + d, 1.0); }

double plusDarker(double s, double a, double d, double A) {
  if (isZero(A)) return 0;
  const double t = unit(a + A);
  if (isZero(t)) return 0;
  const double u = unit((a - s * a) + (A - d));
  return unit(t - u / A);
}

const std::map<std::string, Channel>& channels() {
  static const std::map<std::string, Channel> byName = {
      {CompositingFilter::Multiply, multiply},     {CompositingFilter::Screen, screen},
      {CompositingFilter::Overlay, overlay},       {CompositingFilter::Darken, darken},
      {CompositingFilter::Lighten, lighten},       {CompositingFilter::ColorDodge, colorDodge},
      {CompositingFilter::ColorBurn, colorBurn},   {CompositingFilter::PlusLighter, plusLighter},
      {CompositingFilter::PlusDarker, plusDarker},
  };
  return byName;
}

Color sourceOver(const Color& d, const Color& s) {
  const double alpha = s.alpha + (1 - s.alpha) * d.alpha;
  if (isZero(alpha)) return Color::white().withAlpha(alpha);
  const auto channel = [&](double over, double under) { return (s.alpha * over + (1 - s.alpha) * d.alpha * under) / alpha; };
  return {channel(s.red, d.red), channel(s.green, d.green), channel(s.blue, d.blue), alpha};
}

}  // namespace

Color vlo_colorBlendedWithColorCompositingFilter(const Color& backdrop, const std::optional<Color>& color,
                                                 const std::optional<std::string>& compositingFilter) {
  if (!color || isZero(color->alpha)) return backdrop;
  if (!compositingFilter || *compositingFilter == CompositingFilter::Normal ||
      *compositingFilter == CompositingFilter::SourceOver) {
    return sourceOver(backdrop, *color);
  }
  const auto found = channels().find(*compositingFilter);
  if (found == channels().end()) return backdrop;
  const auto channel = [&](double s, double d) { return found->second(s, color->alpha, d, backdrop.alpha); };
  return {channel(color->red, backdrop.red), channel(color->green, backdrop.green), channel(color->blue, backdrop.blue),
          backdrop.alpha};
}

Color vlo_colorBlendedWithColor(const Color& backdrop, const std::optional<Color>& color) {
  return vlo_colorBlendedWithColorCompositingFilter(backdrop, color, CompositingFilter::SourceOver);
}

}  // namespace vaelo
