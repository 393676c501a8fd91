// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "platform/ui/attributed_string.h"
#include "platform/ui/view.h"

namespace vaelo {

/// Natural follows the interface's direction.
enum class TextAlignment { Left, Center, Right, Natural };

/// Text that can't be edited. Main thread.
class Label : public View {
 public:
  explicit Label(const Rect& frame = {}) : View(frame) {}
  const std::string& text() const { return text_; }
  /// Drops attributed text.
  void setText(std::string text);
  const std::optional<AttributedString>& attributedText() const { return attributedText_; }
  /// text() becomes its characters.
  void setAttributedText(std::optional<AttributedString> text);
  const Font& font() const { return font_; }
  void setFont(const Font& font);
  const Color& textColor() const { return textColor_; }
  void setTextColor(const Color& color);
  TextAlignment textAlignment() const { return alignment_; }
  void setTextAlignment(TextAlignment alignment);
  /// 0: as many as it takes; 1 at the start. What does not fit ends in an ellipsis.
  int numberOfLines() const { return numberOfLines_; }
  void setNumberOfLines(int lines);

  /// The measured text; empty text takes no room.
  Size intrinsicContentSize() const override;
  Size sizeThatFits(const Size& size) const override;

 private:
  Size measured(double maxWidth) const;
  std::string text_;
  std::optional<AttributedString> attributedText_;
  Font font_ = Font::preferred(TextStyle::Body);
  Color textColor_ = Color::black();
  TextAlignment alignment_ = TextAlignment::Natural;
  int numberOfLines_ = 1;
};

}  // namespace vaelo
