// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/gio_launch_services.h"

#include <gio/gdesktopappinfo.h>

#include <algorithm>

#include "host/desktop/application_launch.h"
#include "host/desktop/content_type.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

std::string text(const char* value) { return value ? value : ""; }

ApplicationRecord recordOf(GAppInfo* app) {
  constexpr std::string_view suffix = ".desktop";
  ApplicationRecord record;
  record.itemID = text(g_app_info_get_id(app));
  record.bundleIdentifier =
      record.itemID.ends_with(suffix) ? record.itemID.substr(0, record.itemID.size() - suffix.size()) : record.itemID;
  record.itemName = text(g_app_info_get_name(app));
  record.localizedName = text(g_app_info_get_display_name(app));
  record.localizedShortName = record.localizedName;
  record.executableName = text(g_app_info_get_executable(app));
  if (G_IS_DESKTOP_APP_INFO(app)) record.bundleContainerURL = text(g_desktop_app_info_get_filename(G_DESKTOP_APP_INFO(app)));
  record.isInstalled = true;
  record.supportsOpenInPlace = g_app_info_supports_files(app) || g_app_info_supports_uris(app);
  return record;
}

class GioDocumentRecord : public DocumentRecord {
 public:
  explicit GioDocumentRecord(URL url) : url_(std::move(url)) {}
  URL url() const override { return url_; }

  Result<Ranked> applicationsAvailableForOpeningByHandlerRank() override {
    const std::string type = contentTypeOf(url_.path());
    std::vector<ApplicationRecord> owners;
    std::vector<ApplicationRecord> others;
    const auto add = [&](GAppInfo* app, bool owns) {
      ApplicationRecord record = recordOf(app);
      const auto isIn = [&](const auto& list) { return std::find(list.begin(), list.end(), record) != list.end(); };
      if (isIn(owners) || isIn(others)) return;
      (owns && !needsTerminal(app) ? owners : others).push_back(std::move(record));
    };
    const auto addAll = [&](GList* apps, bool own) {
      for (GList* at = apps; at; at = at->next) add(G_APP_INFO(at->data), own);
      g_list_free_full(apps, g_object_unref);
    };
    if (const GRef<GAppInfo> chosen{g_app_info_get_default_for_type(type.c_str(), FALSE)}) add(chosen.get(), true);
    addAll(g_app_info_get_recommended_for_type(type.c_str()), true);
    addAll(g_app_info_get_fallback_for_type(type.c_str()), false);
    return Ranked{{HandlerRankOwner, owners}, {"Alternate", others}};
  }

 private:
  URL url_;
};

}  // namespace

std::shared_ptr<DocumentRecord> GioLaunchServices::documentRecord(const URL& url, bool) {
  return std::make_shared<GioDocumentRecord>(url);
}

std::optional<ApplicationRecord> GioLaunchServices::applicationRecord(const std::string& bundleIdentifier) {
  const GRef<GDesktopAppInfo> app{g_desktop_app_info_new((bundleIdentifier + ".desktop").c_str())};
  if (!app) return std::nullopt;
  return recordOf(G_APP_INFO(app.get()));
}

}  // namespace vaelo
