// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/gtk_document_interaction.h"

#include <gio/gdesktopappinfo.h>

#include "host/support/glib_ptr.h"

namespace vaelo {

// No menu is offered yet, which the callers are told.
bool GtkDocumentInteraction::presentOptionsMenuFromRect(const Rect&, const ViewRef&, bool) { return false; }
bool GtkDocumentInteraction::presentOptionsMenuFromBarButtonItem(const BarButtonItemRef&, bool) { return false; }

bool GtkDocumentInteraction::openInPlaceWith(const ApplicationRecord& application) {
  const GRef<GDesktopAppInfo> app(g_desktop_app_info_new(application.itemID.c_str()));
  if (!app) return false;
  const GRef<GFile> file(g_file_new_for_path(url_.path().c_str()));
  GList files{file.get(), nullptr, nullptr};
  const GRef<GdkAppLaunchContext> context(gdk_display_get_app_launch_context(gdk_display_get_default()));
  GError* error = nullptr;
  const bool started = g_app_info_launch(G_APP_INFO(app.get()), &files, G_APP_LAUNCH_CONTEXT(context.get()), &error);
  const GErrorPtr owned(error);
  return started;
}

}  // namespace vaelo
