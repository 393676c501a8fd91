// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "platform/storage_quota.h"
#include "platform/ui/document_list_controller.h"
#include "platform/ui/label.h"

namespace vaelo {

/// Hears what the user presses in a status bar. Main thread.
class DocumentListControllerStatusBarDelegate {
 public:
  virtual ~DocumentListControllerStatusBarDelegate() = default;
  virtual void upgradeStorageButtonPressed() = 0;
};

/// What a list's toolbar shows while it is browsed: one centred line about the folder and the account. Main thread.
class DocumentListControllerStatusBar {
 public:
  using Delegate = DocumentListControllerStatusBarDelegate;

  /// Makes the line and its toolbar items. `offer` may be null; the delegate is held weakly.
  void createStatusBarButtonPressDelegate(StorageOfferRef offer, std::weak_ptr<Delegate> delegate);
  void setStatusText(const std::string& text);
  /// Takes the account's offer; null for none.
  void showUpgradeOffer(StorageOfferRef offer) { offer_ = std::move(offer); }

  const StorageOfferRef& offer() const { return offer_; }
  std::shared_ptr<Delegate> delegate() const { return delegate_.lock(); }
  const std::shared_ptr<Label>& primaryLabel() const { return primaryLabel_; }
  /// The line between two flexible spaces.
  const std::vector<BarButtonItemRef>& toolbarItems() const { return toolbarItems_; }

 private:
  StorageOfferRef offer_;
  std::weak_ptr<Delegate> delegate_;
  std::shared_ptr<Label> primaryLabel_;
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
