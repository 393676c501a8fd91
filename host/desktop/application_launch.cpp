// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/application_launch.h"

#include <gio/gdesktopappinfo.h>

#include <memory>

#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

/// One made from a command line has no identifier and no entry to look into.
bool isStartedOverTheBus(GAppInfo* app) {
  return G_IS_DESKTOP_APP_INFO(app) && g_app_info_get_id(app) &&
         g_desktop_app_info_get_boolean(G_DESKTOP_APP_INFO(app), "DBusActivatable");
}

/// GIO starts programs through a helper, so a program that is not there would not be told.
bool hasProgram(GAppInfo* app) {
  const char* line = g_app_info_get_commandline(app);
  char** words = nullptr;
  if (!line || !g_shell_parse_argv(line, nullptr, &words, nullptr)) return false;
  const bool found = !takeString(g_find_program_in_path(words[0])).empty();
  g_strfreev(words);
  return found;
}

void launched(GObject* app, GAsyncResult* result, gpointer held) {
  const std::unique_ptr<LaunchFailed> failed(static_cast<LaunchFailed*>(held));
  GError* error = nullptr;
  g_app_info_launch_uris_finish(G_APP_INFO(app), result, &error);
  if (!error) return;
  const GErrorPtr owned(error);
  (*failed)(owned->message);
}

}  // namespace

bool needsTerminal(GAppInfo* app) {
  return G_IS_DESKTOP_APP_INFO(app) &&
         g_desktop_app_info_get_boolean(G_DESKTOP_APP_INFO(app), "Terminal");  // not for people
}

bool launchApplication(GAppInfo* app, const std::vector<std::string>& uris, GAppLaunchContext* context,
                       LaunchFailed failed) {
  GList* list = nullptr;
  for (auto uri = uris.rbegin(); uri != uris.rend(); ++uri) {
    list = g_list_prepend(list, const_cast<char*>(uri->c_str()));
  }
  const std::unique_ptr<GList, decltype(&g_list_free)> owned(list, g_list_free);
  if (isStartedOverTheBus(app)) {
    g_app_info_launch_uris_async(app, list, context, nullptr, launched, new LaunchFailed(std::move(failed)));
    return true;
  }
  if (!hasProgram(app)) {
    failed(_("It is no longer installed."));
    return false;
  }
  GError* error = nullptr;
  if (g_app_info_launch_uris(app, list, context, &error)) return true;
  const GErrorPtr reason(error);
  failed(reason ? reason->message : "");
  return false;
}

bool launchProgram(const std::vector<std::string>& arguments, const std::string& name, GAppLaunchContext* context,
                   LaunchFailed failed) {
  std::string command;
  for (const std::string& argument : arguments) {
    // A percent sign begins a field code in a command line of this kind.
    for (const char c : takeString(g_shell_quote(argument.c_str()))) command += c == '%' ? "%%" : std::string(1, c);
    command += ' ';
  }
  GError* error = nullptr;
  const GRef<GAppInfo> app(
      g_app_info_create_from_commandline(command.c_str(), name.c_str(), G_APP_INFO_CREATE_NONE, &error));
  const GErrorPtr reason(error);
  if (app) return launchApplication(app.get(), {}, context, std::move(failed));
  failed(reason ? reason->message : "");
  return false;
}

}  // namespace vaelo
