// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/stack_view.h"

#include <algorithm>

namespace vaelo {

void StackView::setAxis(LayoutAxis axis) {
  if (axis_ == axis) return;
  axis_ = axis;
  notify(ViewChange::Arrangement);
}

void StackView::setAlignment(StackAlignment alignment) {
  if (alignment_ == alignment) return;
  alignment_ = alignment;
  notify(ViewChange::Arrangement);
}

void StackView::setDistribution(StackDistribution distribution) {
  if (distribution_ == distribution) return;
  distribution_ = distribution;
  notify(ViewChange::Arrangement);
}

void StackView::setSpacing(double spacing) {
  if (spacing_ == spacing) return;
  spacing_ = spacing;
  notify(ViewChange::Arrangement);
}

void StackView::addArrangedSubview(const ViewRef& view) { insertArrangedSubview(view, arranged_.size()); }

void StackView::insertArrangedSubview(const ViewRef& view, std::size_t index) {
  const ViewRef kept = view;
  std::erase(arranged_, kept);
  kept->setTranslatesAutoresizingMaskIntoConstraints(false);
  if (kept->superview() != this) addSubview(kept);
  const auto place = std::min(index, arranged_.size());
  arranged_.insert(arranged_.begin() + static_cast<std::ptrdiff_t>(place), kept);
  notify(ViewChange::Subviews);
}

void StackView::removeArrangedSubview(const ViewRef& view) {
  const ViewRef kept = view;
  if (std::erase(arranged_, kept) > 0) notify(ViewChange::Subviews);
}

void StackView::willRemoveSubview(View& view) {
  std::erase_if(arranged_, [&view](const ViewRef& arranged) { return arranged.get() == &view; });
}

}  // namespace vaelo
