// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirror/view_mirror.h"

#include <algorithm>
#include <cmath>

#include "host/gtk/mirror/view_layout.h"
#include "platform/ui/button.h"
#include "platform/ui/image_view.h"
#include "platform/ui/text_field.h"

namespace vaelo {

namespace {

constexpr const char* MirrorKey = "vaelo-view-mirror";
/// Layout may change texts, which changes the layout; what never rests is left as it is.
constexpr int MostPasses = 4;

ViewMirror* mirrorOf(GtkWidget* widget) { return static_cast<ViewMirror*>(g_object_get_data(G_OBJECT(widget), MirrorKey)); }

LayoutDirection directionOf(GtkWidget* widget) {
  return gtk_widget_get_direction(widget) == GTK_TEXT_DIR_RTL ? LayoutDirection::RightToLeft : LayoutDirection::LeftToRight;
}

ScrollView* scrollViewIn(const View& view) {
  for (const ViewRef& part : view.subviews()) {
    if (auto* scroll = dynamic_cast<ScrollView*>(part.get())) return scroll;
    if (ScrollView* scroll = scrollViewIn(*part)) return scroll;
  }
  return nullptr;
}

bool shows(const View& view) {
  for (const View* each = &view; each; each = each->superview()) {
    if (each->hidden()) return false;
  }
  return true;
}

/// Where the view is shown, in `origin`. A picture that is too large for the view that it is in would cover what stands
/// beside that, so it comes as large as there is room for.
Rect placeOf(const View& view, const View& origin) {
  const Rect frame = view.convertRectTo(view.bounds(), origin);
  const View* around = view.superview();
  if (!around || !dynamic_cast<const ImageView*>(&view) || frame.width <= 0 || frame.height <= 0) return frame;
  const Size room = around->frame().size();
  const double scale = std::clamp(std::min(room.width / frame.width, room.height / frame.height), 0.0, 1.0);
  return frame.insetBy(frame.width * (1 - scale) / 2, frame.height * (1 - scale) / 2);
}

int least(GtkWidget* widget, GtkOrientation orientation, int across) {
  int size = 0;
  gtk_widget_measure(widget, orientation, across, &size, nullptr, nullptr, nullptr);
  return size;
}

}  // namespace

ViewMirror::ViewMirror(ViewRef root)
    : root_(std::move(root)),
      outer_(GTK_WIDGET(g_object_ref_sink(gtk_box_new(GTK_ORIENTATION_VERTICAL, 0)))),
      scroller_(gtk_scrolled_window_new()),
      area_(gtk_box_new(GTK_ORIENTATION_VERTICAL, 0)),
      adjustment_(gtk_scrolled_window_get_vadjustment(GTK_SCROLLED_WINDOW(scroller_))) {
  gtk_scrolled_window_set_policy(GTK_SCROLLED_WINDOW(scroller_), GTK_POLICY_NEVER, GTK_POLICY_AUTOMATIC);
  gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scroller_), area_);
  gtk_box_append(GTK_BOX(outer_), scroller_);
  for (GtkWidget* widget : {outer_, area_}) g_object_set_data(G_OBJECT(widget), MirrorKey, this);
  gtk_widget_set_layout_manager(
      outer_,
      gtk_custom_layout_new(
          nullptr, +[](GtkWidget*, GtkOrientation, int, int* minimum, int* natural, int*, int*) { *minimum = *natural = 0; },
          +[](GtkWidget* widget, int width, int height, int) {
            if (ViewMirror* self = mirrorOf(widget)) self->allocate(width, height);
          }));
  gtk_widget_set_layout_manager(
      area_, gtk_custom_layout_new(
                 nullptr,
                 +[](GtkWidget* widget, GtkOrientation orientation, int, int* minimum, int* natural, int*, int*) {
                   const ViewMirror* self = mirrorOf(widget);
                   *minimum = *natural = self && orientation == GTK_ORIENTATION_VERTICAL ? self->height_ : 0;
                 },
                 +[](GtkWidget* widget, int, int, int) {
                   if (ViewMirror* self = mirrorOf(widget)) self->place();
                 }));
  g_signal_connect_swapped(adjustment_, "value-changed", G_CALLBACK(+[](ViewMirror* self) { self->userScrolled(); }), this);
  GtkGesture* tap = gtk_gesture_click_new();
  g_signal_connect_swapped(tap, "released", G_CALLBACK(+[](const ViewMirror* self) { self->tapped(); }), this);
  gtk_widget_add_controller(scroller_, GTK_EVENT_CONTROLLER(tap));
  follow();
}

