// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/page_parts.h"

#include <algorithm>
#include <cmath>

#include "host/support/texts.h"

namespace vaelo {

namespace {

GtkWidget* makePart(GtkWidget* area) {
  auto* part = GTK_WIDGET(g_object_new(GTK_TYPE_BOX, "accessible-role", GTK_ACCESSIBLE_ROLE_IMG, nullptr));
  gtk_widget_set_can_target(part, FALSE);
  gtk_widget_set_parent(part, area);
  return part;
}

}  // namespace

PageParts::~PageParts() {
  for (GtkWidget* part : parts_) gtk_widget_unparent(part);
}

void PageParts::show(int first, int last, int count) {
  const auto shown = static_cast<std::size_t>(std::max(last - first + 1, 0));
  if (first == first_ && count == count_ && shown == shown_) return;
  first_ = first;
  count_ = count;
  shown_ = shown;
  while (parts_.size() < shown) parts_.push_back(makePart(area_));
  for (std::size_t i = 0; i < parts_.size(); ++i) {
    gtk_widget_set_visible(parts_[i], i < shown);
    if (i >= shown) continue;
    const std::string label = filled(_("Page %s of %s"), {numberText(first + static_cast<int>(i) + 1), numberText(count)});
    gtk_accessible_update_property(GTK_ACCESSIBLE(parts_[i]), GTK_ACCESSIBLE_PROPERTY_LABEL, label.c_str(),
                                   GTK_ACCESSIBLE_PROPERTY_DESCRIPTION, "", -1);
  }
}

void PageParts::describe(int page, const std::string& text) {
  const auto i = static_cast<std::size_t>(page - first_);
  if (page < first_ || i >= shown_) return;
  gtk_accessible_update_property(GTK_ACCESSIBLE(parts_[i]), GTK_ACCESSIBLE_PROPERTY_DESCRIPTION, text.c_str(), -1);
}

void PageParts::allocate(const std::function<PageArea(int page)>& areaOf) const {
  for (std::size_t i = 0; i < shown_; ++i) {
    // The toolkit complains of a child that is placed without having been asked for its size.
    gtk_widget_measure(parts_[i], GTK_ORIENTATION_HORIZONTAL, -1, nullptr, nullptr, nullptr, nullptr);
    const PageArea area = areaOf(first_ + static_cast<int>(i));
    const GtkAllocation place = {static_cast<int>(std::floor(area.x)), static_cast<int>(std::floor(area.y)),
                                 static_cast<int>(std::ceil(area.width)), static_cast<int>(std::ceil(area.height))};
    gtk_widget_size_allocate(parts_[i], &place, -1);
  }
}

}  // namespace vaelo
