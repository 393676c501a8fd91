// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gio/gio.h>

#include <cstdint>
#include <functional>
#include <string>

#include "host/support/glib_ptr.h"

namespace vaelo {

/// How a copy out of the drive ended.
struct CopyOutcome {
  enum class Kind { Copied, Cancelled, Failed };
  Kind kind = Kind::Copied;
  std::string reason;         ///< for a person, when it failed
  std::size_t notCopied = 0;  ///< items of a folder that are not downloaded
};

/// Copies a document or folder to a place that the user chose, on whatever disk GIO reaches. Blocks, so belongs on a worker.
///
/// The copy grows under a hidden name beside its destination and gets its own name when it is whole; until then, and on
/// failure, what was there stays as it was. A document that stands at the destination at the start is replaced, since the
/// user was asked; what comes there later never is, nor is a folder. What the account knows of the item (identifier,
/// sharing) stays behind; items that are not downloaded are left out and counted.
class CopyOut {
 public:
  /// Called on the worker with the bytes copied and those there are, now and then.
  using Progress = std::function<void(std::uint64_t done, std::uint64_t all)>;

  CopyOut(GFile* source, GFile* destination, GCancellable* cancellable, Progress progress);
  CopyOutcome run();

 private:
  bool mayGoThere(GError** error);
  std::uint64_t sizeOf(GFile* item);
  bool copy(GFile* from, GFile* to, GError** error);
  bool copyFolder(GFile* from, GFile* to, GError** error);
  bool putInPlace(GFile* made, GError** error);

  GRef<GFile> source_;
  GRef<GFile> destination_;
  GRef<GCancellable> cancellable_;
  Progress progress_;
  bool replaces_ = false;
  std::uint64_t all_ = 0;
  std::uint64_t done_ = 0;
  std::size_t notCopied_ = 0;
};

}  // namespace vaelo
