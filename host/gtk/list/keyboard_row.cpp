// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/keyboard_row.h"

#include <algorithm>
#include <utility>

namespace vaelo {

KeyboardRow::KeyboardRow(GtkWidget* view, const FolderModel& model, std::function<const FolderItem*()> focused)
    : view_(view), model_(model), focused_(std::move(focused)) {
  const auto follow = [](KeyboardRow* self) {
    self->unfollow();
    g_set_weak_pointer(&self->root_, gtk_widget_get_root(self->view_));
    if (!self->root_) return;
    g_signal_connect_swapped(self->root_, "notify::focus-widget", G_CALLBACK(+[](KeyboardRow* kept) { kept->note(); }),
                             self);
  };
  g_signal_connect_swapped(view_, "notify::root", G_CALLBACK(+follow), this);
}

KeyboardRow::~KeyboardRow() {
  unfollow();
  g_signal_handlers_disconnect_by_data(view_, this);
}

void KeyboardRow::unfollow() {
  if (root_) g_signal_handlers_disconnect_by_data(root_, this);
  g_clear_weak_pointer(&root_);
}

void KeyboardRow::note() {
  // A page that goes out of sight loses it to a row that nobody chose.
  if (held_ || !gtk_widget_get_mapped(view_)) return;
  const FolderItem* item = focused_();
  if (!item || (known_ && item->name == formerName_)) return;
  set(item->name);
}

void KeyboardRow::set(const std::string& name) {
  const auto i = model_.indexOf(name);
  if (!i) return;
  known_ = true;
  name_ = name;
  formerName_.clear();
  position_ = *i;
}

void KeyboardRow::renamed(const std::string& from, const std::string& to) {
  if (known_ && name_ == from) formerName_ = std::exchange(name_, to);
}

std::optional<std::size_t> KeyboardRow::position() {
  if (!known_ || model_.itemCount() == 0) return std::nullopt;
  auto i = model_.indexOf(name_);
  if (!i && !formerName_.empty()) i = model_.indexOf(formerName_);
  position_ = i.value_or(std::min(position_, model_.itemCount() - 1));
  return position_;
}

}  // namespace vaelo
