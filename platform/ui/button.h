// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "platform/ui/control.h"
#include "platform/ui/label.h"

namespace vaelo {

enum class ButtonType { System, Custom };

/// A push button with a title. Main thread.
class Button : public Control {
 public:
  /// The room around the title, in points.
  static constexpr double TitleInset = 6;

  explicit Button(ButtonType type = ButtonType::System);
  ButtonType type() const { return type_; }
  const std::string& title() const { return titleLabel_->text(); }
  void setTitle(std::string title);
  /// Carries the title's font; a subview of the button.
  const std::shared_ptr<Label>& titleLabel() const { return titleLabel_; }
  Size intrinsicContentSize() const override;
  void layoutSubviews() override;

 private:
  ButtonType type_;
  std::shared_ptr<Label> titleLabel_;
};

}  // namespace vaelo
