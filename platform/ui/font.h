// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// The roles that text plays; the host picks the face for each.
enum class TextStyle {
  LargeTitle,
  Title1,
  Title2,
  Title3,
  Headline,
  Subheadline,
  Body,
  Callout,
  Footnote,
  Caption1,
  Caption2,
};

/// Distances of a font's lines, in points. The descender is negative: it lies below the baseline.
struct FontMetrics {
  double pointSize = 0;
  double ascender = 0;
  double descender = 0;
  double capHeight = 0;
  double lineHeight = 0;
};

/// A text style at a size in points. A value; its metrics come from Graphics::fontMetrics.
struct Font {
  TextStyle style = TextStyle::Body;
  double pointSize = 17;

  /// The style at its default size.
  static Font preferred(TextStyle style) { return {style, defaultPointSize(style)}; }
  Font withSize(double points) const { return {style, points}; }
  static double defaultPointSize(TextStyle style);
  friend bool operator==(const Font&, const Font&) = default;
};

}  // namespace vaelo
