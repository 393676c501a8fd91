// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

#include "items/dr_item.h"
#include "platform/file_presenter.h"
#include "platform/notifications.h"
#include "platform/ui/bar_button_item.h"
#include "platform/ui/document_interaction_controller.h"
#include "platform/ui/document_list_controller.h"
#include "platform/ui/document_target_selection_controller.h"
#include "platform/ui/navigation_controller.h"
#include "platform/user_activity.h"

namespace vaelo {

class GlimpseItemController;
class PreviewDetailsViewController;

/// Owns the showing of one document: puts its screen on the stack, follows the document and offers it to other devices while
/// the application is in front, and carries out Delete and Move for its screen. Main thread, but for the file-presenter
/// callbacks, which come on fcQueue.
class PreviewItemManager : public FilePresenter,
                           public DocumentTargetSelectionControllerDelegate,
                           public std::enable_shared_from_this<PreviewItemManager> {
 public:
  /// `mode` 0 is the quick preview, any other value the details. The navigation controller is held weakly.
  static std::shared_ptr<PreviewItemManager> newItemManagerWithModeNavController(
      long mode, const std::shared_ptr<NavigationController>& navigation);
  ~PreviewItemManager() override;

  /// The lists from the drive's root down to the folder of `url`; nothing when they can't be made.
  static std::optional<std::vector<DocumentListControllerRef>> dlcStackForURL(const URL& url);

  const std::shared_ptr<DRItem>& item() const { return item_; }
  long mode() const { return mode_; }
  /// The share sheet of this preview, which must live while it is shown; null before the first.
  const std::shared_ptr<DocumentInteractionController>& documentInteractionController() const {
    return documentInteractionController_;
  }
  void setDocumentInteractionController(std::shared_ptr<DocumentInteractionController> sheet) {
    documentInteractionController_ = std::move(sheet);
  }
  /// What other devices are told; null while nothing is. Any thread.
  std::shared_ptr<UserActivity> batonActivity();
  const std::shared_ptr<OperationQueue>& fcQueue() const { return fcQueue_; }
  bool filePresenterRegistered();
  const std::optional<Date>& modifiedDate() const { return modifiedDate_; }
  bool refreshPending();
  /// Kept ready for downloads that a preview starts.
  const std::shared_ptr<DispatchQueue>& downloadQueue() const { return downloadQueue_; }
  bool autoDownload() const { return autoDownload_; }
  void setAutoDownload(bool autoDownload) { autoDownload_ = autoDownload; }
  /// The details while they are shown for this manager; else null.
  const std::shared_ptr<PreviewDetailsViewController>& detailsViewController() const { return detailsViewController_; }
  std::shared_ptr<NavigationController> navigationController() const { return navigationController_.lock(); }

  void previewItem(const std::shared_ptr<DRItem>& item) { setItemUpdatePreview(item, true); }
  /// Prepares the preview again, as previewItem does.
  void setItem(const std::shared_ptr<DRItem>& item) { setItemUpdatePreview(item, true); }
  void setItemUpdatePreview(const std::shared_ptr<DRItem>& item, bool update);
  /// Takes the item and makes its screen ready; null when there is nothing that could be shown.
  ViewControllerRef prepareToPreviewItem(const std::shared_ptr<DRItem>& item);
  std::shared_ptr<GlimpseItemController> currentGlimpseController();
  std::shared_ptr<PreviewDetailsViewController> createDetailsViewController();
  std::shared_ptr<GlimpseItemController> createGlimpseController();
  void replaceLastViewController(const ViewControllerRef& screen);
  bool isPreviewControllerDisplayed(const ViewControllerRef& screen) const;
  void viewControllerWillDisappear(const ViewControllerRef& screen);
  /// Asks, then deletes the document; the preview goes when the deletion is noticed.
  void showWarningAndDeleteDocumentBarButton(const ViewControllerRef& presenter, const BarButtonItemRef& button);
  /// Lets the user pick a folder that the document moves to.
  void showMoveTarget(const ViewControllerRef& presenter);
  void documentTargetSelectionControllerDidSelectItemAtURL(const std::shared_ptr<DocumentTargetSelectionController>& picker,
                                                           const URL& folder) override;
  /// Replaces the whole stack by the lists down to the URL, with its preview on top when it is a document; false when
  /// there is no such place, and then nothing changed.
  bool warpToNewURL(const URL& url);

  /// Begins and ends following the document and offering it to other devices. Any thread.
  void registerAsFilePresenter();
  void unregisterAsFilePresenter();
  void registerBatonActivity();
  void registerBatonActivityForBookmark(const std::string& bookmark);
  void unregisterBatonActivity();

  std::optional<URL> presentedItemURL() override;
  std::shared_ptr<OperationQueue> presentedItemOperationQueue() override { return fcQueue_; }
  void presentedItemDidChange() override;
  void presentedItemDidMoveToURL(const URL& url) override;
  void accommodatePresentedItemDeletionWithCompletionHandler(Completion completion) override;
  void accommodatePresentedSubitemDeletionAtURLCompletionHandler(const URL& url, Completion completion) override;

 private:
  PreviewItemManager();
  void observeActivity();
  void didBecomeActiveNotification();
  void willResignActiveNotification();
  void refreshItem(const URL& url);
  void endRefresh();
  void movedTo(const URL& url);
  static void batonBookmarkArrived(const std::weak_ptr<PreviewItemManager>& weakSelf, const Result<std::string>& bookmark);
  void storeItem(const std::shared_ptr<DRItem>& item);
  std::optional<URL> itemURL();

  std::mutex itemMutex_;  // guards item_ where other threads read it, and batonActivity_; only the main thread writes item_
  std::shared_ptr<DRItem> item_;
  std::shared_ptr<UserActivity> batonActivity_;
  long mode_ = 0;
  bool autoDownload_ = false;
  std::weak_ptr<NavigationController> navigationController_;
  std::shared_ptr<DocumentInteractionController> documentInteractionController_;
  std::shared_ptr<PreviewDetailsViewController> detailsViewController_;
  std::shared_ptr<DispatchQueue> downloadQueue_;
  std::optional<Date> modifiedDate_;
  std::recursive_mutex lock_;  // guards the two flags
  bool filePresenterRegistered_ = false;
  bool refreshPending_ = false;
  std::vector<NotificationCenter::Token> observations_;
  std::shared_ptr<OperationQueue> fcQueue_;  // last, so that it ends before what its callbacks use
};

}  // namespace vaelo
