// SPDX-License-Identifier: GPL-3.0-or-later
// How a mirror tells the toolkit's constraint layout what the views want.
#include <cmath>

#include "host/gtk/mirror/view_mirror.h"
#include "platform/ui/label.h"
#include "platform/ui/stack_view.h"

namespace vaelo {

namespace {

/// The layout weighs what can't be had at once by strength; far apart, so that many weak wishes don't outweigh a strong one.
int strengthOf(double priority) { return static_cast<int>(std::pow(10.0, 4 + priority / 200)); }

GtkConstraintAttribute attributeOf(LayoutAttribute attribute, bool rightToLeft) {
  switch (attribute) {
    case LayoutAttribute::Left:
      return GTK_CONSTRAINT_ATTRIBUTE_LEFT;
    case LayoutAttribute::Right:
      return GTK_CONSTRAINT_ATTRIBUTE_RIGHT;
    case LayoutAttribute::Top:
      return GTK_CONSTRAINT_ATTRIBUTE_TOP;
    case LayoutAttribute::Bottom:
      return GTK_CONSTRAINT_ATTRIBUTE_BOTTOM;
    case LayoutAttribute::Leading:
      return rightToLeft ? GTK_CONSTRAINT_ATTRIBUTE_RIGHT : GTK_CONSTRAINT_ATTRIBUTE_LEFT;
    case LayoutAttribute::Trailing:
      return rightToLeft ? GTK_CONSTRAINT_ATTRIBUTE_LEFT : GTK_CONSTRAINT_ATTRIBUTE_RIGHT;
    case LayoutAttribute::Width:
      return GTK_CONSTRAINT_ATTRIBUTE_WIDTH;
    case LayoutAttribute::Height:
      return GTK_CONSTRAINT_ATTRIBUTE_HEIGHT;
    case LayoutAttribute::CenterX:
      return GTK_CONSTRAINT_ATTRIBUTE_CENTER_X;
    case LayoutAttribute::CenterY:
      return GTK_CONSTRAINT_ATTRIBUTE_CENTER_Y;
    case LayoutAttribute::NotAnAttribute:
      break;
  }
  return GTK_CONSTRAINT_ATTRIBUTE_NONE;
}

GtkConstraintRelation relationOf(LayoutRelation relation) {
  if (relation == LayoutRelation::Equal) return GTK_CONSTRAINT_RELATION_EQ;
  return relation == LayoutRelation::LessThanOrEqual ? GTK_CONSTRAINT_RELATION_LE : GTK_CONSTRAINT_RELATION_GE;
}

GtkConstraintRelation opposite(GtkConstraintRelation relation) {
  if (relation == GTK_CONSTRAINT_RELATION_EQ) return relation;
  return relation == GTK_CONSTRAINT_RELATION_LE ? GTK_CONSTRAINT_RELATION_GE : GTK_CONSTRAINT_RELATION_LE;
}

bool isSide(LayoutAttribute attribute) {
  return attribute == LayoutAttribute::Leading || attribute == LayoutAttribute::Trailing;
}

/// The names of a stack's edges along its axis or across it.
struct Edges {
  LayoutAttribute begin;
  LayoutAttribute end;
  LayoutAttribute size;
  LayoutAttribute center;
};

Edges edgesOf(LayoutAxis axis) {
  using enum LayoutAttribute;
  return axis == LayoutAxis::Horizontal ? Edges{Leading, Trailing, Width, CenterX} : Edges{Top, Bottom, Height, CenterY};
}

}  // namespace

GtkConstraintTarget* ViewMirror::targetOf(const View& view) const {
  const auto found = nodes_.find(&view);
  return found == nodes_.end() || !found->second.slot ? nullptr : GTK_CONSTRAINT_TARGET(found->second.slot);
}

void ViewMirror::constrain() {
  // A new layout rather than an emptied one, whose solver keeps what it worked out.
  GtkLayoutManager* layout = gtk_constraint_layout_new();
  gtk_widget_set_layout_manager(field_, layout);
  layout_ = GTK_CONSTRAINT_LAYOUT(layout);
  for (const auto& [key, node] : nodes_) {
    View& view = *const_cast<View*>(key);
    for (const LayoutConstraintRef& constraint : view.constraints()) tie(*constraint);
    if (auto* stack = dynamic_cast<StackView*>(&view)) constrainStack(*stack);
    if (!node.slot) continue;
    if (view.translatesAutoresizingMaskIntoConstraints()) {
      constrainToFrame(view);
    } else {
      constrainToContent(view);
    }
  }
  gtk_widget_queue_resize(field_);
}

void ViewMirror::require(const View* first, GtkConstraintAttribute attribute, GtkConstraintRelation relation,
                         const View* second, GtkConstraintAttribute secondAttribute, double multiplier, double constant,
                         double priority) {
  const auto known = [this](const View* view) { return !view || nodes_.contains(view); };
  if (!first || !known(first) || !known(second)) return;
  GtkConstraintTarget* target = targetOf(*first);
  gtk_constraint_layout_add_constraint(
      layout_, second ? gtk_constraint_new(target, attribute, relation, targetOf(*second), secondAttribute, multiplier,
                                           constant, strengthOf(priority))
                      : gtk_constraint_new_constant(target, attribute, relation, constant, strengthOf(priority)));
}

// From right to left a distance inwards is one to the left.
void ViewMirror::tie(const LayoutConstraint& constraint) {
  const bool mirrored = rightToLeft() && isSide(constraint.firstAttribute());
  const GtkConstraintRelation relation = relationOf(constraint.relation());
  require(constraint.firstItem(), attributeOf(constraint.firstAttribute(), rightToLeft()),
          mirrored ? opposite(relation) : relation, constraint.secondItem(),
          attributeOf(constraint.secondAttribute(), rightToLeft()), constraint.multiplier(),
          mirrored ? -constraint.constant() : constraint.constant(), static_cast<double>(constraint.priority()));
}

void ViewMirror::constrainToFrame(View& view) {
  const View* above = view.superview();
  if (!above) return;
  const Rect& frame = view.frame();
  const auto fixed = [&](GtkConstraintAttribute attribute, double value) {
    require(&view, attribute, GTK_CONSTRAINT_RELATION_EQ, above, attribute, 1, value, LayoutPriority::Required);
  };
  fixed(GTK_CONSTRAINT_ATTRIBUTE_LEFT, frame.x);
  fixed(GTK_CONSTRAINT_ATTRIBUTE_TOP, frame.y);
  for (const auto& [attribute, size] :
       {std::pair(GTK_CONSTRAINT_ATTRIBUTE_WIDTH, frame.width), std::pair(GTK_CONSTRAINT_ATTRIBUTE_HEIGHT, frame.height)}) {
    require(&view, attribute, GTK_CONSTRAINT_RELATION_EQ, nullptr, GTK_CONSTRAINT_ATTRIBUTE_NONE, 1, size,
            LayoutPriority::Required);
  }
}

// As large as its content (hugging), and no smaller (compression resistance).
void ViewMirror::constrainToContent(View& view) {
  Size natural = view.intrinsicContentSize();
  const auto* label = dynamic_cast<const Label*>(&view);
  if (label && label->numberOfLines() != 1 && label->frame().width > 0) {
    natural.height = label->sizeThatFits({label->frame().width, 0}).height;
  }
  for (const LayoutAxis axis : {LayoutAxis::Horizontal, LayoutAxis::Vertical}) {
    const double size = axis == LayoutAxis::Horizontal ? natural.width : natural.height;
    if (size == View::NoIntrinsicMetric) continue;
    const auto attribute = axis == LayoutAxis::Horizontal ? GTK_CONSTRAINT_ATTRIBUTE_WIDTH : GTK_CONSTRAINT_ATTRIBUTE_HEIGHT;
    require(&view, attribute, GTK_CONSTRAINT_RELATION_LE, nullptr, GTK_CONSTRAINT_ATTRIBUTE_NONE, 1, size,
            static_cast<double>(view.contentHuggingPriority(axis)));
    require(&view, attribute, GTK_CONSTRAINT_RELATION_GE, nullptr, GTK_CONSTRAINT_ATTRIBUTE_NONE, 1, size,
            static_cast<double>(view.contentCompressionResistancePriority(axis)));
  }
}

void ViewMirror::constrainStack(StackView& stack) {
  const bool horizontal = stack.axis() == LayoutAxis::Horizontal;
  const Edges along = edgesOf(stack.axis());
  const Edges across = edgesOf(horizontal ? LayoutAxis::Vertical : LayoutAxis::Horizontal);
  const auto equal = [this](const View& a, LayoutAttribute edgeOfA, const View& b, LayoutAttribute edgeOfB,
                            LayoutRelation relation = LayoutRelation::Equal, double constant = 0) {
    const bool mirrored = rightToLeft() && isSide(edgeOfA);
    require(&a, attributeOf(edgeOfA, rightToLeft()), mirrored ? opposite(relationOf(relation)) : relationOf(relation), &b,
            attributeOf(edgeOfB, rightToLeft()), 1, mirrored ? -constant : constant, LayoutPriority::Required);
  };
  const View* last = nullptr;
  for (const ViewRef& arranged : stack.arrangedSubviews()) {
    if (arranged->hidden()) continue;
    const View& view = *arranged;
    if (last) {
      equal(view, along.begin, *last, along.end, LayoutRelation::Equal, stack.spacing());
      if (stack.distribution() == StackDistribution::FillEqually) equal(view, along.size, *last, along.size);
    } else {
      equal(view, along.begin, stack, along.begin);
    }
    equal(view, across.begin, stack, across.begin, LayoutRelation::GreaterThanOrEqual);
    equal(view, across.end, stack, across.end, LayoutRelation::LessThanOrEqual);
    switch (stack.alignment()) {
      case StackAlignment::Fill:
        equal(view, across.begin, stack, across.begin);
        equal(view, across.end, stack, across.end);
        break;
      case StackAlignment::Leading:
      case StackAlignment::FirstBaseline:
        equal(view, across.begin, stack, across.begin);
        break;
      case StackAlignment::Trailing:
        equal(view, across.end, stack, across.end);
        break;
      case StackAlignment::Center:
        equal(view, across.center, stack, across.center);
        break;
    }
    last = &view;
  }
  if (last) equal(*last, along.end, stack, along.end);
}

}  // namespace vaelo
