// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "host/gtk/mirror/layout_solver.h"
#include "host/gtk/mirror/view_layout.h"
#include "platform/ui/label.h"
#include "platform/ui/stack_view.h"
#include "platform/ui/visual_format.h"

namespace vaelo {
namespace {

using enum LayoutAttribute;
using enum LayoutRelation;
using Solver = LayoutSolver;

void add(Solver& solver, Solver::Length length, LayoutRelation relation, double constant, float priority) {
  solver.add({{{length, 1}}, relation, constant, priority});
}

TEST(LayoutSolverTest, WhatContradictsAHigherPriorityGivesWayAsLittleAsItCan) {
  Solver solver;
  const Solver::Length width = solver.addLength();
  add(solver, width, LessThanOrEqual, 100, 1000);
  add(solver, width, GreaterThanOrEqual, 300, 750);
  add(solver, width, Equal, 20, 250);
  ASSERT_EQ(solver.solve().size(), 1U);
  EXPECT_NEAR(solver.solve()[0], 100, 1e-6);
}

TEST(LayoutSolverTest, AtOnePriorityTheHeavierOneHolds) {
  Solver solver;
  const Solver::Length width = solver.addLength();
  solver.add({{{width, 1}}, Equal, 10, 1000, 1});
  solver.add({{{width, 1}}, Equal, 70, 1000, 2});
  EXPECT_NEAR(solver.solve().at(0), 70, 1e-6);
}

TEST(LayoutSolverTest, LengthsMayBeNegativeAndStandTwiceInARow) {
  Solver solver;
  const Solver::Length start = solver.addLength();
  solver.add({{{start, 1}, {start, 1}}, Equal, -50, 1000});
  EXPECT_NEAR(solver.solve().at(0), -25, 1e-6);
}

TEST(LayoutSolverTest, WithoutAnyRowThereIsStillAnAnswer) {
  Solver solver;
  solver.addLength();
  EXPECT_EQ(solver.solve().size(), 1U);
}

/// A view with a natural size.
class SizedView : public View {
 public:
  SizedView(double width, double height) : size_{width, height} { setTranslatesAutoresizingMaskIntoConstraints(false); }
  Size intrinsicContentSize() const override { return size_; }

 private:
  Size size_;
};

class ViewLayoutTest : public testing::Test {
 protected:
  std::shared_ptr<SizedView> block(double width, double height) {
    const auto made = std::make_shared<SizedView>(width, height);
    root->addSubview(made);
    return made;
  }
  std::shared_ptr<StackView> stack(LayoutAxis axis, StackAlignment alignment, StackDistribution distribution) {
    const auto made = std::make_shared<StackView>();
    made->setTranslatesAutoresizingMaskIntoConstraints(false);
    made->setAxis(axis);
    made->setAlignment(alignment);
    made->setDistribution(distribution);
    made->setSpacing(10);
    root->addSubview(made);
    return made;
  }
  void pin(View& view, const char* across, const char* down) {
    for (const char* format : {across, down})
      LayoutConstraint::activate(constraintsWithVisualFormat(format, {{"view", &view}}));
  }
  void fill(View& view) { pin(view, "H:|[view]|", "V:|[view]|"); }
  bool solve(LayoutDirection direction = LayoutDirection::LeftToRight) { return solveLayout(*root, direction); }
  static void expectFrame(const View& view, const Rect& frame) {
    EXPECT_NEAR(view.frame().x, frame.x, 1e-3);
    EXPECT_NEAR(view.frame().y, frame.y, 1e-3);
    EXPECT_NEAR(view.frame().width, frame.width, 1e-3);
    EXPECT_NEAR(view.frame().height, frame.height, 1e-3);
  }

