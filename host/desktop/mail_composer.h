// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gio/gio.h>

#include <string>
#include <vector>

#include "host/desktop/application_launch.h"

namespace vaelo {

/// Opens a new message in the user's mail program with a file attached. Main thread.
///
/// A mail program that has an own way to attach is started that way. All others get a mailto: link with an "attach" field,
/// which most understand; the user sees the message before it goes, so one without the attachment does no harm.
class MailComposer {
 public:
  /// Whether the desktop knows a mail program.
  static bool isAvailable();
  /// False when none could be started, which `failed` was told before.
  static bool compose(const std::string& path, GAppLaunchContext* context, LaunchFailed failed);

  /// The command that starts the program with this command line (from a desktop entry) on a new message; empty when it
  /// has no way of its own. `attachment` is an absolute path.
  static std::vector<std::string> ownCommand(const std::string& commandLine, const std::string& attachment);
  static std::string mailtoLink(const std::string& attachment);
};

}  // namespace vaelo
