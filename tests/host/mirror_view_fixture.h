// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>
#include <gtest/gtest.h>

#include <memory>
#include <vector>

#include "host/gtk/mirror/view_mirror.h"
#include "platform/ui/label.h"
#include "platform/ui/scroll_view.h"
#include "platform/ui/stack_view.h"
#include "platform/ui/visual_format.h"
#include "tests/host/painted_frame.h"
#include "tests/support/memory_platform.h"

namespace vaelo {

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
  ~MirrorViewTest() override { hide(); }

  void hide() {
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
  void settle() { waitForFrame(window); }
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

}  // namespace vaelo