  ViewRef root = std::make_shared<View>(Rect{0, 0, 400, 300});
};

TEST_F(ViewLayoutTest, AViewIsPlacedByItsConstraintsAndItsNaturalSize) {
  const auto view = block(100, 40);
  pin(*view, "H:|-20-[view]", "V:[view]-30-|");
  EXPECT_TRUE(solve());
  expectFrame(*view, {20, 230, 100, 40});
  EXPECT_FALSE(solve());
}

TEST_F(ViewLayoutTest, RightToLeftTheLeadingEdgeIsTheRightOne) {
  const auto leading = block(100, 40);
  const auto left = block(100, 40);
  pin(*leading, "H:|-20-[view]", "V:|[view]");
  LayoutConstraint::activate(
      {LayoutConstraint::makeEqual(*left, Left, *root, Left, 5), LayoutConstraint::makeEqual(*left, Top, *root, Top)});
  solve(LayoutDirection::RightToLeft);
  expectFrame(*leading, {280, 0, 100, 40});
  expectFrame(*left, {5, 0, 100, 40});
}

TEST_F(ViewLayoutTest, FramesOfTheirOwnAreKeptInBothDirections) {
  const auto fixed = std::make_shared<View>(Rect{10, 20, 300, 200});
  root->addSubview(fixed);
  const auto inside = std::make_shared<SizedView>(50, 50);
  fixed->addSubview(inside);
  pin(*inside, "H:|[view]", "V:|[view]");
  solve();
  expectFrame(*inside, {0, 0, 50, 50});
  solve(LayoutDirection::RightToLeft);
  expectFrame(*fixed, {10, 20, 300, 200});
  expectFrame(*inside, {250, 0, 50, 50});
}

TEST_F(ViewLayoutTest, TheOneThatResistsLessIsCompressed) {
  const auto name = block(300, 20);
  const auto value = block(300, 20);
  value->setContentCompressionResistancePriority(LayoutPriority::DefaultLow, LayoutAxis::Horizontal);
  LayoutConstraint::activate(
      constraintsWithVisualFormat("H:|[name]-10-[value]|", {{"name", name.get()}, {"value", value.get()}}));
  solve();
  EXPECT_NEAR(name->frame().width, 300, 1e-3);
  EXPECT_NEAR(value->frame().width, 90, 1e-3);
}

TEST_F(ViewLayoutTest, TheOneThatHugsLessGrows) {
  const auto name = block(50, 20);
  const auto value = block(60, 20);
  name->setContentHuggingPriority(251, LayoutAxis::Horizontal);
  LayoutConstraint::activate(
      constraintsWithVisualFormat("H:|[name]-10-[value]|", {{"name", name.get()}, {"value", value.get()}}));
  solve();
  EXPECT_NEAR(name->frame().width, 50, 1e-3);
  EXPECT_NEAR(value->frame().width, 340, 1e-3);
}

TEST_F(ViewLayoutTest, AStackThatFillsGivesTheRestToWhatHugsLeast) {
  const auto column = stack(LayoutAxis::Vertical, StackAlignment::Fill, StackDistribution::Fill);
  fill(*column);
  const auto large = std::make_shared<View>();
  const auto facts = std::make_shared<StackView>();
  facts->setAxis(LayoutAxis::Vertical);
  facts->setContentHuggingPriority(LayoutPriority::Required, LayoutAxis::Vertical);
  large->setContentHuggingPriority(249, LayoutAxis::Vertical);
  column->addArrangedSubview(large);
  column->addArrangedSubview(facts);
  facts->addArrangedSubview(std::make_shared<SizedView>(80, 30));
  facts->addArrangedSubview(std::make_shared<SizedView>(60, 20));
  solve();
  expectFrame(*large, {0, 0, 400, 240});
  expectFrame(*facts, {0, 250, 400, 50});
  expectFrame(*facts->arrangedSubviews()[1], {0, 30, 400, 20});
}

TEST_F(ViewLayoutTest, EqualPartsLeaveOutWhatIsHidden) {
  const auto row = stack(LayoutAxis::Horizontal, StackAlignment::Center, StackDistribution::FillEqually);
  fill(*row);
  const auto first = std::make_shared<SizedView>(10, 30);
  const auto gone = std::make_shared<SizedView>(10, 30);
  const auto second = std::make_shared<SizedView>(90, 50);
  for (const auto& part : {first, gone, second}) row->addArrangedSubview(part);
  gone->setHidden(true);
  solve();
  expectFrame(*first, {0, 135, 195, 30});
  expectFrame(*second, {205, 125, 195, 50});
}

TEST_F(ViewLayoutTest, EqualSpacingLetsTheGapsGrow) {
  const auto row = stack(LayoutAxis::Horizontal, StackAlignment::Trailing, StackDistribution::EqualSpacing);
  fill(*row);
  for (int i = 0; i < 3; ++i) row->addArrangedSubview(std::make_shared<SizedView>(100, 30));
  solve();
  expectFrame(*row->arrangedSubviews()[1], {150, 270, 100, 30});
  expectFrame(*row->arrangedSubviews()[2], {300, 270, 100, 30});
}

TEST_F(ViewLayoutTest, AStackIsAsLargeAsWhatItHolds) {
  const auto column = stack(LayoutAxis::Vertical, StackAlignment::Leading, StackDistribution::Fill);
  pin(*column, "H:|-5-[view]", "V:|-5-[view]");
  column->addArrangedSubview(std::make_shared<SizedView>(80, 30));
  column->addArrangedSubview(std::make_shared<SizedView>(120, 20));
  solve();
  expectFrame(*column, {5, 5, 120, 60});
  expectFrame(*column->arrangedSubviews()[0], {0, 0, 80, 30});
}

TEST_F(ViewLayoutTest, WhereThereIsTooLittleRoomTheFarEdgeGivesWay) {
  const auto column = stack(LayoutAxis::Vertical, StackAlignment::Center, StackDistribution::Fill);
  fill(*column);
  for (int i = 0; i < 2; ++i) {
    const auto part = std::make_shared<SizedView>(50, 200);
    part->setContentCompressionResistancePriority(LayoutPriority::Required, LayoutAxis::Vertical);
    column->addArrangedSubview(part);
  }
  solve();
  expectFrame(*column->arrangedSubviews()[0], {175, 0, 50, 200});
  expectFrame(*column->arrangedSubviews()[1], {175, 210, 50, 200});
}

TEST_F(ViewLayoutTest, WhatIsInAStackWithTooLittleRoomStaysInIt) {
  const auto column = stack(LayoutAxis::Vertical, StackAlignment::Center, StackDistribution::Fill);
  fill(*column);
  const auto inner = stack(LayoutAxis::Vertical, StackAlignment::Center, StackDistribution::Fill);
  inner->removeFromSuperview();
  column->addArrangedSubview(inner);
  for (StackView* place : {inner.get(), inner.get(), column.get()}) {
    const auto part = std::make_shared<SizedView>(50, 200);
    part->setContentCompressionResistancePriority(LayoutPriority::Required, LayoutAxis::Vertical);
    place->addArrangedSubview(part);
  }
  solve();
  EXPECT_NEAR(inner->frame().height, 410, 1e-3);
  EXPECT_NEAR(column->arrangedSubviews()[1]->frame().y, 420, 1e-3);
}

TEST_F(ViewLayoutTest, CentresStandWhereTheRelationSays) {
  const auto view = block(100, 40);
  LayoutConstraint::activate({LayoutConstraint::makeEqual(*view, CenterX, *root, CenterX, 10),
                              LayoutConstraint::makeEqual(*view, CenterY, *root, CenterY)});
  solve();
  expectFrame(*view, {160, 130, 100, 40});
  solve(LayoutDirection::RightToLeft);
  expectFrame(*view, {160, 130, 100, 40});
}

}  // namespace
}  // namespace vaelo
