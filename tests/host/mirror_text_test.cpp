// SPDX-License-Identifier: GPL-3.0-or-later
// Texts of a mirrored screen: in letters of each size, and with pictures in them.
#include "host/gtk/mirrored_text.h"
#include "host/gtk/pango_graphics.h"
#include "tests/host/mirror_view_fixture.h"

namespace vaelo {
namespace {

constexpr double DotSize = 10;

class MirrorTextTest : public MirrorViewTest {
 protected:
  void setTwoTags() {
    const ImageRef dot = PangoGraphics().renderImage({DotSize, DotSize}, [](DrawingContext& context) {
      context.fillRect({0, 0, DotSize, DotSize});
    });
    AttributedString tags;
    for (const char* name : {"Work ", "Holiday"}) {
      tags.appendImage(dot);
      tags.append(name);
    }
    label->setAttributedText(tags);
  }
};

/// Letters of twice the size, for as long as it lives.
struct LargeLetters {
  LargeLetters() { set(2); }
  ~LargeLetters() { set(1); }
  static void set(int scale) {
    adw_init();
    g_object_set(gtk_settings_get_default(), "gtk-xft-dpi", scale * 96 * 1024, nullptr);
  }
};

TEST_F(MirrorTextTest, LargeLettersTakeFurtherLines) {
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

TEST_F(MirrorTextTest, APictureInATextStandsNearerToWhatFollowsIt) {
  setTwoTags();
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
            words.intrinsicContentSize().width + 2 * DotSize + AttributedString::RoomBeforeImage);
}

TEST_F(MirrorTextTest, APictureInATextIsAsFineAsTheScreenAndNoLargerForIt) {
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
    g_object_unref(g_object_ref_sink(shown.widget()));
  }
}

TEST_F(MirrorTextTest, OfManyThingsWithPicturesTheLastAreLeftOut) {
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
    int natural = 0;
    gtk_widget_measure(gtk_widget_get_next_sibling(gtk_widget_get_first_child(line)), GTK_ORIENTATION_HORIZONTAL, -1,
                       nullptr, &natural, nullptr, nullptr);
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
      const bool isWhole = gtk_widget_get_width(child) >= natural;
      whole += isWhole ? 1 : 0;
      cut += isWhole ? 0 : 1;
    }
    EXPECT_GE(whole, 2);
    EXPECT_LT(whole, 10);
    EXPECT_EQ(cut, 1) << "the end of the line tells that there is more";
    EXPECT_TRUE(GTK_IS_LABEL(last)) << "no dot stands for nothing";
    hide();
  }
  gtk_widget_set_default_direction(GTK_TEXT_DIR_LTR);
}

TEST_F(MirrorTextTest, InLargeLettersThingsWithPicturesStandBelowEachOther) {
  const LargeLetters large;
  setTwoTags();
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

}  // namespace
}  // namespace vaelo
