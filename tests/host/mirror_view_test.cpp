// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/pango_graphics.h"
#include "platform/ui/button.h"
#include "platform/ui/image_view.h"
#include "platform/ui/text_field.h"
#include "tests/host/list_test_folder.h"
#include "tests/host/mirror_view_fixture.h"

namespace vaelo {
namespace {

TEST_F(MirrorViewTest, WidgetsStandWhereTheLayoutPutsTheViews) {
  const auto second = addLabel("Size");
  column->setSpacing(10);
  show();
  EXPECT_EQ(root->frame().width, gtk_widget_get_width(mirror->widget()));
  ASSERT_EQ(widgets().size(), 2U);
  EXPECT_EQ(placeOf(widgets()[0]).x, 0);
  EXPECT_NEAR(placeOf(widgets()[1]).midY(), second->frame().midY(), 1);
  EXPECT_GT(second->frame().y, 10);
}

TEST_F(MirrorViewTest, RightToLeftTheColumnBeginsOnTheRight) {
  show(GTK_TEXT_DIR_RTL);
  EXPECT_NEAR(placeOf(widgets()[0]).maxX(), gtk_widget_get_width(mirror->widget()), 1);
}

TEST_F(MirrorViewTest, WhatChangesIsFollowed) {
  show();
  const double before = label->frame().width;
  label->setText("A much longer text");
  settle();
  GtkWidget* text = gtk_widget_get_first_child(widgets()[0]);
  EXPECT_STREQ(gtk_label_get_text(GTK_LABEL(text)), "A much longer text");
  EXPECT_GT(label->frame().width, before);
  const auto added = addLabel("Size");
  settle();
  ASSERT_EQ(widgets().size(), 2U);
  added->setHidden(true);
  settle();
  EXPECT_FALSE(gtk_widget_get_child_visible(widgets()[1]));
  label->removeFromSuperview();
  settle();
  EXPECT_EQ(widgets().size(), 1U);
}

TEST_F(MirrorViewTest, WidgetsKeepTheOrderOfTheViewsForTheKeyboard) {
  show();
  const auto first = std::make_shared<Label>();
  first->setText("first");
  column->insertSubview(first, 0);
  column->insertArrangedSubview(first, 0);
  settle();
  ASSERT_EQ(widgets().size(), 2U);
  EXPECT_STREQ(gtk_label_get_text(GTK_LABEL(gtk_widget_get_first_child(widgets()[0]))), "first");
}

TEST_F(MirrorViewTest, NothingIsLaidOutAgainWhenNothingChanged) {
  show();
  struct Count : ViewObserver {
    int changes = 0;
    void viewChanged(View&, ViewChange) override { ++changes; }
    void animationWillBegin(View&, const Animation&) override {}
    void animationDidEnd(View&) override {}
    void viewWillBeDestroyed(View&) override {}
  } count;
  ViewObserver* following = label->observer();
  label->setObserver(&count);
  gtk_widget_queue_resize(mirror->widget());
  settle();
  EXPECT_EQ(count.changes, 0);
  label->setObserver(following);
}

TEST_F(MirrorViewTest, WhatIsHigherThanThePageScrollsAndTellsTheModel) {
  for (int i = 0; i < 40; ++i) addLabel("row");
  show();
  const double page = gtk_adjustment_get_page_size(adjustment());
  EXPECT_GT(gtk_adjustment_get_upper(adjustment()), page);
  gtk_adjustment_set_value(adjustment(), 25);
  EXPECT_EQ(scroll->contentOffset().y, 25);
  scroll->setContentOffset({0, 40});
  settle();
  EXPECT_EQ(gtk_adjustment_get_value(adjustment()), 40);
  const double before = gtk_adjustment_get_upper(adjustment());
  scroll->setContentInset({0, 0, 200, 0});
  settle();
  EXPECT_NEAR(gtk_adjustment_get_upper(adjustment()), before + 200, 1);
}

TEST_F(MirrorViewTest, ButtonsArePressedAndFieldsAreTypedIn) {
  const auto button = std::make_shared<Button>(ButtonType::System);
  button->setTitle("Open");
  int presses = 0;
  button->addAction(ControlEvent::TouchUpInside, [&presses] { ++presses; });
  column->addArrangedSubview(button);
  const auto field = std::make_shared<TextField>();
  field->setText("Report.txt");
  column->addArrangedSubview(field);
  LayoutConstraint::makeConstant(*field, LayoutAttribute::Width, 200)->setActive(true);
  show();
  ASSERT_EQ(widgets().size(), 3U);
  g_signal_emit_by_name(widgets()[1], "clicked");
  EXPECT_EQ(presses, 1);
  EXPECT_STREQ(gtk_editable_get_text(GTK_EDITABLE(entryOf(widgets()[2]))), "Report.txt");
  gtk_editable_set_text(GTK_EDITABLE(entryOf(widgets()[2])), "New.txt");
  EXPECT_EQ(field->text(), "New.txt");
}

TEST_F(MirrorViewTest, ACentredTextIsInTheMiddleWhetherItCanBeClearedOrNot) {
  const auto field = std::make_shared<TextField>();
  field->setText("Report.txt");
  field->setClearButtonMode(ClearButtonMode::WhileEditing);
  column->addArrangedSubview(field);
  LayoutConstraint::makeConstant(*field, LayoutAttribute::Width, 200)->setActive(true);
  for (const GtkTextDirection direction : {GTK_TEXT_DIR_LTR, GTK_TEXT_DIR_RTL}) {
    field->setTextAlignment(TextAlignment::Center);
    gtk_widget_set_default_direction(direction);
    show(direction);
    GtkWidget* entry = entryOf(widgets()[1]);
    const auto fromMiddle = [entry] {
      graphene_rect_t text;
      EXPECT_TRUE(gtk_widget_compute_bounds(GTK_WIDGET(gtk_editable_get_delegate(GTK_EDITABLE(entry))), entry, &text));
      return static_cast<double>(text.origin.x + text.size.width / 2) - gtk_widget_get_width(entry) / 2.0;
    };
    field->endEditing(true);
    settle();
    EXPECT_NEAR(fromMiddle(), 0, 1);
    field->becomeFirstResponder();
    settle();
    ASSERT_NE(gtk_entry_get_icon_name(GTK_ENTRY(entry), GTK_ENTRY_ICON_SECONDARY), nullptr);
    EXPECT_NEAR(fromMiddle(), 0, 1);
    field->setTextAlignment(TextAlignment::Natural);
    settle();
    EXPECT_GT(std::abs(fromMiddle()), 5) << "it begins where the field does";
    field->endEditing(true);
    hide();
  }
  gtk_widget_set_default_direction(GTK_TEXT_DIR_LTR);
}

TEST_F(MirrorViewTest, ANameThatIsTooLongIsShortenedInItsMiddleWhileItIsNotEdited) {
  const auto field = std::make_shared<TextField>();
  field->setText("A name that is much too long for its field.txt");
  column->addArrangedSubview(field);
  LayoutConstraint::makeConstant(*field, LayoutAttribute::Width, 200)->setActive(true);
  show();
  GtkWidget* entry = entryOf(widgets()[1]);
  GtkLabel* shown = GTK_LABEL(gtk_widget_get_last_child(widgets()[1]));
  const auto editedTextIsSeen = [entry] {
    GdkRGBA color;
    gtk_style_context_get_color(gtk_widget_get_style_context(GTK_WIDGET(gtk_editable_get_delegate(GTK_EDITABLE(entry)))),
                                &color);
    return color.alpha > 0;
  };
  field->endEditing(true);
  settle();
  EXPECT_TRUE(gtk_widget_get_visible(GTK_WIDGET(shown)));
  EXPECT_EQ(gtk_label_get_text(shown), field->text());
  EXPECT_TRUE(pango_layout_is_ellipsized(gtk_label_get_layout(shown)));
  EXPECT_EQ(gtk_label_get_ellipsize(shown), PANGO_ELLIPSIZE_MIDDLE);
  EXPECT_FALSE(editedTextIsSeen());
  EXPECT_EQ(gtk_editable_get_text(GTK_EDITABLE(entry)), field->text()) << "for screen readers";
  graphene_rect_t resting;
  graphene_rect_t edited;
  ASSERT_TRUE(gtk_widget_compute_bounds(GTK_WIDGET(shown), entry, &resting));
  ASSERT_TRUE(gtk_widget_compute_bounds(GTK_WIDGET(gtk_editable_get_delegate(GTK_EDITABLE(entry))), entry, &edited));
  EXPECT_TRUE(graphene_rect_equal(&resting, &edited));
  field->becomeFirstResponder();
  settle();
  EXPECT_FALSE(gtk_widget_get_visible(GTK_WIDGET(shown)));
  EXPECT_TRUE(editedTextIsSeen());
  field->setText("Other.txt");
  field->endEditing(true);
  EXPECT_STREQ(gtk_label_get_text(shown), "Other.txt");
}

TEST_F(MirrorViewTest, TheClearButtonShowsWhileThereIsWhatItClears) {
  const auto field = std::make_shared<TextField>();
  field->setText("Report.txt");
  field->setClearButtonMode(ClearButtonMode::WhileEditing);
  column->addArrangedSubview(field);
  LayoutConstraint::makeConstant(*field, LayoutAttribute::Width, 200)->setActive(true);
  show();
  GtkWidget* entry = entryOf(widgets()[1]);
  const auto shows = [entry] { return gtk_entry_get_icon_name(GTK_ENTRY(entry), GTK_ENTRY_ICON_SECONDARY) != nullptr; };
  field->endEditing(true);
  EXPECT_FALSE(shows()) << "nothing is edited";
  field->becomeFirstResponder();
  EXPECT_TRUE(shows());
  g_signal_emit_by_name(entry, "icon-release", GTK_ENTRY_ICON_SECONDARY);
  EXPECT_EQ(field->text(), "");
  EXPECT_TRUE(field->isEditing());
  EXPECT_FALSE(shows()) << "nothing is left";
}

/// Wants to scroll for itself or not.
struct Scrolling : TextFieldDelegate {
  bool textFieldShouldScrollToVisibleWhenBecomingFirstResponder(TextField&) override { return byToolkit; }
  bool byToolkit = true;
};

TEST_F(MirrorViewTest, AFieldIsScrolledToUnlessItsScreenRefuses) {
  for (const char* text : {"Size", "Where", "Created", "Modified"}) {
    LayoutConstraint::makeConstant(*addLabel(text), LayoutAttribute::Height, 200)->setActive(true);
  }
  const auto field = std::make_shared<TextField>();
  const auto delegate = std::make_shared<Scrolling>();
  field->setDelegate(delegate);
  column->addArrangedSubview(field);
  LayoutConstraint::makeConstant(*field, LayoutAttribute::Width, 200)->setActive(true);
  show();
  ASSERT_GT(field->frame().y, 800);
  delegate->byToolkit = false;
  gtk_widget_grab_focus(entryOf(widgets().back()));
  // As many frames as the toolkit would move through.
  for (int frame = 0; frame < 20; ++frame) settle();
  EXPECT_TRUE(field->isEditing());
  EXPECT_EQ(gtk_adjustment_get_value(adjustment()), 0);
  field->resignFirstResponder();
  delegate->byToolkit = true;
  gtk_widget_grab_focus(entryOf(widgets().back()));
  EXPECT_TRUE(list_test::waitUntil([&] { return gtk_adjustment_get_value(adjustment()) > 0; }));
  EXPECT_TRUE(field->isEditing());
}

TEST_F(MirrorViewTest, SmallPicturesAreMagnifiedInSquaresAndOnlyOnce) {
  memory.screens.deviceShown.screen.scale = 1;
  const auto picture = std::make_shared<ImageView>(Rect{20, 100, 45, 45});
  picture->setMagnificationFilter(MagnificationFilter::Nearest);
  picture->setImage(PangoGraphics().renderImage({10, 10}, [](DrawingContext& context) { context.fillRect({0, 0, 5, 10}); }));
  content->addSubview(picture);
  show();
  GtkWidget* widget = widgets().back();
  EXPECT_NEAR(placeOf(widget).x, 20, 1);
  EXPECT_NEAR(placeOf(widget).width, 45, 1);
  GdkPaintable* shown = gtk_picture_get_paintable(GTK_PICTURE(widget));
  EXPECT_EQ(gdk_paintable_get_intrinsic_width(shown), 50);
  gtk_widget_queue_resize(mirror->widget());
  settle();
  EXPECT_EQ(gtk_picture_get_paintable(GTK_PICTURE(widget)), shown);
}

TEST_F(MirrorViewTest, APictureThatIsTooLargeForItsViewIsShownSmaller) {
  const auto around = std::make_shared<View>(Rect{20, 100, 60, 30});
  const auto picture = std::make_shared<ImageView>(Rect{-20, -35, 100, 100});
  picture->setImage(PangoGraphics().renderImage({10, 10}, [](DrawingContext& context) { context.fillRect({0, 0, 5, 10}); }));
  around->addSubview(picture);
  content->addSubview(around);
  show();
  const Rect shown = placeOf(widgets().back());
  EXPECT_NEAR(shown.width, 30, 1);
  EXPECT_NEAR(shown.height, 30, 1);
  EXPECT_NEAR(shown.center().x, 50, 1);
  EXPECT_NEAR(shown.center().y, 115, 1);
}

TEST_F(MirrorViewTest, AMirrorThatIsGoneLeavesTheViews) {
  show();
  gtk_window_set_child(GTK_WINDOW(window), nullptr);
  mirror.reset();
  gtk_window_destroy(GTK_WINDOW(window));
  for (const ViewRef& view : {root, ViewRef(column), ViewRef(label)}) EXPECT_EQ(view->observer(), nullptr);
  label->setText("nobody looks");
}

}  // namespace
}  // namespace vaelo
