// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/folder_item.h"

#include <utility>

namespace vaelo {
namespace {

struct ItemObject {
  GObject parent;
  FolderItem* item;
};

struct ItemClass {
  GObjectClass parent;
};

void finalize(GObject* object) {
  FolderItem* item = reinterpret_cast<ItemObject*>(object)->item;
  if (item) {
    if (item->finalized) item->finalized(*item);
    delete item;
  }
  static_cast<GObjectClass*>(g_type_class_peek_parent(G_OBJECT_GET_CLASS(object)))->finalize(object);
}

}  // namespace

GType folderItemGetType() {
  static const GType type = g_type_register_static_simple(
      G_TYPE_OBJECT, "VaeloFolderItem", sizeof(ItemClass),
      [](gpointer itemClass, gpointer) { G_OBJECT_CLASS(itemClass)->finalize = finalize; }, sizeof(ItemObject), nullptr,
      G_TYPE_FLAG_NONE);
  return type;
}

GObject* folderItemNew(FolderItem item) {
  auto* object = static_cast<GObject*>(g_object_new(folderItemGetType(), nullptr));
  reinterpret_cast<ItemObject*>(object)->item = new FolderItem(std::move(item));
  return object;
}

FolderItem& folderItemOf(gpointer object) { return *static_cast<ItemObject*>(object)->item; }

}  // namespace vaelo
