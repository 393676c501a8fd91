// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/window_notice.h"

#include <adwaita.h>

#include "host/gtk/toast.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

struct WindowNotice::Window {
  GWeakRef toasts;

  Window() { g_weak_ref_init(&toasts, nullptr); }
  ~Window() { g_weak_ref_clear(&toasts); }
  Window(const Window&) = delete;
  Window& operator=(const Window&) = delete;

  void tell(const std::string& sentence) {
    const GRef<GObject> overlay(static_cast<GObject*>(g_weak_ref_get(&toasts)));
    if (overlay && gtk_widget_get_root(GTK_WIDGET(overlay.get()))) return toast(overlay.get(), sentence);
    GApplication* application = g_application_get_default();
    if (!application || !g_application_get_is_registered(application)) return;
    const GRef<GNotification> notification(g_notification_new(_("Markup")));
    g_notification_set_body(notification.get(), sentence.c_str());
    g_application_send_notification(application, nullptr, notification.get());
  }

  static void toast(GObject* overlay, const std::string& sentence) {
    AdwToast* shown = makeToast(sentence);
    adw_toast_set_timeout(shown, 0);
    adw_toast_overlay_add_toast(ADW_TOAST_OVERLAY(overlay), shown);
  }
};

WindowNotice::WindowNotice(GtkWidget* widget) : widget_(widget), window_(std::make_shared<Window>()) {
  mapped_ = g_signal_connect_swapped(widget_, "map", G_CALLBACK(+[](WindowNotice* self) {
                                       GtkWidget* found = gtk_widget_get_ancestor(self->widget_, ADW_TYPE_TOAST_OVERLAY);
                                       g_weak_ref_set(&self->window_->toasts, found);
                                     }),
                                     this);
}

WindowNotice::~WindowNotice() { g_signal_handler_disconnect(widget_, mapped_); }

std::function<void(const std::string&)> WindowNotice::teller() const {
  return [window = window_](const std::string& sentence) { window->tell(sentence); };
}

}  // namespace vaelo
