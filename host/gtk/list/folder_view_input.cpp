// SPDX-License-Identifier: GPL-3.0-or-later
// Keys and gestures of FolderView.

#include <algorithm>
#include <array>
#include <cmath>

#include "host/gtk/list/folder_view.h"
#include "host/support/texts.h"

namespace vaelo {
namespace {

constexpr double WandersAfter = 24;  // pixels; half a row
constexpr std::array RowKeys = {GDK_KEY_Up,      GDK_KEY_KP_Up,      GDK_KEY_Down,      GDK_KEY_KP_Down,
                                GDK_KEY_Left,    GDK_KEY_KP_Left,    GDK_KEY_Right,     GDK_KEY_KP_Right,
                                GDK_KEY_Home,    GDK_KEY_KP_Home,    GDK_KEY_End,       GDK_KEY_KP_End,
                                GDK_KEY_Page_Up, GDK_KEY_KP_Page_Up, GDK_KEY_Page_Down, GDK_KEY_KP_Page_Down};

bool goesOn(guint key) {
  return std::any_of(RowKeys.begin(), RowKeys.end(), [&](auto each) { return static_cast<guint>(each) == key; });
}

FolderItem* itemOfRow(GtkWidget* row) {
  GObject* item = row ? folderRowItem(row) : nullptr;
  return item ? &folderItemOf(item) : nullptr;
}

}  // namespace

FolderItem* FolderView::focusedItem() const {
  GtkWidget* focused = focus();
  if (!focused || focused == list_ || !gtk_widget_is_ancestor(focused, list_)) return nullptr;
  return itemOfRow(folderRowIn(focused));
}

void FolderView::connectKeys() {
  GtkEventController* keys = gtk_event_controller_key_new();
  // Before the rows, which would take the space bar for themselves.
  gtk_event_controller_set_propagation_phase(keys, GTK_PHASE_CAPTURE);
  g_signal_connect(keys, "key-pressed",
                   G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType modifiers, FolderView* self) {
                     return static_cast<gboolean>(self->keyPressed(key, modifiers));
                   }),
                   this);
  gtk_widget_add_controller(widget(), keys);
}

void FolderView::extendToFocus() {
  const FolderItem* focused = focusedItem();
  if (const auto row = focused ? model_.indexOf(focused->name) : std::nullopt) range_.extendTo(*row);
}

bool FolderView::keyPressed(guint key, GdkModifierType modifiers) {
  swipe_->close();
  const bool plain = !(modifiers & (GDK_CONTROL_MASK | GDK_ALT_MASK | GDK_SUPER_MASK | GDK_META_MASK));
  if (key == GDK_KEY_F5) {
    refresh();
    return true;
  }
  if (key == GDK_KEY_Menu || (key == GDK_KEY_F10 && (modifiers & GDK_SHIFT_MASK))) {
    requestContextAtFocus();
    return true;
  }
  // From row to row the arrows go. The list's own Tab does as well, and what is behind thousands of rows is out of reach.
  if ((key == GDK_KEY_Tab || key == GDK_KEY_ISO_Left_Tab) && plain && focusedItem()) {
    const auto onwards = key == GDK_KEY_Tab ? GTK_DIR_TAB_FORWARD : GTK_DIR_TAB_BACKWARD;
    g_signal_emit_by_name(scroller_, "move-focus-out", onwards);
    return true;
  }
  // The window knows more of it than the list, whose own key it is as well.
  if (key == GDK_KEY_a && (modifiers & gtk_accelerator_get_default_mod_mask()) == GDK_CONTROL_MASK) {
    return gtk_widget_activate_action(widget(), "win.select-all", nullptr);
  }
  if (command(key, modifiers)) return true;
  const gint64 now = g_get_monotonic_time();
  FolderItem* focused = focusedItem();
  const std::size_t last = model_.itemCount() - 1;
  const std::size_t focusedRow = focused ? model_.indexOf(focused->name).value_or(last) : last;
  // Shift and a key that goes to another row select all up to there, from this row on unless they did so before.
  if (context_.editing && focused && (modifiers & GDK_SHIFT_MASK) && !range_.endsAt(focusedRow) && goesOn(key)) {
    range_.begin(focusedRow);
  }
  if (key == GDK_KEY_space && plain && context_.editing && focused && !typeAhead_.isTyping(now)) {
    extends_ = modifiers & GDK_SHIFT_MASK;
    pressed(static_cast<guint>(focusedRow));
    return true;
  }
  const gunichar letter = gdk_keyval_to_unicode(key);
  if (!plain || !letter || !g_unichar_isprint(letter) || !model_.itemCount()) return false;
  if (letter == ' ' && !typeAhead_.isTyping(now)) return false;
  std::array<char, 8> utf8{};
  g_unichar_to_utf8(letter, utf8.data());
  const auto found = typeAhead_.type(model_, utf8.data(), now, focusedRow);
  if (!found) return true;
  scrollTo(nameAt(*found));
  // After a pointer or finger the window shows no longer where the keyboard is.
  gtk_window_set_focus_visible(GTK_WINDOW(gtk_widget_get_root(widget())), TRUE);
  // A row that takes the focus before it has its place makes the list scroll by its guess again.
  focusRevealed_ = true;
  return true;
}

