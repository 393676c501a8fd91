// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirror/view_layout.h"

#include <algorithm>
#include <cmath>
#include <map>
#include <optional>

#include "host/gtk/mirror/layout_solver.h"
#include "host/gtk/mirrored_text.h"
#include "platform/ui/button.h"
#include "platform/ui/stack_view.h"

namespace vaelo {

namespace {

using Length = LayoutSolver::Length;
using Terms = std::vector<LayoutSolver::Term>;
using enum LayoutRelation;

// What gives way where there is too little room: the far edge first, of all of them the outermost, so that what is in a
// stack stays in it; never the near one, and texts last.
constexpr double FarEdgeWeight = 1;
constexpr double FarEdgeWeightOfDepth = 1 / 16.0;
constexpr double OtherWeight = 2;
constexpr double NaturalSizeWeight = 4;
constexpr double NearEdgeWeight = 16;
/// A view without a natural size holds what is in it ...
constexpr float HoldingPriority = 200;
/// ... and is no larger than that, the more so the closer it is to hug it.
constexpr float SmallnessOfHugging = 20;
constexpr double Unchanged = 0.01;  // points

/// One direction of the layout; positions are absolute and count from the leading or upper edge of the root.
class AxisLayout {
 public:
  AxisLayout(View& root, LayoutAxis axis, bool mirrored)
      : root_(root), horizontal_(axis == LayoutAxis::Horizontal), axis_(axis), mirrored_(mirrored && horizontal_) {
    const Extent& all = add(root);
    fix({{all.start, 1}}, 0);
    fix({{all.size, 1}}, sizeOf(root.frame()));
    addBelow(root);
    for (const View* view : views_) addRows(*view, extents_.at(view));
  }

  /// Writes the solution into the frames.
  bool apply() {
    const std::vector<double> lengths = solver_.solve();
    if (lengths.empty()) return false;
    bool changed = false;
    for (View* view : views_) {
      if (view == &root_ || view->translatesAutoresizingMaskIntoConstraints()) continue;
      const Extent& extent = extents_.at(view);
      const auto valueOf = [&lengths](Length length) { return lengths[static_cast<std::size_t>(length)]; };
      const Extent& above = extents_.at(view->superview());
      const double size = std::max(0.0, valueOf(extent.size));
      double start = valueOf(extent.start) - valueOf(above.start);
      if (mirrored_) start = valueOf(above.size) - start - size;
      Rect frame = view->frame();
      double& origin = horizontal_ ? frame.x : frame.y;
      double& length = horizontal_ ? frame.width : frame.height;
      if (std::abs(origin - start) < Unchanged && std::abs(length - size) < Unchanged) continue;
      origin = start;
      length = size;
      view->setFrame(frame);
      changed = true;
    }
    return changed;
  }

 private:
  struct Extent {
    Length start;
    Length size;
  };

  double startOf(const Rect& frame) const { return horizontal_ ? frame.x : frame.y; }
  double sizeOf(const Rect& frame) const { return horizontal_ ? frame.width : frame.height; }

  const Extent& add(View& view) {
    views_.push_back(&view);
    return extents_.emplace(&view, Extent{solver_.addLength(), solver_.addLength()}).first->second;
  }

  void addBelow(const View& view) {
    if (dynamic_cast<const Button*>(&view)) return;  // its title is its own matter
    for (const ViewRef& part : view.subviews()) {
      add(*part);
      addBelow(*part);
    }
  }

  void row(Terms terms, LayoutRelation relation, double constant, float priority, double weight) {
    solver_.add({std::move(terms), relation, constant, priority, weight});
  }
  void fix(Terms terms, double constant) {
    row(std::move(terms), Equal, constant, LayoutPriority::Required, NearEdgeWeight);
  }

  void addRows(const View& view, const Extent& extent) {
    if (&view != &root_) {
      if (view.translatesAutoresizingMaskIntoConstraints()) {
        addFrame(view, extent);
      } else {
        row({{extent.size, 1}}, GreaterThanOrEqual, 0, LayoutPriority::Required, NearEdgeWeight);
        addNaturalSize(view, extent);
      }
    }
    for (const LayoutConstraintRef& constraint : view.constraints()) addConstraint(*constraint);
    if (const auto* stack = dynamic_cast<const StackView*>(&view)) addStack(*stack, extent);
  }

