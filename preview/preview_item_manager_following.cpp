// SPDX-License-Identifier: GPL-3.0-or-later
// How the manager follows its document: as a file presenter, and as an activity that other devices can continue.
#include "app/settings.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "preview/glimpse_item_controller.h"
#include "preview/preview_details_view_controller.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

namespace {

std::string pathOf(const std::optional<URL>& url) { return url ? url->path() : std::string(); }

// The service says with it that the document has no place that other devices know.
constexpr int NotInDriveCode = 7;

}  // namespace

void PreviewItemManager::registerAsFilePresenter() {
  {
    const std::lock_guard lock(lock_);
    if (!filePresenterRegistered_) {
      Platform::current().fileCoordination.addFilePresenter(*this);
      filePresenterRegistered_ = true;
    }
  }
  registerBatonActivity();
}

void PreviewItemManager::unregisterAsFilePresenter() {
  {
    const std::lock_guard lock(lock_);
    if (filePresenterRegistered_) {
      Platform::current().fileCoordination.removeFilePresenter(*this);
      filePresenterRegistered_ = false;
    }
  }
  unregisterBatonActivity();
}

bool PreviewItemManager::filePresenterRegistered() {
  const std::lock_guard lock(lock_);
  return filePresenterRegistered_;
}

bool PreviewItemManager::refreshPending() {
  const std::lock_guard lock(lock_);
  return refreshPending_;
}

void PreviewItemManager::endRefresh() {
  const std::lock_guard lock(lock_);
  refreshPending_ = false;
}

std::shared_ptr<UserActivity> PreviewItemManager::batonActivity() {
  const std::lock_guard lock(itemMutex_);
  return batonActivity_;
}

void PreviewItemManager::registerBatonActivity() {
  const std::optional<URL> url = itemURL();
  if (!url) return;
  const std::weak_ptr<PreviewItemManager> weakSelf = weak_from_this();
  const auto answered = [weakSelf](const Result<std::string>& bookmark) { batonBookmarkArrived(weakSelf, bookmark); };
  Platform::current().fileProvider.BookmarkableStringFromDocumentURL(vlo_URLByResolvingAlias(*url), answered);
}

// On any thread, which must not come to own the manager: it and its screens end on the main thread.
void PreviewItemManager::batonBookmarkArrived(const std::weak_ptr<PreviewItemManager>& weakSelf,
                                              const Result<std::string>& bookmark) {
  if (weakSelf.expired()) return;
  if (bookmark.error) {
    if (bookmark.error->domain == CloudDocumentsErrorDomain && bookmark.error->code == NotInDriveCode) {
      VLO_INFO("BookmarkableStringFromDocumentURL returned %{public}@", *bookmark.error);
    } else {
      VLO_ERROR("BookmarkableStringFromDocumentURL returned %{public}@", *bookmark.error);
    }
    return;
  }
  if (!bookmark.value) {
    VLO_ERROR("BookmarkableStringFromDocumentURL returned empty bookmark");
    return;
  }
  Platform::current().queues.main().async([weakSelf, text = *bookmark.value] {
    if (const auto self = weakSelf.lock()) self->registerBatonActivityForBookmark(text);
  });
}

void PreviewItemManager::registerBatonActivityForBookmark(const std::string& bookmark) {
  if (bookmark.empty()) return;
  const std::shared_ptr<UserActivity> activity =
      Platform::current().userActivities.makeActivity(Settings::batonVaeloActivityType());
  activity->setEligibleForBaton(true);
  activity->setUserInfo({{UserActivityDocumentURLKey, bookmark}});
  // Current before anybody can tell it to resign.
  const std::lock_guard lock(itemMutex_);
  activity->becomeCurrent();
  batonActivity_ = activity;
}

void PreviewItemManager::unregisterBatonActivity() {
  std::shared_ptr<UserActivity> activity;
  {
    const std::lock_guard lock(itemMutex_);
    activity.swap(batonActivity_);
  }
  if (activity) activity->resignCurrent();
}

std::optional<URL> PreviewItemManager::presentedItemURL() {
  const std::optional<URL> url = itemURL();
  VLO_DEBUG("presentedItemURL %@", url);
  return url;
}

void PreviewItemManager::presentedItemDidChange() {
  VLO_INFO("presentedItemDidChange: %@", itemURL());
  {
    const std::lock_guard lock(lock_);
    if (refreshPending_) return;
    refreshPending_ = true;
  }
  const std::weak_ptr<PreviewItemManager> weakSelf = weak_from_this();
  Platform::current().queues.main().after(std::chrono::seconds(1), [weakSelf] {
    const auto self = weakSelf.lock();
    if (!self) return;
    if (const auto url = self->itemURL()) self->refreshItem(*url);
    self->endRefresh();
  });
}

