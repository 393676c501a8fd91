// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

enum class TextStyle { Body, Title2, Subheadline, Footnote, Caption2 };

/// A text style at a size; 0 is the style's own default size.
struct Font {
  TextStyle style = TextStyle::Body;
  double pointSize = 0;
  friend bool operator==(const Font&, const Font&) = default;
};

}  // namespace vaelo
