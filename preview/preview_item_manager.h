// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <mutex>
#include <optional>
#include <vector>

#include "items/dr_item.h"
#include "platform/file_presenter.h"
#include "platform/notifications.h"
#include "platform/ui/document_list_controller.h"
#include "platform/ui/navigation_controller.h"

namespace vaelo {

class GlimpseItemController;

/// Owns the showing of one document: puts its screen on the stack, and follows the document while the application is in
/// front. Main thread, but for the file-presenter callbacks, which come on fcQueue.
class PreviewItemManager : public FilePresenter, public std::enable_shared_from_this<PreviewItemManager> {
 public:
  /// `mode` 0 is the quick preview. The navigation controller is held weakly.
  static std::shared_ptr<PreviewItemManager> newItemManagerWithModeNavController(
      long mode, const std::shared_ptr<NavigationController>& navigation);
  ~PreviewItemManager() override;

  /// The lists from the drive's root down to the folder of `url`; nothing when they can't be made.
  static std::optional<std::vector<DocumentListControllerRef>> dlcStackForURL(const URL& url);

  const std::shared_ptr<DRItem>& item() const { return item_; }
  long mode() const { return mode_; }
  void previewItem(const std::shared_ptr<DRItem>& item) { setItemUpdatePreview(item, true); }
  /// Prepares the preview again, as previewItem does.
  void setItem(const std::shared_ptr<DRItem>& item) { setItemUpdatePreview(item, true); }
  void setItemUpdatePreview(const std::shared_ptr<DRItem>& item, bool update);
  /// Takes the item and makes its screen ready; null when there is nothing that could be shown.
  ViewControllerRef prepareToPreviewItem(const std::shared_ptr<DRItem>& item);
  std::shared_ptr<GlimpseItemController> currentGlimpseController();
  std::shared_ptr<GlimpseItemController> createGlimpseController();
  void replaceLastViewController(const ViewControllerRef& screen);
  bool isPreviewControllerDisplayed(const ViewControllerRef& screen) const;
  void viewControllerWillDisappear(const ViewControllerRef& screen);
  /// Replaces the whole stack by the lists down to the URL, with its preview on top when it is a document; false when
  /// there is no such place, and then nothing changed.
  bool warpToNewURL(const URL& url);

  /// Begins and ends following the document.
  void registerAsFilePresenter();
  void unregisterAsFilePresenter();

  std::optional<URL> presentedItemURL() override;
  std::shared_ptr<OperationQueue> presentedItemOperationQueue() override { return fcQueue_; }
  void presentedItemDidChange() override;
  void presentedItemDidMoveToURL(const URL& url) override;
  void accommodatePresentedItemDeletionWithCompletionHandler(Completion completion) override;
  void accommodatePresentedSubitemDeletionAtURL(const URL& url, Completion completion) override;

 private:
  PreviewItemManager();
  void observeActivity();
  void didBecomeActiveNotification();
  void willResignActiveNotification();
  void refreshItem(const URL& url);
  std::optional<URL> itemURL();

  std::mutex itemMutex_;  // guards item_ where fcQueue reads it; only the main thread writes
  std::shared_ptr<DRItem> item_;
  long mode_ = 0;
  std::weak_ptr<NavigationController> navigationController_;
  std::optional<Date> modifiedDate_;
  std::recursive_mutex lock_;  // guards the two flags
  bool filePresenterRegistered_ = false;
  bool refreshPending_ = false;
  std::vector<NotificationCenter::Token> observations_;
  std::shared_ptr<OperationQueue> fcQueue_;  // last, so that it ends before what its callbacks use
};

}  // namespace vaelo
