// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/row_swipe.h"

#include <algorithm>
#include <utility>

namespace vaelo {
namespace {

constexpr unsigned SlideMilliseconds = 200;
// Edge to edge, and wide enough for a finger.
constexpr const char* ButtonStyle =
    "button.vaelo-swipe { border-radius: 0; min-width: 60px; min-height: 0; padding: 0 6px; }";

/// The buttons at the end of a row, of which as much is drawn as the row leaves free.
struct Strip {
  GtkWidget parent;
  float uncovered;
};

struct StripClass {
  GtkWidgetClass parent;
};

GtkWidgetClass* swipeParentClass() { return static_cast<GtkWidgetClass*>(g_type_class_peek(GTK_TYPE_WIDGET)); }

void measureSwipe(GtkWidget* widget, GtkOrientation orientation, int, int* minimum, int* natural, int*, int*) {
  *minimum = *natural = 0;
  // As high as the row.
  if (orientation == GTK_ORIENTATION_VERTICAL) return;
  for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
    int width = 0;
    gtk_widget_measure(child, GTK_ORIENTATION_HORIZONTAL, -1, nullptr, &width, nullptr, nullptr);
    *natural += width;
  }
  *minimum = *natural;
}

void allocate(GtkWidget* widget, int width, int height, int) {
  const bool rtl = gtk_widget_get_direction(widget) == GTK_TEXT_DIR_RTL;
  int start = 0;
  for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
    int wide = 0;
    int high = 0;
    gtk_widget_measure(child, GTK_ORIENTATION_HORIZONTAL, -1, nullptr, &wide, nullptr, nullptr);
    gtk_widget_measure(child, GTK_ORIENTATION_VERTICAL, wide, &high, nullptr, nullptr, nullptr);
    const GtkAllocation place = {rtl ? width - start - wide : start, 0, wide, std::max(high, height)};
    gtk_widget_size_allocate(child, &place, -1);
    start += wide;
  }
}

void snapshot(GtkWidget* widget, GtkSnapshot* snapshot) {
  const float uncovered = reinterpret_cast<Strip*>(widget)->uncovered;
  const auto width = static_cast<float>(gtk_widget_get_width(widget));
  const bool rtl = gtk_widget_get_direction(widget) == GTK_TEXT_DIR_RTL;
  const graphene_rect_t free =
      GRAPHENE_RECT_INIT(rtl ? 0 : width - uncovered, 0, uncovered, static_cast<float>(gtk_widget_get_height(widget)));
  gtk_snapshot_push_clip(snapshot, &free);
  swipeParentClass()->snapshot(widget, snapshot);
  gtk_snapshot_pop(snapshot);
}

void disposeSwipe(GObject* object) {
  while (GtkWidget* child = gtk_widget_get_first_child(GTK_WIDGET(object))) gtk_widget_unparent(child);
  G_OBJECT_CLASS(swipeParentClass())->dispose(object);
}

void initSwipeClass(gpointer stripClass, gpointer) {
  G_OBJECT_CLASS(stripClass)->dispose = disposeSwipe;
  auto* widgetClass = static_cast<GtkWidgetClass*>(stripClass);
  widgetClass->measure = measureSwipe;
  widgetClass->size_allocate = allocate;
  widgetClass->snapshot = snapshot;
}

GType stripGetType() {
  static const GType type = g_type_register_static_simple(GTK_TYPE_WIDGET, "VaeloRowStrip", sizeof(StripClass),
                                                          initSwipeClass, sizeof(Strip), nullptr, G_TYPE_FLAG_NONE);
  return type;
}

void addStyle(GtkWidget* button) {
  static GtkCssProvider* const provider = [] {
    GtkCssProvider* made = gtk_css_provider_new();
    gtk_css_provider_load_from_data(made, ButtonStyle, -1);
    return made;
  }();
  gtk_style_context_add_provider(gtk_widget_get_style_context(button), GTK_STYLE_PROVIDER(provider),
                                 GTK_STYLE_PROVIDER_PRIORITY_APPLICATION);
}