void FolderView::connectContextGestures() {
  // The list tells of presses without their modifiers.
  GtkGesture* any = gtk_gesture_click_new();
  gtk_event_controller_set_propagation_phase(GTK_EVENT_CONTROLLER(any), GTK_PHASE_CAPTURE);
  const auto note = [](GtkGesture* gesture, int, double x, double y, FolderView* self) {
    const GdkModifierType held = gtk_event_controller_get_current_event_state(GTK_EVENT_CONTROLLER(gesture));
    self->extends_ = held & GDK_SHIFT_MASK;
    self->pressX_ = x;
    self->pressY_ = y;
    self->swipe_->pressedAt(x, y);
  };
  g_signal_connect(any, "pressed", G_CALLBACK(+note), this);
  // Who presses a row and lets go elsewhere, or swipes along it, means no tap. The row itself would take it for one. While
  // items are selected, who drags over rows selects them, which the list sees to.
  const auto letGo = [](GtkGesture* gesture, int, double x, double y, FolderView* self) {
    if (!self->context_.editing && std::hypot(x - self->pressX_, y - self->pressY_) > WandersAfter) {
      gtk_gesture_set_state(gesture, GTK_EVENT_SEQUENCE_CLAIMED);
    }
  };
  g_signal_connect(any, "released", G_CALLBACK(+letGo), this);
  gtk_widget_add_controller(scroller_, GTK_EVENT_CONTROLLER(any));

  GtkGesture* click = gtk_gesture_click_new();
  gtk_gesture_single_set_button(GTK_GESTURE_SINGLE(click), GDK_BUTTON_SECONDARY);
  g_signal_connect_swapped(click, "pressed",
                           G_CALLBACK(+[](FolderView* self, int, double x, double y) { self->requestContext(x, y); }), this);
  gtk_widget_add_controller(scroller_, GTK_EVENT_CONTROLLER(click));

  GtkGesture* press = gtk_gesture_long_press_new();
  // In the capture phase, so that it can keep the row from taking the same press for an activation.
  gtk_event_controller_set_propagation_phase(GTK_EVENT_CONTROLLER(press), GTK_PHASE_CAPTURE);
  g_signal_connect(press, "pressed", G_CALLBACK(+[](GtkGesture* gesture, double x, double y, FolderView* self) {
                     // Whoever selects may think before the finger goes on.
                     if (self->context_.editing) return;
                     gtk_gesture_set_state(gesture, GTK_EVENT_SEQUENCE_CLAIMED);
                     self->requestContext(x, y);
                   }),
                   this);
  gtk_widget_add_controller(scroller_, GTK_EVENT_CONTROLLER(press));
}

