// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "platform/ui/signal.h"
#include "platform/ui/view.h"

namespace vaelo {

class BarButtonItem;
using BarButtonItemRef = std::shared_ptr<BarButtonItem>;

enum class SystemItem { Cancel, Done, Trash, Action, Organize, FlexibleSpace, FixedSpace };
enum class BarButtonStyle { Plain, Done };

/// A button, a space or a view in a navigation bar or toolbar. Main thread.
class BarButtonItem : public std::enable_shared_from_this<BarButtonItem> {
 public:
  /// Gets the item that was pressed.
  using Action = std::function<void(const BarButtonItemRef& sender)>;

  static BarButtonItemRef withTitle(std::string title, BarButtonStyle style, Action action);
  /// Spaces have no action.
  static BarButtonItemRef system(SystemItem item, Action action = nullptr);
  static BarButtonItemRef withCustomView(ViewRef view);

  const std::string& title() const { return title_; }
  void setTitle(std::string title);
  const std::optional<SystemItem>& systemItem() const { return systemItem_; }
  const ViewRef& customView() const { return customView_; }
  BarButtonStyle style() const { return style_; }
  bool enabled() const { return enabled_; }
  /// Also enables or disables a control that is the custom view.
  void setEnabled(bool enabled);
  const Action& action() const { return action_; }
  void setAction(Action action) { action_ = std::move(action); }
  /// For the host, and for tests: the user pressed the item. A disabled one ignores it; a control that is the custom view
  /// gets touch-up-inside.
  void press();
  /// Emitted after a property changed.
  Signal<BarButtonItem&>& changed() { return changed_; }

 private:
  BarButtonItem() = default;
  std::string title_;
  std::optional<SystemItem> systemItem_;
  ViewRef customView_;
  BarButtonStyle style_ = BarButtonStyle::Plain;
  bool enabled_ = true;
  Action action_;
  Signal<BarButtonItem&> changed_;
};

}  // namespace vaelo
