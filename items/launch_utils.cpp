// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/launch_utils.h"

#include <algorithm>

#include "items/file_utils.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

namespace {

std::vector<ApplicationRecord> candidatesFor(const std::optional<URL>& document) {
  if (!document) return {};
  const std::shared_ptr<DocumentRecord> record = Platform::current().launchServices.documentRecord(*document, false);
  return record ? LaunchUtils::availableAppsForDoc(*record) : std::vector<ApplicationRecord>();
}

}  // namespace

std::vector<ApplicationRecord> LaunchUtils::availableAppsForDoc(DocumentRecord& record) {
  std::vector<ApplicationRecord> found;
  found.reserve(8);
  const std::optional<std::string> type = FileUtils::fileUTI(record.url());
  const Result<DocumentRecord::Ranked> ranked = record.applicationsAvailableForOpeningByHandlerRank();
  if (!ranked.value) return found;
  for (const auto& [rank, applications] : *ranked.value) {
    for (const ApplicationRecord& application : applications) {
      if (rank != HandlerRankOwner) {
        VLO_DEBUG("UTI %{public}@: Found non-Owner '%{public}@' app %{public}@", type, rank, application.description());
      } else if (!application.supportsOpenInPlace) {
        VLO_DEBUG("UTI %{public}@: Found non-OpenInPlace app %{public}@", type, application.description());
      } else {
        VLO_DEBUG("UTI %{public}@: Found *perfect* app: %{public}@", type, application.description());
        found.push_back(application);
      }
    }
  }
  return found;
}

bool LaunchUtils::isUrlInDefaultContainer(const URL& url) {
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  return cloud.containerIdentifierForURL(url) == cloud.defaultContainerIdentifier();
}

std::optional<ApplicationRecord> LaunchUtils::defaultAppForDocumentRequireOpenIn(const URL& document, bool requireOpenIn) {
  if (!FileUtils::exists(document)) VLO_DEBUG("Assuming apps can open a promised document...");
  return isUrlInDefaultContainer(document) ? appForDocumentInDrive(document, requireOpenIn)
                                           : appForDocumentInLibrary(document);
}

std::optional<ApplicationRecord> LaunchUtils::appForDocumentInDrive(const URL& document, bool requireOpenIn) {
  const std::optional<URL> resolved = vlo_URLByResolvingBookmark(document);
  if (resolved && FileUtils::isAudioVideoImageFile(*resolved)) {
    VLO_DEBUG("Preferring GL due to file type, over default app to open %@", *resolved);
    return std::nullopt;
  }
  const std::vector<ApplicationRecord> candidates = candidatesFor(resolved);
  if (candidates.empty()) {
    VLO_DEBUG("No default app to open %@", resolved);
    return std::nullopt;
  }
  const ApplicationRecord& app = candidates.front();
  VLO_DEBUG("App for %@: %@, %@, %@, %@, %@, %@, %@, %@, %@, %@, %@", document, app.itemName, app.localizedName,
            app.localizedShortName, app.shortVersionString, app.vendorName, app.bundleIdentifier, app.executableName,
            app.bundleContainerURL, app.isInstalled, app.itemID, app.description());
  if (requireOpenIn && !app.supportsOpenInPlace) {
    VLO_DEBUG("App %@ does not support open in place. Ignoring", app.description());
    return std::nullopt;
  }
  if (app.bundleIdentifier == Platform::current().launchServices.ownBundleIdentifier()) {
    VLO_DEBUG("Ignoring %@ as default app", app.description());
    return std::nullopt;
  }
  return app;
}

std::optional<ApplicationRecord> LaunchUtils::appForDocumentInLibrary(const URL& document) {
  Platform& platform = Platform::current();
  const std::optional<std::string> identifier = platform.cloudDocuments.containerIdentifierForURL(document);
  const CloudContainerRef container = identifier ? platform.cloudDocuments.containerWithIdentifier(*identifier) : nullptr;
  if (!container) return std::nullopt;
  const std::vector<ApplicationRecord> candidates = candidatesFor(vlo_URLByResolvingBookmark(document));
  const std::string name = container->localizedName();
  for (const std::string& owner : container->ownerBundleIdentifiers()) {
    const std::optional<ApplicationRecord> app = platform.launchServices.applicationRecord(owner);
    if (!app || !app->supportsOpenInPlace) {
      VLO_DEBUG("Container %@: Default app (%@) %@", name, owner,
                app && app->isInstalled ? "doesn't support open in place" : "not installed");
      continue;
    }
    VLO_DEBUG("Container %@: Default app (%@) supports open in place", name, owner);
    if (std::find(candidates.begin(), candidates.end(), *app) != candidates.end()) return app;
    VLO_DEBUG("Container %@: Default app does NOT support/own this document type.", name);
    const auto fallback = std::find_if(candidates.begin(), candidates.end(),
                                       [](const ApplicationRecord& candidate) { return candidate.supportsOpenInPlace; });
    if (fallback != candidates.end()) {
      VLO_DEBUG("Falling back to default open-in-place app instead: %@", fallback->description());
      return *fallback;
    }
    VLO_DEBUG("No fallback app, using Glimpse");
  }
  return std::nullopt;
}

std::optional<std::string> LaunchUtils::defaultAppNameForDocumentRequireOpenIn(const URL& document, bool requireOpenIn) {
  const std::optional<ApplicationRecord> app = defaultAppForDocumentRequireOpenIn(document, requireOpenIn);
  return app ? std::optional(app->localizedName) : std::nullopt;
}

bool LaunchUtils::openInDefaultAppViewControllerRequireOpenIn(const URL& document, const ViewControllerRef& presenter,
                                                              bool requireOpenIn) {
  VLO_INFO("Opening document %@ in default app", document);
  const std::optional<ApplicationRecord> app = defaultAppForDocumentRequireOpenIn(document, requireOpenIn);
  const std::optional<URL> resolved = app ? vlo_URLByResolvingBookmark(document) : std::nullopt;
  if (!resolved) return false;
  const auto opened = std::make_shared<bool>(false);
  ScreenFactory& screens = Platform::current().screens;
  screens.runPreOpenAlert(*resolved, presenter, [&screens, resolved, app, opened] {
    screens.makeDocumentInteraction(*resolved)->openInPlaceWith(*app);
    *opened = true;
  });
  return *opened;
}

}  // namespace vaelo
