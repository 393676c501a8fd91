// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirror/view_mirror.h"

#include <algorithm>

#include "host/gtk/mirror/mirror_area.h"
#include "platform/ui/button.h"

namespace vaelo {

namespace {

constexpr int MostPasses = 6;

/// What a view shows is shown by its own widget; a button draws its title itself.
bool showsItsSubviews(const View& view) { return dynamic_cast<const Button*>(&view) == nullptr; }

void collect(View& view, std::vector<View*>& found) {
  found.push_back(&view);
  if (!showsItsSubviews(view)) return;
  for (const ViewRef& subview : view.subviews()) collect(*subview, found);
}

bool isLine(const View& view) { return view.backgroundColor() == Color::barHairlineShadow(); }

}  // namespace

ViewMirror::ViewMirror(ViewRef root) : root_(std::move(root)), field_(gtk_fixed_new()) {
  area_ = GTK_WIDGET(g_object_ref_sink(makeMirrorArea(
      field_, [](gpointer self) { static_cast<ViewMirror*>(self)->allocated(); }, this)));
  gtk_widget_set_overflow(area_, GTK_OVERFLOW_HIDDEN);
  gtk_widget_set_hexpand(area_, TRUE);
  gtk_widget_set_vexpand(area_, TRUE);
  GtkGesture* click = gtk_gesture_click_new();
  g_signal_connect_swapped(
      click, "released", G_CALLBACK(+[](ViewMirror* self, int, double, double, GtkGestureClick*) { self->tapped(); }), this);
  gtk_widget_add_controller(area_, GTK_EVENT_CONTROLLER(click));
  update();
}

ViewMirror::~ViewMirror() {
  g_clear_handle_id(&idle_, g_source_remove);
  for (auto& [view, node] : nodes_) const_cast<View*>(view)->setObserver(nullptr);
  nodes_.clear();
  g_object_run_dispose(G_OBJECT(area_));
  g_object_unref(area_);
}

void ViewMirror::viewChanged(View& view, ViewChange change) {
  const auto found = nodes_.find(&view);
  if (found != nodes_.end()) found->second.changed = true;
  // What a layout changes is laid out again, but not for ever: texts that depend on their width may never agree with it.
  if (!reporting_) passes_ = 0;
  if (change != ViewChange::Layout || !reporting_) scheduleUpdate();
}

void ViewMirror::viewWillBeDestroyed(View& view) { drop(view); }

void ViewMirror::scheduleUpdate() {
  if (idle_ != 0 || passes_ >= MostPasses) return;
  // Before the frame clock lays out and draws.
  idle_ = g_idle_add_full(
      G_PRIORITY_HIGH_IDLE + 5,
      [](gpointer self) -> gboolean {
        static_cast<ViewMirror*>(self)->idle_ = 0;
        static_cast<ViewMirror*>(self)->update();
        return G_SOURCE_REMOVE;
      },
      this, nullptr);
}

void ViewMirror::update() {
  ++passes_;
  root_->layoutIfNeeded();
  std::vector<View*> present;
  collect(*root_, present);
  keepOnly(present);
  for (View* view : present) {
    if (!nodes_.contains(view)) add(*view);
    Node& node = nodes_[view];
    if (node.content && node.changed) node.content->update();
    node.changed = false;
    if (!node.slot) continue;
    gtk_widget_set_visible(node.slot, !view->hidden());
    gtk_widget_set_opacity(node.slot, view->alpha());
  }
  constrain();
}

void ViewMirror::add(View& view) {
  Node node;
  view.setObserver(this);
  node.content = makeMirroredContent(view);
  if (&view != root_.get()) {
    node.slot = makeMirrorArea(node.content ? node.content->widget() : nullptr, nullptr, nullptr);
    if (!node.content) gtk_widget_set_can_target(node.slot, FALSE);
    if (isLine(view)) gtk_widget_add_css_class(node.slot, "hairline");
    gtk_widget_set_parent(node.slot, field_);
  }
  nodes_[&view] = std::move(node);
}

void ViewMirror::drop(View& view) {
  const auto found = nodes_.find(&view);
  if (found == nodes_.end()) return;
  view.setObserver(nullptr);
  found->second.content = nullptr;
  // Constraints keep no widget alive: they go before it.
  gtk_widget_set_layout_manager(field_, nullptr);
  if (found->second.slot) gtk_widget_unparent(found->second.slot);
  nodes_.erase(found);
  scheduleUpdate();
}

void ViewMirror::keepOnly(const std::vector<View*>& present) {
  std::vector<View*> gone;
  for (const auto& [view, node] : nodes_) {
    if (std::find(present.begin(), present.end(), view) == present.end()) gone.push_back(const_cast<View*>(view));
  }
  for (View* view : gone) drop(*view);
}

bool ViewMirror::rightToLeft() const { return gtk_widget_get_direction(area_) == GTK_TEXT_DIR_RTL; }

// Children first, so that a view that lays out its content finds the frames of this layout in it.
void ViewMirror::allocated() {
  reporting_ = true;
  graphene_rect_t whole;
  graphene_rect_init(&whole, 0, 0, static_cast<float>(gtk_widget_get_width(area_)),
                     static_cast<float>(gtk_widget_get_height(area_)));
  const Rect before = root_->frame();
  if (before.width != static_cast<double>(whole.size.width) || before.height != static_cast<double>(whole.size.height)) {
    scheduleUpdate();
  }
  report(*root_, whole);
  reporting_ = false;
}

bool ViewMirror::report(View& view, const graphene_rect_t& above) {
  const auto node = nodes_.find(&view);
  if (node == nodes_.end()) return false;
  graphene_rect_t box = above;
  if (node->second.slot && !gtk_widget_compute_bounds(node->second.slot, field_, &box)) return false;
  bool moved = false;
  if (showsItsSubviews(view)) {
    const std::vector<ViewRef> subviews = view.subviews();
    for (const ViewRef& subview : subviews) moved = report(*subview, box) || moved;
  }
  const double x = static_cast<double>(node->second.slot ? box.origin.x - above.origin.x : 0);
  const double y = static_cast<double>(node->second.slot ? box.origin.y - above.origin.y : 0);
  const Rect frame = {x, y, static_cast<double>(box.size.width), static_cast<double>(box.size.height)};
  // Whoever places a view by its frame knows it already, and finer than the layout's whole pixels.
  if (node->second.slot && view.translatesAutoresizingMaskIntoConstraints()) {
    if (moved) view.setNeedsLayout();
    view.layoutIfNeeded();
    return false;
  }
  const bool changed = frame != view.frame();
  if (changed || moved) view.setNeedsLayout();
  // What several lines of text need depends on the width that they got.
  if (changed) scheduleUpdate();
  view.applyLayoutFrame(frame);
  return changed;
}

void ViewMirror::tapped() {
  const ViewRef kept = root_;
  const std::vector<TapGestureRecognizerRef> recognizers = kept->gestureRecognizers();
  for (const TapGestureRecognizerRef& recognizer : recognizers) recognizer->recognize();
}

}  // namespace vaelo
