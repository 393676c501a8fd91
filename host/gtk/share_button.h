// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <optional>

#include "platform/ui/document_interaction_controller.h"

namespace vaelo {

/// The Share button that the quick preview has of its own: shares the document that is shown when it is pressed, a
/// bookmark's target in the bookmark's place. Main thread.
class ShareButton {
 public:
  /// `shown` answers the document; nothing when none is shown.
  explicit ShareButton(std::function<std::optional<URL>()> shown);
  const BarButtonItemRef& item() const { return item_; }
  /// Takes away the sheet of a document that is no longer what is shown.
  void shownChanged();

 private:
  std::optional<URL> shared() const;
  void pressed();

  std::function<std::optional<URL>()> shown_;
  BarButtonItemRef item_;
  std::shared_ptr<DocumentInteractionController> sheet_;
};

}  // namespace vaelo
