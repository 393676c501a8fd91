// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "platform/ui/label.h"
#include "platform/ui/upgrade_button.h"

namespace vaelo {

/// The status line: a text in the middle, and under it a button while the account's storage runs low. Main thread.
class DriveStatusLabelView : public View {
 public:
  /// Flexible in both directions, not opaque, without label and button.
  static std::shared_ptr<DriveStatusLabelView> initWithFrame(const Rect& frame);
  /// For initWithFrame.
  explicit DriveStatusLabelView(const Rect& frame) : View(frame) {}

  /// Both are null until they are given, and become subviews then.
  const std::shared_ptr<Label>& primaryLabel() const { return primaryLabel_; }
  void setPrimaryLabel(std::shared_ptr<Label> label);
  const std::shared_ptr<UpgradeButton>& quotaButton() const { return quotaButton_; }
  void setQuotaButton(std::shared_ptr<UpgradeButton> button);

  void setPrimaryLabelText(const std::string& text);
  bool showLowQuota() const { return showLowQuota_; }
  /// Shows or hides the button.
  void showLowQuota(bool show);

  /// Label and button centred one above the other, the pair centred and raised by a point, on whole pixels.
  void layoutSubviews() override;
  /// The room that label and button need, so that a toolbar grows with large text.
  Size intrinsicContentSize() const override;

 private:
  std::shared_ptr<Label> primaryLabel_;
  std::shared_ptr<UpgradeButton> quotaButton_;
  bool showLowQuota_ = false;
};

}  // namespace vaelo
