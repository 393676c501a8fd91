// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "app/drive_status_label_view.h"
#include "platform/storage_quota.h"
#include "platform/ui/document_list_controller.h"

namespace vaelo {

/// Hears what the user presses in a status bar. Main thread.
class DocumentListControllerStatusBarDelegate {
 public:
  virtual ~DocumentListControllerStatusBarDelegate() = default;
  /// The user asks for more storage, and the application is to run the upgrade itself.
  virtual void upgradeStorageButtonPressed() = 0;
};

/// What a list's toolbar shows while it is browsed: one centred line about the folder and the account, and a button while
/// the account's storage runs low. Owned by a shared_ptr. Main thread.
class DocumentListControllerStatusBar : public std::enable_shared_from_this<DocumentListControllerStatusBar> {
 public:
  using Delegate = DocumentListControllerStatusBarDelegate;

  /// Makes the line and its toolbar items. `offer` may be null; the delegate is held weakly.
  void createStatusBarButtonPressDelegate(StorageOfferRef offer, std::weak_ptr<Delegate> delegate);
  /// Fills the line with its label and its button.
  void configureLabels(const StorageOfferRef& offer);
  void setStatusText(const std::string& text);
  /// Takes the account's offer, null for none, and shows the button where the offer calls for it.
  void showUpgradeOffer(const StorageOfferRef& offer);
  /// The user pressed the button.
  void upgradeStoragePressed(UpgradeButton& button);

  std::shared_ptr<Delegate> delegate() const { return delegate_.lock(); }
  const std::shared_ptr<DriveStatusLabelView>& labelsView() const { return labelsView_; }
  /// The line between two flexible spaces.
  const std::vector<BarButtonItemRef>& toolbarItems() const { return toolbarItems_; }

 private:
  std::weak_ptr<Delegate> delegate_;
  std::shared_ptr<DriveStatusLabelView> labelsView_;
  std::vector<BarButtonItemRef> toolbarItems_;
};

using StatusBarRef = std::shared_ptr<DocumentListControllerStatusBar>;

/// The status bar that a list keeps; null before it has one.
StatusBarRef statusBarOf(const DocumentListController& list);
void setStatusBar(DocumentListController& list, const StatusBarRef& bar);
/// Gives the list a new status bar.
void createStatusBarButtonPressDelegate(DocumentListController& list, StorageOfferRef offer,
                                        std::weak_ptr<DocumentListControllerStatusBarDelegate> delegate);
/// The list's toolbar becomes its status bar, which it has.
void displayStatusBar(DocumentListController& list);

}  // namespace vaelo
