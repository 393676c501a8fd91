// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "platform/error.h"

namespace vaelo {

/// What tells an item from every other one. Inodes are given out again soon after a deletion; the time of birth tells the
/// new owner from the old.
struct ItemIdentity {
  std::uint64_t device = 0;
  std::uint64_t inode = 0;
  std::int64_t born = 0;       ///< nanoseconds since 1970; 0 where the file system doesn't know
  std::int64_t carriedID = 0;  ///< the document identifier that the item carries; 0 for none

  bool isSameFile(const ItemIdentity& other) const {
    return device == other.device && inode == other.inode && born == other.born;
  }
};

/// Of the item at a physical path, links not followed; nothing when nothing is there. Any thread.
std::optional<ItemIdentity> identityOf(const std::string& path);
/// Of an open file, whose path is needed in case it is a promise, which carries its identifier inside.
std::optional<ItemIdentity> identityOfOpenFile(int handle, const std::string& path);

enum class Carrying { Done, CarriesAnother, NotPossible };
/// Makes the item carry `id`. Unless `replacing`, an identifier that is there already stays: another process may be giving
/// one at the same moment, and the first one stands.
Carrying carryID(const std::string& path, std::int64_t id, bool replacing);

}  // namespace vaelo
