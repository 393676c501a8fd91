// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <vector>

#include "platform/ui/view.h"

namespace vaelo {

enum class StackAlignment { Fill, Leading, Center, Trailing, FirstBaseline };
enum class StackDistribution { Fill, FillEqually, EqualSpacing };

/// Views in a row or column. Main thread.
class StackView : public View {
 public:
  explicit StackView(const Rect& frame = {}) : View(frame) {}
  LayoutAxis axis() const { return axis_; }
  void setAxis(LayoutAxis axis);
  /// Across the axis.
  StackAlignment alignment() const { return alignment_; }
  void setAlignment(StackAlignment alignment);
  /// Along the axis.
  StackDistribution distribution() const { return distribution_; }
  void setDistribution(StackDistribution distribution);
  double spacing() const { return spacing_; }
  void setSpacing(double spacing);

  const std::vector<ViewRef>& arrangedSubviews() const { return arranged_; }
  /// Also makes it a subview, and places it by constraints.
  void addArrangedSubview(const ViewRef& view);
  void insertArrangedSubview(const ViewRef& view, std::size_t index);
  /// Takes it out of the row; it stays a subview until removeFromSuperview.
  void removeArrangedSubview(const ViewRef& view);

 protected:
  void willRemoveSubview(View& view) override;

 private:
  std::vector<ViewRef> arranged_;
  LayoutAxis axis_ = LayoutAxis::Horizontal;
  StackAlignment alignment_ = StackAlignment::Fill;
  StackDistribution distribution_ = StackDistribution::Fill;
  double spacing_ = 0;
};

}  // namespace vaelo
