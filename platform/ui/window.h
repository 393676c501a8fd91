// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <optional>

#include "platform/ui/signal.h"
#include "platform/ui/view_controller.h"

namespace vaelo {

/// The application's window. Main thread. Made by ScreenFactory::makeWindow, so that the host can show it; a plain one is
/// shown by nobody and serves tests.
class Window : public std::enable_shared_from_this<Window> {
 public:
  explicit Window(const Rect& bounds = {});
  virtual ~Window();
  Window(const Window&) = delete;
  Window& operator=(const Window&) = delete;

  const ViewControllerRef& rootViewController() const { return root_; }
  void setRootViewController(ViewControllerRef root);
  const std::optional<Color>& backgroundColor() const { return backgroundColor_; }
  void setBackgroundColor(std::optional<Color> color);
  const Rect& bounds() const { return bounds_; }
  /// For the host: the window has another size. Screens are told before their views change.
  void resize(const Size& size, bool animated);
  const TraitCollection& traitCollection() const { return traits_; }
  void setTraitCollection(const TraitCollection& traits);

  bool visible() const { return visible_; }
  /// Loads the root screen's view and makes it appear. Subclasses that show something call the base.
  virtual void makeKeyAndVisible();

  /// Shows presented screens; without one, presentations take no time. Not owned.
  PresentationHost* presentationHost() const { return presentationHost_; }
  void setPresentationHost(PresentationHost* host) { presentationHost_ = host; }
  /// Emitted after the root screen, background or traits changed.
  Signal<Window&>& changed() { return changed_; }

 private:
  void showRoot();
  Rect bounds_;
  std::optional<Color> backgroundColor_;
  TraitCollection traits_;
  ViewControllerRef root_;
  bool visible_ = false;
  PresentationHost* presentationHost_ = nullptr;
  Signal<Window&> changed_;
};

using WindowRef = std::shared_ptr<Window>;

}  // namespace vaelo
