// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/drive_unavailable_screen.h"

#include <adwaita.h>

namespace vaelo {

DriveUnavailableController::DriveUnavailableController() : page_(GTK_WIDGET(g_object_ref_sink(adw_status_page_new()))) {
  adw_status_page_set_icon_name(ADW_STATUS_PAGE(page_), "network-offline-symbolic");
  adw_status_page_set_title(ADW_STATUS_PAGE(page_), "Vaelo Drive is not available");
  adw_status_page_set_description(ADW_STATUS_PAGE(page_),
                                  "No account is signed in on this device. Sign in to see your documents.");
  setTitle("Vaelo Drive");
}

DriveUnavailableController::~DriveUnavailableController() { g_object_unref(page_); }

}  // namespace vaelo
