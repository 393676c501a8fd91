// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/main.h"

#include "app/app_delegate.h"
#include "items/file_utils.h"
#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

int vaeloMain(int argc, char** argv) {
  // A program may be started without any arguments, not even its own name.
  const char* program = argc > 0 ? argv[0] : "";
  VLO_DEBUG("-------------------------------------------------------");
  VLO_INFO("Running %s", program);
  VLO_INFO("Built (main) on " __DATE__ " @ " __TIME__);
  FileUtils::logFileAttributes(program);
  return Platform::current().application.run(argc, argv, [] { return std::make_shared<AppDelegate>(); });
}

}  // namespace vaelo
