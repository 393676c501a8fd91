// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <vector>

#include "platform/ui/signal.h"

namespace vaelo {

class View;
class LayoutConstraint;
using LayoutConstraintRef = std::shared_ptr<LayoutConstraint>;

enum class LayoutAttribute {
  NotAnAttribute,
  Left,
  Right,
  Top,
  Bottom,
  Leading,
  Trailing,
  Width,
  Height,
  CenterX,
  CenterY,
};
enum class LayoutRelation { LessThanOrEqual, Equal, GreaterThanOrEqual };
enum class LayoutAxis { Horizontal, Vertical };

namespace LayoutPriority {
inline constexpr float Required = 1000;
inline constexpr float DefaultHigh = 750;
inline constexpr float DefaultLow = 250;
}  // namespace LayoutPriority

/// first.attribute (relation) second.attribute * multiplier + constant, or a plain constant without a second item.
///
/// An active constraint is kept alive by the nearest common superview of its items (by the first item when they have none),
/// which View::constraints lists. Items aren't kept alive; one that is gone is null, and the constraint inactive. Main
/// thread.
class LayoutConstraint : public std::enable_shared_from_this<LayoutConstraint> {
 public:
  static LayoutConstraintRef make(View& first, LayoutAttribute firstAttribute, LayoutRelation relation, View* second,
                                  LayoutAttribute secondAttribute, double multiplier = 1, double constant = 0);
  /// The common form: `first.attribute == second.attribute + constant`.
  static LayoutConstraintRef makeEqual(View& first, LayoutAttribute firstAttribute, View& second,
                                       LayoutAttribute secondAttribute, double constant = 0);
  /// A fixed width or height.
  static LayoutConstraintRef makeConstant(View& first, LayoutAttribute attribute, double constant,
                                          LayoutRelation relation = LayoutRelation::Equal);
  ~LayoutConstraint();
  LayoutConstraint(const LayoutConstraint&) = delete;
  LayoutConstraint& operator=(const LayoutConstraint&) = delete;

  View* firstItem() const { return first_; }
  View* secondItem() const { return second_; }
  LayoutAttribute firstAttribute() const { return firstAttribute_; }
  LayoutAttribute secondAttribute() const { return secondAttribute_; }
  LayoutRelation relation() const { return relation_; }
  double multiplier() const { return multiplier_; }

  double constant() const { return constant_; }
  void setConstant(double constant);
  float priority() const { return priority_; }
  void setPriority(float priority);
  bool active() const { return holder_ != nullptr; }
  /// Setting the state that it has already does nothing.
  void setActive(bool active);

  static void activate(const std::vector<LayoutConstraintRef>& constraints);
  static void deactivate(const std::vector<LayoutConstraintRef>& constraints);

  /// Emitted after constant, priority or activity changed.
  Signal<LayoutConstraint&>& changed() { return changed_; }

 private:
  friend class View;
  LayoutConstraint(View& first, LayoutAttribute firstAttribute, LayoutRelation relation, View* second,
                   LayoutAttribute secondAttribute, double multiplier, double constant);
  void itemWasDestroyed(const View* item);

  View* first_;
  View* second_;
  LayoutAttribute firstAttribute_;
  LayoutAttribute secondAttribute_;
  LayoutRelation relation_;
  double multiplier_;
  double constant_;
  float priority_ = LayoutPriority::Required;
  View* holder_ = nullptr;
  Signal<LayoutConstraint&> changed_;
};

}  // namespace vaelo
