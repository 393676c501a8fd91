// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/ui/navigation_item.h"
#include "platform/ui/popover_anchor.h"
#include "platform/ui/presentation_host.h"
#include "platform/ui/restoration_coder.h"
#include "platform/ui/trait_collection.h"
#include "platform/ui/view.h"

namespace vaelo {

class NavigationController;
class ViewController;
class Window;
using ViewControllerRef = std::shared_ptr<ViewController>;

enum class PresentationStyle {
  Automatic = -2,
  FullScreen = 0,
  PageSheet = 1,
  FormSheet = 2,
  OverCurrentContext = 6,
  Popover = 7
};
enum class ViewControllerChange { Title, ToolbarItems, View, Children, Presentation };
enum class AppearanceState { Disappeared, Appearing, Appeared, Disappearing };

/// How a change of size is carried out.
struct TransitionCoordinator {
  bool animated = false;
};

/// A screen: a view made when first asked for, what it puts into the bars, and its place among other screens. Main thread.
///
/// A presented screen is owned by the screen that presents it, children by their parent.
class ViewController : public std::enable_shared_from_this<ViewController> {
 public:
  ViewController() = default;
  virtual ~ViewController();
  ViewController(const ViewController&) = delete;
  ViewController& operator=(const ViewController&) = delete;

  /// The class's name in log lines.
  virtual std::string className() const { return "ViewController"; }

  // The view.
  /// Loads the view on first use: loadView, then viewDidLoad.
  const ViewRef& view();
  bool isViewLoaded() const { return view_ != nullptr; }
  void setView(ViewRef view);
  /// Makes the view; the base makes an empty one as large as a phone's screen.
  virtual void loadView();
  virtual void viewDidLoad() {}
  virtual void viewWillAppear(bool) {}
  virtual void viewDidAppear(bool) {}
  virtual void viewWillDisappear(bool) {}
  virtual void viewDidDisappear(bool) {}
  virtual void viewWillLayoutSubviews() {}
  virtual void viewDidLayoutSubviews() {}
  /// Children and presented screens are told too; overrides call the base.
  virtual void viewWillTransitionToSize(const Size& size, TransitionCoordinator& coordinator);
  /// The traits of the window that the screen is in; else those of a phone.
  TraitCollection traitCollection() const;

  // Bars.
  const std::string& title() const { return title_; }
  /// Also the navigation item's title.
  void setTitle(std::string title);
  NavigationItem& navigationItem() { return navigationItem_; }
  const std::vector<BarButtonItemRef>& toolbarItems() const { return toolbarItems_; }
  void setToolbarItems(std::vector<BarButtonItemRef> items, bool animated = false);

  // The tree of screens.
  /// Null for none; not owned.
  ViewController* parent() const { return parent_; }
  const std::vector<ViewControllerRef>& children() const { return children_; }
  /// Does not add the child's view; the caller does, and then calls didMoveToParent.
  void addChild(const ViewControllerRef& child);
  void removeFromParent();
  virtual void didMoveToParent(ViewController*) {}
  /// The nearest navigation controller above; null for none.
  std::shared_ptr<NavigationController> navigationController() const;

  // Presentation.
  /// Shows `presented` over everything that this screen's tree shows; `completion` runs when it stands. The presenter is the
  /// outermost parent, or what it presents already.
  void presentViewController(const ViewControllerRef& presented, bool animated, std::function<void()> completion = nullptr);
  /// Takes away what this screen's tree presents, with everything above it; a screen that presents nothing goes away itself
  /// when it is presented. `completion` runs in any case: at once when there is nothing to take away.
  void dismissViewControllerAnimated(bool animated, std::function<void()> completion = nullptr);
  /// What this screen or a parent of it presents.
  ViewControllerRef presentedViewController() const;
  /// The screen that presents this one or a parent of it; null for none.
  ViewController* presentingViewController() const;
  PresentationStyle modalPresentationStyle() const { return presentationStyle_; }
  void setModalPresentationStyle(PresentationStyle style) { presentationStyle_ = style; }
  const std::optional<PopoverAnchor>& popoverAnchor() const { return popoverAnchor_; }
  void setPopoverAnchor(std::optional<PopoverAnchor> anchor) { popoverAnchor_ = std::move(anchor); }

  // Restoration.
  const std::string& restorationIdentifier() const { return restorationIdentifier_; }
  void setRestorationIdentifier(std::string identifier) { restorationIdentifier_ = std::move(identifier); }
  virtual void encodeRestorableStateWithCoder(RestorationCoder&) {}
  virtual void decodeRestorableStateWithCoder(const RestorationCoder&) {}

  // Appearance, for containers and hosts.
  AppearanceState appearanceState() const { return appearanceState_; }
  /// Loads the view and calls viewWillAppear, or calls viewWillDisappear; does nothing when it is that far already.
  void beginAppearanceTransition(bool appearing, bool animated);
  /// Calls viewDidAppear or viewDidDisappear for a transition that began.
  void endAppearanceTransition();

  /// The window whose tree of screens this one is in; null for none.
  Window* window() const;
  Signal<ViewController&, ViewControllerChange>& changed() { return changed_; }

 protected:
  /// A container says which of its children take part when sizes and appearance change.
  virtual std::vector<ViewControllerRef> visibleChildren() const { return children_; }
  void notify(ViewControllerChange change) { changed_.emit(*this, change); }
  /// Takes this screen away when it is presented, with everything above it.
  void dismissSelf(bool animated, std::function<void()> completion = nullptr);

 private:
  friend class Window;
  ViewController* outermost() const;
  void finishPresented(bool animated, std::function<void()> completion);

  ViewRef view_;
  bool loading_ = false;
  bool transitionAnimated_ = false;
  AppearanceState appearanceState_ = AppearanceState::Disappeared;
  std::string title_;
  NavigationItem navigationItem_;
  std::vector<BarButtonItemRef> toolbarItems_;
  ViewController* parent_ = nullptr;
  std::vector<ViewControllerRef> children_;
  ViewControllerRef presented_;
  ViewController* presenting_ = nullptr;
  Window* window_ = nullptr;  // of a window's root screen only
  PresentationStyle presentationStyle_ = PresentationStyle::Automatic;
  std::optional<PopoverAnchor> popoverAnchor_;
  std::string restorationIdentifier_;
  Signal<ViewController&, ViewControllerChange> changed_;
};

}  // namespace vaelo
