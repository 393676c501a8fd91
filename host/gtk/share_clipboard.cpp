// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/share_clipboard.h"

#include "host/support/glib_ptr.h"

namespace vaelo {

void copyFileToClipboard(GdkClipboard* clipboard, const std::string& path) {
  const GRef<GFile> file(g_file_new_for_path(path.c_str()));
  GSList files{file.get(), nullptr};
  GdkFileList* list = gdk_file_list_new_from_list(&files);
  // File managers look for their own type, which also says that the file is copied and not cut.
  const std::string own = "copy\n" + takeString(g_file_get_uri(file.get()));
  GBytes* bytes = g_bytes_new(own.data(), own.size());
  GdkContentProvider* forms[] = {gdk_content_provider_new_typed(GDK_TYPE_FILE_LIST, list),
                                 gdk_content_provider_new_for_bytes("x-special/gnome-copied-files", bytes)};
  const GRef<GdkContentProvider> all(gdk_content_provider_new_union(forms, G_N_ELEMENTS(forms)));
  gdk_clipboard_set_content(clipboard, all.get());
  g_bytes_unref(bytes);
  g_boxed_free(GDK_TYPE_FILE_LIST, list);
}

}  // namespace vaelo
