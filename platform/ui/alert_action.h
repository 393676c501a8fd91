// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <utility>

#include "platform/ui/signal.h"

namespace vaelo {

class AlertAction;
using AlertActionRef = std::shared_ptr<AlertAction>;

enum class AlertActionStyle { Default, Cancel, Destructive };

/// A button of an alert or action sheet. Main thread.
class AlertAction : public std::enable_shared_from_this<AlertAction> {
 public:
  using Handler = std::function<void(const AlertActionRef&)>;

  static AlertActionRef make(std::string title, AlertActionStyle style, Handler handler = nullptr);

  const std::string& title() const { return title_; }
  AlertActionStyle style() const { return style_; }
  bool enabled() const { return enabled_; }
  void setEnabled(bool enabled);
  const Handler& handler() const { return handler_; }
  /// Asked when the action is chosen; while it answers false the alert stays and the handler does not run.
  const std::function<bool()>& shouldDismiss() const { return shouldDismiss_; }
  void setShouldDismiss(std::function<bool()> shouldDismiss) { shouldDismiss_ = std::move(shouldDismiss); }
  /// Emitted after enabled changed.
  Signal<AlertAction&>& changed() { return changed_; }

 private:
  AlertAction() = default;
  std::string title_;
  AlertActionStyle style_ = AlertActionStyle::Default;
  bool enabled_ = true;
  Handler handler_;
  std::function<bool()> shouldDismiss_;
  Signal<AlertAction&> changed_;
};

}  // namespace vaelo
