// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <limits>

namespace vaelo {

/// Bytes of an account, neither below zero.
struct StorageFigures {
  std::int64_t free = 0;
  std::int64_t total = 0;

  /// 0 to 100. An account that may hold nothing has nothing free.
  double freePercent() const {
    if (total <= 0) return 0;
    const double share = 100.0 * static_cast<double>(free) / static_cast<double>(total);
    return share > 100 ? 100 : share;
  }
  friend bool operator==(const StorageFigures&, const StorageFigures&) = default;
};

/// From a file system's own figures, in blocks. Some report more than there is in the world, which counts as the most there
/// can be.
inline StorageFigures storageFigures(std::uint64_t freeBlocks, std::uint64_t blocks, std::uint64_t blockSize) {
  constexpr auto most = std::numeric_limits<std::int64_t>::max();
  const auto bytes = [blockSize](std::uint64_t count) {
    std::uint64_t product = 0;
    const bool overflows = __builtin_mul_overflow(count, blockSize, &product);
    return overflows || product > static_cast<std::uint64_t>(most) ? most : static_cast<std::int64_t>(product);
  };
  return {bytes(freeBlocks), bytes(blocks)};
}

}  // namespace vaelo
