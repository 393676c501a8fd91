// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gmock/gmock.h>

#include <chrono>
#include <string>

#include "items/dr_item.h"
#include "items/url_additions.h"
#include "platform/ui/alert_controller.h"
#include "platform/ui/preview_controller.h"
#include "preview/glimpse_item_controller.h"
#include "preview/preview_details_view_controller.h"
#include "preview/preview_item_manager.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {

/// A drive with documents, a window's stack, and managers that show the documents in it.
class PreviewFixture : public AppFixture {
 protected:
  PreviewFixture() {
    loadNav();
    window->setRootViewController(nav);
    window->makeKeyAndVisible();
    addFile("Plans/Report.pdf");
    log().clear();
  }
  ~PreviewFixture() override {
    nav->setViewControllers({}, false);
    window->setRootViewController(nullptr);
    memory.clock->forgetWhatIsLeft();
  }

  std::shared_ptr<PreviewItemManager> makeManager(long mode = 0) {
    return PreviewItemManager::newItemManagerWithModeNavController(mode, nav);
  }
  /// A manager that shows the document.
  std::shared_ptr<PreviewItemManager> show(long mode = 0) {
    const auto manager = makeManager(mode);
    manager->previewItem(DRItem::initWithURL(document));
    return manager;
  }
  void setModified(const URL& url, std::chrono::seconds time) {
    memory.disk.items.at(url.path()).values[ResourceKey::ContentModificationDate] = Value(Date(time));
  }
  void forgetModified(const URL& url) {
    memory.disk.items.at(url.path()).values[ResourceKey::ContentModificationDate] = Value();
  }
  ViewControllerRef top() { return nav->topViewController(); }
  std::shared_ptr<GlimpseItemController> glimpse() { return GlimpseItemController::defaultController(); }
  /// Counts how often the quick preview is told to read its document anew.
  std::shared_ptr<void> countReloads(int& reloads) {
    return glimpse()->previewChanged().connect([&reloads](PreviewController&, PreviewChange change) {
      if (change == PreviewChange::CurrentItem) ++reloads;
    });
  }
  std::size_t times(const std::string& level, const std::string& message) { return log().count(level, message); }
  std::string text(const URL& url) { return url.absoluteString(); }
  const std::vector<std::shared_ptr<MemoryUserActivity>>& activities() { return memory.userActivities.made; }

  std::shared_ptr<Window> window = std::make_shared<Window>(Rect{0, 0, 360, 720});
  const URL document = Drive.appendingPathComponent("Plans/Report.pdf");
};

}  // namespace vaelo
