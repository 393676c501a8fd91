// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/long_work_dialog.h"

#include "host/gtk/gtk_screens.h"
#include "host/gtk/gtk_window.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

std::string headingFor(LongWork::Kind kind, const std::string& path) {
  const std::string name = takeString(g_filename_display_basename(path.c_str()));
  return filled(kind == LongWork::Kind::Removal ? _("Deleting “%s”…") : _("Moving “%s”…"), {name});
}

}  // namespace

LongWorkDialog::LongWorkDialog(GtkScreens& screens, LongWork& work) : screens_(screens), work_(work) {
  work_.setWatcher([this](LongWork::Kind kind, const std::string* path) {
    if (path) {
      show(headingFor(kind, *path));
    } else {
      close();
    }
  });
}

LongWorkDialog::~LongWorkDialog() {
  work_.setWatcher(nullptr);
  close();
}

void LongWorkDialog::show(const std::string& heading) {
  if (dialog_) {
    adw_message_dialog_set_heading(ADW_MESSAGE_DIALOG(dialog_), heading.c_str());
    return;
  }
  const auto window = screens_.window();
  if (!window || work_.isCancelled()) return;
  GtkWidget* dialog = adw_message_dialog_new(window->widget(), heading.c_str(), nullptr);
  GtkWidget* spinner = gtk_spinner_new();
  constexpr int size = 32;
  gtk_widget_set_size_request(spinner, size, size);
  gtk_spinner_start(GTK_SPINNER(spinner));
  adw_message_dialog_set_extra_child(ADW_MESSAGE_DIALOG(dialog), spinner);
  adw_message_dialog_add_response(ADW_MESSAGE_DIALOG(dialog), "cancel", _("_Cancel"));
  adw_message_dialog_set_close_response(ADW_MESSAGE_DIALOG(dialog), "cancel");
  g_signal_connect_swapped(dialog, "response::cancel", G_CALLBACK(+[](LongWork* work) { work->cancel(); }), &work_);
  g_set_weak_pointer(&dialog_, dialog);
  gtk_window_present(GTK_WINDOW(dialog));
}

void LongWorkDialog::close() {
  if (!dialog_) return;
  GtkWidget* gone = dialog_;
  g_clear_weak_pointer(&dialog_);
  g_signal_handlers_disconnect_by_data(gone, &work_);
  gtk_window_destroy(GTK_WINDOW(gone));
}

}  // namespace vaelo
