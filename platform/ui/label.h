// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/ui/font.h"
#include "platform/ui/view.h"

namespace vaelo {

enum class TextAlignment { Natural, Left, Right, Center };

/// A text that is read, not edited.
class Label : public View {
 public:
  const std::string& text() const { return text_; }
  void setText(std::string text) { set(text_, std::move(text)); }
  const Font& font() const { return font_; }
  void setFont(Font font) { set(font_, font); }
  const Color& textColor() const { return textColor_; }
  void setTextColor(Color color) { set(textColor_, color); }
  TextAlignment alignment() const { return alignment_; }
  void setAlignment(TextAlignment alignment) { set(alignment_, alignment); }
  /// 0 is no limit.
  int maxLines() const { return maxLines_; }
  void setMaxLines(int lines) { set(maxLines_, lines); }

 private:
  std::string text_;
  Font font_;
  Color textColor_ = Color::black();
  TextAlignment alignment_ = TextAlignment::Natural;
  int maxLines_ = 1;
};

}  // namespace vaelo