  void addFrame(const View& view, const Extent& extent) {
    const Extent& above = extents_.at(view.superview());
    fix({{extent.size, 1}}, sizeOf(view.frame()));
    if (mirrored_) {
      fix({{extent.start, 1}, {above.start, -1}, {above.size, -1}}, -view.frame().maxX());
    } else {
      fix({{extent.start, 1}, {above.start, -1}}, startOf(view.frame()));
    }
  }

  std::optional<double> naturalSize(const View& view) const {
    const Size natural = view.intrinsicContentSize();
    if (horizontal_) return natural.width == View::NoIntrinsicMetric ? std::nullopt : std::optional(natural.width);
    if (natural.height == View::NoIntrinsicMetric) return std::nullopt;
    const auto* label = dynamic_cast<const Label*>(&view);
    return label ? heightOf(*label, view.frame().width) : natural.height;
  }

  void addNaturalSize(const View& view, const Extent& extent) {
    const float hugging = view.contentHuggingPriority(axis_);
    if (const std::optional<double> natural = naturalSize(view)) {
      row({{extent.size, 1}}, GreaterThanOrEqual, *natural, view.contentCompressionResistancePriority(axis_),
          NaturalSizeWeight);
      row({{extent.size, 1}}, LessThanOrEqual, *natural, hugging, OtherWeight);
      return;
    }
    for (const ViewRef& part : view.subviews()) {
      const auto inside = extents_.find(part.get());
      if (inside == extents_.end() || part->translatesAutoresizingMaskIntoConstraints()) continue;
      row({{extent.start, 1}, {extent.size, 1}, {inside->second.start, -1}, {inside->second.size, -1}}, GreaterThanOrEqual,
          0, HoldingPriority, OtherWeight);
    }
    row({{extent.size, 1}}, LessThanOrEqual, 0, hugging / SmallnessOfHugging, OtherWeight);
  }

  /// What an attribute is in start and size; nothing when it belongs to the other axis.
  std::optional<Terms> termsOf(const View& view, LayoutAttribute attribute, double factor) const {
    const auto found = extents_.find(&view);
    if (found == extents_.end()) return std::nullopt;
    const auto& [start, size] = found->second;
    const bool nearEdge = attribute == LayoutAttribute::Leading || attribute == LayoutAttribute::Top ||
                          attribute == (mirrored_ ? LayoutAttribute::Right : LayoutAttribute::Left);
    using enum LayoutAttribute;
    const bool across = attribute == Leading || attribute == Trailing || attribute == Left || attribute == Right ||
                        attribute == CenterX || attribute == Width;
    if (across != horizontal_) return std::nullopt;
    if (attribute == Width || attribute == Height) return Terms{{size, factor}};
    if (attribute == CenterX || attribute == CenterY) return Terms{{start, factor}, {size, factor / 2}};
    return nearEdge ? Terms{{start, factor}} : Terms{{start, factor}, {size, factor}};
  }

  void addConstraint(const LayoutConstraint& constraint) {
    if (!constraint.firstItem()) return;
    std::optional<Terms> terms = termsOf(*constraint.firstItem(), constraint.firstAttribute(), 1);
    if (!terms) return;
    if (constraint.secondItem()) {
      const std::optional<Terms> other =
          termsOf(*constraint.secondItem(), constraint.secondAttribute(), -constraint.multiplier());
      if (!other) return;
      terms->insert(terms->end(), other->begin(), other->end());
    }
    const LayoutAttribute first = constraint.firstAttribute();
    const bool isSize = first == LayoutAttribute::Width || first == LayoutAttribute::Height;
    // Right to left a positive distance to the right is one against the reading direction.
    const bool fromLeft =
        first == LayoutAttribute::Left || first == LayoutAttribute::Right || first == LayoutAttribute::CenterX;
    const bool turned = mirrored_ && !isSize && fromLeft;
    LayoutRelation relation = constraint.relation();
    if (turned && relation != Equal) relation = relation == LessThanOrEqual ? GreaterThanOrEqual : LessThanOrEqual;
    const bool farEdge = first == LayoutAttribute::Bottom || first == LayoutAttribute::Trailing;
    row(std::move(*terms), relation, turned ? -constraint.constant() : constraint.constant(), constraint.priority(),
        farEdge ? farEdgeWeightIn(*constraint.firstItem()) : OtherWeight);
  }

