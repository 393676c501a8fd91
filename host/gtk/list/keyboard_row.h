// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <optional>
#include <string>

#include "host/gtk/list/folder_model.h"

namespace vaelo {

/// Which row of a list has the keyboard, or had it last: known by its item, and once that is gone by its place. The toolkit
/// knows it by the widget, which goes with the item, or comes to show another one. Main thread.
class KeyboardRow {
 public:
  /// `focused` answers the item of `view` whose row has the keyboard, null for none. All outlive this.
  KeyboardRow(GtkWidget* view, const FolderModel& model, std::function<const FolderItem*()> focused);
  ~KeyboardRow();
  KeyboardRow(const KeyboardRow&) = delete;
  KeyboardRow& operator=(const KeyboardRow&) = delete;

  /// Where the keyboard belongs; nothing as long as no row had it, and in an empty list.
  std::optional<std::size_t> position();
  /// It belongs to this item, unless that isn't listed.
  void set(const std::string& name);
  /// An item gets another name: of the two, the row is that which is listed.
  void renamed(const std::string& from, const std::string& to);
  /// While the rows change, the toolkit moves the keyboard by rules of its own, which say nothing about where it belongs.
  void hold(bool held) { held_ = held; }

 private:
  void note();
  void unfollow();

  GtkWidget* view_;
  const FolderModel& model_;
  const std::function<const FolderItem*()> focused_;
  GtkRoot* root_ = nullptr;  // weak pointer
  bool held_ = false;
  bool known_ = false;
  std::string name_;
  std::string formerName_;
  std::size_t position_ = 0;
};

}  // namespace vaelo
