// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <memory>
#include <set>
#include <string>

#include "host/gtk/preview/archive_listing.h"

namespace vaelo {

/// The rows of an archive's list: a model of folders that open in their place, and the widgets for it. Main thread.
GtkTreeListModel* makeArchiveRows(std::shared_ptr<const ArchiveListing> listing);
GtkListItemFactory* makeArchiveRowFactory();
/// The paths of the folders that are open among the first rows, and opening them again in another model.
std::set<std::string> openArchiveFolders(GtkTreeListModel* rows);
void openArchiveFolders(GtkTreeListModel* rows, const std::set<std::string>& paths);

}  // namespace vaelo
