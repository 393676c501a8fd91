// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>

#include "platform/ui/view_controller.h"
#include "platform/url.h"

namespace vaelo {

class PreviewController;

/// The documents that a quick preview shows. Main thread.
class PreviewControllerDataSource {
 public:
  virtual ~PreviewControllerDataSource() = default;
  virtual std::size_t numberOfPreviewItemsInPreviewController(PreviewController& controller) = 0;
  virtual URL previewControllerPreviewItemAtIndex(PreviewController& controller, std::size_t index) = 0;
};

class PreviewControllerDelegate {
 public:
  virtual ~PreviewControllerDelegate() = default;
  virtual bool previewControllerCanEditItem(PreviewController& controller, const URL& item) = 0;
  virtual bool previewControllerShouldSaveEditedItem(PreviewController& controller, const URL& item) = 0;
};

/// What draws a preview; the host's side of a PreviewController. Main thread.
class PreviewRenderer {
 public:
  virtual ~PreviewRenderer() = default;
  virtual void reloadData() = 0;
  virtual void refreshCurrentPreviewItem() = 0;
};

/// The platform's quick preview: shows the content of a document. Main thread.
class PreviewController : public ViewController {
 public:
  std::string className() const override { return "PreviewController"; }
  void setDataSource(PreviewControllerDataSource* source) { dataSource_ = source; }
  void setDelegate(PreviewControllerDelegate* delegate) { delegate_ = delegate; }
  PreviewControllerDataSource* dataSource() const { return dataSource_; }
  PreviewControllerDelegate* delegate() const { return delegate_; }
  const BarButtonItems& additionalRightBarButtonItems() const { return additionalItems_; }
  void setAdditionalRightBarButtonItems(BarButtonItems items) { set(additionalItems_, std::move(items)); }
  /// For the host, while it shows the screen.
  void setRenderer(PreviewRenderer* renderer) { renderer_ = renderer; }
  void reloadData();
  void refreshCurrentPreviewItem();

 private:
  PreviewControllerDataSource* dataSource_ = nullptr;
  PreviewControllerDelegate* delegate_ = nullptr;
  PreviewRenderer* renderer_ = nullptr;
  BarButtonItems additionalItems_;
};

}  // namespace vaelo
