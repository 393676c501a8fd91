// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include "platform/ui/view_controller.h"

namespace vaelo {

using ViewControllerList = std::vector<ViewControllerRef>;

class NavigationControllerDelegate {
 public:
  virtual ~NavigationControllerDelegate() = default;
  virtual void navigationControllerWillShowViewControllerAnimated(NavigationController&, const ViewControllerRef&, bool) {}
  virtual void navigationControllerDidShowViewControllerAnimated(NavigationController&, const ViewControllerRef&, bool) {}
};

/// Mirrors a stack of screens; the host installs one. Main thread.
class NavigationHost {
 public:
  virtual ~NavigationHost() = default;
  /// Shows the last of `stack` and calls `done` once when it stands still. A later call ends an earlier one's animation.
  virtual void showStack(const ViewControllerList& stack, bool animated, std::function<void()> done) = 0;
  virtual void setToolbarHidden(bool hidden) = 0;
};

/// A stack of screens of which the top one shows. Main thread.
///
/// Each change of the top screen calls, in this order: the old one's viewWillDisappear, the new one's viewWillAppear, the delegate's
/// will-show; when the transition has ended viewDidDisappear, viewDidAppear and the delegate's did-show.
class NavigationController : public ViewController {
 public:
  std::string className() const override { return "NavigationController"; }

  const ViewControllerList& viewControllers() const { return stack_; }
  void setViewControllers(const ViewControllerList& stack, bool animated);
  void pushViewController(const ViewControllerRef& controller, bool animated);
  /// The screen that left; null when only the root is there.
  ViewControllerRef popViewController(bool animated);
  void popToRootViewController(bool animated);
  ViewControllerRef topViewController() const { return stack_.empty() ? nullptr : stack_.back(); }
  /// What the user sees: what is presented, else the top screen.
  ViewControllerRef visibleViewController() const;

  void setDelegate(std::weak_ptr<NavigationControllerDelegate> delegate) { delegate_ = std::move(delegate); }
  bool isToolbarHidden() const { return toolbarHidden_; }
  void setToolbarHidden(bool hidden);

  /// Null detaches; without a host every transition ends at once.
  void setNavigationHost(NavigationHost* host);
  /// For the host: a gesture went back until `count` screens are left.
  void userWentBack(std::size_t count);

 private:
  void show(ViewControllerList stack, bool animated, bool hostKnows);
  std::shared_ptr<NavigationController> self();

  ViewControllerList stack_;
  std::weak_ptr<NavigationControllerDelegate> delegate_;
  NavigationHost* host_ = nullptr;
  bool toolbarHidden_ = true;
};

}  // namespace vaelo
