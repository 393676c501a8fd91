// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <vector>

#include "platform/ui/preview_controller.h"

namespace vaelo {

class PreviewItemManager;

/// The one screen that shows a document's content: each PreviewItemManager points it at its own document. Main thread.
class GlimpseItemController : public PreviewController,
                              public PreviewControllerDataSource,
                              public PreviewControllerDelegate {
 public:
  /// The shared screen, made on first use; safe from any thread.
  static const std::shared_ptr<GlimpseItemController>& defaultController();
  std::string className() const override { return "GlimpseItemController"; }

  /// A screen of the manager's item that has not been loaded yet.
  static std::shared_ptr<GlimpseItemController> initWithItemManager(const std::shared_ptr<PreviewItemManager>& manager);

  /// Shows the manager's item, or nothing when it has none. The manager is held weakly.
  void glimpseNewItem(const std::shared_ptr<PreviewItemManager>& manager);
  /// True while the view is in a window; never loads the view to find out.
  bool isVisible() const;
  std::shared_ptr<PreviewItemManager> itemManager() const { return itemManager_.lock(); }
  const std::optional<std::vector<URL>>& arrayOfDocuments() const { return arrayOfDocuments_; }
  /// What a peek offers; nobody sets it, so it is empty.
  const std::vector<BarButtonItemRef>& previewActionItems() const { return previewActionItems_; }

  void showMoveTarget(const BarButtonItemRef& sender);
  void showWarningAndDeleteDocument(const BarButtonItemRef& sender);

  void viewWillDisappear(bool animated) override;
  std::size_t numberOfPreviewItemsInPreviewController(PreviewController& controller) override;
  URL previewControllerPreviewItemAtIndex(PreviewController& controller, std::size_t index) override;
  /// Markup is for documents whose extension names a portable document.
  bool previewControllerCanEditItem(PreviewController& controller, const URL& item) override;
  bool previewControllerShouldSaveEditedItem(PreviewController& controller, const URL& item) override;

  GlimpseItemController() = default;

 private:
  static std::shared_ptr<GlimpseItemController> make();
  static bool _glPreviewItemIsPDFKind(const URL& item);
  void takeDocumentsOf(const std::shared_ptr<PreviewItemManager>& manager);

  std::weak_ptr<PreviewItemManager> itemManager_;
  std::optional<std::vector<URL>> arrayOfDocuments_;
  std::vector<BarButtonItemRef> previewActionItems_;
};

}  // namespace vaelo
