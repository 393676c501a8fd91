// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "platform/file_progress.h"
#include "platform/ui/bar_button_item.h"
#include "platform/ui/button.h"
#include "platform/ui/device.h"
#include "platform/ui/layout_constraint.h"
#include "platform/ui/scroll_view.h"
#include "platform/ui/view_controller.h"

namespace vaelo {

class PreviewItemManager;

/// The frame of the application's own preview screens: a scroll view with a wrapper view that subclasses fill, the
/// document's actions in the bars, and the progress of its download. The actions are the manager's. Main thread.
class PreviewBaseViewController : public ViewController {
 public:
  std::string className() const override { return "PreviewBaseViewController"; }

  const ViewRef& wrapperView() const { return wrapperView_; }
  const ViewRef& contentView() const { return contentView_; }
  const std::shared_ptr<ScrollView>& scrollView() const { return scrollView_; }
  std::shared_ptr<PreviewItemManager> itemManager() const { return itemManager_.lock(); }
  void setItemManager(std::weak_ptr<PreviewItemManager> manager) { itemManager_ = std::move(manager); }
  long mode() const { return mode_; }
  void setMode(long mode) { mode_ = mode; }
  /// Null while no progress is asked for.
  const std::shared_ptr<void>& subscriber() const { return subscriber_; }
  /// Null until the screen appears.
  const BarButtonItemRef& barButtonActionItem() const { return barButtonActionItem_; }
  const BarButtonItemRef& barButtonDeleteItem() const { return barButtonDeleteItem_; }
  const BarButtonItemRef& barButtonMoveItem() const { return barButtonMoveItem_; }
  const LayoutConstraintRef& parentLeadingConstraint() const { return parentLeadingConstraint_; }
  const LayoutConstraintRef& parentTrailingConstraint() const { return parentTrailingConstraint_; }
  const LayoutConstraintRef& parentTopConstraint() const { return parentTopConstraint_; }
  const LayoutConstraintRef& parentBottomConstraint() const { return parentBottomConstraint_; }
  /// The last step of 5 % that was logged; -1 for none yet.
  std::int32_t lastProgressChunk() const { return lastProgressChunk_; }

  void loadView() override;
  void viewDidLoad() override;
  void viewWillAppear(bool animated) override;
  void viewWillDisappear(bool animated) override;
  void viewWillLayoutSubviews() override;

  void setupConstraints();
  EdgeInsets scrollViewDefaultEdgeInsets() const;
  void configureMargins();
  /// Portrait for a narrow and high window, whatever the device says.
  InterfaceOrientation currentPseudoOrientation() const;
  /// Shows the manager's item anew; subclasses call the base.
  virtual void refreshItem();
  void configureButtons();
  /// The button that opens the document in its default application; null for none.
  virtual std::shared_ptr<Button> openInAppNavControllerButton() { return nullptr; }
  void openInDefaultApp();
  void showWarningAndDeleteDocument();
  void showDocumentActivities();
  void showMoveTarget();

  /// Begins and ends following the download of the item.
  void registerForProgress();
  void unregisterProgress();
  void observeValueForKeyPathOfObjectChangeContext(const std::string& keyPath, const std::shared_ptr<Progress>& progress);
  virtual void updateProgress(const std::shared_ptr<Progress>& /*progress*/) {}

 private:
  BarButtonItemRef buttonFor(SystemItem item, void (PreviewBaseViewController::*action)());
  FileProgress::Withdrawn progressPublished(const std::shared_ptr<Progress>& progress);

  ViewRef wrapperView_;
  ViewRef contentView_;
  std::shared_ptr<ScrollView> scrollView_;
  std::weak_ptr<PreviewItemManager> itemManager_;
  long mode_ = 0;
  std::shared_ptr<void> subscriber_;
  BarButtonItemRef barButtonActionItem_;
  BarButtonItemRef barButtonDeleteItem_;
  BarButtonItemRef barButtonMoveItem_;
  LayoutConstraintRef parentLeadingConstraint_;
  LayoutConstraintRef parentTrailingConstraint_;
  LayoutConstraintRef parentTopConstraint_;
  LayoutConstraintRef parentBottomConstraint_;
  std::int32_t lastProgressChunk_ = -1;
  std::vector<LayoutConstraintRef> frameConstraints_;
  std::vector<std::shared_ptr<void>> observations_;
};

}  // namespace vaelo
