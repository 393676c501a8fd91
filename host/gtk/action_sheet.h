// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <memory>

#include "host/gtk/share_presentation.h"
#include "platform/ui/alert_controller.h"

namespace vaelo {

/// Shows a question with its answers below each other: at its anchor on a wide window, rising from the bottom edge on a
/// narrow one. A tap beside it and Escape mean its cancel action; the keyboard begins there too, so that nothing is lost by
/// a Return too many. Main thread.
class ActionSheet {
 public:
  /// `gone` is called once, after the sheet went, and may end this object.
  ActionSheet(std::shared_ptr<AlertController> alert, const std::shared_ptr<GtkWindowHost>& window,
              std::function<void()> gone);
  ActionSheet(const ActionSheet&) = delete;
  ActionSheet& operator=(const ActionSheet&) = delete;

  /// The question is answered.
  void close();

 private:
  GtkWidget* makeContent(bool narrow);
  GtkWidget* makeButton(const AlertActionRef& action);
  void dismissed();

  std::shared_ptr<AlertController> alert_;
  std::function<void()> gone_;
  bool answered_ = false;
  GtkWidget* first_ = nullptr;  ///< the button where the keyboard begins
  std::unique_ptr<SharePresentation> presentation_;
};

}  // namespace vaelo
