// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "host/gtk/share_presentation.h"
#include "platform/cloud_documents.h"
#include "platform/ui/document_interaction_controller.h"

namespace vaelo {

class ShareActions;

/// Shares a document from a sheet over the window, and hands it to installed applications with a notice in the window and
/// the desktop's own. What was chosen is done after the sheet went and the delegate heard of it. Main thread.
class GtkDocumentInteraction : public DocumentInteractionController {
 public:
  /// `drive` outlives the controller.
  GtkDocumentInteraction(URL url, CloudDocuments& drive, std::weak_ptr<GtkWindowHost> window);
  ~GtkDocumentInteraction() override;
  URL url() const override { return url_; }
  std::string name() const override { return name_; }
  void setName(std::string name) override { name_ = std::move(name); }
  void setDelegate(std::weak_ptr<DocumentInteractionControllerDelegate> delegate) override {
    delegate_ = std::move(delegate);
  }
  bool presentOptionsMenuFromRect(const Rect& rect, const ViewRef& view, bool animated) override;
  bool presentOptionsMenuFromBarButtonItem(const BarButtonItemRef& item, bool animated) override;
  bool presentOpenInMenu() override;
  bool openInPlaceWith(const ApplicationRecord& application) override;

 private:
  std::shared_ptr<ShareActions> makeActions(const std::shared_ptr<GtkWindowHost>& window) const;
  bool present(const ShareAnchor& anchor);

  URL url_;
  std::string name_;
  CloudDocuments& drive_;
  std::weak_ptr<GtkWindowHost> window_;
  std::weak_ptr<DocumentInteractionControllerDelegate> delegate_;
  std::unique_ptr<SharePresentation> sheet_;
};

}  // namespace vaelo
