// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/recent_documents.h"

#include <gtk/gtk.h>

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

#include "host/support/glib_ptr.h"

namespace vaelo {

void noteRecentDocument(const URL& document) {
  g_idle_add_full(
      G_PRIORITY_LOW,
      [](gpointer held) -> gboolean {
        const URL& noted = *static_cast<URL*>(held);
        // By name alone, since the document may not be downloaded.
        std::string type = takeString(g_content_type_guess(noted.lastPathComponent().c_str(), nullptr, 0, nullptr));
        GtkRecentData data{};
        data.mime_type = type.data();
        data.app_name = const_cast<char*>("Vaelo Drive");
        data.app_exec = const_cast<char*>("vaelo-drive %u");
        gtk_recent_manager_add_full(gtk_recent_manager_get_default(), noted.absoluteString().c_str(), &data);
        return G_SOURCE_REMOVE;
      },
      new URL(document), [](gpointer held) { delete static_cast<URL*>(held); });
}

std::optional<URL> latestRecentDocument(const std::function<bool(const URL&)>& counts) {
  GList* items = gtk_recent_manager_get_items(gtk_recent_manager_get_default());
  std::vector<std::pair<gint64, std::string>> found;
  for (GList* at = items; at; at = at->next) {
    auto* info = static_cast<GtkRecentInfo*>(at->data);
    found.emplace_back(g_date_time_to_unix(gtk_recent_info_get_visited(info)), gtk_recent_info_get_uri(info));
  }
  g_list_free_full(items, [](gpointer info) { gtk_recent_info_unref(static_cast<GtkRecentInfo*>(info)); });
  std::sort(found.rbegin(), found.rend());
  for (const auto& [visited, uri] : found) {
    const std::optional<URL> url = URL::fromFileURLString(uri);
    if (url && counts(*url)) return url;
  }
  return std::nullopt;
}

}  // namespace vaelo
