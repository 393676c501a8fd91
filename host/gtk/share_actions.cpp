// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/share_actions.h"

#include <gio/gdesktopappinfo.h>

#include <algorithm>

#include "host/desktop/application_launch.h"
#include "host/desktop/bluetooth_sender.h"
#include "host/desktop/mail_composer.h"
#include "host/desktop/recent_documents.h"
#include "host/gtk/alert_dialog.h"
#include "host/gtk/gtk_window.h"
#include "host/gtk/share_applications.h"
#include "host/gtk/share_clipboard.h"
#include "host/gtk/share_save.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr std::size_t MostApplications = 3;  // the others are behind "another application"
constexpr const char* OwnEntry = "com.marrow.VaeloDrive.desktop";

std::string nameOf(GAppInfo* app) { return g_app_info_get_display_name(app); }

}  // namespace

ShareActions::ShareActions(SharedItem item, const std::shared_ptr<GtkWindowHost>& window)
    : item_(std::move(item)), window_(window) {}

std::string ShareActions::notice() const {
  if (!item_.exists) return _("This item is no longer there.");
  if (!item_.downloaded) return _("This item is not downloaded. Until it is, only its link can be shared.");
  return "";
}

std::vector<ShareRow> ShareActions::rows() {
  const auto self = shared_from_this();
  const bool here = item_.downloaded;
  std::vector<ShareRow> rows;
  addApplicationRows(rows);
  if (!item_.folder && MailComposer::isAvailable()) {
    rows.push_back({_("Send by E-Mail"), "mail-send-symbolic", nullptr, here, [self] { self->sendByMail(); }});
  }
  if (!item_.folder && BluetoothSender::isAvailable()) {
    rows.push_back({_("Send by Bluetooth"), "bluetooth-symbolic", nullptr, here, [self] { self->sendByBluetooth(); }});
  }
  rows.push_back(
      {item_.folder ? _("Copy") : _("Copy File"), "edit-copy-symbolic", nullptr, here, [self] { self->copyFile(); }});
  if (item_.link) {
    rows.push_back({_("Copy Link"), "insert-link-symbolic", nullptr, item_.exists,
                    [self] { self->copyText(*self->item_.link, _("Link copied")); }});
  }
  if (item_.shareLink) {
    rows.push_back({_("Copy Link for Others"), "emblem-shared-symbolic", nullptr, item_.exists,
                    [self] { self->copyText(*self->item_.shareLink, _("Link for others copied")); }});
  }
  rows.push_back({_("Save a Copy…"), "document-save-as-symbolic", nullptr, here, [self] {
                    const auto window = self->window_.lock();
                    if (window && self->hasContent()) saveCopyOf(self->item_.url, self->item_.name, window);
                  }});
  return rows;
}

void ShareActions::addApplicationRows(std::vector<ShareRow>& rows) {
  const auto self = shared_from_this();
  GList* apps = g_app_info_get_recommended_for_type(item_.contentType.c_str());
  if (GAppInfo* own = g_app_info_get_default_for_type(item_.contentType.c_str(), FALSE)) apps = g_list_prepend(apps, own);
  std::vector<std::string> ids{OwnEntry};
  for (GList* at = apps; at && ids.size() <= MostApplications; at = at->next) {
    const std::shared_ptr<GAppInfo> app(G_APP_INFO(g_object_ref(at->data)), g_object_unref);
    const char* id = g_app_info_get_id(app.get());
    const bool takesFiles = g_app_info_supports_files(app.get()) || g_app_info_supports_uris(app.get());
    if (!id || !takesFiles || needsTerminal(app.get()) || std::find(ids.begin(), ids.end(), id) != ids.end()) continue;
    ids.emplace_back(id);
    rows.push_back({filled(_("Open in “%s”"), {nameOf(app.get())}), "application-x-executable-symbolic",
                    g_app_info_get_icon(app.get()), item_.downloaded, [self, app] { self->openWith(app.get()); }});
  }
  g_list_free_full(apps, g_object_unref);
  rows.push_back({_("Open With Another Application…"), "view-app-grid-symbolic", nullptr, item_.downloaded,
                  [self] { self->chooseApplication(); }});
}

