// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "platform/ui/view.h"

namespace vaelo {

/// A button, a view or a space in a navigation bar or toolbar. Main thread.
class BarButtonItem : public Observable {
 public:
  enum class Kind { Title, Cancel, Done, Trash, Action, Organize, FlexibleSpace, FixedSpace, CustomView };
  using Action = std::function<void(BarButtonItem&)>;

  static std::shared_ptr<BarButtonItem> withTitle(std::string title, Action action);
  static std::shared_ptr<BarButtonItem> system(Kind kind, Action action = nullptr);
  static std::shared_ptr<BarButtonItem> withCustomView(std::shared_ptr<View> view);

  Kind kind() const { return kind_; }
  const std::string& title() const { return title_; }
  const std::shared_ptr<View>& customView() const { return customView_; }
  bool isEnabled() const { return enabled_; }
  void setEnabled(bool enabled) { set(enabled_, enabled); }
  /// Runs the action as a press does; nothing while disabled.
  void press();

 private:
  Kind kind_ = Kind::Title;
  std::string title_;
  std::shared_ptr<View> customView_;
  Action action_;
  bool enabled_ = true;
};

using BarButtonItems = std::vector<std::shared_ptr<BarButtonItem>>;

}  // namespace vaelo
