// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "platform/launch_services.h"
#include "platform/ui/bar_button_item.h"

namespace vaelo {

class DocumentInteractionController;

class DocumentInteractionControllerDelegate {
 public:
  virtual ~DocumentInteractionControllerDelegate() = default;
  virtual void documentInteractionControllerDidDismissOptionsMenu(DocumentInteractionController&) {}
};

/// Shares a document or opens it in another application. It must be kept alive while its menu is shown. Main thread.
class DocumentInteractionController {
 public:
  virtual ~DocumentInteractionController() = default;
  virtual URL url() const = 0;
  /// The name that the menu shows; at the start the document's own.
  virtual std::string name() const = 0;
  virtual void setName(std::string name) = 0;
  virtual void setDelegate(std::weak_ptr<DocumentInteractionControllerDelegate> delegate) = 0;
  /// False when there is nothing to offer.
  virtual bool presentOptionsMenuFromRect(const Rect& rect, const ViewRef& view, bool animated) = 0;
  virtual bool presentOptionsMenuFromBarButtonItem(const BarButtonItemRef& item, bool animated) = 0;
  /// Lets the user choose among all applications, and opens the document itself in the chosen one. False when there is
  /// nothing to open.
  virtual bool presentOpenInMenu() = 0;
  /// Hands the document itself, not a copy, to the application. True when it was started.
  virtual bool openInPlaceWith(const ApplicationRecord& application) = 0;
};

}  // namespace vaelo
