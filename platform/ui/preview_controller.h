// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <vector>

#include "platform/ui/view_controller.h"
#include "platform/url.h"

namespace vaelo {

class PreviewController;

/// What a preview shows.
class PreviewControllerDataSource {
 public:
  virtual ~PreviewControllerDataSource() = default;
  virtual std::size_t numberOfPreviewItemsInPreviewController(PreviewController& controller) = 0;
  virtual URL previewControllerPreviewItemAtIndex(PreviewController& controller, std::size_t index) = 0;
};

class PreviewControllerDelegate {
 public:
  virtual ~PreviewControllerDelegate() = default;
  virtual bool previewControllerCanEditItem(PreviewController&, const URL&) { return false; }
  virtual bool previewControllerShouldSaveEditedItem(PreviewController&, const URL&) { return false; }
};

enum class PreviewChange { AllItems, CurrentItem, BarButtonItems };

/// Shows the content of documents. Data source and delegate are held weakly; without them it shows nothing and edits
/// nothing. Main thread.
class PreviewController : public ViewController {
 public:
  std::string className() const override { return "PreviewController"; }
  std::shared_ptr<PreviewControllerDataSource> dataSource() const { return dataSource_.lock(); }
  void setDataSource(std::weak_ptr<PreviewControllerDataSource> source) { dataSource_ = std::move(source); }
  std::shared_ptr<PreviewControllerDelegate> delegate() const { return delegate_.lock(); }
  void setDelegate(std::weak_ptr<PreviewControllerDelegate> delegate) { delegate_ = std::move(delegate); }
  /// Asks the data source anew.
  void reloadData();
  /// Reads the shown document anew.
  void refreshCurrentPreviewItem();
  /// Buttons beside the host's own, from the trailing edge inwards.
  const std::vector<BarButtonItemRef>& additionalRightBarButtonItems() const { return additionalItems_; }
  void setAdditionalRightBarButtonItems(std::vector<BarButtonItemRef> items);

  // For the host.
  std::size_t itemCount();
  /// Index below itemCount().
  URL itemAtIndex(std::size_t index);
  bool canEditItem(const URL& item);
  bool shouldSaveEditedItem(const URL& item);
  Signal<PreviewController&, PreviewChange>& previewChanged() { return previewChanged_; }

 private:
  std::weak_ptr<PreviewControllerDataSource> dataSource_;
  std::weak_ptr<PreviewControllerDelegate> delegate_;
  std::vector<BarButtonItemRef> additionalItems_;
  Signal<PreviewController&, PreviewChange> previewChanged_;
};

}  // namespace vaelo
