// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/ui/text_field.h"
#include "platform/ui/view_controller.h"

namespace vaelo {

/// A button of an alert.
class AlertAction : public Observable {
 public:
  enum class Style { Default, Cancel, Destructive };
  AlertAction(std::string title, Style style, std::function<void()> handler = nullptr)
      : title_(std::move(title)), style_(style), handler_(std::move(handler)) {}
  const std::string& title() const { return title_; }
  Style style() const { return style_; }
  bool isEnabled() const { return enabled_; }
  void setEnabled(bool enabled) { set(enabled_, enabled); }
  /// Asked when pressed; the alert stays open when it answers false.
  void setShouldDismiss(std::function<bool()> shouldDismiss) { shouldDismiss_ = std::move(shouldDismiss); }

 private:
  friend class AlertController;
  std::string title_;
  Style style_;
  std::function<void()> handler_;
  std::function<bool()> shouldDismiss_;
  bool enabled_ = true;
};

/// A question or a message over a screen: an alert in the middle, or a sheet of actions. Main thread.
class AlertController : public ViewController {
 public:
  enum class Style { Alert, ActionSheet };
  struct PopoverAnchor {
    std::shared_ptr<View> sourceView;
    Rect sourceRect;
    bool leftAndRightArrowsOnly = false;
    std::shared_ptr<BarButtonItem> barButton;
  };

  AlertController(std::string title, std::string message, Style style)
      : title_(std::move(title)), message_(std::move(message)), style_(style) {}
  std::string className() const override { return "AlertController"; }
  std::string title() const override { return title_; }
  const std::string& message() const { return message_; }
  Style style() const { return style_; }
  void addAction(std::shared_ptr<AlertAction> action) { actions_.push_back(std::move(action)); }
  const std::vector<std::shared_ptr<AlertAction>>& actions() const { return actions_; }
  std::shared_ptr<TextField> addTextField();
  const std::vector<std::shared_ptr<TextField>>& textFields() const { return textFields_; }
  const ViewControllerRef& contentViewController() const { return content_; }
  void setContentViewController(ViewControllerRef content) { content_ = std::move(content); }
  PopoverAnchor& popover() { return popover_; }

  /// The user pressed `action`: nothing while it is disabled; otherwise asks whether the alert may close, runs the handler
  /// and, when it may, takes the alert away first.
  void press(const std::shared_ptr<AlertAction>& action);

 private:
  std::string title_;
  std::string message_;
  Style style_;
  std::vector<std::shared_ptr<AlertAction>> actions_;
  std::vector<std::shared_ptr<TextField>> textFields_;
  ViewControllerRef content_;
  PopoverAnchor popover_;
};

}  // namespace vaelo
