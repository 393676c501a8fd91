// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

namespace vaelo {

/// Which different names the drive's store takes for one. The disk under the mirror may tell them apart, but the store could
/// keep one of the items only.
struct NameRules {
  bool foldsCase = false;           ///< "a" and "A"
  bool foldsNormalization = false;  ///< "é" as one character and as two
  bool foldAny() const { return foldsCase || foldsNormalization; }
};

/// What the account's file says of the store: [Store] FoldsCase and FoldsNormalization, both false when absent.
NameRules readNameRules(const std::string& accountFile);

/// The item in the folder of `path` that the store would take for `path`, but for `path` itself and `but`; nothing when
/// there is none. Reads the folder when the rules fold anything. Any thread.
std::optional<std::string> clashingItem(const std::string& path, const NameRules& rules, const std::string& but = {});

}  // namespace vaelo
