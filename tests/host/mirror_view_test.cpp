// SPDX-License-Identifier: GPL-3.0-or-later
#include <adwaita.h>
#include <gtest/gtest.h>

#include "host/gtk/mirror/view_mirror.h"
#include "host/gtk/mirrored_text.h"
#include "host/gtk/pango_graphics.h"
#include "platform/ui/button.h"
#include "platform/ui/image_view.h"
#include "platform/ui/stack_view.h"
#include "platform/ui/text_field.h"
#include "platform/ui/visual_format.h"
#include "tests/host/list_test_folder.h"
#include "tests/support/memory_platform.h"

namespace vaelo {
namespace {

/// A page as screens are: a content as high as the page in a view that scrolls, with a column of things in it.
class MirrorViewTest : public testing::Test {
 protected:
  MirrorViewTest() {
    scroll->setTranslatesAutoresizingMaskIntoConstraints(false);
    root->addSubview(scroll);
    for (const char* format : {"H:|[scroll]|", "V:|[scroll]|"}) {
      LayoutConstraint::activate(constraintsWithVisualFormat(format, {{"scroll", scroll.get()}}));
    }
    scroll->addSubview(content);
    column->setTranslatesAutoresizingMaskIntoConstraints(false);
    column->setAxis(LayoutAxis::Vertical);
    column->setAlignment(StackAlignment::Leading);
    content->addSubview(column);
    for (const char* format : {"H:|[column]|", "V:|[column]"}) {
      LayoutConstraint::activate(constraintsWithVisualFormat(format, {{"column", column.get()}}));
    }
    label->setText("Kind");
    column->addArrangedSubview(label);
  }
  ~MirrorViewTest() override {
    if (!mirror) return;
    gtk_window_set_child(GTK_WINDOW(window), nullptr);
    mirror.reset();
    gtk_window_destroy(GTK_WINDOW(window));
  }

  void show(GtkTextDirection direction = GTK_TEXT_DIR_LTR) {
    window = (adw_init(), gtk_window_new());
    mirror = std::make_unique<ViewMirror>(root);
    gtk_widget_set_direction(mirror->widget(), direction);
    gtk_window_set_child(GTK_WINDOW(window), mirror->widget());
    gtk_window_set_default_size(GTK_WINDOW(window), 360, 400);
    gtk_widget_show(window);
    settle();
  }
  void settle() {
    // Until a frame was drawn after the last change.
    bool drawn = false;
    gtk_widget_queue_draw(window);
    g_signal_connect(gtk_widget_get_frame_clock(window), "after-paint",
                     G_CALLBACK(+[](GdkFrameClock*, bool* flag) { *flag = true; }), &drawn);
    while (!drawn) g_main_context_iteration(nullptr, TRUE);
    g_signal_handlers_disconnect_by_data(gtk_widget_get_frame_clock(window), &drawn);
  }
  std::vector<GtkWidget*> widgets() {
    GtkWidget* scroller = gtk_widget_get_first_child(mirror->widget());
    GtkWidget* area = gtk_widget_get_first_child(gtk_scrolled_window_get_child(GTK_SCROLLED_WINDOW(scroller)));
    std::vector<GtkWidget*> found;
    for (GtkWidget* each = gtk_widget_get_first_child(area); each; each = gtk_widget_get_next_sibling(each)) {
      found.push_back(each);
    }
    return found;
  }
  static GtkWidget* entryOf(GtkWidget* field) { return gtk_overlay_get_child(GTK_OVERLAY(field)); }
  Rect placeOf(GtkWidget* widget) {
    graphene_rect_t bounds;
    EXPECT_TRUE(gtk_widget_compute_bounds(widget, mirror->widget(), &bounds));
    return {static_cast<double>(bounds.origin.x), static_cast<double>(bounds.origin.y),
            static_cast<double>(bounds.size.width), static_cast<double>(bounds.size.height)};
  }
  GtkAdjustment* adjustment() {
    return gtk_scrolled_window_get_vadjustment(GTK_SCROLLED_WINDOW(gtk_widget_get_first_child(mirror->widget())));
  }
  std::shared_ptr<Label> addLabel(const char* text) {
    const auto added = std::make_shared<Label>();
    added->setText(text);
    column->addArrangedSubview(added);
    return added;
  }