ViewMirror::~ViewMirror() {
  for (View* view : followed_) view->setObserver(nullptr);
  g_signal_handlers_disconnect_by_data(adjustment_, this);
  for (GtkWidget* widget : {outer_, area_}) g_object_set_data(G_OBJECT(widget), MirrorKey, nullptr);
  slots_.clear();
  g_object_unref(outer_);
}

void ViewMirror::follow() {
  stale_ = false;
  for (View* view : followed_) view->setObserver(nullptr);
  followed_.clear();
  scroll_ = scrollViewIn(*root_);
  std::vector<std::unique_ptr<Slot>> old = std::move(slots_);
  slots_.clear();
  follow(*root_, old);
  for (const std::unique_ptr<Slot>& gone : old) {
    if (gone) gtk_box_remove(GTK_BOX(area_), gone->content->widget());
  }
  GtkWidget* before = nullptr;
  for (const std::unique_ptr<Slot>& slot : slots_) {
    GtkWidget* widget = slot->content->widget();
    if (gtk_widget_get_parent(widget) == area_) {
      gtk_box_reorder_child_after(GTK_BOX(area_), widget, before);
    } else {
      gtk_box_insert_child_after(GTK_BOX(area_), widget, before);
    }
    before = widget;
  }
}

void ViewMirror::follow(View& view, std::vector<std::unique_ptr<Slot>>& old) {
  view.setObserver(this);
  followed_.push_back(&view);
  const auto known = std::find_if(old.begin(), old.end(), [&](const auto& slot) { return slot && slot->view == &view; });
  if (known != old.end()) {
    slots_.push_back(std::move(*known));
  } else if (std::unique_ptr<MirroredContent> content = makeMirroredContent(view)) {
    slots_.push_back(std::make_unique<Slot>(Slot{&view, std::move(content)}));
  }
  if (dynamic_cast<Button*>(&view)) return;
  for (const ViewRef& part : view.subviews()) follow(*part, old);
}

void ViewMirror::viewWillBeDestroyed(View& view) {
  std::erase(followed_, &view);
  const auto gone = std::find_if(slots_.begin(), slots_.end(), [&](const auto& slot) { return slot->view == &view; });
  if (gone != slots_.end()) {
    gtk_box_remove(GTK_BOX(area_), (*gone)->content->widget());
    slots_.erase(gone);
  }
  if (scroll_ == &view) scroll_ = nullptr;
}

void ViewMirror::viewChanged(View& view, ViewChange change) {
  switch (change) {
    case ViewChange::Scroll:
      if (placing_ || &view != scroll_) return;
      break;
    case ViewChange::Frame:
    case ViewChange::Layout:
    case ViewChange::Constraints:
    case ViewChange::Arrangement:
    case ViewChange::Visibility:
      break;
    case ViewChange::Subviews:
      stale_ = true;
      break;
    case ViewChange::Appearance:
    case ViewChange::Content:
    case ViewChange::Display:
    case ViewChange::Interaction:
    case ViewChange::Focus:
    case ViewChange::Selection:
    case ViewChange::Description: {
      if (auto* field = dynamic_cast<TextField*>(&view); field && change == ViewChange::Focus)
        scrollToFocusUnlessRefused(*field);
      const auto slot = std::find_if(slots_.begin(), slots_.end(), [&](const auto& each) { return each->view == &view; });
      if (slot != slots_.end()) (*slot)->content->update();
      if (change != ViewChange::Content && change != ViewChange::Appearance) return;
      break;
    }
  }
  if (placing_) {
    changed_ = changed_ || change != ViewChange::Frame;
  } else {
    gtk_widget_queue_resize(outer_);
    if (change == ViewChange::Scroll) showOffset();
  }
}

