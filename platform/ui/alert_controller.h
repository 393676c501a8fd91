// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "platform/ui/alert_action.h"
#include "platform/ui/text_field.h"
#include "platform/ui/view_controller.h"

namespace vaelo {

enum class AlertStyle { Alert, ActionSheet };

/// A question or a message over the screen; its anchor is the popover anchor that every screen has. Main thread.
class AlertController : public ViewController {
 public:
  /// Texts may be empty.
  AlertController(AlertStyle style, const std::string& title, std::string message);
  static std::shared_ptr<AlertController> make(AlertStyle style, const std::string& title, const std::string& message) {
    return std::make_shared<AlertController>(style, title, message);
  }
  std::string className() const override { return "AlertController"; }

  AlertStyle style() const { return style_; }
  const std::string& message() const { return message_; }
  const std::vector<AlertActionRef>& actions() const { return actions_; }
  void addAction(AlertActionRef action);
  /// The action that the return key of the keyboard means; null for none.
  const AlertActionRef& preferredAction() const { return preferredAction_; }
  void setPreferredAction(AlertActionRef action) { preferredAction_ = std::move(action); }
  const std::vector<std::shared_ptr<TextField>>& textFields() const { return textFields_; }
  /// Adds a field and lets `configure` set it up.
  void addTextField(const std::function<void(const std::shared_ptr<TextField>&)>& configure);
  /// A screen shown between message and buttons; null for none.
  const ViewControllerRef& contentViewController() const { return contentViewController_; }
  void setContentViewController(ViewControllerRef controller);

  /// For the host, and for tests: the user chose the action. Nothing happens when it is disabled; else its shouldDismiss is
  /// asked, the alert goes away, and then the handler runs, so that it can show something else. True when the alert went.
  bool performAction(const AlertActionRef& action);
  /// For the host: the user waved the alert away (Escape, a click beside it): performs the cancel action. False when there
  /// is none; the alert stays.
  bool cancel();
  void viewDidLoad() override;

 private:
  AlertStyle style_;
  std::string message_;
  std::vector<AlertActionRef> actions_;
  AlertActionRef preferredAction_;
  std::vector<std::shared_ptr<TextField>> textFields_;
  ViewControllerRef contentViewController_;
};

}  // namespace vaelo
