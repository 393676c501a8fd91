// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "platform/ui/label.h"
#include "platform/ui/view_controller.h"

namespace vaelo {

/// A few lines of red text that are as high as the text: the error line of a prompt. Main thread.
class SimpleTextViewController : public ViewController {
 public:
  std::string className() const override { return "SimpleTextViewController"; }
  /// Null before the view is loaded.
  const std::shared_ptr<Label>& messageLabel() const { return messageLabel_; }
  /// Points on either side of the text.
  static double _labelHorizontalInsets() { return 16; }
  void viewDidLoad() override;

 private:
  std::shared_ptr<Label> messageLabel_;
};

}  // namespace vaelo
