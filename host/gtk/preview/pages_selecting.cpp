// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_selecting.h"

#include <utility>

#include "host/support/texts.h"

namespace vaelo {

PagesSelecting::PagesSelecting(PagesCanvas& canvas, GtkWidget* host, Events events)
    : canvas_(canvas),
      host_(host),
      events_(std::move(events)),
      selection_([this](int page) { return events_.textOf(page); }),
      actions_(g_simple_action_group_new()) {
  const GActionEntry entries[] = {
      {"copy",
       [](GSimpleAction*, GVariant*, gpointer self) { static_cast<PagesSelecting*>(self)->copy(); },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"select-all",
       [](GSimpleAction*, GVariant*, gpointer data) {
         auto* self = static_cast<PagesSelecting*>(data);
         self->selectPage(self->canvas_.currentPage());
       },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"highlight",
       [](GSimpleAction*, GVariant*, gpointer self) { static_cast<PagesSelecting*>(self)->highlight(); },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}}};
  g_action_map_add_action_entries(G_ACTION_MAP(actions_.get()), entries, G_N_ELEMENTS(entries), this);
  gtk_widget_insert_action_group(host_, "pages", G_ACTION_GROUP(actions_.get()));
  const GRef<GMenu> items(g_menu_new());
  g_menu_append(items.get(), _("_Copy"), "pages.copy");
  g_menu_append(items.get(), _("_Highlight"), "pages.highlight");
  g_menu_append(items.get(), _("_Select Page"), "pages.select-all");
  menu_ = gtk_popover_menu_new_from_model(G_MENU_MODEL(items.get()));
  gtk_popover_set_has_arrow(GTK_POPOVER(menu_), FALSE);
  gtk_widget_set_halign(menu_, GTK_ALIGN_START);
  gtk_widget_set_parent(menu_, host_);
  g_signal_connect_swapped(menu_, "closed", G_CALLBACK(gtk_widget_grab_focus), canvas_.widget());
}

PagesSelecting::~PagesSelecting() {
  g_signal_handlers_disconnect_by_data(menu_, canvas_.widget());
  gtk_widget_unparent(menu_);
  gtk_widget_insert_action_group(host_, "pages", nullptr);
}

void PagesSelecting::begin(double x, double y, int presses) {
  whenRead_ = nullptr;
  using Unit = PagesSelection::Unit;
  selection_.begin(canvas_.placeAt(x, y), presses > 1 ? Unit::Word : Unit::Character);
  canvas_.redraw();
}

void PagesSelecting::extend(double x, double y) {
  selection_.extend(canvas_.placeAt(x, y));
  canvas_.redraw();
}

void PagesSelecting::selectPage(int page) {
  selection_.begin({page, 0, 0}, PagesSelection::Unit::Page);
  canvas_.redraw();
}

bool PagesSelecting::isEmpty() const {
  const std::optional<std::string> text = selection_.text();
  return text && text->empty();
}

bool PagesSelecting::clear() {
  const bool wasEmpty = isEmpty();
  whenRead_ = nullptr;
  selection_.clear();
  canvas_.redraw();
  return !wasEmpty;
}

void PagesSelecting::whenRead(std::function<void(const std::string& text)> then) {
  whenRead_ = std::move(then);
  textRead();
}

void PagesSelecting::textRead() {
  canvas_.redraw();
  if (!whenRead_) return;
  const std::optional<std::string> text = selection_.text();
  if (!text) return;
  const auto then = std::exchange(whenRead_, nullptr);
  if (!text->empty()) then(*text);
}

void PagesSelecting::copy() {
  whenRead(
      [this](const std::string& text) { gdk_clipboard_set_text(gtk_widget_get_clipboard(canvas_.widget()), text.c_str()); });
}

void PagesSelecting::highlight() {
  whenRead([this](const std::string&) {
    const auto [first, last] = selection_.pages();
    for (int page = first; page <= last; ++page) events_.highlight(page, selection_.rectsOn(page));
    clear();
  });
}

void PagesSelecting::showMenu(double x, double y) {
  const PagePlace place = canvas_.placeAt(x, y);
  if (!selection_.contains(place)) begin(x, y, 2);
  for (const char* name : {"copy", "highlight"}) {
    GAction* action = g_action_map_lookup_action(G_ACTION_MAP(actions_.get()), name);
    const bool enabled = !isEmpty() && (*name == 'c' || events_.mayHighlight());
    g_simple_action_set_enabled(G_SIMPLE_ACTION(action), enabled);
  }
  double hostX = 0;
  double hostY = 0;
  gtk_widget_translate_coordinates(canvas_.widget(), host_, x, y, &hostX, &hostY);
  const GdkRectangle pointed = {static_cast<int>(hostX), static_cast<int>(hostY), 1, 1};
  gtk_popover_set_pointing_to(GTK_POPOVER(menu_), &pointed);
  gtk_popover_popup(GTK_POPOVER(menu_));
}

bool PagesSelecting::key(guint key, GdkModifierType state) {
  const bool shift = state & GDK_SHIFT_MASK;
  if (key == GDK_KEY_Menu || (shift && key == GDK_KEY_F10)) {
    showMenu(canvas_.width() / 2, canvas_.height() / 3);
    return true;
  }
  if (!(state & GDK_CONTROL_MASK) || shift || (state & GDK_ALT_MASK)) return false;
  if (key == GDK_KEY_c || key == GDK_KEY_Insert) {
    copy();
    return true;
  }
  if (key == GDK_KEY_a) {
    selectPage(canvas_.currentPage());
    return true;
  }
  return false;
}

}  // namespace vaelo
