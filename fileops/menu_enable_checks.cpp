// SPDX-License-Identifier: GPL-3.0-or-later
#include "fileops/menu_enable_checks.h"

#include <algorithm>
#include <optional>
#include <string>

#include "items/dr_item.h"
#include "items/file_utils.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

/// The container of the folder on screen and the folder's depth in it; null, with a line in the log, when it is unknown.
CloudContainerRef containerShown(const DocumentListController& list, std::size_t& depth) {
  CloudContainerRef container;
  std::vector<std::string> components;
  std::optional<Error> error;
  if (list.presentedURL()) {
    error = FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(*list.presentedURL(), &container,
                                                                                     &components);
  }
  if (error || !container) {
    VLO_ERROR("Couldn't get container for URL %@: %@", list.presentedURL(), error);
    return nullptr;
  }
  depth = components.size();
  return container;
}

}  // namespace

unsigned MenuEnableChecks::numContainersInURLArray(const std::vector<URL>& urls) {
  CloudDocuments& drive = Platform::current().cloudDocuments;
  return static_cast<unsigned>(
      std::count_if(urls.begin(), urls.end(), [&drive](const URL& url) { return drive.isDocumentsContainer(url); }));
}

unsigned MenuEnableChecks::numFoldersInURLArray(const std::vector<URL>& urls) {
  const bool any = std::any_of(urls.begin(), urls.end(), [](const URL& url) {
    const std::shared_ptr<DRItem> item = DRItem::initWithURL(url);
    return item && item->isDirectory() && !item->isPackage();
  });
  return any ? 1 : 0;
}

bool MenuEnableChecks::isDesktopOrDocumentsInURLArray(const std::vector<URL>& urls) {
  return std::any_of(urls.begin(), urls.end(), vlo_isDesktopOrDocumentsFolder);
}

bool MenuEnableChecks::canShowMoveForSelectedItems(const DocumentListController& list) {
  // Of most items the list knows enough: looking at each of 100,000 on the disk would take seconds.
  const std::vector<URL> special = list.selectedItemsThatMayBeSpecial();
  if (list.selectedItemCount() == 0 || isDesktopOrDocumentsInURLArray(special)) return false;
  if (numContainersInURLArray(special) > 0) return false;
  return containerSupportsAnyDepth(list) || numFoldersInURLArray(list.selectedItemsThatMayBeFolders()) == 0;
}

bool MenuEnableChecks::canShowDeleteForSelectedItems(const DocumentListController& list) {
  const std::vector<URL> special = list.selectedItemsThatMayBeSpecial();
  if (list.selectedItemCount() == 0 || isDesktopOrDocumentsInURLArray(special)) return false;
  const unsigned containers = numContainersInURLArray(special);
  return containers == 0 || containers == list.selectedItemCount();
}

bool MenuEnableChecks::canEnableNewFolderForSelectedItems(const DocumentListController& list) {
  std::size_t depth = 0;
  const CloudContainerRef container = containerShown(list, depth);
  if (!container) return false;
  const std::string identifier = container->identifier();
  const std::optional<std::string> levels = container->supportedFolderLevels();
  if (!levels) {
    VLO_DEBUG("Container %@ has no depth. Enabling new folder button", identifier);
    return true;
  }
  if (*levels == FolderLevelsNone) {
    VLO_DEBUG("Container %@ supports no folders. Disabling new folder button", identifier);
    return false;
  }
  if (*levels == FolderLevelsAny) {
    VLO_DEBUG("Container %@ supports any folder. Enabling new folder button", identifier);
    return true;
  }
  if (*levels != FolderLevelsOne) {
    VLO_WARNING("Container %@ has unknown depth option %@. Disabling new folder button", identifier, levels);
    return false;
  }
  if (depth == 0) {
    VLO_DEBUG("Container %@ supports one folder. File is depth 0. Enabling new folder button", identifier);
    return true;
  }
  VLO_DEBUG("Container %@ supports one folder. File is depth %u. Disabling new folder button", identifier, depth);
  return false;
}

// The lines speak of the new folder button: they are those that a log of that button has.
bool MenuEnableChecks::containerSupportsAnyDepth(const DocumentListController& list) {
  std::size_t depth = 0;
  const CloudContainerRef container = containerShown(list, depth);
  if (!container) return false;
  const std::optional<std::string> levels = container->supportedFolderLevels();
  if (!levels) {
    VLO_DEBUG("Container %@ has no depth. Enabling new folder button", container->identifier());
    return true;
  }
  if (*levels != FolderLevelsAny) return false;
  VLO_DEBUG("Container %@ supports any folder. Enabling new folder button", container->identifier());
  return true;
}

bool MenuEnableChecks::containerHasSubfolders(const URL& url) {
  CloudContainerRef container;
  if (FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(url, &container, nullptr)) return true;
  const std::optional<URL> top = container ? container->documentsFolderURL() : std::nullopt;
  if (!container) return true;
  if (!top) return false;
  const std::vector<ResourceKey> keys = {ResourceKey::IsDirectory, ResourceKey::IsPackage};
  bool found = false;
  const auto visit = [&found, &keys](const URL& entry) {
    // Those of the promised item, so that what is not downloaded counts as well.
    ResourceMap values =
        Platform::current().resourceValues.promisedItemResourceValues(entry, keys).value.value_or(ResourceMap());
    found = values[ResourceKey::IsDirectory].boolValue() && !values[ResourceKey::IsPackage].boolValue();
    return !found;
  };
  const auto skip = [](const URL& entry, const Error& error) {
    VLO_INFO("Error enumerating %@: %@", entry, error);
    return true;
  };
  Platform::current().fileManager.enumerate(
      *top, keys, SkipsSubdirectoryDescendants | SkipsPackageDescendants | SkipsHiddenFiles, visit, skip);
  return found;
}

}  // namespace vaelo