bool ShareActions::hasContent() const {
  // Looked at anew: the item may have gone while the sheet was open.
  if (g_file_test(item_.url.path().c_str(), G_FILE_TEST_EXISTS)) return true;
  toast(filled(item_.exists && !item_.downloaded ? _("“%s” is not downloaded yet.") : _("“%s” is no longer there."),
               {item_.name}));
  return false;
}

GRef<GAppLaunchContext> ShareActions::contextFor(GAppInfo* app) const {
  GdkAppLaunchContext* context = gdk_display_get_app_launch_context(gdk_display_get_default());
  if (app) gdk_app_launch_context_set_icon(context, g_app_info_get_icon(app));
  return GRef<GAppLaunchContext>(G_APP_LAUNCH_CONTEXT(context));
}

LaunchFailed ShareActions::tellFailure(const std::string& title) const {
  return [weak = window_, title](const std::string& reason) {
    const auto window = weak.lock();
    if (window) showMessage(window->widget(), title, reason);
  };
}

void ShareActions::toast(const std::string& text) const {
  if (const auto window = window_.lock()) window->showToast(text);
}

bool ShareActions::openWith(GAppInfo* app) {
  if (!hasContent()) return false;
  const GRef<GFile> file(g_file_new_for_path(item_.url.path().c_str()));
  const std::string name = nameOf(app);
  if (!launchApplication(app, {takeString(g_file_get_uri(file.get()))}, contextFor(app).get(),
                         tellFailure(filled(_("“%s” Could Not Be Started"), {name})))) {
    return false;
  }
  noteRecentDocument(item_.url);
  toast(filled(_("Opening “%s” in %s…"), {item_.name, name}));
  return true;
}

bool ShareActions::openWithApplication(const ApplicationRecord& application) {
  const GRef<GDesktopAppInfo> app(g_desktop_app_info_new(application.itemID.c_str()));
  if (app) return openWith(G_APP_INFO(app.get()));
  tellFailure(filled(_("“%s” Could Not Be Started"), {application.localizedName}))(
      _("The application is no longer installed."));
  return false;
}

bool ShareActions::chooseApplication() {
  const auto window = window_.lock();
  if (!window || !hasContent()) return false;
  chooseApplicationFor(item_.name, window->widget(), [self = shared_from_this()](GAppInfo* app) { self->openWith(app); });
  return true;
}

void ShareActions::sendByMail() {
  if (!hasContent()) return;
  if (MailComposer::compose(item_.url.path(), contextFor(nullptr).get(),
                            tellFailure(_("The Mail Program Could Not Be Started")))) {
    toast(filled(_("Attaching “%s” to a message…"), {item_.name}));
  }
}

void ShareActions::sendByBluetooth() {
  if (!hasContent()) return;
  if (BluetoothSender::send(item_.url.path(), contextFor(nullptr).get(), tellFailure(_("Bluetooth Could Not Be Started")))) {
    toast(filled(_("Sending “%s” by Bluetooth…"), {item_.name}));
  }
}

void ShareActions::copyFile() {
  const auto window = window_.lock();
  if (!window || !hasContent()) return;
  copyFileToClipboard(gtk_widget_get_clipboard(GTK_WIDGET(window->widget())), item_.url.path());
  window->showToast(filled(_("“%s” copied"), {item_.name}));
}

void ShareActions::copyText(const std::string& text, const std::string& said) {
  const auto window = window_.lock();
  if (!window) return;
  gdk_clipboard_set_text(gtk_widget_get_clipboard(GTK_WIDGET(window->widget())), text.c_str());
  window->showToast(said);
}

}  // namespace vaelo
