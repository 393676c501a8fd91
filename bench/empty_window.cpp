// SPDX-License-Identifier: GPL-3.0-or-later
// An empty window of the toolkit, beside which bench/side-by-side times the application's start.
#include <adwaita.h>

namespace {

void activate(GtkApplication* application) {
  GtkWidget* window = adw_application_window_new(application);
  gtk_window_set_default_size(GTK_WINDOW(window), 800, 640);
  GtkWidget* content = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
  gtk_box_append(GTK_BOX(content), adw_header_bar_new());
  adw_application_window_set_content(ADW_APPLICATION_WINDOW(window), content);
  gtk_window_present(GTK_WINDOW(window));
}

}  // namespace

int main(int argc, char** argv) {
  AdwApplication* application = adw_application_new("com.marrow.EmptyWindow", G_APPLICATION_NON_UNIQUE);
  g_signal_connect(application, "activate", G_CALLBACK(activate), nullptr);
  const int status = g_application_run(G_APPLICATION(application), argc, argv);
  g_object_unref(application);
  return status;
}
