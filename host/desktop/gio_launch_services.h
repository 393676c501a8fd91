// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/launch_services.h"

namespace vaelo {

/// Applications as the desktop knows them (Desktop Entry and MIME applications specifications). The user's default and the
/// recommended handlers of a type are its owners, but for programs that run in a terminal.
class GioLaunchServices : public LaunchServices {
 public:
  std::shared_ptr<DocumentRecord> documentRecord(const URL& url, bool sourceIsManaged) override;
  std::optional<ApplicationRecord> applicationRecord(const std::string& bundleIdentifier) override;
  std::string ownBundleIdentifier() override { return "com.marrow.VaeloDrive"; }
};

}  // namespace vaelo
