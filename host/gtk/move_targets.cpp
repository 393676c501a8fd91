// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/move_targets.h"

#include <cstring>
#include <unordered_set>

#include "host/gtk/list/folder_reader.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "items/file_utils.h"

namespace vaelo {

namespace {

/// Whether the container lets folders be put at this depth; 0 is its top.
bool takesFolders(const CloudContainer& container, std::size_t depth) {
  const std::optional<std::string> levels = container.supportedFolderLevels();
  if (!levels || *levels == FolderLevelsAny) return true;
  return *levels == FolderLevelsOne && depth == 0;
}

bool canHoldNewFolder(const URL& folder) {
  CloudContainerRef container;
  std::vector<std::string> components;
  const bool isUnknown =
      FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(folder, &container, &components).has_value();
  return !isUnknown && container && takesFolders(*container, components.size());
}

std::string refusalOf(const URL& folder, const std::vector<URL>& items) {
  CloudContainerRef container;
  std::vector<std::string> components;
  if (FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(folder, &container, &components) ||
      !container) {
    return _("This folder can’t be used.");
  }
  bool allHere = true;
  for (const URL& item : items) {
    if (folder.path() == item.path() || folder.isInside(item)) return _("A folder can’t be moved into itself.");
    allHere = allHere && item.deletingLastPathComponent().path() == folder.path();
    const bool isFolder = FileUtils::getResourceValueForURL(ResourceKey::IsDirectory, item).boolValue() &&
                          !FileUtils::getResourceValueForURL(ResourceKey::IsPackage, item).boolValue();
    if (isFolder && !takesFolders(*container, components.size())) return _("This library doesn’t take folders here.");
    if (!isFolder && !FileUtils::isValidExtensionForContainer(folder.appendingPathComponent(item.lastPathComponent()))) {
      return _("This library doesn’t take documents of this type.");
    }
  }
  return allHere
             ? (items.size() == 1 ? _("The item is in this folder already.") : _("The items are in this folder already."))
             : "";
}

}  // namespace

MoveTarget moveTargetAt(const URL& folder, const std::vector<URL>& items, bool libraries, CloudDocuments& drive) {
  MoveTarget target;
  target.refusal = refusalOf(folder, items);
  const FolderReading reading = readFolder(folder.path());
  if (!reading.snapshot) {
    target.refusal = filled(_("This folder can’t be read: %s"), {g_strerror(reading.errorNumber)});
    return target;
  }
  target.takesFolders = canHoldNewFolder(folder);
  std::unordered_set<std::string> moved;
  for (const URL& item : items) moved.insert(item.path());
  for (std::size_t i = 0; i < reading.snapshot->size(); ++i) {
    if (reading.snapshot->kind(i) != EntryKind::Folder) continue;
    const std::string name(reading.snapshot->name(i));
    const std::string path = folder.appendingPathComponent(name).path();
    if (moved.contains(path)) continue;
    target.folders.push_back({takeString(g_filename_display_name(name.c_str())), path, EntryKind::Folder, ""});
  }
  if (!libraries) return target;
  for (const CloudContainerRef& container : drive.allContainers()) {
    const std::optional<URL> documents = container->documentsFolderURL();
    if (!documents || container->identifier() == drive.defaultContainerIdentifier()) continue;
    target.folders.push_back({container->localizedName(), documents->path(), EntryKind::Folder, LibraryIcon});
  }
  return target;
}

}  // namespace vaelo
