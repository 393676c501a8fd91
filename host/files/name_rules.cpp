// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/name_rules.h"

#include <glib.h>

#include "host/drive/small_file.h"
#include "host/files/tree_walk.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

std::string folded(const std::string& name, const NameRules& rules) {
  std::string text = takeString(g_utf8_make_valid(name.data(), static_cast<gssize>(name.size())));
  if (rules.foldsCase) text = takeString(g_utf8_casefold(text.c_str(), -1));
  if (rules.foldsNormalization) text = takeString(g_utf8_normalize(text.c_str(), -1, G_NORMALIZE_NFC));
  return text;
}

}  // namespace

NameRules readNameRules(const std::string& accountFile) {
  const Result<KeyFile> file = readKeyFile(accountFile);
  if (!file) return {};
  GKeyFile* keys = file.value->get();
  return {keyFileBool(keys, "Store", "FoldsCase", false), keyFileBool(keys, "Store", "FoldsNormalization", false)};
}

std::optional<std::string> clashingItem(const std::string& path, const NameRules& rules, const std::string& but) {
  if (!rules.foldAny()) return std::nullopt;
  const URL wanted(path);
  const std::string name = folded(wanted.lastPathComponent(), rules);
  std::optional<std::string> found;
  const auto compare = [&](const URL& item) {
    const bool clashes = item.path() != path && item.path() != but && folded(item.lastPathComponent(), rules) == name;
    if (clashes) found = item.path();
    return !clashes;
  };
  enumerateTree(wanted.deletingLastPathComponent(), SkipsSubdirectoryDescendants, compare,
                [](const URL&, const Error&) { return true; });
  return found;
}

}  // namespace vaelo
