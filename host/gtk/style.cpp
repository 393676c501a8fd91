// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/style.h"

#include <gtk/gtk.h>

#include <set>
#include <string>

#include "host/support/glib_ptr.h"

namespace vaelo {

void addStyle(const char* rules) {
  static std::set<std::string> added;
  GdkDisplay* display = gdk_display_get_default();
  if (!display || !added.insert(rules).second) return;
  const GRef<GtkCssProvider> provider(gtk_css_provider_new());
  gtk_css_provider_load_from_data(provider.get(), rules, -1);
  gtk_style_context_add_provider_for_display(display, GTK_STYLE_PROVIDER(provider.get()),
                                             GTK_STYLE_PROVIDER_PRIORITY_APPLICATION);
}

}  // namespace vaelo
