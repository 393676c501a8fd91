// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/layout_constraint.h"

#include <algorithm>

#include "platform/ui/view.h"

namespace vaelo {

namespace {

View* commonSuperview(View& first, View* second) {
  if (!second) return &first;
  for (View* view = &first; view; view = view->superview()) {
    if (second->isDescendantOf(*view)) return view;
  }
  return &first;
}

}  // namespace

LayoutConstraint::LayoutConstraint(View& first, LayoutAttribute firstAttribute, LayoutRelation relation, View* second,
                                   LayoutAttribute secondAttribute, double multiplier, double constant)
    : first_(&first),
      second_(second),
      firstAttribute_(firstAttribute),
      secondAttribute_(secondAttribute),
      relation_(relation),
      multiplier_(multiplier),
      constant_(constant) {}

LayoutConstraint::~LayoutConstraint() = default;

LayoutConstraintRef LayoutConstraint::make(View& first, LayoutAttribute firstAttribute, LayoutRelation relation,
                                           View* second, LayoutAttribute secondAttribute, double multiplier,
                                           double constant) {
  LayoutConstraintRef made(
      new LayoutConstraint(first, firstAttribute, relation, second, secondAttribute, multiplier, constant));
  first.remember(made);
  if (second && second != &first) second->remember(made);
  return made;
}

LayoutConstraintRef LayoutConstraint::makeEqual(View& first, LayoutAttribute firstAttribute, View& second,
                                                LayoutAttribute secondAttribute, double constant) {
  return make(first, firstAttribute, LayoutRelation::Equal, &second, secondAttribute, 1, constant);
}

LayoutConstraintRef LayoutConstraint::makeConstant(View& first, LayoutAttribute attribute, double constant,
                                                   LayoutRelation relation) {
  return make(first, attribute, relation, nullptr, LayoutAttribute::NotAnAttribute, 1, constant);
}

void LayoutConstraint::setConstant(double constant) {
  if (constant_ == constant) return;
  constant_ = constant;
  changed_.emit(*this);
  if (holder_) holder_->notify(ViewChange::Constraints);
}

void LayoutConstraint::setPriority(float priority) {
  if (priority_ == priority) return;
  priority_ = priority;
  changed_.emit(*this);
  if (holder_) holder_->notify(ViewChange::Constraints);
}

void LayoutConstraint::setActive(bool active) {
  if (active == (holder_ != nullptr) || (active && !first_)) return;
  const LayoutConstraintRef self = shared_from_this();
  View* const holder = active ? commonSuperview(*first_, second_) : holder_;
  if (active) {
    holder->constraints_.push_back(self);
  } else {
    std::erase(holder->constraints_, self);
  }
  holder_ = active ? holder : nullptr;
  changed_.emit(*this);
  holder->notify(ViewChange::Constraints);
}

void LayoutConstraint::activate(const std::vector<LayoutConstraintRef>& constraints) {
  for (const LayoutConstraintRef& constraint : constraints) constraint->setActive(true);
}

void LayoutConstraint::deactivate(const std::vector<LayoutConstraintRef>& constraints) {
  for (const LayoutConstraintRef& constraint : constraints) constraint->setActive(false);
}

void LayoutConstraint::itemWasDestroyed(const View* item) {
  if (holder_) {
    std::erase(holder_->constraints_, shared_from_this());
    // A holder that is itself being destroyed has nobody left to tell.
    if (holder_ != item) holder_->notify(ViewChange::Constraints);
    holder_ = nullptr;
  }
  if (first_ == item) first_ = nullptr;
  if (second_ == item) second_ = nullptr;
  changed_.emit(*this);
}

}  // namespace vaelo
