// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <string>
#include <unordered_map>

#include "host/gtk/list/folder_item.h"
#include "host/gtk/list/worker.h"

namespace vaelo {

/// The icons of kinds of entries, each made once: a folder of 100,000 pictures has one. Main thread.
///
/// Documents go by the extension of their name. Finding the type and decoding the picture takes some milliseconds a kind, so
/// a worker does that, and rows are without icon until then.
class IconTable {
 public:
  /// `changed` is called when more icons are there.
  explicit IconTable(std::function<void()> changed);
  ~IconTable();
  IconTable(const IconTable&) = delete;
  IconTable& operator=(const IconTable&) = delete;

  /// For `widget`'s display and scale factor, `size` in application pixels. Null while it is being made.
  GdkPaintable* iconFor(const FolderItem& item, int size, GtkWidget* widget);

 private:
  void lookUp(const std::string& key, GIcon* icon, int size, int scale, GtkTextDirection direction);
  void store(const std::string& key, GdkPaintable* icon);
  void clear();

  std::function<void()> changed_;
  std::unordered_map<std::string, GdkPaintable*> icons_;  // null while under way
  GtkIconTheme* theme_ = nullptr;
  gulong themeChanged_ = 0;
  Worker worker_;
};

}  // namespace vaelo