  MemoryPlatform memory;
  ViewRef root = std::make_shared<View>(Rect{0, 0, 100, 100});
  std::shared_ptr<ScrollView> scroll = std::make_shared<ScrollView>();
  ViewRef content = std::make_shared<View>(Rect{0, 0, 360, 400});
  std::shared_ptr<StackView> column = std::make_shared<StackView>();
  std::shared_ptr<Label> label = std::make_shared<Label>();
  GtkWidget* window = nullptr;
  std::unique_ptr<ViewMirror> mirror;
};

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
  field->setTextAlignment(TextAlignment::Center);
  column->addArrangedSubview(field);
  LayoutConstraint::makeConstant(*field, LayoutAttribute::Width, 200)->setActive(true);
  show();
  GtkWidget* entry = entryOf(widgets()[1]);
  const auto middleOfText = [entry] {
    graphene_rect_t text;
    EXPECT_TRUE(gtk_widget_compute_bounds(GTK_WIDGET(gtk_editable_get_delegate(GTK_EDITABLE(entry))), entry, &text));
    return static_cast<double>(text.origin.x + text.size.width / 2);
  };
  field->endEditing(true);
  settle();
  EXPECT_NEAR(middleOfText(), gtk_widget_get_width(entry) / 2.0, 1);
  field->becomeFirstResponder();
  settle();
  ASSERT_NE(gtk_entry_get_icon_name(GTK_ENTRY(entry), GTK_ENTRY_ICON_SECONDARY), nullptr);
  EXPECT_NEAR(middleOfText(), gtk_widget_get_width(entry) / 2.0, 1);
  field->setTextAlignment(TextAlignment::Natural);
  settle();
  EXPECT_LT(middleOfText(), gtk_widget_get_width(entry) / 2.0 - 5) << "it begins where the field does";
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

/// Letters of twice the size, for as long as it lives.
struct LargeLetters {
  LargeLetters() { set(2); }
  ~LargeLetters() { set(1); }
  static void set(int scale) {
    adw_init();
    g_object_set(gtk_settings_get_default(), "gtk-xft-dpi", scale * 96 * 1024, nullptr);
  }
};

TEST_F(MirrorViewTest, LargeLettersTakeFurtherLines) {
  label->setText("plain text document of a kind");
  show();
  GtkLabel* shown = GTK_LABEL(gtk_widget_get_first_child(widgets()[0]));
  EXPECT_FALSE(gtk_label_get_wrap(shown));
  const LargeLetters large;
  label->setText("plain text document of a kind, and more of it");
  settle();
  shown = GTK_LABEL(gtk_widget_get_first_child(widgets()[0]));
  EXPECT_TRUE(gtk_label_get_wrap(shown));
  EXPECT_EQ(gtk_label_get_lines(shown), 3);
  const double line = PangoGraphics().measure("X", label->font(), 0, 1).height;
  EXPECT_NEAR(label->frame().height, 3 * line, 2);
}

TEST_F(MirrorViewTest, APictureInATextStandsNearerToWhatFollowsIt) {
  const ImageRef dot = PangoGraphics().renderImage({10, 10}, [](DrawingContext& context) {
    context.fillRect({0, 0, 10, 10});
  });
  AttributedString tags;
  for (const char* name : {"Work ", "Holiday"}) {
    tags.appendImage(dot);
    tags.append(name);
  }
  label->setAttributedText(tags);
  show();
  GtkWidget* first = gtk_widget_get_first_child(widgets()[0]);
  GtkWidget* work = gtk_widget_get_next_sibling(first);
  GtkWidget* second = gtk_widget_get_next_sibling(work);
  EXPECT_EQ(gtk_widget_get_margin_start(first), 0);
  EXPECT_EQ(gtk_widget_get_margin_start(second), AttributedString::RoomBeforeImage);
  // The label asks for that room, so that no name is cut.
  Label words;
  words.setText("Work Holiday");
  EXPECT_EQ(label->intrinsicContentSize().width,
            words.intrinsicContentSize().width + 2 * dot->width() + AttributedString::RoomBeforeImage);
}

TEST_F(MirrorViewTest, APictureInATextIsAsFineAsTheScreenAndNoLargerForIt) {
  for (const int scale : {1, 2, 3}) {
    memory.screens.deviceShown.screen.scale = scale;
    const ImageRef dot = PangoGraphics().renderImage({10, 10}, [](DrawingContext& context) {
      context.fillRect({5, 0, 5, 10});
    });
    EXPECT_EQ(dot->width(), 10);
    GdkTexture* texture = GDK_TEXTURE(std::dynamic_pointer_cast<const GtkImageData>(dot)->paintable());
    ASSERT_EQ(gdk_texture_get_width(texture), 10 * scale);
    std::vector<guint32> pixels(static_cast<std::size_t>(100 * scale * scale));
    gdk_texture_download(texture, reinterpret_cast<guchar*>(pixels.data()), static_cast<gsize>(10 * scale) * 4);
    EXPECT_EQ(pixels[static_cast<std::size_t>(5 * scale - 1)], 0U) << "the left half is empty";
    EXPECT_NE(pixels[static_cast<std::size_t>(5 * scale)], 0U);
    MirroredText shown(*label);
    AttributedString text;
    text.appendImage(dot);
    label->setAttributedText(text);
    shown.update();
    int natural = 0;
    gtk_widget_measure(gtk_widget_get_first_child(shown.widget()), GTK_ORIENTATION_HORIZONTAL, -1, nullptr, &natural,
                       nullptr, nullptr);
    EXPECT_EQ(natural, 10);
    g_object_ref_sink(shown.widget());
    g_object_unref(shown.widget());
  }
}

TEST_F(MirrorViewTest, OfManyThingsWithPicturesTheLastAreLeftOut) {
  const ImageRef dot = PangoGraphics().renderImage({10, 10}, [](DrawingContext& context) {
    context.fillRect({0, 0, 10, 10});
  });
  AttributedString tags;
  for (int i = 0; i < 50; ++i) {
    tags.appendImage(dot);
    tags.append("Important ");
  }
  label->setAttributedText(tags);
  for (const GtkTextDirection direction : {GTK_TEXT_DIR_LTR, GTK_TEXT_DIR_RTL}) {
    gtk_widget_set_default_direction(direction);
    show(direction);
    GtkWidget* line = widgets()[0];
    const double width = gtk_widget_get_width(line);
    const double natural = [line] {
      int wanted = 0;
      gtk_widget_measure(gtk_widget_get_next_sibling(gtk_widget_get_first_child(line)), GTK_ORIENTATION_HORIZONTAL, -1,
                         nullptr, &wanted, nullptr, nullptr);
      return wanted;
    }();
    double end = direction == GTK_TEXT_DIR_RTL ? width : 0;
    int whole = 0;
    int cut = 0;
    GtkWidget* last = nullptr;
    for (GtkWidget* child = gtk_widget_get_first_child(line); child; child = gtk_widget_get_next_sibling(child)) {
      if (!gtk_widget_get_child_visible(child)) continue;
      graphene_rect_t at;
      ASSERT_TRUE(gtk_widget_compute_bounds(child, line, &at));
      const double left = static_cast<double>(at.origin.x);
      const double right = left + static_cast<double>(at.size.width);
      EXPECT_GE(left, direction == GTK_TEXT_DIR_RTL ? 0 : end);
      EXPECT_LE(right, direction == GTK_TEXT_DIR_RTL ? end : width);
      end = direction == GTK_TEXT_DIR_RTL ? left : right;
      last = child;
      if (!GTK_IS_LABEL(child)) continue;
      const bool isWhole = gtk_widget_get_width(child) >= static_cast<int>(natural);
      whole += isWhole ? 1 : 0;
      cut += isWhole ? 0 : 1;
    }
    EXPECT_GE(whole, 2);
    EXPECT_LT(whole, 10);
    EXPECT_EQ(cut, 1) << "the end of the line tells that there is more";
    EXPECT_TRUE(GTK_IS_LABEL(last)) << "no dot stands for nothing";
    gtk_window_set_child(GTK_WINDOW(window), nullptr);
    mirror.reset();
    gtk_window_destroy(GTK_WINDOW(window));
  }
  gtk_widget_set_default_direction(GTK_TEXT_DIR_LTR);
}

TEST_F(MirrorViewTest, InLargeLettersThingsWithPicturesStandBelowEachOther) {
  const LargeLetters large;
  const ImageRef dot = PangoGraphics().renderImage({10, 10}, [](DrawingContext& context) {
    context.fillRect({0, 0, 5, 10});
  });
  AttributedString tags;
  for (const char* name : {"Work ", "Holiday"}) {
    tags.appendImage(dot);
    tags.append(name);
  }
  label->setAttributedText(tags);
  show();
  GtkWidget* box = widgets()[0];
  ASSERT_EQ(gtk_orientable_get_orientation(GTK_ORIENTABLE(box)), GTK_ORIENTATION_VERTICAL);
  int lines = 0;
  for (GtkWidget* line = gtk_widget_get_first_child(box); line; line = gtk_widget_get_next_sibling(line)) {
    ++lines;
    EXPECT_TRUE(GTK_IS_PICTURE(gtk_widget_get_first_child(line)));
    EXPECT_TRUE(GTK_IS_LABEL(gtk_widget_get_last_child(line)));
  }
  EXPECT_EQ(lines, 2);
  EXPECT_NEAR(label->frame().height, 2 * label->sizeThatFits({}).height, 1);
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
