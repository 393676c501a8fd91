// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "platform/ui/document_interaction_controller.h"

namespace vaelo {

/// Hands a document to an installed application, with the desktop's start notice. Main thread.
class GtkDocumentInteraction : public DocumentInteractionController {
 public:
  explicit GtkDocumentInteraction(URL url) : url_(std::move(url)), name_(url_.lastPathComponent()) {}
  URL url() const override { return url_; }
  std::string name() const override { return name_; }
  void setName(std::string name) override { name_ = std::move(name); }
  void setDelegate(std::weak_ptr<DocumentInteractionControllerDelegate> delegate) override {
    delegate_ = std::move(delegate);
  }
  bool presentOptionsMenuFromRect(const Rect& rect, const ViewRef& view, bool animated) override;
  bool presentOptionsMenuFromBarButtonItem(const BarButtonItemRef& item, bool animated) override;
  bool openInPlaceWith(const ApplicationRecord& application) override;

 private:
  URL url_;
  std::string name_;
  std::weak_ptr<DocumentInteractionControllerDelegate> delegate_;
};

}  // namespace vaelo
