// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "app/quota_fetcher.h"
#include "items/dr_item.h"
#include "platform/cloud_documents.h"
#include "platform/notifications.h"
#include "platform/storage_quota.h"
#include "platform/ui/document_list_controller.h"
#include "platform/ui/navigation_controller.h"

namespace vaelo {

class PreviewItemManager;

/// The spine of the application: a stack of lists, one a folder level, with a preview on top. Every selection in a list, every way in
/// from outside and every change of the account comes here. Main thread.
class NavController : public NavigationController,
                      public NavigationControllerDelegate,
                      public DocumentListControllerDelegate,
                      public QuotaFetcherDelegate {
 public:
  ~NavController() override;
  std::string className() const override { return "NavController"; }

  bool editMode() const { return editMode_; }
  void setEditMode(bool editMode) { editMode_ = editMode; }
  /// False until the first list has reported its items; the status line waits for it.
  bool pickerIsAlive() const { return pickerIsAlive_; }
  const std::string& viewTitle() const { return viewTitle_; }
  std::uint64_t quotaBytes() const { return quotaBytes_; }
  const std::optional<Date>& lastQuotaFetch() const { return lastQuotaFetch_; }
  const std::shared_ptr<QuotaFetcher>& quotaFetcher() const { return quotaFetcher_; }
  const std::shared_ptr<PreviewItemManager>& itemManager() const { return itemManager_; }
  const StorageOfferRef& upgradeOffer() const { return upgradeOffer_; }

  void viewDidLoad() override;
  void viewWillDisappear(bool animated) override;
  /// Builds the stack from the root: the drive's list, or the unavailable screen when no account is signed in.
  void setupInitialViewController();
  /// Makes a list ready to be shown.
  void initNewListController(const DocumentListControllerRef& list);
  /// The top screen when it is a list, else null.
  DocumentListControllerRef getTopDocumentListController() const;
  /// Replaces the stack by the lists down to the URL; false when there is no such place.
  bool warpToFolderForURL(const URL& url);
  /// Jumps to an item from outside; mode 0 is the quick preview, 1 the details. False leaves the stack as it was.
  bool warpToNewURLPreviewMode(const std::optional<URL>& url, long mode);
  void showPreviewPreviewMode(const std::shared_ptr<DRItem>& item, long mode);
  /// Commits a peek.
  void orbPopToURL(const URL& url);
  /// Opens the root list's search with the query.
  void startSearch(const std::string& query);
  /// For diagnostics.
  void logContainerURL() const;
  void encodeRestorableStateWithCoder(RestorationCoder& coder) override;
  void decodeRestorableStateWithCoder(const RestorationCoder& coder) override;

  void navigationControllerWillShowViewControllerAnimated(NavigationController&, const ViewControllerRef&, bool) override {}
  void navigationControllerDidShowViewControllerAnimated(NavigationController& navigation, const ViewControllerRef& screen,
                                                         bool animated) override;

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

  /// True exactly when an account is signed in.
  bool checkVaeloState() const;
  /// Rebuilds the stack when the account is another one than the last time.
  void handleAccountChanges();
  void saveVaeloToken(const std::optional<UbiquityIdentityToken>& token);

  void configureNavBar(const DocumentListControllerRef& list);
  void configureToolbar(const DocumentListControllerRef& list);
  /// Brings the status line of the list, or of the top one, up to date.
  void updateStatusUI(DocumentListControllerRef list);
  bool okToShowQuota() const { return lastQuotaFetch_.has_value(); }
  std::string toolbarStatusText(std::size_t itemCount) const;
  std::string quotaAvailableString() const;
  void quotaFetcherDidUpdateValue(QuotaFetcher& fetcher, std::uint64_t freeBytes) override;

 private:
  void observe();
  void didBecomeActiveNotification(const Notification& notification);
  void vaeloAccountAvailabilityChanged();
  void offerChangedNotification();
  std::string offerLevel() const;
  void showDrive();
  void showDriveUnavailable();
  void newItemManager(long mode);
  /// Replaces the stack, animated, by the lists down to the item's URL.
  void switchToFolderOf(const DRItem& item);
  /// The item that a link leads to; null when it leads out of the drive or nowhere.
  std::shared_ptr<DRItem> targetOfLink(const DRItem& link) const;

  bool editMode_ = false;
  bool pickerIsAlive_ = false;
  std::string viewTitle_;
  std::uint64_t quotaBytes_ = 0;
  std::optional<Date> lastQuotaFetch_;
  std::shared_ptr<QuotaFetcher> quotaFetcher_;
  std::shared_ptr<PreviewItemManager> itemManager_;
  StorageOfferRef upgradeOffer_;
  std::vector<NotificationCenter::Token> observations_;
};

}  // namespace vaelo
