// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "platform/launch_services.h"
#include "platform/ui/view_controller.h"

namespace vaelo {

/// Hands one document to other applications. Main thread.
class DocumentInteractionController {
 public:
  virtual ~DocumentInteractionController() = default;
  virtual const URL& url() const = 0;
  /// The name that the sheet shows; empty for the document's own.
  virtual void setName(const std::string& name) = 0;
  virtual void presentOptionsMenuFromRectInView(const Rect& rect, const std::shared_ptr<View>& view, bool animated) = 0;
  virtual void presentOptionsMenuFromBarButtonItem(const std::shared_ptr<BarButtonItem>& button, bool animated) = 0;
  /// Opens the document, where it lies, with the application.
  virtual void openInPlaceWithApplication(const ApplicationRecord& application) = 0;
};

}  // namespace vaelo
