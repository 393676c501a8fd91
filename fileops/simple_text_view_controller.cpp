// SPDX-License-Identifier: GPL-3.0-or-later
#include "fileops/simple_text_view_controller.h"

namespace vaelo {

void SimpleTextViewController::viewDidLoad() {
  ViewController::viewDidLoad();
  View& root = *view();
  messageLabel_ = std::make_shared<Label>();
  messageLabel_->setTranslatesAutoresizingMaskIntoConstraints(false);
  messageLabel_->setText("");
  messageLabel_->setNumberOfLines(5);
  messageLabel_->setFont(Font::preferred(TextStyle::Footnote));
  messageLabel_->setTextColor(Color::systemRed());
  root.addSubview(messageLabel_);
  for (const LayoutAxis axis : {LayoutAxis::Horizontal, LayoutAxis::Vertical}) {
    root.setContentHuggingPriority(LayoutPriority::Required, axis);
  }
  View& label = *messageLabel_;
  const double inset = _labelHorizontalInsets();
  LayoutConstraint::activate({
      LayoutConstraint::makeEqual(label, LayoutAttribute::Top, root, LayoutAttribute::Top),
      LayoutConstraint::makeEqual(root, LayoutAttribute::Height, label, LayoutAttribute::Height),
      LayoutConstraint::makeEqual(label, LayoutAttribute::Leading, root, LayoutAttribute::Leading, inset),
      LayoutConstraint::makeEqual(label, LayoutAttribute::Trailing, root, LayoutAttribute::Trailing, -inset),
  });
}

}  // namespace vaelo
