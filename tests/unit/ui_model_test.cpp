// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "platform/ui/bar_button_item.h"
#include "platform/ui/control.h"
#include "platform/ui/keyboard_notice.h"
#include "platform/ui/stack_view.h"
#include "platform/ui/text_field.h"
#include "platform/ui/visual_format.h"

namespace vaelo {
namespace {

using testing::ElementsAre;

class Recorder : public ViewObserver {
 public:
  void viewChanged(View&, ViewChange change) override { changes.push_back(change); }
  void animationWillBegin(View&, const Animation&) override { animated = true; }
  void animationDidEnd(View&) override { animated = false; }
  void viewWillBeDestroyed(View&) override { destroyed = true; }
  std::vector<ViewChange> changes;
  bool animated = false;
  bool destroyed = false;
};

struct FieldDelegate : TextFieldDelegate {
  bool textFieldShouldBeginEditing(TextField&) override { return mayBegin; }
  bool textFieldShouldEndEditing(TextField& field) override {
    ++asked;
    if (resignsWhenAsked) {
      EXPECT_FALSE(field.resignFirstResponder());
    }
    return mayEnd;
  }
  void textFieldDidEndEditing(TextField&) override { ++ended; }
  bool textFieldShouldChangeCharactersInRangeReplacementString(TextField&, const TextRange& range,
                                                               const std::string& replacement) override {
    lastRange = range;
    lastReplacement = replacement;
    return replacement != "\n";
  }
  bool textFieldShouldReturn(TextField&) override { return ++returns > 0; }
  bool mayBegin = true;
  bool mayEnd = true;
  bool resignsWhenAsked = false;
  int asked = 0;
  int ended = 0;
  int returns = 0;
  TextRange lastRange;
  std::string lastReplacement;
};

TEST(ViewTest, ConstructorsMayBuildATreeAndAParentThatGoesLeavesNoDanglingSuperview) {
  struct Composite : View {
    Composite() { addSubview(inner); }
    ViewRef inner = std::make_shared<View>();
  };
  auto composite = std::make_shared<Composite>();
  const ViewRef inner = composite->inner;
  EXPECT_EQ(inner->superview(), composite.get());
  composite.reset();
  EXPECT_EQ(inner->superview(), nullptr);
}

TEST(ViewTest, TellsItsObserverOncePerRealChange) {
  Recorder recorder;
  {
    auto view = std::make_shared<View>();
    view->setObserver(&recorder);
    view->setHidden(true);
    view->setHidden(true);
    view->setFrame({0, 0, 10, 10});
    view->applyLayoutFrame({0, 0, 20, 20});
    EXPECT_THAT(recorder.changes, ElementsAre(ViewChange::Visibility, ViewChange::Frame));
    bool inside = false;
    view->animate({}, [&] { inside = recorder.animated; });
    EXPECT_TRUE(inside);
    EXPECT_FALSE(recorder.animated);
  }
  EXPECT_TRUE(recorder.destroyed);
}

TEST(ViewTest, FlexibleSubviewsFollowTheSizeOfTheirSuperview) {
  View outer({0, 0, 100, 100});
  auto wide = std::make_shared<View>(Rect{10, 10, 80, 20});
  wide->setAutoresizingMask(FlexibleWidth | FlexibleTopMargin);
  outer.addSubview(wide);
  outer.setFrame({0, 0, 150, 130});
  EXPECT_EQ(wide->frame(), (Rect{10, 40, 130, 20}));
}

TEST(ViewTest, ConvertsBetweenSiblings) {
  View root({0, 0, 100, 100});
  auto left = std::make_shared<View>(Rect{10, 20, 30, 30});
  auto right = std::make_shared<View>(Rect{50, 5, 30, 30});
  root.addSubview(left);
  root.addSubview(right);
  EXPECT_EQ(left->convertRectTo({1, 1, 2, 2}, *right), (Rect{-39, 16, 2, 2}));
}

TEST(LayoutConstraintTest, LivesInTheCommonSuperviewWhileActive) {
  View root;
  auto a = std::make_shared<View>();
  auto b = std::make_shared<View>();
  root.addSubview(a);
  root.addSubview(b);
  auto gap = LayoutConstraint::makeEqual(*b, LayoutAttribute::Leading, *a, LayoutAttribute::Trailing, 10);
  EXPECT_FALSE(gap->active());
  gap->setActive(true);
  EXPECT_THAT(root.constraints(), ElementsAre(gap));
  int told = 0;
  const auto token = gap->changed().connect([&](LayoutConstraint&) { ++told; });
  gap->setConstant(20);
  gap->setConstant(20);
  EXPECT_EQ(told, 1);
  b->removeFromSuperview();
  EXPECT_FALSE(gap->active());
  EXPECT_TRUE(root.constraints().empty());
}

TEST(LayoutConstraintTest, AnItemThatGoesMakesItInactive) {
  View root;
  auto child = std::make_shared<View>();
  root.addSubview(child);
  auto edge = LayoutConstraint::makeEqual(*child, LayoutAttribute::Top, root, LayoutAttribute::Top);
  auto height = LayoutConstraint::makeConstant(*child, LayoutAttribute::Height, 30);
  LayoutConstraint::activate({edge, height});
  child->removeFromSuperview();
  EXPECT_TRUE(height->active());
  child.reset();
  EXPECT_EQ(height->firstItem(), nullptr);
  EXPECT_FALSE(height->active());
  edge->setActive(true);
  EXPECT_FALSE(edge->active());
}

class VisualFormatTest : public testing::Test {
 protected:
  VisualFormatTest() {
    root.addSubview(a);
    root.addSubview(b);
  }
  View root;
  ViewRef a = std::make_shared<View>();
  ViewRef b = std::make_shared<View>();
  VisualFormatBindings bindings{{"a", a.get()}, {"_b", b.get()}};
};

TEST_F(VisualFormatTest, ARowWithAGapBetweenTheEdges) {
  const auto made = constraintsWithVisualFormat("H:|[a]-10-[_b]|", bindings);
  ASSERT_EQ(made.size(), 3u);
  EXPECT_EQ(made[0]->firstItem(), a.get());
  EXPECT_EQ(made[0]->secondItem(), &root);
  EXPECT_EQ(made[0]->firstAttribute(), LayoutAttribute::Leading);
  EXPECT_EQ(made[0]->constant(), 0);
  EXPECT_EQ(made[1]->firstItem(), b.get());
  EXPECT_EQ(made[1]->firstAttribute(), LayoutAttribute::Leading);
  EXPECT_EQ(made[1]->secondItem(), a.get());
  EXPECT_EQ(made[1]->secondAttribute(), LayoutAttribute::Trailing);
  EXPECT_EQ(made[1]->constant(), 10);
  EXPECT_EQ(made[2]->firstItem(), &root);
  EXPECT_EQ(made[2]->secondItem(), b.get());
  EXPECT_EQ(made[2]->firstAttribute(), LayoutAttribute::Trailing);
  EXPECT_FALSE(made[0]->active());
}

TEST_F(VisualFormatTest, OneEdgeVertically) {
  const auto made = constraintsWithVisualFormat("V:|[a]", bindings);
  ASSERT_EQ(made.size(), 1u);
  EXPECT_EQ(made[0]->firstAttribute(), LayoutAttribute::Top);
}

TEST_F(VisualFormatTest, SizesWithRelationAndPriority) {
  const auto equal = constraintsWithVisualFormat("[a(==_b)]", bindings);
  ASSERT_EQ(equal.size(), 1u);
  EXPECT_EQ(equal[0]->firstAttribute(), LayoutAttribute::Width);
  EXPECT_EQ(equal[0]->secondItem(), b.get());
  EXPECT_EQ(equal[0]->secondAttribute(), LayoutAttribute::Width);
  const auto list = constraintsWithVisualFormat("V:[a(>=20,<=40@750)]-[_b]", bindings);
  ASSERT_EQ(list.size(), 3u);
  EXPECT_EQ(list[0]->relation(), LayoutRelation::GreaterThanOrEqual);
  EXPECT_EQ(list[1]->constant(), 40);
  EXPECT_EQ(list[1]->priority(), 750);
  EXPECT_EQ(list[2]->constant(), 8);
}

TEST_F(VisualFormatTest, AnythingElseGivesNothing) {
  for (const char* format : {"", "H:", "[a", "[a]]", "[missing]", "[a]-10[_b]", "|[a]|x", "[a(==)]", "[a]-(10-[_b]", "a"}) {
    EXPECT_TRUE(constraintsWithVisualFormat(format, bindings).empty()) << format;
  }
  View lonely;
  EXPECT_TRUE(constraintsWithVisualFormat("|[x]", {{"x", &lonely}}).empty());
}

TEST(StackViewTest, AViewThatLeavesTheTreeLeavesTheRow) {
  StackView stack;
  auto row = std::make_shared<View>();
  auto other = std::make_shared<View>();
  stack.addArrangedSubview(row);
  stack.insertArrangedSubview(other, 0);
  EXPECT_THAT(stack.arrangedSubviews(), ElementsAre(other, row));
  EXPECT_FALSE(row->translatesAutoresizingMaskIntoConstraints());
  stack.removeArrangedSubview(other);
  EXPECT_EQ(other->superview(), &stack);
  row->removeFromSuperview();
  EXPECT_TRUE(stack.arrangedSubviews().empty());
}

class TextFieldTest : public testing::Test {
 protected:
  TextFieldTest() { field->setDelegate(delegate); }
  std::shared_ptr<TextField> field = std::make_shared<TextField>();
  std::shared_ptr<FieldDelegate> delegate = std::make_shared<FieldDelegate>();
};

TEST_F(TextFieldTest, OffsetsCountCharactersNotBytes) {
  field->setText("äö.pdf");
  EXPECT_EQ(field->selectedRange(), (TextRange{6, 0}));
  EXPECT_TRUE(field->userReplace({1, 1}, "ü"));
  EXPECT_EQ(field->text(), "äü.pdf");
  EXPECT_EQ(field->selectedRange(), (TextRange{2, 0}));
}

TEST_F(TextFieldTest, AWholeNewTextAsksAboutWhatDiffersOnly) {
  field->setText("aäb");
  int told = 0;
  field->addAction(ControlEvent::EditingChanged, [&] { ++told; });
  // ä and ö share their first byte.
  EXPECT_TRUE(field->userSetText("aöb"));
  EXPECT_EQ(delegate->lastRange, (TextRange{1, 1}));
  EXPECT_EQ(delegate->lastReplacement, "ö");
  EXPECT_EQ(field->text(), "aöb");
  EXPECT_TRUE(field->userSetText("aöb"));
  EXPECT_EQ(told, 1);
}

TEST_F(TextFieldTest, ARefusedReplacementChangesNothing) {
  field->setText("name");
  EXPECT_FALSE(field->userReplace({4, 0}, "\n"));
  EXPECT_EQ(field->text(), "name");
}

TEST_F(TextFieldTest, TheDelegateKeepsTheFieldInEditingUnlessForced) {
  EXPECT_TRUE(field->becomeFirstResponder());
  delegate->mayEnd = false;
  EXPECT_FALSE(field->resignFirstResponder());
  EXPECT_TRUE(field->isEditing());
  EXPECT_TRUE(field->endEditing(true));
  EXPECT_FALSE(field->isEditing());
  EXPECT_EQ(delegate->ended, 1);
}

// An alert that the delegate shows takes the focus, and the widget then asks to resign in the middle of the question.
TEST_F(TextFieldTest, AskingAgainWhileBeingAskedIsRefused) {
  field->becomeFirstResponder();
  delegate->resignsWhenAsked = true;
  EXPECT_TRUE(field->resignFirstResponder());
  EXPECT_EQ(delegate->asked, 1);
}

TEST_F(TextFieldTest, OnlyOneFieldOfAScreenIsEdited) {
  View root;
  auto other = std::make_shared<TextField>();
  root.addSubview(field);
  root.addSubview(other);
  field->becomeFirstResponder();
  delegate->mayEnd = false;
  EXPECT_FALSE(other->becomeFirstResponder());
  delegate->mayEnd = true;
  EXPECT_TRUE(other->becomeFirstResponder());
  EXPECT_FALSE(field->isEditing());
}

TEST_F(TextFieldTest, ADisabledReturnKeyDoesNotAskTheDelegate) {
  field->setEnablesReturnKeyAutomatically(true);
  EXPECT_FALSE(field->pressReturn());
  field->setText("x");
  EXPECT_TRUE(field->pressReturn());
  field->setReturnKeyEnabled(false);
  EXPECT_FALSE(field->pressReturn());
  EXPECT_EQ(delegate->returns, 1);
}

TEST(BarButtonItemTest, DisabledItemsAreNotPressed) {
  BarButtonItemRef sender;
  const auto item = BarButtonItem::system(SystemItem::Trash, [&](const BarButtonItemRef& from) { sender = from; });
  item->setEnabled(false);
  item->press();
  EXPECT_EQ(sender, nullptr);
  item->setEnabled(true);
  item->press();
  EXPECT_EQ(sender, item);
}

TEST(BarButtonItemTest, AControlInsideIsPressedAndFollowsTheItem) {
  auto control = std::make_shared<Control>();
  int pressed = 0;
  control->addAction(ControlEvent::TouchUpInside, [&] { ++pressed; });
  const auto item = BarButtonItem::withCustomView(control);
  item->press();
  item->setEnabled(false);
  item->press();
  EXPECT_EQ(pressed, 1);
  EXPECT_FALSE(control->enabled());
}

TEST(KeyboardNoticeTest, SurvivesItsTripThroughANotification) {
  const KeyboardNotice sent{{0, 700, 400, 300}, {0, 400, 400, 300}, 0.4, AnimationCurve::EaseIn};
  const KeyboardNotice got = KeyboardNotice::from({KeyboardWillShowNotification, sent.userInfo()});
  EXPECT_EQ(got.beginFrame, sent.beginFrame);
  EXPECT_EQ(got.endFrame, sent.endFrame);
  EXPECT_EQ(got.seconds, 0.4);
  EXPECT_EQ(got.curve, AnimationCurve::EaseIn);
}

TEST(SignalTest, AListenerThatIsGoneIsNotTold) {
  Signal<int> signal;
  int sum = 0;
  auto token = signal.connect([&](int value) { sum += value; });
  signal.emit(2);
  token.reset();
  signal.emit(5);
  EXPECT_EQ(sum, 2);
}

}  // namespace
}  // namespace vaelo
