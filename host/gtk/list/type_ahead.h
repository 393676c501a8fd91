// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "host/gtk/list/folder_model.h"

namespace vaelo {

/// Finds rows by the first letters that are typed. Letters that follow within a second make the beginning longer; the same
/// letter again goes to the next row that begins with it. Case doesn't count. Main thread.
class TypeAhead {
 public:
  /// The row to go to; nothing when no name begins so. `letter` is UTF-8, `now` in microseconds of any steady clock, `from`
  /// the row that has the focus. O(n), some milliseconds for 100,000 rows.
  std::optional<std::size_t> type(const FolderModel& model, const std::string& letter, std::int64_t now, std::size_t from);
  /// True while a letter more would make the beginning longer.
  bool isTyping(std::int64_t now) const;

 private:
  std::string typed_;
  std::int64_t last_ = 0;
};

}  // namespace vaelo