void FolderView::connectDrags() {
  swipe_ = std::make_unique<RowSwipe>(scroller_, context_, [this](FolderItem& item) { return swipeButtons(item); });
  markDrag_ = std::make_unique<MarkDrag>(scroller_, context_, model_);
}

std::vector<RowSwipe::Button> FolderView::swipeButtons(const FolderItem& item) {
  std::vector<RowSwipe::Button> buttons;
  if (!events_.offersBySwipe) return buttons;
  const std::string name = item.name;
  if (events_.contextRequested) {
    buttons.push_back({"view-more-horizontal-symbolic", _("More"), nullptr,
                       [this, name](const GdkRectangle& at) { events_.contextRequested(name, scroller_, at); }});
  }
  const auto add = [&](ListCommand command, const char* icon, const char* label, const char* style) {
    if (!events_.offersBySwipe(command)) return;
    buttons.push_back({icon, label, style, [this, name, command](const GdkRectangle& at) {
                         const FolderItem* shown = model_.liveItem(name);
                         const auto row = shown ? placeOf(*shown) : std::nullopt;
                         events_.commanded(command, name, scroller_, row.value_or(at));
                       }});
  };
  add(ListCommand::Share, "emblem-shared-symbolic", _("Share"), "suggested-action");
  add(ListCommand::Delete, "user-trash-symbolic", _("Delete"), "destructive-action");
  return buttons;
}

void FolderView::requestContext(double x, double y) {
  FolderItem* item = itemOfRow(folderRowIn(gtk_widget_pick(scroller_, x, y, GTK_PICK_DEFAULT)));
  if (!item || !events_.contextRequested) return;
  // Keys that come next mean the item whose menu it was. And the menu takes the release, for which the row would wait.
  GtkWidget* listItem = gtk_widget_get_parent(item->row);
  gtk_widget_grab_focus(listItem);
  gtk_widget_unset_state_flags(listItem, GTK_STATE_FLAG_ACTIVE);
  const GdkRectangle at{static_cast<int>(x), static_cast<int>(y), 1, 1};
  events_.contextRequested(std::string(item->name), scroller_, at);
}

std::optional<GdkRectangle> FolderView::placeOf(const FolderItem& item) const {
  graphene_rect_t bounds;
  if (!item.row || !gtk_widget_compute_bounds(item.row, scroller_, &bounds)) return std::nullopt;
  return GdkRectangle{static_cast<int>(bounds.origin.x), static_cast<int>(bounds.origin.y),
                      static_cast<int>(bounds.size.width), static_cast<int>(bounds.size.height)};
}

void FolderView::requestContextAtFocus() {
  FolderItem* item = focusedItem();
  const auto at = item ? placeOf(*item) : std::nullopt;
  if (at && events_.contextRequested) events_.contextRequested(std::string(item->name), scroller_, *at);
}

bool FolderView::command(guint key, GdkModifierType modifiers) {
  const auto held = static_cast<GdkModifierType>(modifiers & gtk_accelerator_get_default_mod_mask());
  std::optional<ListCommand> command;
  if (key == GDK_KEY_F2 && !held) command = ListCommand::Rename;
  if (key == GDK_KEY_Delete && !held) command = ListCommand::Delete;
  if (key == GDK_KEY_Return && held == GDK_ALT_MASK) command = ListCommand::Details;
  if (key == GDK_KEY_m && held == GDK_CONTROL_MASK) command = ListCommand::Move;
  if (!command || !events_.commanded) return false;
  // Whoever types fast is ahead of the frame in which the row that was found takes the focus, and that must not take it from
  // what the command shows.
  if (focusRevealed_) finishReveal();
  FolderItem* item = focusedItem();
  const auto at = item ? placeOf(*item) : std::nullopt;
  if (!at && !context_.editing) return false;
  events_.commanded(*command, at ? std::string(item->name) : std::string(), scroller_, at.value_or(GdkRectangle()));
  return true;
}

}  // namespace vaelo
