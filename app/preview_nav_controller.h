// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/ui/navigation_controller.h"

namespace vaelo {

/// A stack for previews apart from the folder lists. Main thread.
class PreviewNavController : public NavigationController {
 public:
  std::string className() const override { return "PreviewNavController"; }
};

}  // namespace vaelo
