// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <memory>
#include <string>

#include "host/gtk/list/folder_snapshot.h"

namespace vaelo {

/// What is read of an entry once its row is seen.
struct ItemDetails {
  std::string displayName;          ///< UTF-8, for an item whose extension is hidden; else empty
  std::string secondLine;           ///< UTF-8, ready to show
  std::string shortLine;            ///< what stands first in it, for below an icon
  GdkTexture* thumbnail = nullptr;  ///< owned
  bool mayHaveThumbnail = false;    ///< one is missing that could be made
  ItemDetails() = default;
  ~ItemDetails() { g_clear_object(&thumbnail); }
  ItemDetails(const ItemDetails&) = delete;
  ItemDetails& operator=(const ItemDetails&) = delete;
};

/// One row of a FolderModel. It lives while somebody holds it, which lists do for the rows near the visible ones. Main
/// thread.
struct FolderItem {
  std::string name;         ///< bytes; the path where the entries were supplied by the caller
  std::string displayName;  ///< UTF-8
  std::string icon;         ///< the name of an icon that stands in for that of the kind; may be empty
  std::string place;        ///< UTF-8, where it lies, shown before what is read of it; may be empty
  EntryKind kind;
  bool detailsAreFresh = false;
  std::shared_ptr<const ItemDetails> details;  ///< null until read; kept while newer ones are on their way
  GtkWidget* row = nullptr;                    ///< shows the item at the moment
  std::function<void(FolderItem&)> finalized;
};

GType folderItemGetType();
/// A new object that holds `item`; owned by the caller.
GObject* folderItemNew(FolderItem item);
/// The item in an object of folderItemGetType(), as long as the object lives.
FolderItem& folderItemOf(gpointer object);

}  // namespace vaelo
