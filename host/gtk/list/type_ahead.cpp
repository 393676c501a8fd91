// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/type_ahead.h"

#include <algorithm>

namespace vaelo {
namespace {

constexpr std::int64_t Pause = 1000000;

std::string folded(std::string_view text) {
  // Names that are not UTF-8 are found by what is shown of them.
  char* valid = g_utf8_make_valid(text.data(), static_cast<gssize>(text.size()));
  char* normal = g_utf8_normalize(valid, -1, G_NORMALIZE_ALL);
  char* fold = g_utf8_casefold(normal, -1);
  std::string result(fold);
  g_free(fold);
  g_free(normal);
  g_free(valid);
  return result;
}

bool isAscii(std::string_view text) {
  return std::all_of(text.begin(), text.end(), [](char c) { return static_cast<unsigned char>(c) < 0x80; });
}

/// `prefix` is folded.
bool beginsWith(std::string_view name, const std::string& prefix, bool asciiPrefix) {
  const std::string_view start = name.substr(0, prefix.size());
  if (asciiPrefix && isAscii(start)) {
    return start.size() == prefix.size() &&
           std::equal(start.begin(), start.end(), prefix.begin(), [](char c, char p) { return g_ascii_tolower(c) == p; });
  }
  // Enough of the name for the prefix: letters take up to four bytes, and marks follow them.
  return folded(name.substr(0, prefix.size() * 8)).starts_with(prefix);
}

}  // namespace

bool TypeAhead::isTyping(std::int64_t now) const { return !typed_.empty() && now - last_ < Pause; }

std::optional<std::size_t> TypeAhead::type(const FolderModel& model, const std::string& letter, std::int64_t now,
                                           std::size_t from) {
  if (!isTyping(now)) typed_.clear();
  const bool again = typed_ == letter;
  if (!again) typed_ += letter;
  last_ = now;

  const std::string prefix = folded(typed_);
  const bool ascii = isAscii(prefix);
  const std::size_t count = model.itemCount();
  // A first letter looks behind the focused row, so that one can go on; a longer beginning may still be the focused row's.
  const std::size_t first = from + (again || typed_ == letter ? 1 : 0);
  for (std::size_t step = 0; step < count; ++step) {
    const std::size_t i = (first + step) % count;
    // Entries that somebody supplied are named by their paths, which nobody sees.
    const std::string_view shown = model.entries() ? (*model.entries())[i].displayName : model.nameAt(i);
    if (beginsWith(shown, prefix, ascii)) return i;
  }
  return std::nullopt;
}

}  // namespace vaelo
