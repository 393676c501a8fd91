// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <optional>
#include <string>

#include "platform/formatting.h"
#include "platform/ui/attributed_string.h"
#include "platform/ui/stack_view.h"
#include "preview/file_info_cell.h"

namespace vaelo {

class DRItem;

/// The facts about a file, one a row, their names in one column. Main thread.
class FileInfoStackView : public StackView {
 public:
  static std::shared_ptr<FileInfoStackView> initWithFrame(const Rect& frame);
  using StackView::StackView;

  const std::shared_ptr<DRItem>& item() const { return item_; }
  /// Builds the rows anew; null keeps them.
  void setItem(const std::shared_ptr<DRItem>& item);
  /// Null where the row is absent.
  const std::shared_ptr<FileInfoCell>& creationDateCell() const { return creationDateCell_; }
  const std::shared_ptr<FileInfoCell>& modifiedDateCell() const { return modifiedDateCell_; }
  std::shared_ptr<FileInfoCell> addCellValueMaxLines(const std::string& name, const std::string& value, int maxLines);
  /// A coloured dot and the name for each of the item's tags; nothing when it has none.
  static std::optional<AttributedString> buildTagsWithImagesStringFont(const DRItem& item, const Font& font);
  /// Chooses the longest style in which the dates fit.
  void layoutSubviews() override;

 private:
  std::shared_ptr<DRItem> item_;
  std::shared_ptr<FileInfoCell> creationDateCell_;
  std::shared_ptr<FileInfoCell> modifiedDateCell_;
};

}  // namespace vaelo
