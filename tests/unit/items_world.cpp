// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/unit/items_world.h"

namespace vaelo {

ItemsWorld::ItemsWorld() {
  documentsDirectories.clear();
  typeOfExtension.clear();
  conformances.clear();
  descriptions.clear();
  types.makesTypes = false;
  cloud.movesAreFree = false;
  evictError.reset();
  characters.alsoIllegal = "\\";
  resolvedFile.value = 7;
  openedHandle.value = 7;
  openAttributes.value.emplace();
}

MemoryItem& ItemsWorld::addFile(const URL& url, ResourceMap said) { return add(url, FileType::Regular, std::move(said)); }

MemoryItem& ItemsWorld::addFolder(const URL& url, ResourceMap said) {
  return add(url, FileType::Directory, std::move(said));
}

MemoryItem& ItemsWorld::add(const URL& url, FileType type, ResourceMap said) {
  MemoryItem& item = disk.add(url.path(), type);
  item.attributes = {};
  item.attributes.type = type;
  item.values = std::move(said);
  item.hasOnlyValues = true;
  return item;
}

}  // namespace vaelo
