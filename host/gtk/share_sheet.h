// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <string>
#include <vector>

#include "host/desktop/shared_item.h"

namespace vaelo {

/// A row of the share sheet.
struct ShareRow {
  std::string title;
  std::string iconName;   ///< when there is no `icon`
  GIcon* icon = nullptr;  ///< not owned; needed while the sheet is made
  bool enabled = true;
  std::function<void()> chosen;
};

/// Makes the sheet: what is shared, what is to be known of it, and a list of rows. A row's `chosen` runs on a tap or Enter.
/// `closed` is what the close button does; without one there is no such button. What is higher than `mostHeight` scrolls.
/// The caller sinks the reference. Main thread.
GtkWidget* makeShareSheet(const SharedItem& item, const std::string& notice, std::vector<ShareRow> rows, int mostHeight,
                          std::function<void()> closed);
/// Gives the keyboard to the first row of a sheet that shows.
void focusFirstShareRow(GtkWidget* sheet);

}  // namespace vaelo