// A screen that scrolls for the keyboard itself doesn't want the toolkit to do it as well.
void ViewMirror::scrollToFocusUnlessRefused(TextField& field) {
  const auto asked = field.delegate();
  const bool refused = field.isEditing() && asked && !asked->textFieldShouldScrollToVisibleWhenBecomingFirstResponder(field);
  gtk_viewport_set_scroll_to_focus(GTK_VIEWPORT(gtk_scrolled_window_get_child(GTK_SCROLLED_WINDOW(scroller_))), !refused);
}

void ViewMirror::allocate(int width, int height) {
  placing_ = true;
  root_->setFrame({0, 0, static_cast<double>(width), static_cast<double>(height)});
  layOut();
  for (const std::unique_ptr<Slot>& slot : slots_) {
    // It depends on its size how a picture is shown.
    if (dynamic_cast<ImageView*>(slot->view)) slot->content->update();
  }
  if (const int needed = contentHeight(); needed != height_) {
    height_ = needed;
    gtk_widget_queue_resize(area_);
  }
  const GtkAllocation all = {0, 0, width, height};
  gtk_widget_size_allocate(scroller_, &all, -1);
  placing_ = false;
  if (stale_) gtk_widget_queue_resize(outer_);
}

void ViewMirror::layOut() {
  for (int pass = 0; pass < MostPasses; ++pass) {
    changed_ = false;
    root_->layoutIfNeeded();
    if (stale_) follow();
    const bool moved = solveLayout(*root_, directionOf(outer_));
    if (!moved && !changed_) return;
    // What lays out its parts by hand does so when they were given other frames, too.
    for (View* view : followed_) {
      if (moved && !view->subviews().empty()) view->setNeedsLayout();
    }
    changed_ = false;
    root_->layoutIfNeeded();
    if (!changed_) return;
  }
}

int ViewMirror::contentHeight() const {
  if (!scroll_) return 0;
  double deepest = scroll_->contentSize().height;
  for (const std::unique_ptr<Slot>& slot : slots_) {
    if (shows(*slot->view)) deepest = std::max(deepest, slot->view->convertRectTo(slot->view->bounds(), *scroll_).maxY());
  }
  return static_cast<int>(std::ceil(deepest + std::max(0.0, scroll_->contentInset().bottom) - 0.01));
}

void ViewMirror::place() {
  for (const std::unique_ptr<Slot>& slot : slots_) place(*slot);
}

void ViewMirror::place(Slot& slot) {
  GtkWidget* widget = slot.content->widget();
  gtk_widget_set_child_visible(widget, shows(*slot.view));
  const View& origin = scroll_ ? *scroll_ : *root_;
  const Rect frame = placeOf(*slot.view, origin);
  const auto room = [](double length, int needed) { return std::max(needed, static_cast<int>(std::ceil(length - 0.01))); };
  const int width = room(frame.width, least(widget, GTK_ORIENTATION_HORIZONTAL, -1));
  const int height = room(frame.height, least(widget, GTK_ORIENTATION_VERTICAL, width));
  // What needs more than its frame keeps the middle of it.
  const GtkAllocation at = {static_cast<int>(std::floor(frame.center().x - width / 2.0 + 0.5)),
                            static_cast<int>(std::floor(frame.center().y - height / 2.0 + 0.5)), width, height};
  gtk_widget_size_allocate(widget, &at, -1);
}

void ViewMirror::showOffset() {
  if (scroll_) gtk_adjustment_set_value(adjustment_, scroll_->contentOffset().y);
}

void ViewMirror::userScrolled() {
  if (!scroll_ || placing_) return;
  placing_ = true;
  scroll_->setContentOffset({0, gtk_adjustment_get_value(adjustment_)});
  placing_ = false;
}

void ViewMirror::tapped() const {
  const ViewRef kept = root_;
  const auto recognizers = root_->gestureRecognizers();
  for (const TapGestureRecognizerRef& recognizer : recognizers) recognizer->recognize();
}

}  // namespace vaelo
