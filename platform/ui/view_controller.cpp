// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/view_controller.h"

#include <utility>

#include "platform/ui/navigation_controller.h"

namespace vaelo {

const std::shared_ptr<View>& ViewController::view() {
  // viewDidLoad may ask for the view; it is then loaded already.
  if (!view_ && !loadingView_) {
    loadingView_ = true;
    loadView();
    loadingView_ = false;
    viewDidLoad();
  }
  return view_;
}

void ViewController::loadView() { setView(std::make_shared<View>()); }

void ViewController::setNavigationController(const std::shared_ptr<NavigationController>& controller) {
  navigationController_ = controller;
}

PresentationHost* ViewController::presentationHost() const {
  if (presentationHost_) return presentationHost_;
  if (const auto presenting = presenting_.lock()) return presenting->presentationHost();
  const std::shared_ptr<NavigationController> navigation = navigationController_.lock();
  return navigation && navigation.get() != this ? navigation->presentationHost() : nullptr;
}

void ViewController::presentViewController(const ViewControllerRef& controller, bool animated, std::function<void()> done) {
  if (presented_) return;
  presented_ = controller;
  controller->presenting_ = weak_from_this();
  if (PresentationHost* host = presentationHost()) {
    host->present(controller, shared_from_this(), animated, std::move(done));
  } else if (done) {
    done();
  }
}

void ViewController::dismissViewController(bool animated, std::function<void()> done) {
  if (!presented_) {
    if (const auto presenting = presenting_.lock()) {
      presenting->dismissViewController(animated, std::move(done));
    } else if (done) {
      done();
    }
    return;
  }
  const ViewControllerRef leaving = presented_;
  PresentationHost* host = presentationHost();
  presentedWasDismissed();
  if (host) {
    host->dismiss(leaving, animated, std::move(done));
  } else if (done) {
    done();
  }
}

void ViewController::presentedWasDismissed() {
  if (!presented_) return;
  const ViewControllerRef leaving = std::exchange(presented_, nullptr);
  leaving->presenting_.reset();
}

}  // namespace vaelo
