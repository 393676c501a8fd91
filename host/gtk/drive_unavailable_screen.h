// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>

#include "host/gtk/host_screen.h"
#include "platform/result.h"
#include "platform/ui/view_controller.h"

namespace vaelo {

/// Says that no account is signed in, or why none could be made. Main thread.
class DriveUnavailableController : public ViewController, public HostScreen {
 public:
  explicit DriveUnavailableController(const std::optional<Error>& setUpFailure);
  ~DriveUnavailableController() override;
  std::string className() const override { return "DriveUnavailableController"; }
  GtkWidget* contentWidget() override { return page_; }
  void takeFocus() override {
    if (accounts_) gtk_widget_grab_focus(accounts_);
  }

 private:
  GtkWidget* page_;
  GtkWidget* accounts_ = nullptr;  // part of the page
};

}  // namespace vaelo
