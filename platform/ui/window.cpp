// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/window.h"

namespace vaelo {

void Window::makeKeyAndVisible() {
  visible_ = true;
  if (root_) root_->view()->setInWindow(true);
  if (host_) host_->windowBecameVisible(*this);
}

}  // namespace vaelo
