// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <memory>

#include "platform/ui/alert_controller.h"

namespace vaelo {

/// Shows an alert that asks for text: its fields, what its content view says, and its actions, which may refuse to let it
/// go. The dialog lives until its window is destroyed. Main thread.
GtkWindow* showPromptDialog(const std::shared_ptr<AlertController>& alert, GtkWindow* over, std::function<void()> shown);

}  // namespace vaelo
