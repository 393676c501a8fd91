// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <memory>
#include <string>

#include "platform/ui/alert_controller.h"

namespace vaelo {

/// Shows an alert over the window and reports what was pressed to the model. The dialog lives until it is closed; its window
/// is returned so that it can be closed from code. Main thread.
GtkWindow* showAlertDialog(const std::shared_ptr<AlertController>& alert, GtkWindow* over, std::function<void()> shown);

/// Tells the user something that has one answer. `over` may be null. Main thread.
void showMessage(GtkWindow* over, const std::string& title, const std::string& text);

}  // namespace vaelo
