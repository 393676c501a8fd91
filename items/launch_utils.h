// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "platform/launch_services.h"
#include "platform/ui/view_controller.h"

namespace vaelo {

/// Decides which installed application opens a document of the drive, and opens it there in place. Main thread.
class LaunchUtils {
 public:
  /// True when the document was handed to an application.
  static bool openInDefaultAppViewControllerRequireOpenIn(const URL& document, const ViewControllerRef& presenter,
                                                          bool requireOpenIn);
  static bool isUrlInDefaultContainer(const URL& url);
  static std::optional<ApplicationRecord> defaultAppForDocumentRequireOpenIn(const URL& document, bool requireOpenIn);
  /// Applications that own the document's type and open it in place, best first.
  static std::vector<ApplicationRecord> availableAppsForDoc(DocumentRecord& record);
  /// The localized name of the application that would be chosen.
  static std::optional<std::string> defaultAppNameForDocumentRequireOpenIn(const URL& document, bool requireOpenIn);

 private:
  static std::optional<ApplicationRecord> appForDocumentInDrive(const URL& document, bool requireOpenIn);
  static std::optional<ApplicationRecord> appForDocumentInLibrary(const URL& document);
};

}  // namespace vaelo
