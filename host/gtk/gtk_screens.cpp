// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/gtk_screens.h"

#include "host/desktop/web_page.h"
#include "host/drive/promise_file.h"
#include "host/gtk/drive_unavailable_screen.h"
#include "host/gtk/folder_list_screen.h"
#include "host/gtk/gtk_document_interaction.h"
#include "host/gtk/gtk_window.h"
#include "host/gtk/offer_button.h"
#include "host/gtk/root_list_screen.h"
#include "host/gtk/upgrade_flow.h"
#include "host/support/display_name.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

WindowRef GtkScreens::makeWindow(const Rect& bounds) {
  auto window = std::make_shared<GtkWindowHost>(application_, bounds, tags_);
  window_ = window;
  return window;
}

DocumentListControllerRef GtkScreens::makeRootList() {
  const std::optional<URL> root = drive_.defaultContainerURL();
  if (!root) return nullptr;
  return std::make_shared<RootListScreen>(*root, drive_, *this, tags_);
}

DocumentListControllerRef GtkScreens::makeList(const URL& folder) {
  return std::make_shared<FolderListScreen>(folder, drive_, *this, tags_);
}

std::optional<std::vector<DocumentListControllerRef>> GtkScreens::hierarchyTo(const URL& folder) {
  const URL real = drive_.realPathURL(folder);
  const Result<CloudContainerRef> container = drive_.containerForURL(real);
  const std::optional<URL> top = container.value ? (*container.value)->documentsFolderURL() : std::nullopt;
  const DocumentListControllerRef root = makeRootList();
  if (!root || !top || !real.isInside(*top)) return std::nullopt;
  std::vector<DocumentListControllerRef> lists{root};
  const bool isRoot = root->presentedURL() == *top;
  if (!isRoot) lists.push_back(makeList(*top));
  const std::size_t above = top->pathComponents().size();
  const std::vector<std::string> components = real.pathComponents();
  URL at = *top;
  for (std::size_t i = above; i < components.size(); ++i) {
    at = at.appendingPathComponent(components[i], true);
    lists.push_back(makeList(at));
  }
  return lists;
}

ViewControllerRef GtkScreens::makeDriveUnavailable() {
  return std::make_shared<DriveUnavailableController>(drive_.setUpFailure());
}

bool GtkScreens::canPreviewItem(const URL&) {
  // What the preview can't draw it shows as icon and facts, so there is nothing that it can't show.
  return true;
}

std::shared_ptr<DocumentInteractionController> GtkScreens::makeDocumentInteraction(const URL& url) {
  return std::make_shared<GtkDocumentInteraction>(url, drive_, window_);
}

std::function<void(const std::string&)> GtkScreens::pageOpener() {
  return [weak = window_](const std::string& address) {
    const auto shown = weak.lock();
    const GRef<GdkAppLaunchContext> context(
        shown ? gdk_display_get_app_launch_context(gtk_widget_get_display(GTK_WIDGET(shown->widget()))) : nullptr);
    openWebPage(address, G_APP_LAUNCH_CONTEXT(context.get()), [weak](const std::string& reason) {
      if (const auto window = weak.lock()) window->showToast(sentences(_("The page can’t be opened."), reason));
    });
  };
}

std::shared_ptr<UpgradeButton> GtkScreens::makeUpgradeButton(StorageOfferRef offer) {
  return std::make_shared<OfferButton>(std::move(offer), pageOpener());
}

std::shared_ptr<UpgradeFlowManager> GtkScreens::makeUpgradeFlow(StorageOfferRef offer) {
  return std::make_shared<UpgradeFlow>(std::move(offer), pageOpener());
}

// What is not downloaded can't be handed over. Chosen in a list it is shown instead, which says so and shows it coming.
void GtkScreens::runPreOpenAlert(const URL& url, const ViewControllerRef& presenter, std::function<void()> open) {
  const bool isHere = g_file_test(url.path().c_str(), G_FILE_TEST_EXISTS);
  if (isHere || !physicalPathOf(url.path())) return open();
  const auto shown = window();
  if (!shown || std::dynamic_pointer_cast<DocumentListController>(presenter)) return;
  shown->showToast(filled(_("“%s” is not downloaded yet."), {displayNameOf(url)}));
}

InterfaceIdiom GtkScreens::userInterfaceIdiom() {
  const auto shown = window();
  return shown ? shown->traitCollection().idiom : InterfaceIdiom::Desktop;
}

Screen GtkScreens::mainScreen() {
  constexpr Rect usual{0, 0, 800, 640};
  const auto shown = window();
  return {usual, shown ? shown->traitCollection().displayScale : 1};
}

InterfaceOrientation GtkScreens::statusBarOrientation() {
  const auto shown = window();
  if (!shown) return InterfaceOrientation::Unknown;
  return shown->bounds().width > shown->bounds().height ? InterfaceOrientation::LandscapeLeft
                                                        : InterfaceOrientation::Portrait;
}

}  // namespace vaelo
