// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/label.h"

#include <algorithm>
#include <utility>

#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

void Label::setText(std::string text) {
  if (!attributedText_ && text_ == text) return;
  attributedText_.reset();
  text_ = std::move(text);
  notify(ViewChange::Content);
}

void Label::setAttributedText(std::optional<AttributedString> text) {
  if (attributedText_ == text) return;
  text_ = text ? text->plainText() : "";
  attributedText_ = std::move(text);
  notify(ViewChange::Content);
}

void Label::setFont(const Font& font) {
  if (font_ == font) return;
  font_ = font;
  notify(ViewChange::Appearance);
}

void Label::setTextColor(const Color& color) {
  if (textColor_ == color) return;
  textColor_ = color;
  notify(ViewChange::Appearance);
}

void Label::setTextAlignment(TextAlignment alignment) {
  if (alignment_ == alignment) return;
  alignment_ = alignment;
  notify(ViewChange::Appearance);
}

void Label::setNumberOfLines(int lines) {
  if (numberOfLines_ == lines) return;
  numberOfLines_ = lines;
  notify(ViewChange::Content);
}

Size Label::measured(double maxWidth) const {
  Size size;
  if (!text_.empty()) {
    size = Platform::current().screens.graphics().measure(text_, font_, maxWidth, numberOfLines_);
  }
  if (attributedText_) {
    for (const AttributedString::Run& run : attributedText_->runs()) {
      if (!run.image) continue;
      if (&run != &attributedText_->runs().front()) size.width += AttributedString::RoomBeforeImage;
      size.width += run.image->width();
      size.height = std::max(size.height, run.image->height());
    }
  }
  return size;
}

Size Label::intrinsicContentSize() const { return measured(0); }

Size Label::sizeThatFits(const Size& size) const { return measured(numberOfLines_ == 1 ? 0 : size.width); }

}  // namespace vaelo