  double farEdgeWeightIn(const View& view) const {
    int depth = 0;
    for (const View* each = &view; each && each != &root_; each = each->superview()) ++depth;
    return std::min(FarEdgeWeight + depth * FarEdgeWeightOfDepth, OtherWeight);
  }

  void addStack(const StackView& stack, const Extent& extent) {
    std::vector<Extent> parts;
    for (const ViewRef& part : stack.arrangedSubviews()) {
      if (!part->hidden()) parts.push_back(extents_.at(part.get()));
    }
    if (parts.empty()) return;
    if (stack.axis() == axis_) {
      addAlong(stack, extent, parts);
    } else {
      for (const Extent& part : parts) addAcross(stack, extent, part);
    }
  }

  void addAlong(const StackView& stack, const Extent& extent, const std::vector<Extent>& parts) {
    fix({{parts.front().start, 1}, {extent.start, -1}}, 0);
    // Equal spacing lets the gaps grow, filling lets the views.
    const LayoutRelation gap = stack.distribution() == StackDistribution::EqualSpacing ? GreaterThanOrEqual : Equal;
    for (std::size_t i = 1; i < parts.size(); ++i) {
      const Extent& before = parts[i - 1];
      row({{parts[i].start, 1}, {before.start, -1}, {before.size, -1}}, gap, stack.spacing(), LayoutPriority::Required,
          NearEdgeWeight);
      if (stack.distribution() == StackDistribution::FillEqually) {
        fix({{parts[i].size, 1}, {before.size, -1}}, 0);
      } else if (gap != Equal && i > 1) {
        const Extent& first = parts[0];
        fix({{parts[i].start, 1},
             {before.start, -1},
             {before.size, -1},
             {parts[1].start, -1},
             {first.start, 1},
             {first.size, 1}},
            0);
      }
    }
    const Extent& last = parts.back();
    row({{last.start, 1}, {last.size, 1}, {extent.start, -1}, {extent.size, -1}}, Equal, 0, LayoutPriority::Required,
        farEdgeWeightIn(stack));
  }

  void addAcross(const StackView& stack, const Extent& extent, const Extent& part) {
    const StackAlignment alignment = stack.alignment();
    const Terms nearEdges = {{part.start, 1}, {extent.start, -1}};
    const Terms farEdges = {{part.start, 1}, {part.size, 1}, {extent.start, -1}, {extent.size, -1}};
    const bool atStart = alignment == StackAlignment::Fill || alignment == StackAlignment::Leading ||
                         alignment == StackAlignment::FirstBaseline;
    const bool atEnd = alignment == StackAlignment::Fill || alignment == StackAlignment::Trailing;
    row(nearEdges, atStart ? Equal : GreaterThanOrEqual, 0, LayoutPriority::Required, NearEdgeWeight);
    row(farEdges, atEnd ? Equal : LessThanOrEqual, 0, LayoutPriority::Required, farEdgeWeightIn(stack));
    if (alignment == StackAlignment::Center) {
      row({{part.start, 1}, {part.size, 0.5}, {extent.start, -1}, {extent.size, -0.5}}, Equal, 0, LayoutPriority::Required,
          OtherWeight);
    }
  }

  View& root_;
  bool horizontal_;
  LayoutAxis axis_;
  bool mirrored_;
  LayoutSolver solver_;
  std::vector<View*> views_;  // parents before their parts
  std::map<const View*, Extent> extents_;
};

}  // namespace

bool solveLayout(View& root, LayoutDirection direction) {
  // Heights of wrapped texts depend on their widths.
  const bool across = AxisLayout(root, LayoutAxis::Horizontal, direction == LayoutDirection::RightToLeft).apply();
  const bool down = AxisLayout(root, LayoutAxis::Vertical, false).apply();
  return across || down;
}

}  // namespace vaelo
