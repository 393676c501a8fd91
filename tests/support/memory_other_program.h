// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "tests/support/memory_disk.h"
#include "tests/support/memory_file_coordination.h"

namespace vaelo {

/// What another program does to the drive in memory, uncoordinated: who shows the items hears of it on its queue.
class MemoryOtherProgram {
 public:
  MemoryOtherProgram(MemoryDisk& disk, MemoryFileCoordination& coordination) : disk_(disk), coordination_(coordination) {}

  /// Writes a file, also where none is, at the time that the clock says.
  void write(const std::string& path, std::uint64_t size);
  void rename(const std::string& from, const std::string& to);
  void remove(const std::string& path);
  /// Puts the content in place of a promise.
  void download(const std::string& path);

 private:
  MemoryDisk& disk_;
  MemoryFileCoordination& coordination_;
};

}  // namespace vaelo
