// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "platform/ui/navigation_item.h"
#include "platform/ui/restoration_coder.h"
#include "platform/ui/view.h"

namespace vaelo {

class NavigationController;
class ViewController;
using ViewControllerRef = std::shared_ptr<ViewController>;

/// Shows and takes away what is presented over a screen; the host installs one per window. Main thread.
class PresentationHost {
 public:
  virtual ~PresentationHost() = default;
  /// Calls `done` when it is shown.
  virtual void present(const ViewControllerRef& presented, const ViewControllerRef& presenting, bool animated,
                       std::function<void()> done) = 0;
  virtual void dismiss(const ViewControllerRef& presented, bool animated, std::function<void()> done) = 0;
};

/// One screen: a view that is made when first needed, what it shows in the bars, and the callbacks of its life. Main thread.
class ViewController : public Observable, public std::enable_shared_from_this<ViewController> {
 public:
  ViewController() = default;
  virtual ~ViewController() = default;
  ViewController(const ViewController&) = delete;
  ViewController& operator=(const ViewController&) = delete;

  /// The name that log lines use.
  virtual std::string className() const { return "ViewController"; }

  /// Loads the view (loadView, then viewDidLoad) the first time.
  const std::shared_ptr<View>& view();
  bool isViewLoaded() const { return view_ != nullptr; }
  virtual void loadView();
  virtual void viewDidLoad() {}
  virtual void viewWillAppear(bool /*animated*/) {}
  virtual void viewDidAppear(bool /*animated*/) {}
  virtual void viewWillDisappear(bool /*animated*/) {}
  virtual void viewDidDisappear(bool /*animated*/) {}
  virtual void viewWillLayoutSubviews() {}
  virtual void viewWillTransitionToSize(const Size&) {}

  virtual std::string title() const { return navigationItem_.title(); }
  virtual void setTitle(const std::string& title) { navigationItem_.setTitle(title); }
  NavigationItem& navigationItem() { return navigationItem_; }
  const BarButtonItems& toolbarItems() const { return toolbarItems_; }
  void setToolbarItems(BarButtonItems items) { set(toolbarItems_, std::move(items)); }

  std::shared_ptr<NavigationController> navigationController() const { return navigationController_.lock(); }
  /// For the navigation controller that takes the screen onto its stack.
  void setNavigationController(const std::shared_ptr<NavigationController>& controller);

  const ViewControllerRef& presentedViewController() const { return presented_; }
  ViewControllerRef presentingViewController() const { return presenting_.lock(); }
  /// Shows `controller` over this screen. While another one is presented, nothing happens.
  void presentViewController(const ViewControllerRef& controller, bool animated, std::function<void()> done = nullptr);
  /// Takes away what this screen presents or, when it presents nothing, this screen itself. `done` runs at once when there
  /// is nothing to take away.
  void dismissViewController(bool animated, std::function<void()> done = nullptr);
  /// The host that presentations go to; inherited from the presenting screen and from the navigation controller.
  void setPresentationHost(PresentationHost* host) { presentationHost_ = host; }
  /// For the host: the user took the presented screen away.
  void presentedWasDismissed();

  const std::string& restorationIdentifier() const { return restorationIdentifier_; }
  void setRestorationIdentifier(std::string identifier) { restorationIdentifier_ = std::move(identifier); }
  virtual void encodeRestorableStateWithCoder(RestorationCoder&) {}
  virtual void decodeRestorableStateWithCoder(const RestorationCoder&) {}

  const TraitCollection& traitCollection() const { return traits_; }
  void setTraitCollection(const TraitCollection& traits) { set(traits_, traits); }

 protected:
  void setView(std::shared_ptr<View> view) { view_ = std::move(view); }
  PresentationHost* presentationHost() const;

 private:
  std::shared_ptr<View> view_;
  bool loadingView_ = false;
  NavigationItem navigationItem_;
  BarButtonItems toolbarItems_;
  std::weak_ptr<NavigationController> navigationController_;
  ViewControllerRef presented_;
  std::weak_ptr<ViewController> presenting_;
  PresentationHost* presentationHost_ = nullptr;
  std::string restorationIdentifier_;
  TraitCollection traits_;
};

}  // namespace vaelo
