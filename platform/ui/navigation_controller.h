// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <vector>

#include "platform/ui/navigation_host.h"
#include "platform/ui/view_controller.h"

namespace vaelo {

class NavigationController;

/// Is told which screen of the stack is shown. Main thread.
class NavigationControllerDelegate {
 public:
  virtual ~NavigationControllerDelegate() = default;
  virtual void navigationControllerWillShowViewControllerAnimated(NavigationController&, const ViewControllerRef&, bool) {}
  virtual void navigationControllerDidShowViewControllerAnimated(NavigationController&, const ViewControllerRef&, bool) {}
};

/// A stack of screens of which the top one is shown. Main thread.
///
/// Every change of the top goes: delegate willShow, viewWillDisappear and viewWillAppear, the host's transition,
/// viewDidDisappear and viewDidAppear, delegate didShow. Without a host the transition takes no time. Before the
/// controller's own view is loaded only the delegate is told. A change during a transition ends that transition first.
class NavigationController : public ViewController {
 public:
  NavigationController() = default;
  ~NavigationController() override;
  std::string className() const override { return "NavigationController"; }

  /// From the root to the top.
  const std::vector<ViewControllerRef>& viewControllers() const { return stack_; }
  /// An empty list empties the stack.
  void setViewControllers(std::vector<ViewControllerRef> controllers, bool animated);
  void pushViewController(const ViewControllerRef& controller, bool animated);
  /// Takes the top away unless it is the root; null when nothing was taken.
  ViewControllerRef popViewControllerAnimated(bool animated);
  /// What was taken away, from the lowest up.
  std::vector<ViewControllerRef> popToRootViewControllerAnimated(bool animated);
  /// Null for an empty stack.
  ViewControllerRef topViewController() const { return stack_.empty() ? nullptr : stack_.back(); }
  /// What the user sees: the last of what is presented over the stack, else the top.
  ViewControllerRef visibleViewController() const;

  std::shared_ptr<NavigationControllerDelegate> delegate() const { return delegate_.lock(); }
  void setDelegate(std::weak_ptr<NavigationControllerDelegate> delegate) { delegate_ = std::move(delegate); }

  /// The platform's command to select all that the top screen shows. `sender` may be null.
  virtual void selectAllItems(const BarButtonItemRef& /*sender*/) {}

  bool toolbarHidden() const { return toolbarHidden_; }
  void setToolbarHidden(bool hidden, bool animated = false);
  double navigationBarHeight() const { return navigationBarHeight_; }
  double toolbarHeight() const { return toolbarHeight_; }
  /// For the host: the real heights of the bars, in points.
  void setBarHeights(double navigationBar, double toolbar);

  /// For the host: it shows the stack from now on, or with null no more; not owned. It begins with viewControllers().
  void setHost(NavigationHost* host);
  NavigationHost* host() const { return host_; }
  /// For the host: the user went back (swipe, key or button) until `count` screens were left, which the host shows already.
  void userWentBackTo(std::size_t count);

  void viewDidLoad() override;
  void viewWillAppear(bool animated) override;
  void viewDidAppear(bool animated) override;
  void viewWillDisappear(bool animated) override;
  void viewDidDisappear(bool animated) override;
  /// The folder that the topmost list shows, and on the way back the lists down to it, if the folder is still there.
  void encodeRestorableStateWithCoder(RestorationCoder& coder) override;
  void decodeRestorableStateWithCoder(const RestorationCoder& coder) override;

 protected:
  std::vector<ViewControllerRef> visibleChildren() const override;

 private:
  struct Transition {
    ViewControllerRef from;
    ViewControllerRef to;
    bool animated = false;
  };
  void changeStack(std::vector<ViewControllerRef> next, bool animated, bool hostShowsItAlready);
  void finishTransition(const std::shared_ptr<Transition>& transition);
  void attachTopView();

  std::vector<ViewControllerRef> stack_;
  std::shared_ptr<Transition> transition_;
  std::weak_ptr<NavigationControllerDelegate> delegate_;
  NavigationHost* host_ = nullptr;
  bool toolbarHidden_ = true;
  double navigationBarHeight_ = 44;
  double toolbarHeight_ = 44;
};

}  // namespace vaelo
