// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "platform/ui/label.h"

namespace vaelo {

/// One fact about a file: its name and its value, side by side. Main thread.
class FileInfoCell : public View {
 public:
  static std::shared_ptr<FileInfoCell> initWithNameAndValueValueMaxLines(const std::string& name, const std::string& value,
                                                                         int maxLines);
  static std::shared_ptr<FileInfoCell> init() { return initWithNameAndValueValueMaxLines("", "", 1); }
  /// Of both texts.
  static Font font() { return Font::preferred(TextStyle::Subheadline); }

  const std::shared_ptr<Label>& nameLabel() const { return nameLabel_; }
  const std::shared_ptr<Label>& valueLabel() const { return valueLabel_; }

 protected:
  void didMoveToWindow() override;

 private:
  void alignName();
  std::shared_ptr<Label> nameLabel_;
  std::shared_ptr<Label> valueLabel_;
};

}  // namespace vaelo
