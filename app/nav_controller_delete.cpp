// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/nav_controller.h"
#include "fileops/menu_enable_checks.h"
#include "fileops/ui_utils.h"
#include "items/file_utils.h"
#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

void NavController::showWarningAndDeleteDocument() {
  VLO_USER_ACTION("Pressed Delete (nav)");
  const DocumentListControllerRef list = getTopDocumentListController();
  const std::vector<URL> items = list ? list->selectedItems() : std::vector<URL>();
  VLO_INFO("Pressed Delete after selecting %{public}@ items: %@", items.size(), items);
  showWarningAndDeleteURLsUsingViewWithDocumentListControllerFinishedCompletion(items, nullptr, list, nullptr);
}

void NavController::showWarningAndDeleteURLsUsingViewWithDocumentListControllerFinishedCompletion(
    const std::vector<URL>& urls, const ViewRef& view, const DocumentListControllerRef& list, Completion finished) {
  const unsigned containers = MenuEnableChecks::numContainersInURLArray(urls);
  if (containers != 0 && containers != urls.size()) {
    VLO_ERROR("Not Deleting: mix of containers and items: %@", urls);
    if (finished) finished();
    return;
  }
  if (MenuEnableChecks::isDesktopOrDocumentsInURLArray(urls)) {
    VLO_WARNING("Not deleting special folder: %@", urls);
    if (finished) finished();
    UIUtils::showUnsupportedError(visibleViewController());
    return;
  }
  // The screens own the sheet that holds this.
  const auto answered = [weak = weakSelf(this), urls, list, finished = std::move(finished)](const AlertActionRef&,
                                                                                            bool cancelled) {
    const auto self = weak.lock();
    if (!self) return;
    Failures failures;
    if (cancelled) {
      VLO_USER_ACTION("Delete was Cancelled (nav)");
    } else {
      VLO_USER_ACTION("Delete was Confirmed (nav)");
      if (list) self->setEditModeAndUpdateUIForViewController(false, list);
      failures = self->deleteConfirmed(urls);
    }
    if (finished) finished();
    if (failures.count == 1) {
      UIUtils::showErrorParentViewController(failures.latest, self->topViewController());
    } else if (failures.count > 1) {
      const std::string title =
          Platform::current().formatting.localizedCount(".DICT.CANNOT_DELETE_ITEMS.%d", failures.count);
      UIUtils::showAlertMessageParentViewController(title, "", self->topViewController());
    }
  };
  UIUtils::showDeleteWarningAlertHasContainerViewControllerUsingViewUsingButtonCompletion(
      urls, containers != 0, visibleViewController(), view, barButtonDeleteItem_, answered);
}

NavController::Failures NavController::deleteConfirmed(const std::vector<URL>& urls) {
  Failures failures;
  for (const URL& url : urls) {
    if (Platform::current().cloudDocuments.isDocumentsContainer(url)) {
      deleteContainer(url, failures);
      continue;
    }
    VLO_INFO("Deleting item %@", url);
    if (const std::optional<Error> error = FileUtils::remove(url)) {
      ++failures.count;
      failures.latest = error;
      VLO_WARNING("Failed to delete URL %@: %{public}@", url, error->description());
    }
  }
  return failures;
}

void NavController::deleteContainer(const URL& url, Failures& failures) {
  CloudDocuments& drive = Platform::current().cloudDocuments;
  const Result<CloudContainerRef> found = drive.containerForURL(url);
  const CloudContainerRef container = found.error ? nullptr : found.value.value_or(nullptr);
  const std::string identifier = container ? container->identifier() : "";
  if (identifier.empty()) {
    ++failures.count;
    VLO_WARNING("No container for URL %@: %{public}@", url, found.error);
    return;
  }
  if (identifier == drive.defaultContainerIdentifier()) {
    VLO_ERROR("NOT Deleting root container %{public}@", identifier);
    ++failures.count;
    return;
  }
  VLO_INFO("Deleting container %{public}@", identifier);
  if (const std::optional<Error> error = container->deleteAllContents()) {
    ++failures.count;
    failures.latest = error;
    VLO_WARNING("Failed to delete container %{public}@: %{public}@", identifier, error->description());
  }
}

}  // namespace vaelo
