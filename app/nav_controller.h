// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "app/document_list_controller_status_bar.h"
#include "app/quota_fetcher.h"
#include "platform/date.h"
#include "platform/notifications.h"
#include "platform/ui/document_interaction_controller.h"
#include "platform/ui/document_list_controller_delegate.h"
#include "platform/ui/document_target_selection_controller.h"
#include "platform/ui/navigation_controller.h"
#include "platform/ui/upgrade_flow_manager.h"

namespace vaelo {

class DRItem;
class FilenamePrompt;
class PreviewItemManager;
struct UbiquityIdentityToken;

/// The root of the window: the stack of folder lists with the previews on top. It is its own delegate and that of every list
/// it shows, routes what is chosen, jumps to items from outside, and follows the account, its free space and its storage
/// offer. Owned by a shared_ptr. Main thread.
class NavController : public NavigationController,
                      public NavigationControllerDelegate,
                      public DocumentListControllerDelegate,
                      public DocumentInteractionControllerDelegate,
                      public DocumentTargetSelectionControllerDelegate,
                      public QuotaFetcherDelegate,
                      public DocumentListControllerStatusBarDelegate {
 public:
  using NavigationController::NavigationController;
  std::string className() const override { return "NavController"; }

  // What it knows.
  /// Several items of the visible list can be selected.
  bool editMode() const { return editMode_; }
  /// False until a list reports its items; the status line waits for that.
  bool pickerIsAlive() const { return pickerIsAlive_; }
  std::shared_ptr<ViewController> splitViewController() const { return splitViewController_.lock(); }
  void setSplitViewController(std::weak_ptr<ViewController> split) { splitViewController_ = std::move(split); }
  /// The title of the list configured last.
  const std::string& viewTitle() const { return viewTitle_; }
  /// The toolbar's buttons in edit mode; null outside it.
  const BarButtonItemRef& barButtonNewFolder() const { return barButtonNewFolder_; }
  const BarButtonItemRef& barButtonDeleteItem() const { return barButtonDeleteItem_; }
  const BarButtonItemRef& barButtonMoveItem() const { return barButtonMoveItem_; }
  /// Free bytes of the account, and when they were learnt.
  std::uint64_t quotaBytes() const { return quotaBytes_; }
  const std::optional<Date>& lastQuotaFetch() const { return lastQuotaFetch_; }
  /// Null while no account is signed in.
  const std::shared_ptr<QuotaFetcher>& quotaFetcher() const { return quotaFetcher_; }
  /// The share sheet that was shown last, which must live while it is shown; null before the first.
  const std::shared_ptr<DocumentInteractionController>& documentInteractionController() const {
    return documentInteractionController_;
  }
  /// Of the item action that may still be going on; empty before the first.
  const Completion& performActionCompletionBlock() const { return performActionCompletionBlock_; }
  /// The question for a name that was asked last, for a new folder or another name; null before the first.
  const std::shared_ptr<FilenamePrompt>& folderPromptAlert() const { return folderPromptAlert_; }
  /// Of the document being previewed; null for none.
  const std::shared_ptr<PreviewItemManager>& itemManager() const { return itemManager_; }
  const std::shared_ptr<UpgradeFlowManager>& upgradeFlowMgr() const { return upgradeFlowMgr_; }
  const StorageOfferRef& upgradeOffer() const { return upgradeOffer_; }

  // The stack.
  /// Builds the stack anew: the drive's root, or the unavailable screen without an account.
  void setupInitialViewController();
  void initNewListController(const DocumentListControllerRef& list);
  /// The top of the stack when it is a list, else null.
  DocumentListControllerRef getTopDocumentListController();
  /// Replaces the stack by the lists down to the folder of `url`; false when they can't be made.
  bool warpToFolderForURL(const URL& url);
  /// Goes to an item from outside and shows a document in the mode (0: quick preview). False, with the stack as it was, when
  /// there is no such item in the drive. What is presented goes away in any case.
  bool warpToNewURLPreviewMode(const std::optional<URL>& url, long mode);
  void showPreviewPreviewMode(const std::shared_ptr<DRItem>& item, long mode);
  /// Goes on from the peek of an item to the item.
  void orbPopToURL(const URL& url);
  /// Searches the whole drive; an empty query opens an empty search field.
  void startSearch(const std::string& query);
  /// Logs where the drive's own container is; a diagnostic.
  void logContainerURL();

  // Modes and bars.
  /// The Select button, the Cancel button, and a command that selects everything in the visible list.
  void beginEditMode(const BarButtonItemRef& sender);
  void endEditMode(const BarButtonItemRef& sender);
  void selectAllItems(const BarButtonItemRef& sender) override;
  /// The one place where the mode changes.
  void setEditModeAndUpdateUIForViewController(bool edit, const DocumentListControllerRef& list);
  void configureVisibleControllerForMode();
  void configureNavBar(const DocumentListControllerRef& list);
  void configureToolbar(const DocumentListControllerRef& list);

  // Names, folders and moves.
  void showRenamePrompt(const URL& url);
  void promtForNewFolderAndCreate();
  void showMoveTargetForSelectedItems();
  /// Asks where the items of the folder are to go, then moves them.
  void showMoveTargetForItemsInFolder(const std::vector<URL>& items, const std::optional<URL>& folder);
  /// Asks for the name of a new folder in `folder`, makes it, and moves the items, if any, into it.
  void showNewFolderPromptDuringMoveItemsToMove(const std::optional<URL>& folder, const std::vector<URL>& items);
  /// Tries every item; one error for each that could not be moved.
  std::vector<Error> moveItemsToDirectoryToDirectory(const std::vector<URL>& items, const URL& folder);
  void moveItemsToDirectoryAndShowErrorsToDirectory(const std::vector<URL>& items, const URL& folder);

  // Deletion.
  void showWarningAndDeleteDocument();
  /// Asks, and deletes for good. The sheet points at `view`, or without one at the toolbar's button. A given list leaves
  /// edit mode when the answer is yes. `finished` may be empty.
  void showWarningAndDeleteURLsUsingViewWithDocumentListControllerFinishedCompletion(const std::vector<URL>& urls,
                                                                                     const ViewRef& view,
                                                                                     const DocumentListControllerRef& list,
                                                                                     Completion finished);

  /// The share sheet for an item, pointing at `view`, or without one at the window.
  void showDICUrlCompletion(const ViewRef& view, const Value& item, Completion completion);

  // The status line.
  /// A value was fetched once, be it 0.
  bool okToShowQuota() const { return lastQuotaFetch_.has_value(); }
  std::string quotaAvailableString() const;
  std::string toolbarStatusText(std::size_t itemCount) const;
  /// Null: the top list.
  void updateStatusUI(DocumentListControllerRef list);
  void quotaFetcherDidUpdateValue(QuotaFetcher& fetcher, std::uint64_t freeBytes) override;

  // The account and its offer.
  /// An account is signed in.
  bool checkVaeloState() const;
  void handleAccountChanges();
  void saveVaeloToken(const std::optional<UbiquityIdentityToken>& token);
  void upgradeStorageButtonPressed() override;

  // ViewController
  void viewDidLoad() override;
  void viewWillDisappear(bool animated) override;
  void encodeRestorableStateWithCoder(RestorationCoder& coder) override;
  void decodeRestorableStateWithCoder(const RestorationCoder& coder) override;

  // NavigationControllerDelegate
  void navigationControllerWillShowViewControllerAnimated(NavigationController& navigation, const ViewControllerRef& shown,
                                                          bool animated) override;
  void navigationControllerDidShowViewControllerAnimated(NavigationController& navigation, const ViewControllerRef& shown,
                                                         bool animated) override;

  // DocumentListControllerDelegate
  void documentListControllerDidSelectContainerWithViewController(const DocumentListControllerRef& list,
                                                                  const DocumentListControllerRef& chosen) override;
  void documentListControllerDidSelectItemAtURL(const DocumentListControllerRef& list, const URL& url) override;
  void documentListControllerItemsChanged(const DocumentListControllerRef& list) override;
  void documentListControllerURLWasRemoved(const DocumentListControllerRef& list) override;
  void documentListControllerPerformActionURLOriginatingViewCompletion(const DocumentListControllerRef& list, int action,
                                                                       const URL& url, const ViewRef& view,
                                                                       Completion completion) override;
  void documentListControllerPerformActionURL(const DocumentListControllerRef& list, int action, const URL& url) override;
  ViewControllerRef documentListControllerViewControllerForPreviewingItemAtURL(const DocumentListControllerRef& list,
                                                                               const URL& url) override;

  // DocumentTargetSelectionControllerDelegate
  void documentTargetSelectionControllerDidSelectItemAtURL(const std::shared_ptr<DocumentTargetSelectionController>& picker,
                                                           const URL& folder) override;

  // DocumentInteractionControllerDelegate
  void documentInteractionControllerDidDismissOptionsMenu(DocumentInteractionController&) override {}

 private:
  void observeNotifications();
  void didBecomeActiveNotification(const Notification& notification);
  void vaeloAccountAvailabilityChanged();
  void offerChangedNotification();
  std::string offerLevelText() const;
  void showDriveUnavailable();
  bool replaceStackDownToFolder(const URL& url, bool animated);
  void chosenItemIsGone();
  void showPreviewSoon(const std::shared_ptr<DRItem>& item, long mode);
  std::shared_ptr<DRItem> targetOfLink(const DRItem& link) const;
  bool openInDefaultApp(const std::shared_ptr<DRItem>& item);
  void showInfo(const URL& url);
  void makeEditToolbar(const DocumentListControllerRef& list);
  BarButtonItemRef editButton(const std::string& title, void (NavController::*action)());
  /// Deletes what was confirmed; how many failed, and the last error that there was.
  struct Failures {
    std::int32_t count = 0;
    std::optional<Error> latest;
  };
  Failures deleteConfirmed(const std::vector<URL>& urls);
  void deleteContainer(const URL& url, Failures& failures);
  static std::string newFolderEntered(const std::weak_ptr<NavController>& navigation, const URL& folder,
                                      const std::vector<URL>& items, const std::string& name, bool& accepted);
  /// A new manager in the place of the present one, which no longer follows its document.
  std::shared_ptr<PreviewItemManager> replaceItemManager(long mode);

  bool editMode_ = false;
  bool pickerIsAlive_ = false;
  std::weak_ptr<ViewController> splitViewController_;
  std::string viewTitle_;
  BarButtonItemRef barButtonNewFolder_;
  BarButtonItemRef barButtonDeleteItem_;
  BarButtonItemRef barButtonMoveItem_;
  std::uint64_t quotaBytes_ = 0;
  std::optional<Date> lastQuotaFetch_;
  std::shared_ptr<QuotaFetcher> quotaFetcher_;
  std::shared_ptr<DocumentInteractionController> documentInteractionController_;
  Completion performActionCompletionBlock_;
  std::shared_ptr<FilenamePrompt> folderPromptAlert_;
  std::shared_ptr<PreviewItemManager> itemManager_;
  std::shared_ptr<UpgradeFlowManager> upgradeFlowMgr_;
  StorageOfferRef upgradeOffer_;
  std::vector<NotificationCenter::Token> observations_;
};

}  // namespace vaelo
