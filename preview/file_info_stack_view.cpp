// SPDX-License-Identifier: GPL-3.0-or-later
#include "preview/file_info_stack_view.h"

#include <algorithm>

#include "items/dr_item.h"
#include "items/file_tags.h"
#include "items/file_utils.h"
#include "platform/localized.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "platform/ui/visual_format.h"

namespace vaelo {

namespace {

constexpr double RowSpacing = 10;
constexpr int WhereLines = 4;

double valueWidth(const std::shared_ptr<FileInfoCell>& cell) {
  if (!cell) return 0;
  cell->layoutIfNeeded();
  return cell->valueLabel()->frame().width;
}

void setTextIfOther(const std::shared_ptr<FileInfoCell>& cell, const std::optional<std::string>& text) {
  // A text that is set lays the whole screen out again.
  if (cell && text && cell->valueLabel()->text() != *text) cell->valueLabel()->setText(*text);
}

}  // namespace

std::shared_ptr<FileInfoStackView> FileInfoStackView::initWithFrame(const Rect& frame) {
  const auto stack = std::make_shared<FileInfoStackView>(frame);
  stack->setAlignment(StackAlignment::Leading);
  stack->setDistribution(StackDistribution::Fill);
  stack->setSpacing(RowSpacing);
  stack->setTranslatesAutoresizingMaskIntoConstraints(false);
  return stack;
}

std::shared_ptr<FileInfoCell> FileInfoStackView::addCellValueMaxLines(const std::string& name, const std::string& value,
                                                                      int maxLines) {
  const auto cell = FileInfoCell::initWithNameAndValueValueMaxLines(name, value, maxLines);
  const auto last =
      arrangedSubviews().empty() ? nullptr : std::dynamic_pointer_cast<FileInfoCell>(arrangedSubviews().back());
  addArrangedSubview(cell);
  if (last) {
    LayoutConstraint::activate(
        constraintsWithVisualFormat("[nameLabel(==lastNameLabel)]",
                                    {{"nameLabel", cell->nameLabel().get()}, {"lastNameLabel", last->nameLabel().get()}}));
  }
  return cell;
}

void FileInfoStackView::setItem(const std::shared_ptr<DRItem>& item) {
  item_ = item;
  if (!item_) return;
  const std::vector<ViewRef> old = arrangedSubviews();
  for (const ViewRef& row : old) {
    removeArrangedSubview(row);
    row->removeFromSuperview();
  }
  const auto add = [this](const std::string& name, const std::optional<std::string>& value, int maxLines = 1) {
    return value ? addCellValueMaxLines(name, *value, maxLines) : nullptr;
  };
  add(localized("Kind"), item_->localizedTypeDescription());
  add(localized("Size"), item_->friendlyFileSize());
  add(localized("Where"), item_->url() ? FileUtils::displayableLocationForURL(*item_->url()) : std::nullopt, WhereLines);
  creationDateCell_ = add(localized("Created"), item_->friendlyCreationDate(DateStyle::Long));
  modifiedDateCell_ = add(localized("Modified"), item_->friendlyContentModificationDate(DateStyle::Long));
  if (std::optional<AttributedString> tags = buildTagsWithImagesStringFont(*item_, FileInfoCell::font())) {
    add(localized("Tags"), "")->valueLabel()->setAttributedText(std::move(tags));
  }
}

std::optional<AttributedString> FileInfoStackView::buildTagsWithImagesStringFont(const DRItem& item, const Font& font) {
  if (!item.tags() || item.tags()->empty()) return std::nullopt;
  const FontMetrics metrics = Platform::current().screens.graphics().fontMetrics(font);
  TextAttributes attributes;
  attributes.baselineOffset = -metrics.descender;
  AttributedString text("", attributes);
  const std::vector<std::string>& tags = *item.tags();
  for (std::size_t i = 0; i < tags.size(); ++i) {
    text.appendImage(FileTags::blipWithTagImageSizeBlipHeightOffset(tags[i], {metrics.capHeight + 2, metrics.lineHeight},
                                                                    metrics.capHeight,
                                                                    {0, metrics.ascender - metrics.capHeight + 1}));
    text.append(i + 1 == tags.size() ? tags[i] : tags[i] + " ", attributes);
  }
  return text;
}

void FileInfoStackView::layoutSubviews() {
  StackView::layoutSubviews();
  const double width = std::max(valueWidth(creationDateCell_), valueWidth(modifiedDateCell_));
  if (width == 0 || !item_) return;
  std::optional<std::string> created;
  std::optional<std::string> modified;
  for (const DateStyle style : {DateStyle::Long, DateStyle::Medium, DateStyle::Short}) {
    created = item_->friendlyCreationDate(style);
    modified = item_->friendlyContentModificationDate(style);
    // The date of creation is measured for both: the rows always have the same style.
    const double needed = Platform::current().screens.graphics().measure(created.value_or(""), FileInfoCell::font()).width;
    if (needed <= width) break;
  }
  setTextIfOther(creationDateCell_, created);
  setTextIfOther(modifiedDateCell_, modified);
}

}  // namespace vaelo
