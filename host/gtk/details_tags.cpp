// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/details_tags.h"

#include <cmath>

#include "host/gtk/tags_popover.h"
#include "items/dr_item.h"
#include "platform/platform.h"
#include "preview/preview_details_view_controller.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

namespace {

const FileInfoCell* rowOfTags(const PreviewDetailsViewController& details) {
  const auto& rows = details.fileInfoView()->arrangedSubviews();
  const auto* last = rows.empty() ? nullptr : dynamic_cast<const FileInfoCell*>(rows.back().get());
  return last && last->valueLabel()->attributedText() ? last : nullptr;
}

/// A change of tags leaves the document's time as it is, by which screens are refreshed.
void showTagsAnew(PreviewDetailsViewController& details) {
  const std::shared_ptr<PreviewItemManager> manager = details.itemManager();
  const std::shared_ptr<DRItem> item = manager ? manager->item() : nullptr;
  if (!item || !item->resolvedURL()) return;
  item->setTags(Platform::current().cloudDocuments.tagNames(*item->resolvedURL()).value);
  details.refreshItem();
}

bool holds(const GdkRectangle& place, double x, double y) {
  return x >= place.x && x < place.x + place.width && y >= place.y && y < place.y + place.height;
}

}  // namespace

DetailsTags::DetailsTags(std::shared_ptr<PreviewDetailsViewController> details, GtkWidget* page, DriveSyncedStore& tags)
    : details_(std::move(details)),
      page_(page),
      tags_(tags),
      click_(gtk_gesture_click_new()),
      hold_(gtk_gesture_long_press_new()) {
  gtk_gesture_single_set_button(GTK_GESTURE_SINGLE(click_), 0);
  g_signal_connect(click_, "released", G_CALLBACK(+[](GtkGesture* gesture, int, double x, double y, DetailsTags* self) {
                     self->pressed(gesture, x, y);
                   }),
                   this);
  g_signal_connect(
      hold_, "pressed",
      G_CALLBACK(+[](GtkGesture* gesture, double x, double y, DetailsTags* self) { self->pressed(gesture, x, y); }), this);
  for (GtkGesture* gesture : {click_, hold_}) gtk_widget_add_controller(page_, GTK_EVENT_CONTROLLER(gesture));
}

DetailsTags::~DetailsTags() {
  for (GtkGesture* gesture : {click_, hold_}) g_signal_handlers_disconnect_by_data(gesture, this);
}

GdkRectangle DetailsTags::place() const {
  const FileInfoCell* row = rowOfTags(*details_);
  const View& shown = row ? static_cast<const View&>(*row) : *details_->fileInfoView();
  const Rect frame = shown.convertRectTo(shown.bounds(), *details_->scrollView());
  const double top = frame.y - details_->scrollView()->contentOffset().y;
  const int x = static_cast<int>(std::floor(frame.x));
  const int width = static_cast<int>(std::ceil(frame.width));
  if (row) return {x, static_cast<int>(std::floor(top)), width, static_cast<int>(std::ceil(frame.height))};
  return {x, static_cast<int>(std::ceil(top + frame.height)), width, 1};
}

void DetailsTags::pressed(GtkGesture* gesture, double x, double y) {
  if (!rowOfTags(*details_) || details_->filenameTextField()->isEditing() || !holds(place(), x, y)) return;
  gtk_gesture_set_state(gesture, GTK_EVENT_SEQUENCE_CLAIMED);
  showTags();
}

void DetailsTags::showTags() {
  const std::shared_ptr<PreviewItemManager> manager = details_->itemManager();
  if (!manager || !manager->item() || !manager->item()->url()) return;
  showTagsPopover(page_, place(), *manager->item()->url(), tags_, [weak = std::weak_ptr(details_)] {
    if (const auto details = weak.lock()) showTagsAnew(*details);
  });
}

}  // namespace vaelo
