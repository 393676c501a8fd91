// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/window_focus.h"

#include <utility>

namespace vaelo {

namespace {

constexpr guint LastsFor = 200;  // milliseconds
constexpr const char* Watcher = "vaelo-focus";

bool someWindowIsActive(GListModel* windows) {
  for (guint i = 0; i < g_list_model_get_n_items(windows); ++i) {
    const GRef<GtkWindow> window(GTK_WINDOW(g_list_model_get_item(windows, i)));
    if (gtk_window_is_active(window.get())) return true;
  }
  return false;
}

}  // namespace

WindowFocus::WindowFocus(std::function<void(bool)> changed)
    : changed_(std::move(changed)),
      windows_(G_LIST_MODEL(g_object_ref(gtk_window_get_toplevels()))),
      anchor_(G_OBJECT(g_object_new(G_TYPE_OBJECT, nullptr))) {
  g_object_set_data(anchor_.get(), Watcher, this);
  g_signal_connect_object(windows_.get(), "items-changed",
                          G_CALLBACK(+[](GListModel*, guint first, guint, guint added, GObject* anchor) {
                            auto* self = static_cast<WindowFocus*>(g_object_get_data(anchor, Watcher));
                            self->watch(first, added);
                            self->look();
                          }),
                          anchor_.get(), GConnectFlags(0));
  watch(0, g_list_model_get_n_items(windows_.get()));
  look();
}

WindowFocus::~WindowFocus() { g_clear_handle_id(&timer_, g_source_remove); }

void WindowFocus::watch(guint first, guint count) {
  for (guint i = first; i < first + count; ++i) {
    const GRef<GObject> window(G_OBJECT(g_list_model_get_item(windows_.get(), i)));
    g_signal_connect_object(window.get(), "notify::is-active", G_CALLBACK(+[](GObject*, GParamSpec*, GObject* anchor) {
                              static_cast<WindowFocus*>(g_object_get_data(anchor, Watcher))->look();
                            }),
                            anchor_.get(), GConnectFlags(0));
  }
}

void WindowFocus::look() {
  if (someWindowIsActive(windows_.get())) {
    g_clear_handle_id(&timer_, g_source_remove);
    if (!std::exchange(focused_, true)) changed_(true);
    return;
  }
  if (!focused_ || timer_ != 0) return;
  timer_ = g_timeout_add(
      LastsFor,
      [](gpointer held) -> gboolean {
        auto* self = static_cast<WindowFocus*>(held);
        self->timer_ = 0;
        self->focused_ = false;
        self->changed_(false);
        return G_SOURCE_REMOVE;
      },
      this);
}

}  // namespace vaelo
