// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "platform/error.h"
#include "platform/ui/alert_action.h"
#include "platform/ui/bar_button_item.h"
#include "platform/ui/text_field.h"
#include "platform/ui/view_controller.h"
#include "platform/url.h"

namespace vaelo {

/// Tells a person what went wrong, renames items, and helps screens and text fields. Main thread.
class UIUtils {
 public:
  /// An alert with the title, the message (either may be empty) and one "OK" button over `parent`.
  static void showAlertMessageParentViewController(const std::string& title, const std::string& message,
                                                   const ViewControllerRef& parent);
  /// An alert titled with the error's description, else its failure reason, else "Error exception".
  static void showErrorParentViewController(const std::optional<Error>& error, const ViewControllerRef& parent);
  /// An alert for a failed move: names the clash or the name that can't be used, else as showError does. The name comes from
  /// the destination path in the error's user information.
  static void showFriendlyMoveErrorParentViewController(const Error& error, const ViewControllerRef& parent);
  /// Likewise for a rename to `basename`.
  static void showFriendlyRenameErrorBasenameParentViewController(const Error& error, const std::string& basename,
                                                                  const ViewControllerRef& parent);
  static void showFriendlyMoveOrRenameErrorBasenameMovingToDirParentViewController(const Error& error,
                                                                                   const std::string& basename,
                                                                                   bool movingToDir,
                                                                                   const ViewControllerRef& parent);
  static void showItemExistsAlertMovingToDirParentViewController(const std::string& basename, bool movingToDir,
                                                                 const ViewControllerRef& parent);
  static void showInvalidItemNameAlertParentViewController(const std::string& basename, const ViewControllerRef& parent);
  /// The alert for something that can't be done with this item.
  static void showUnsupportedError(const ViewControllerRef& parent);
  /// Gets the chosen action, null when nothing was asked, and whether the user gave up.
  using DeleteAnswer = std::function<void(const AlertActionRef& action, bool cancelled)>;
  /// Asks whether the items may go, in a sheet over `parent` that points at the view, or without one at the button. No
  /// items: given up at once. Items without a message: nothing is asked, and nobody answers.
  static void showDeleteWarningAlertHasContainerViewControllerUsingViewUsingButtonCompletion(
      const std::vector<URL>& urls, bool hasContainer, const ViewControllerRef& parent, const ViewRef& view,
      const BarButtonItemRef& button, const DeleteAnswer& completion);
  /// What will go, in a sentence; nothing for an item that can't be read or has no name.
  static std::optional<std::string> messageForDeletePrompt(const std::vector<URL>& urls);
  /// One line for the error, empty for none.
  static std::string bestMessage(const std::optional<Error>& error);
  /// Renames the item, of a bookmark the document that it points to. Nothing is done, and no error given, for the name that
  /// it has. An empty or impossible name is WriteInvalidFileName. Blocks on the disk.
  static std::optional<Error> renameItemAtURLToName(const URL& url, const std::string& name);
  /// Where the item is when it has the name: its extension can't be taken off or changed.
  static URL computeNewURLNewBasename(const URL& url, const std::string& name);
  /// The caret before the last dot; a text without one keeps its caret.
  static void setCursorInTextFieldToBeforeExtension(TextField& field);
  /// Offset and length in characters from the start of the text.
  static void selectTextInTextFieldRange(TextField& field, const TextRange& range);
  /// True on a tablet-class device.
  static bool slateMode();
  static void addChildViewControllerChildViewController(const ViewControllerRef& parent, const ViewControllerRef& child);
};

}  // namespace vaelo
