// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "host/drive/drive_layout.h"
#include "platform/notifications.h"

namespace vaelo {

/// Shows the accounts of this device in a dialog: who is signed in, signing in and out, and adding one. It follows the
/// account file, and so does the rest of the program; the disk is touched by a worker. Both references outlive the dialog,
/// which is gone with `over`. Main thread.
GtkWindow* showAccountsPage(GtkWindow* over, const DriveLayout& layout, NotificationCenter& notifications);

}  // namespace vaelo
