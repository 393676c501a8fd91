// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/button.h"

#include <utility>

namespace vaelo {

Button::Button(ButtonType type) : type_(type), titleLabel_(std::make_shared<Label>()) {
  titleLabel_->setTextAlignment(TextAlignment::Center);
  titleLabel_->setUserInteractionEnabled(false);
  addSubview(titleLabel_);
}

void Button::setTitle(std::string title) {
  if (titleLabel_->text() == title) return;
  titleLabel_->setText(std::move(title));
  notify(ViewChange::Content);
}

Size Button::intrinsicContentSize() const {
  const Size title = titleLabel_->intrinsicContentSize();
  return {title.width + 2 * TitleInset, title.height + 2 * TitleInset};
}

void Button::layoutSubviews() {
  const Size title = titleLabel_->intrinsicContentSize();
  titleLabel_->setFrame({(frame().width - title.width) / 2, (frame().height - title.height) / 2, title.width, title.height});
}

}  // namespace vaelo
