// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_other_program.h"

namespace vaelo {

void MemoryOtherProgram::write(const std::string& path, std::uint64_t size) {
  if (MemoryItem* item = disk_.logicalItem(path)) {
    item->attributes.size = Value(size);
    item->attributes.modificationDate = disk_.now();
  } else {
    disk_.add(path, FileType::Regular, size);
  }
  coordination_.othersChanged(URL(path));
}

void MemoryOtherProgram::rename(const std::string& from, const std::string& to) {
  const std::string folder = URL(to).deletingLastPathComponent().path();
  if (!disk_.hasFolder(folder)) disk_.addFolder(folder);
  const bool replaces = disk_.logicalItem(to) != nullptr;
  if (replaces) disk_.remove(disk_.place(to));
  disk_.move(disk_.place(from), disk_.place(to));
  // Saving under a new name is a change of the document, and no move of the file that held the text.
  if (replaces) {
    coordination_.othersChanged(URL(to));
  } else {
    coordination_.othersMoved(URL(from), URL(to));
  }
}

void MemoryOtherProgram::remove(const std::string& path) {
  disk_.remove(disk_.place(path));
  coordination_.othersDelete(URL(path));
}

void MemoryOtherProgram::download(const std::string& path) {
  if (MemoryItem* item = disk_.logicalItem(path)) item->isPromise = false;
  coordination_.othersChanged(URL(path));
}

}  // namespace vaelo
