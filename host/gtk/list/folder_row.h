// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <unordered_set>

#include "host/gtk/list/folder_item.h"
#include "host/gtk/list/icon_table.h"

namespace vaelo {

/// What all rows of a list share. Outlives them, or parts from them (folderRowsPart).
struct RowContext {
  GtkWidget* list = nullptr;  ///< the scrolled list; rows well outside of what it shows don't draw
  bool grid = false;
  bool editing = false;  ///< check marks are shown
  IconTable* icons = nullptr;
  std::function<bool(const FolderItem&)> isSelected;
  std::function<void(FolderItem&)> drawn;           ///< the item is on screen or about to be
  std::function<void(GtkWidget* row)> itemChanges;  ///< the row is about to show another item, or nothing
  std::unordered_set<GtkWidget*> rows;
};

constexpr int ListIconSize = 40;
constexpr int GridIconSize = 64;

/// A row or grid cell: icon or thumbnail, name, second line, check mark, and a cloud for what is not downloaded. One widget
/// that draws all of it: a list makes two hundred rows before it shows the first, and labels would be most of that time.
/// Main thread.
GtkWidget* folderRowNew(RowContext& context);
/// Shows `item` (a FolderItem object) from now on; null shows nothing.
void folderRowSetItem(GtkWidget* row, GObject* item);
GObject* folderRowItem(GtkWidget* row);
/// The item's details or kind changed.
void folderRowItemChanged(GtkWidget* row);
/// Whether a place that far from the row's left edge is at its check mark; never in a grid.
bool folderRowMarkIsAt(GtkWidget* row, double x);
/// Moves what the row shows towards its start, so that nothing is drawn on so many pixels at its end.
void folderRowSetUncovered(GtkWidget* row, double pixels);
/// The list scrolled or grew: rows that didn't draw while far away look again.
void folderRowsScrolled(RowContext& context);
/// The context goes. A row that GTK still holds on to, as while it handles a press, shows nothing any more.
void folderRowsPart(RowContext& context);
/// The row at or above `widget`, or null.
GtkWidget* folderRowAt(GtkWidget* widget);
/// The same, or the row in `widget`, which may be a list's own item around one, or null.
GtkWidget* folderRowIn(GtkWidget* widget);

}  // namespace vaelo