GtkWidget* makeButton(const RowSwipe::Button& button) {
  GtkWidget* label = gtk_label_new(button.label.c_str());
  gtk_widget_add_css_class(label, "caption");
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 2);
  gtk_widget_set_valign(box, GTK_ALIGN_CENTER);
  gtk_box_append(GTK_BOX(box), gtk_image_new_from_icon_name(button.icon));
  gtk_box_append(GTK_BOX(box), label);
  GtkWidget* made = gtk_button_new();
  gtk_button_set_child(GTK_BUTTON(made), box);
  gtk_widget_add_css_class(made, "vaelo-swipe");
  if (button.style) gtk_widget_add_css_class(made, button.style);
  addStyle(made);
  gtk_widget_set_focus_on_click(made, FALSE);
  gtk_accessible_update_property(GTK_ACCESSIBLE(made), GTK_ACCESSIBLE_PROPERTY_LABEL, button.label.c_str(), -1);
  return made;
}

}  // namespace

RowSwipe::RowSwipe(GtkWidget* scroller, RowContext& context, Offers offers)
    : scroller_(scroller),
      context_(context),
      offers_(std::move(offers)),
      drag_(gtk_gesture_drag_new()),
      slide_(adw_timed_animation_new(
          scroller, 0, 0, SlideMilliseconds,
          adw_callback_animation_target_new(
              [](double value, gpointer self) { static_cast<RowSwipe*>(self)->uncover(value); }, this, nullptr))) {
  context_.itemChanges = [this](GtkWidget* row) {
    if (row == row_) drop();
  };
  g_signal_connect_swapped(slide_.get(), "done", G_CALLBACK(+[](RowSwipe* self) {
                             if (self->uncovered_ <= 0) self->drop();
                           }),
                           this);
  gtk_gesture_single_set_touch_only(GTK_GESTURE_SINGLE(drag_), TRUE);
  // Before the row takes the finger for a press.
  gtk_event_controller_set_propagation_phase(GTK_EVENT_CONTROLLER(drag_), GTK_PHASE_CAPTURE);
  g_signal_connect_swapped(drag_, "drag-begin", G_CALLBACK(+[](RowSwipe* self, double x, double y) { self->began(x, y); }),
                           this);
  g_signal_connect_swapped(drag_, "drag-update", G_CALLBACK(+[](RowSwipe* self, double x, double y) { self->moved(x, y); }),
                           this);
  g_signal_connect_swapped(drag_, "drag-end", G_CALLBACK(+[](RowSwipe* self, double, double) { self->ended(); }), this);
  gtk_widget_add_controller(scroller_, GTK_EVENT_CONTROLLER(drag_));
}

RowSwipe::~RowSwipe() {
  drop();
  context_.itemChanges = nullptr;
  g_signal_handlers_disconnect_by_data(slide_.get(), this);
  g_signal_handlers_disconnect_by_data(drag_, this);
  gtk_widget_remove_controller(scroller_, GTK_EVENT_CONTROLLER(drag_));
}

std::uint32_t RowSwipe::time() const { return gtk_event_controller_get_current_event_time(GTK_EVENT_CONTROLLER(drag_)); }

bool RowSwipe::isInStrip(GtkWidget* widget) const {
  return strip_ && widget && (widget == strip_ || gtk_widget_is_ancestor(widget, strip_));
}

GtkWidget* RowSwipe::rowAt(double x, double y) const {
  GtkWidget* at = gtk_widget_pick(scroller_, x, y, GTK_PICK_DEFAULT);
  return isInStrip(at) ? row_ : folderRowIn(at);
}

void RowSwipe::began(double x, double y) {
  track_.reset();
  dragging_ = false;
  GtkWidget* row = rowAt(x, y);
  if (context_.editing || context_.grid || !row || !folderRowItem(row)) return;
  touched_ = folderItemOf(folderRowItem(row)).name;
  track_.emplace(row == row_ ? uncovered_ : 0, gtk_widget_get_direction(row) == GTK_TEXT_DIR_RTL);
}