void PreviewItemManager::refreshItem(const URL& url) {
  const std::shared_ptr<DRItem> fresh = DRItem::initWithURL(url);
  if (!fresh) return;
  const std::string oldPath = pathOf(itemURL());
  const std::string newPath = pathOf(fresh->url());
  const bool pathChanged = oldPath != newPath;
  if (pathChanged) {
    VLO_ERROR("UNEXPECTED: path changed but we only got a presentedItemDidChange: %@ to %@", oldPath, newPath);
  }
  const std::optional<Date> date = fresh->contentModificationDate();
  VLO_DEBUG("%@: modDate %{public}@ vs %{public}@", fresh->url(), modifiedDate_, date);
  const bool later = modifiedDate_ && date && *modifiedDate_ < *date;
  modifiedDate_ = date;
  setItemUpdatePreview(fresh, pathChanged);
  VLO_INFO("Refreshing %@", itemURL());
  const std::shared_ptr<GlimpseItemController>& glimpse = GlimpseItemController::defaultController();
  glimpse->setTitle(fresh->localizedName().value_or(""));
  if (later && glimpse->isVisible()) {
    VLO_DEBUG("GLPreviewController: refreshCurrentPreviewItem");
    glimpse->refreshCurrentPreviewItem();
  }
  const bool arrived = !item_->isDownloaded() && fresh->isDownloaded();
  if (detailsViewController_ && (later || pathChanged || arrived)) detailsViewController_->refreshItem();
}

void PreviewItemManager::presentedItemDidMoveToURL(const URL& url) {
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  const URL real = cloud.realPathURL(url);
  VLO_INFO("presentedItemDidMoveToURL: %@ changed to %@", itemURL(), real);
  if (cloud.URLIsInDriveTrash(real) || !cloud.URLIsInDriveMirror(real)) {
    accommodatePresentedItemDeletionWithCompletionHandler([](std::optional<Error>) {});
    return;
  }
  if (pathOf(itemURL()) == real.path()) {
    VLO_WARNING("UNEXPECTED: duplicate calls to presentedItemDidMoveToURL: %@", real.path());
    return;
  }
  const std::weak_ptr<PreviewItemManager> weakSelf = weak_from_this();
  Platform::current().queues.main().async([weakSelf, real] {
    if (const auto self = weakSelf.lock()) self->movedTo(real);
  });
}

// Another notice of the same move may have come first.
void PreviewItemManager::movedTo(const URL& url) {
  if (pathOf(itemURL()) == url.path()) {
    VLO_WARNING("UNEXPECTED: duplicate calls to presentedItemDidMoveToURL: %@", url.path());
    return;
  }
  setItem(DRItem::initWithURL(url));
  if (detailsViewController_) detailsViewController_->refreshItem();
}

void PreviewItemManager::accommodatePresentedItemDeletionWithCompletionHandler(Completion completion) {
  VLO_INFO("Accommodate deletion: %@", itemURL());
  completion(std::nullopt);
  unregisterAsFilePresenter();
  std::shared_ptr<PreviewItemManager> self = weak_from_this().lock();
  if (!self) return;
  // Moved, so that the last owner goes on the main thread, and not on this one, which the manager's end waits for.
  Platform::current().queues.main().async([self = std::move(self)] {
    if (const auto navigation = self->navigationController_.lock()) navigation->popViewControllerAnimated(true);
  });
}

void PreviewItemManager::accommodatePresentedSubitemDeletionAtURLCompletionHandler(const URL& url, Completion completion) {
  VLO_INFO("%@ accommodate subitem deletion at %@", itemURL(), url);
  completion(std::nullopt);
  unregisterAsFilePresenter();
  const std::weak_ptr<PreviewItemManager> weakSelf = weak_from_this();
  Platform::current().queues.main().after(std::chrono::seconds(1), [weakSelf] {
    const auto self = weakSelf.lock();
    if (!self) return;
    VLO_INFO("Refreshing %@", self->itemURL());
    const std::shared_ptr<GlimpseItemController>& glimpse = GlimpseItemController::defaultController();
    if (glimpse->isVisible()) glimpse->refreshCurrentPreviewItem();
    self->endRefresh();
  });
}

}  // namespace vaelo
