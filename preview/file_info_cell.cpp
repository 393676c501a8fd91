// SPDX-License-Identifier: GPL-3.0-or-later
#include "preview/file_info_cell.h"

#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "platform/ui/visual_format.h"

namespace vaelo {

namespace {

constexpr float NameHugging = 251;

}  // namespace

std::shared_ptr<FileInfoCell> FileInfoCell::initWithNameAndValueValueMaxLines(const std::string& name,
                                                                              const std::string& value, int maxLines) {
  const auto cell = std::make_shared<FileInfoCell>();
  cell->setTranslatesAutoresizingMaskIntoConstraints(false);
  const auto add = [&cell](const std::string& text, const Color& color, float hugging) {
    const auto label = std::make_shared<Label>();
    label->setTranslatesAutoresizingMaskIntoConstraints(false);
    label->setFont(font());
    label->setTextColor(color);
    label->setText(text);
    label->setContentHuggingPriority(hugging, LayoutAxis::Horizontal);
    label->setContentHuggingPriority(LayoutPriority::Required, LayoutAxis::Vertical);
    label->setContentCompressionResistancePriority(LayoutPriority::Required, LayoutAxis::Vertical);
    cell->addSubview(label);
    return label;
  };
  cell->nameLabel_ = add(name, Color::gray(), NameHugging);
  cell->alignName();
  cell->valueLabel_ = add(value, Color::black(), LayoutPriority::DefaultLow);
  cell->valueLabel_->setNumberOfLines(maxLines);
  cell->valueLabel_->setContentCompressionResistancePriority(LayoutPriority::DefaultLow, LayoutAxis::Horizontal);
  const VisualFormatBindings bindings = {{"_nameLabel", cell->nameLabel_.get()}, {"_valueLabel", cell->valueLabel_.get()}};
  for (const char* format : {"H:|[_nameLabel]-10-[_valueLabel]|", "V:|[_nameLabel]", "V:|[_valueLabel]|"}) {
    LayoutConstraint::activate(constraintsWithVisualFormat(format, bindings));
  }
  return cell;
}

// Only in a window is it known which way people read.
void FileInfoCell::didMoveToWindow() {
  View::didMoveToWindow();
  alignName();
}

// Names line up against the values, whichever way people read.
void FileInfoCell::alignName() {
  const bool rightToLeft = traitCollection().layoutDirection == LayoutDirection::RightToLeft;
  nameLabel_->setTextAlignment(rightToLeft ? TextAlignment::Left : TextAlignment::Right);
}

}  // namespace vaelo