void RowSwipe::moved(double x, double y) {
  if (!track_) return;
  const SwipeTrack::Claim claim = track_->moved(x, y, time());
  if (claim == SwipeTrack::Claim::Undecided) return;
  if (claim == SwipeTrack::Claim::Left || (!dragging_ && !takeRow())) return track_.reset();
  dragging_ = true;
  adw_animation_pause(slide_.get());
  uncover(track_->uncovered(width_));
}

bool RowSwipe::takeRow() {
  double x = 0;
  double y = 0;
  gtk_gesture_drag_get_start_point(GTK_GESTURE_DRAG(drag_), &x, &y);
  GtkWidget* row = rowAt(x, y);
  GObject* item = row ? folderRowItem(row) : nullptr;
  // The list may have moved below the finger.
  if (!item || folderItemOf(item).name != touched_) return false;
  if (row != row_) {
    const std::vector<Button> buttons = offers_(folderItemOf(item));
    if (buttons.empty()) return false;
    makeStrip(row, buttons);
  }
  gtk_gesture_set_state(drag_, GTK_EVENT_SEQUENCE_CLAIMED);
  return true;
}

void RowSwipe::ended() {
  const std::optional<SwipeTrack> track = std::exchange(track_, std::nullopt);
  if (std::exchange(dragging_, false) && track && row_) slideTo(track->endsOpen(width_, time()) ? width_ : 0);
}

void RowSwipe::makeStrip(GtkWidget* row, const std::vector<Button>& buttons) {
  drop();
  row_ = row;
  strip_ = GTK_WIDGET(g_object_new(stripGetType(), nullptr));
  gtk_widget_set_halign(strip_, GTK_ALIGN_END);
  for (const Button& button : buttons) {
    GtkWidget* made = makeButton(button);
    g_signal_connect_data(
        made, "clicked", G_CALLBACK(+[](GtkWidget* pressed, gpointer held) {
          const Pressed at = *static_cast<Pressed*>(held);
          at.swipe->buttonPressed(pressed, at.act);
        }),
        new Pressed{this, button.pressed}, [](gpointer held, GClosure*) { delete static_cast<Pressed*>(held); },
        GConnectFlags(0));
    gtk_widget_set_parent(made, strip_);
  }
  // In the list's own item, beside the row, which draws all that it shows itself and is nothing to a screen reader.
  gtk_widget_insert_after(strip_, gtk_widget_get_parent(row), row);
  gtk_widget_measure(strip_, GTK_ORIENTATION_HORIZONTAL, -1, nullptr, &width_, nullptr, nullptr);
}

void RowSwipe::buttonPressed(GtkWidget* button, const std::function<void(const GdkRectangle&)>& act) {
  graphene_rect_t bounds;
  if (!gtk_widget_compute_bounds(button, scroller_, &bounds)) return;
  close();
  act({static_cast<int>(bounds.origin.x), static_cast<int>(bounds.origin.y), static_cast<int>(bounds.size.width),
       static_cast<int>(bounds.size.height)});
}

void RowSwipe::uncover(double pixels) {
  if (!row_) return;
  uncovered_ = pixels;
  folderRowSetUncovered(row_, pixels);
  reinterpret_cast<Strip*>(strip_)->uncovered = static_cast<float>(pixels);
  gtk_widget_queue_draw(strip_);
}

void RowSwipe::slideTo(double pixels) {
  AdwTimedAnimation* slide = ADW_TIMED_ANIMATION(slide_.get());
  adw_timed_animation_set_value_from(slide, uncovered_);
  adw_timed_animation_set_value_to(slide, pixels);
  adw_animation_play(slide_.get());
}

void RowSwipe::close() {
  tookPress_ = false;
  if (row_) slideTo(0);
}

void RowSwipe::drop() {
  adw_animation_pause(slide_.get());
  if (!row_) return;
  uncover(0);
  row_ = nullptr;
  gtk_widget_unparent(std::exchange(strip_, nullptr));
}

void RowSwipe::pressedAt(double x, double y) {
  const bool covers = row_ && !isInStrip(gtk_widget_pick(scroller_, x, y, GTK_PICK_DEFAULT));
  if (covers) close();
  tookPress_ = covers;
}

}  // namespace vaelo
