// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/markdown_links.h"

#include <algorithm>
#include <cmath>

namespace vaelo {

MarkdownLinks::MarkdownLinks(GtkTextView* view, Links links, std::function<void(const std::string& address)> open)
    : view_(view),
      links_(std::move(links)),
      open_(std::move(open)),
      controllers_{GTK_EVENT_CONTROLLER(gtk_gesture_click_new()), gtk_event_controller_motion_new(),
                   gtk_event_controller_key_new()} {
  gtk_event_controller_set_propagation_phase(controllers_[2], GTK_PHASE_CAPTURE);
  for (GtkEventController* controller : controllers_) gtk_widget_add_controller(GTK_WIDGET(view), controller);
  g_signal_connect(controllers_[0], "released",
                   G_CALLBACK(+[](GtkGestureClick*, int, double x, double y, MarkdownLinks* self) {
                     const bool selects = gtk_text_buffer_get_has_selection(gtk_text_view_get_buffer(self->view_));
                     const MarkdownLink* link = selects ? nullptr : self->at(x, y);
                     if (link) self->activate(*link);
                   }),
                   this);
  g_signal_connect(controllers_[1], "motion",
                   G_CALLBACK(+[](GtkEventControllerMotion*, double x, double y, MarkdownLinks* self) {
                     const MarkdownLink* link = self->at(x, y);
                     const bool leads = link && isOpenable(link->address);
                     gtk_widget_set_cursor_from_name(GTK_WIDGET(self->view_), leads ? "pointer" : "text");
                   }),
                   this);
  g_signal_connect(controllers_[2], "key-pressed",
                   G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType state,
                                  MarkdownLinks* self) -> gboolean { return self->key(key, state); }),
                   this);
  gtk_widget_set_has_tooltip(GTK_WIDGET(view), TRUE);
  tooltip_ = g_signal_connect(
      view, "query-tooltip",
      G_CALLBACK(+[](GtkWidget*, int x, int y, gboolean isKeyboard, GtkTooltip* tooltip, MarkdownLinks* self) -> gboolean {
        const MarkdownLink* link = isKeyboard ? self->selected() : self->at(x, y);
        if (link) gtk_tooltip_set_text(tooltip, link->address.c_str());
        return link != nullptr;
      }),
      this);
}

MarkdownLinks::~MarkdownLinks() {
  g_signal_handler_disconnect(view_, tooltip_);
  for (GtkEventController* controller : controllers_) gtk_widget_remove_controller(GTK_WIDGET(view_), controller);
}

bool MarkdownLinks::isOpenable(const std::string& address) {
  const char* scheme = g_uri_peek_scheme(address.c_str());
  const std::string_view name = scheme ? scheme : "";
  return name == "http" || name == "https" || name == "mailto";
}

const MarkdownLink* MarkdownLinks::at(double x, double y) const {
  int bufferX = 0;
  int bufferY = 0;
  gtk_text_view_window_to_buffer_coords(view_, GTK_TEXT_WINDOW_WIDGET, static_cast<int>(std::lround(x)),
                                        static_cast<int>(std::lround(y)), &bufferX, &bufferY);
  GtkTextIter place;
  if (!gtk_text_view_get_iter_at_location(view_, &place, bufferX, bufferY)) return nullptr;
  const int offset = gtk_text_iter_get_offset(&place);
  const std::vector<MarkdownLink>& links = links_();
  const auto found = std::find_if(links.begin(), links.end(),
                                  [offset](const MarkdownLink& link) { return link.begin <= offset && offset < link.end; });
  return found == links.end() ? nullptr : &*found;
}

void MarkdownLinks::activate(const MarkdownLink& link) {
  if (isOpenable(link.address)) open_(link.address);
}

const MarkdownLink* MarkdownLinks::selected() const {
  GtkTextIter begin;
  GtkTextIter end;
  if (!gtk_text_buffer_get_selection_bounds(gtk_text_view_get_buffer(view_), &begin, &end)) return nullptr;
  for (const MarkdownLink& link : links_()) {
    if (link.begin == gtk_text_iter_get_offset(&begin) && link.end == gtk_text_iter_get_offset(&end)) return &link;
  }
  return nullptr;
}

bool MarkdownLinks::key(guint key, GdkModifierType state) {
  if (state & (GDK_CONTROL_MASK | GDK_ALT_MASK)) return false;
  switch (key) {
    case GDK_KEY_Tab:
      return step(true);
    case GDK_KEY_ISO_Left_Tab:
      return step(false);
    case GDK_KEY_Return:
    case GDK_KEY_KP_Enter:
      if (const MarkdownLink* link = selected()) activate(*link);
      return true;
    default:
      return false;
  }
}

// Selects the next link. False behind the last one, where the focus goes on to the next widget.
bool MarkdownLinks::step(bool forward) {
  GtkTextBuffer* buffer = gtk_text_view_get_buffer(view_);
  GtkTextIter begin;
  GtkTextIter end;
  gtk_text_buffer_get_selection_bounds(buffer, &begin, &end);
  const int from = gtk_text_iter_get_offset(&begin);
  const MarkdownLink* current = selected();
  const MarkdownLink* next = nullptr;
  for (const MarkdownLink& link : links_()) {
    if (forward && !next && (current ? link.begin > from : link.begin >= from)) next = &link;
    if (!forward && link.begin < from) next = &link;
  }
  if (!next) return false;
  gtk_text_buffer_get_iter_at_offset(buffer, &begin, next->begin);
  gtk_text_buffer_get_iter_at_offset(buffer, &end, next->end);
  gtk_text_buffer_select_range(buffer, &begin, &end);
  gtk_text_view_scroll_to_mark(view_, gtk_text_buffer_get_insert(buffer), 0.1, FALSE, 0, 0);
  return true;
}

}  // namespace vaelo
