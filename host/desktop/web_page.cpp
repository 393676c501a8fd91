// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/web_page.h"

#include <memory>

#include "host/support/glib_ptr.h"

namespace vaelo {

void openWebPage(const std::string& address, GAppLaunchContext* context, std::function<void(const std::string&)> failed) {
  using Failed = std::function<void(const std::string&)>;
  g_app_info_launch_default_for_uri_async(
      address.c_str(), context, nullptr,
      +[](GObject*, GAsyncResult* result, gpointer held) {
        const std::unique_ptr<Failed> told(static_cast<Failed*>(held));
        GError* error = nullptr;
        if (g_app_info_launch_default_for_uri_finish(result, &error)) return;
        const GErrorPtr owned(error);
        (*told)(owned ? owned->message : "");
      },
      new Failed(std::move(failed)));
}

}  // namespace vaelo
