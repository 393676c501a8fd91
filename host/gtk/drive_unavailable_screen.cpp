// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/drive_unavailable_screen.h"

#include <adwaita.h>

#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

std::string reasonOf(const std::optional<Error>& setUpFailure) {
  if (!setUpFailure) return _("No account is signed in on this device. Sign in to see your documents.");
  if (setUpFailure->code == FileErrorCode::WriteOutOfSpace) {
    return _("There is no space left on the disk to set up your drive. Make room, then start Vaelo Drive again.");
  }
  const std::string reason = setUpFailure->localizedFailureReason.value_or(setUpFailure->description());
  return filled(_("Your drive can’t be set up: %s. Start Vaelo Drive again once this is mended."), {translated(reason)});
}

}  // namespace

DriveUnavailableController::DriveUnavailableController(const std::optional<Error>& setUpFailure)
    : page_(GTK_WIDGET(g_object_ref_sink(adw_status_page_new()))) {
  // So that a phone on its side has room for the button as well.
  gtk_widget_add_css_class(page_, "compact");
  adw_status_page_set_icon_name(ADW_STATUS_PAGE(page_),
                                setUpFailure ? "drive-harddisk-symbolic" : "network-offline-symbolic");
  adw_status_page_set_title(ADW_STATUS_PAGE(page_), _("Vaelo Drive is not available"));
  const std::string reason = takeString(g_markup_escape_text(reasonOf(setUpFailure).c_str(), -1));
  adw_status_page_set_description(ADW_STATUS_PAGE(page_), reason.c_str());
  if (!setUpFailure) {
    accounts_ = gtk_button_new_with_label(_("Accounts…"));
    gtk_actionable_set_action_name(GTK_ACTIONABLE(accounts_), "app.accounts");
    gtk_widget_add_css_class(accounts_, "pill");
    gtk_widget_set_halign(accounts_, GTK_ALIGN_CENTER);
    adw_status_page_set_child(ADW_STATUS_PAGE(page_), accounts_);
  }
  setTitle("Vaelo Drive");
}

DriveUnavailableController::~DriveUnavailableController() { g_object_unref(page_); }

}  // namespace vaelo
