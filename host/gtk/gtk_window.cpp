// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/gtk_window.h"

#include <algorithm>

#include "host/gtk/action_sheet.h"
#include "host/gtk/alert_dialog.h"
#include "host/gtk/folder_picker.h"
#include "host/gtk/host_dialog.h"
#include "host/gtk/host_screen.h"
#include "host/gtk/toast.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "items/dr_item.h"
#include "platform/platform.h"
#include "platform/ui/document_list_controller.h"
#include "platform/ui/preview_controller.h"
#include "platform/ui/search_controller.h"
#include "preview/preview_details_view_controller.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

namespace {

/// The item that a screen is about.
std::optional<URL> itemOf(ViewController& screen) {
  if (auto* list = dynamic_cast<DocumentListController*>(&screen)) return list->presentedURL();
  if (auto* preview = dynamic_cast<PreviewController*>(&screen)) {
    return preview->itemCount() > 0 ? std::optional(preview->itemAtIndex(0)) : std::nullopt;
  }
  const auto* details = dynamic_cast<PreviewDetailsViewController*>(&screen);
  const auto manager = details ? details->itemManager() : nullptr;
  return manager && manager->item() ? manager->item()->url() : std::nullopt;
}

}  // namespace

GtkWindowHost::GtkWindowHost(GtkApplication* application, const Rect& bounds, DriveSyncedStore& tags)
    : Window(bounds),
      window_(ADW_APPLICATION_WINDOW(adw_application_window_new(application))),
      tags_(tags),
      keyboard_(widget(), Platform::current().notifications),
      toasts_(adw_toast_overlay_new()),
      overlay_(gtk_overlay_new()),
      menu_(g_menu_new()) {
  gtk_window_set_title(widget(), "Vaelo Drive");
  gtk_window_set_icon_name(widget(), "com.marrow.VaeloDrive");
  gtk_window_set_default_size(widget(), static_cast<int>(bounds.width), static_cast<int>(bounds.height));
  gtk_widget_set_size_request(GTK_WIDGET(window_), 360, 294);
  adw_toast_overlay_set_child(ADW_TOAST_OVERLAY(toasts_), stack_.widget());
  // A message may stand at the bottom still when a sheet rises from there, whose answers it must not hide.
  gtk_overlay_set_child(GTK_OVERLAY(overlay_), toasts_);
  adw_application_window_set_content(window_, overlay_);
  setToastRoom(ADW_TOAST_OVERLAY(toasts_), [this] {
    const ScreenPage* page = topPage();
    return ToastRoom{static_cast<int>(this->bounds().width), page ? page->toolbarHeight() : 0};
  });
  const GRef<GMenuItem> grid(g_menu_item_new(_("View as _Grid"), "narrow.grid"));
  g_menu_item_set_attribute(grid.get(), "hidden-when", "s", "action-missing");
  g_menu_append_item(menu_, grid.get());
  const GRef<GMenuItem> tagsOfItem(g_menu_item_new(_("_Tags…"), "details.tags"));
  g_menu_item_set_attribute(tagsOfItem.get(), "hidden-when", "s", "action-missing");
  g_menu_item_set_attribute(tagsOfItem.get(), "accel", "s", "<Control>t");
  g_menu_append_item(menu_, tagsOfItem.get());
  g_menu_append(menu_, _("Select A_ll"), "win.select-all");
  g_menu_append(menu_, _("_Refresh"), "win.refresh");
  g_menu_append(menu_, _("A_ccounts…"), "app.accounts");
  g_menu_append(menu_, _("_Keyboard Shortcuts"), "app.shortcuts");
  g_menu_append(menu_, _("_About Vaelo Drive"), "app.about");
  addActions();
  stack_.onSwipedBack([this](std::size_t left) {
    const auto controller = navigation();
    if (!controller) return;
    controller->userWentBackTo(left);
    // The controller takes for granted that this window shows it already. The page that was left would stay until the next
    // change, with all that it holds.
    stackChanged({}, controller->viewControllers(), false, [] {});
  });
  const auto changed = [](GtkWindowHost* self) { self->sizeChanged(); };
  for (const char* property :
       {"notify::default-width", "notify::default-height", "notify::maximized", "notify::fullscreened"}) {
    g_signal_connect_swapped(window_, property, G_CALLBACK(+changed), this);
  }
  gtk_widget_realize(GTK_WIDGET(window_));
  g_signal_connect_swapped(surface(), "layout", G_CALLBACK(+changed), this);
  setTraitCollection(traitsFor(static_cast<int>(bounds.width), static_cast<int>(bounds.height)));
  setPresentationHost(this);
}

GtkWindowHost::~GtkWindowHost() {
  setPresentationHost(nullptr);
  if (const auto controller = navigation()) controller->setHost(nullptr);
  setToastRoom(ADW_TOAST_OVERLAY(toasts_), [] { return ToastRoom(); });
  g_signal_handlers_disconnect_by_data(window_, this);
  if (surface()) g_signal_handlers_disconnect_by_data(surface(), this);
  sheets_.clear();
  stack_.setPages({}, false, nullptr);
  pages_.clear();
  g_object_unref(menu_);
  gtk_window_destroy(widget());
}

void GtkWindowHost::addActions() {
  static const GActionEntry entries[] = {
      {"refresh",
       [](GSimpleAction*, GVariant*, gpointer self) {
         ScreenPage* page = static_cast<GtkWindowHost*>(self)->topPage();
         if (page) page->refresh();
       },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"search",
       [](GSimpleAction*, GVariant*, gpointer self) {
         ScreenPage* page = static_cast<GtkWindowHost*>(self)->topPage();
         if (page) page->toggleSearch();
       },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"select-all",
       [](GSimpleAction*, GVariant*, gpointer self) { static_cast<GtkWindowHost*>(self)->selectAll(); },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"back",
       [](GSimpleAction*, GVariant*, gpointer self) { static_cast<GtkWindowHost*>(self)->goBack(); },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"tags",
       [](GSimpleAction*, GVariant*, gpointer self) {
         ScreenPage* page = static_cast<GtkWindowHost*>(self)->topPage();
         if (page) page->showTags();
       },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
      {"escape",
       [](GSimpleAction*, GVariant*, gpointer self) { static_cast<GtkWindowHost*>(self)->escape(); },
       nullptr,
       nullptr,
       nullptr,
       {0, 0, 0}},
  };
  g_action_map_add_action_entries(G_ACTION_MAP(window_), entries, G_N_ELEMENTS(entries), this);
  GtkEventController* shortcuts = gtk_shortcut_controller_new();
  gtk_shortcut_controller_set_scope(GTK_SHORTCUT_CONTROLLER(shortcuts), GTK_SHORTCUT_SCOPE_GLOBAL);
  // Of two for one action the menu shows the one that comes last.
  constexpr const char* keys[][2] = {{"<Control>r", "win.refresh"}, {"F5", "win.refresh"},
                                     {"<Control>f", "win.search"},  {"<Control>a", "win.select-all"},
                                     {"<Control>t", "win.tags"},    {"<Alt>Left|<Alt>Up|Back", "win.back"},
                                     {"Escape", "win.escape"}};
  for (const auto& [trigger, action] : keys) {
    gtk_shortcut_controller_add_shortcut(
        GTK_SHORTCUT_CONTROLLER(shortcuts),
        gtk_shortcut_new(gtk_shortcut_trigger_parse_string(trigger), gtk_named_action_new(action)));
  }
  gtk_widget_add_controller(GTK_WIDGET(window_), shortcuts);

  GtkGesture* backButton = gtk_gesture_click_new();
  gtk_gesture_single_set_button(GTK_GESTURE_SINGLE(backButton), 8);
  gtk_event_controller_set_propagation_phase(GTK_EVENT_CONTROLLER(backButton), GTK_PHASE_CAPTURE);
  g_signal_connect_swapped(backButton, "pressed", G_CALLBACK(+[](GtkWindowHost* self) { self->goBack(); }), this);
  gtk_widget_add_controller(GTK_WIDGET(window_), GTK_EVENT_CONTROLLER(backButton));
}

std::shared_ptr<NavigationController> GtkWindowHost::navigation() const {
  return std::dynamic_pointer_cast<NavigationController>(rootViewController());
}

ScreenPage* GtkWindowHost::topPage() const {
  const auto controller = navigation();
  const ViewControllerRef top = controller ? controller->topViewController() : nullptr;
  const auto found = pages_.find(top.get());
  return found == pages_.end() ? nullptr : found->second.get();
}

void GtkWindowHost::makeKeyAndVisible() {
  Window::makeKeyAndVisible();
  if (const auto controller = navigation()) {
    controller->setHost(this);
    controller->setBarHeights(0, 0);  // the bars stand beside the screens, not over them
    // What came before is not told again.
    stackChanged({}, controller->viewControllers(), false, [] {});
  }
  gtk_window_present(widget());
}

void GtkWindowHost::stackChanged(const Stack&, const Stack& newStack, bool animated, std::function<void()> done) {
  const auto controller = navigation();
  std::vector<GtkWidget*> widgets;
  for (const ViewControllerRef& screen : newStack) {
    std::unique_ptr<ScreenPage>& page = pages_[screen.get()];
    if (!page) {
      page = std::make_unique<ScreenPage>(
          screen, [this] { goBack(); }, G_MENU_MODEL(menu_), tags_);
      page->onToolbarShown([this] { fitToasts(ADW_TOAST_OVERLAY(toasts_)); });
      if (makeBanner_) page->setBanner(makeBanner_());
      page->setToolbarHidden(!controller || controller->toolbarHidden());
      page->setNarrow(traitCollection().horizontalSizeClass == SizeClass::Compact);
    }
    page->setCanGoBack(!widgets.empty());
    widgets.push_back(page->widget());
  }
  followTop();
  ScreenPage* top = topPage();
  if (top && top->hostScreen() && latestStack_.size() > newStack.size()) {
    if (const auto item = itemOf(*latestStack_.back())) top->hostScreen()->cameBackFrom(*item);
  }
  latestStack_ = newStack;
  stack_.setPages(widgets, animated, [this, newStack, done = std::move(done)] {
    const auto holds = [](const Stack& stack, const ViewController* screen) {
      return std::any_of(stack.begin(), stack.end(), [&](const ViewControllerRef& held) { return held.get() == screen; });
    };
    // A later change ends the slide of an earlier one: the pages that it has made stay, and those that slid in still have to
    // slide out.
    std::erase_if(pages_,
                  [&](const auto& entry) { return !holds(newStack, entry.first) && !holds(latestStack_, entry.first); });
    done();
  });
  // The keyboard went to the first button of the page, where Enter would go back.
  if (top) top->takeFocus();
}

void GtkWindowHost::returnFocus(GtkWidget* before) {
  if (ScreenPage* page = topPage()) page->returnFocus(before);
}

void GtkWindowHost::itemMoved(const URL& from, const URL& to) {
  for (const auto& [screen, page] : pages_) {
    if (HostScreen* list = page->hostScreen()) list->itemMoved(from, to);
  }
}

void GtkWindowHost::toolbarHiddenChanged(bool hidden, bool) {
  for (const auto& [screen, page] : pages_) page->setToolbarHidden(hidden);
}

void GtkWindowHost::present(const ViewControllerRef&, const ViewControllerRef& presented, bool, std::function<void()> done) {
  const auto alert = std::dynamic_pointer_cast<AlertController>(presented);
  if (alert && alert->style() == AlertStyle::ActionSheet) {
    const auto self = std::static_pointer_cast<GtkWindowHost>(shared_from_this());
    sheets_[presented.get()] =
        std::make_unique<ActionSheet>(alert, self, [this, key = presented.get()] { sheets_.erase(key); });
  } else if (alert) {
    GtkWindow* over = folderPicker_ ? folderPicker_->window() : widget();
    dialogs_[presented.get()] = showAlertDialog(alert, over, std::move(done));
    return;
  }
  if (const auto screen = std::dynamic_pointer_cast<HostDialog>(presented)) {
    GtkWindow* dialog = screen->makeDialog(widget());
    dialogs_[presented.get()] = dialog;
    gtk_window_present(dialog);
  }
  if (const auto picker = std::dynamic_pointer_cast<DocumentTargetSelectionController>(presented)) {
    folderPicker_ = std::make_shared<FolderPicker>(picker, Platform::current().cloudDocuments, widget());
  }
  if (const auto search = std::dynamic_pointer_cast<SearchController>(presented)) {
    const auto page = pages_.find(search->list().get());
    if (page != pages_.end() && page->second->hostScreen()) page->second->hostScreen()->showSearch(search);
  }
  if (done) done();
}

void GtkWindowHost::dismiss(const ViewControllerRef& presented, bool, std::function<void()> done) {
  if (std::dynamic_pointer_cast<DocumentTargetSelectionController>(presented)) {
    // It may be a press in the picker itself that takes it away.
    g_idle_add_once([](gpointer held) { delete static_cast<std::shared_ptr<FolderPicker>*>(held); },
                    new std::shared_ptr<FolderPicker>(std::move(folderPicker_)));
  }
  if (const auto sheet = sheets_.find(presented.get()); sheet != sheets_.end()) sheet->second->close();
  const auto dialog = dialogs_.find(presented.get());
  if (dialog != dialogs_.end()) {
    gtk_window_destroy(dialog->second);
    dialogs_.erase(dialog);
  }
  if (const auto search = std::dynamic_pointer_cast<SearchController>(presented)) {
    const auto page = pages_.find(search->list().get());
    if (page != pages_.end() && page->second->hostScreen()) page->second->hostScreen()->hideSearch();
  }
  if (done) done();
}

void GtkWindowHost::followTop() {
  const auto controller = navigation();
  const ViewControllerRef top = controller ? controller->topViewController() : nullptr;
  topToken_.reset();
  GAction* selects = g_action_map_lookup_action(G_ACTION_MAP(window_), "select-all");
  g_simple_action_set_enabled(G_SIMPLE_ACTION(selects), std::dynamic_pointer_cast<DocumentListController>(top) != nullptr);
  fitToasts(ADW_TOAST_OVERLAY(toasts_));
  if (!top) return;
  const auto follow = [this](NavigationItem& item) { stack_.setSwipesBack(!item.hidesBackButton()); };
  topToken_ = top->navigationItem().changed().connect(follow);
  follow(top->navigationItem());
}

void GtkWindowHost::selectAll() {
  const auto controller = navigation();
  const auto list =
      controller ? std::dynamic_pointer_cast<DocumentListController>(controller->topViewController()) : nullptr;
  // What a search found can't be selected.
  if (!list || list->presentedViewController() || controller->presentedViewController()) return;
  const BarButtonItemRef select = list->navigationItem().rightBarButtonItem();
  if (!list->editing() && select) select->press();
  controller->selectAllItems(nullptr);
}

void GtkWindowHost::goBack() {
  const auto controller = navigation();
  const ViewControllerRef top = controller ? controller->topViewController() : nullptr;
  if (top && !top->navigationItem().hidesBackButton()) controller->popViewControllerAnimated(true);
}

void GtkWindowHost::escape() {
  ScreenPage* page = topPage();
  if (page && page->closeSearch()) return;
  const auto controller = navigation();
  const ViewControllerRef top = controller ? controller->topViewController() : nullptr;
  if (!top || !top->navigationItem().hidesBackButton()) return goBack();
  NavigationItem& bar = top->navigationItem();
  for (const BarButtonItemRef& item : {bar.leftBarButtonItem(), bar.rightBarButtonItem()}) {
    if (item && item->systemItem() == SystemItem::Cancel) return item->press();
  }
}

AdwToast* GtkWindowHost::showToast(const std::string& text, bool stays) {
  AdwToast* toast = makeToast(text);
  if (stays) adw_toast_set_timeout(toast, 0);
  adw_toast_overlay_add_toast(ADW_TOAST_OVERLAY(toasts_), toast);
  return toast;
}

AdwToast* GtkWindowHost::showToast(const std::string& text, const char* button, std::function<void()> pressed,
                                   unsigned seconds) {
  using Pressed = std::function<void()>;
  AdwToast* toast = makeToast(text, button);
  adw_toast_set_timeout(toast, seconds);
  adw_toast_set_priority(toast, ADW_TOAST_PRIORITY_HIGH);
  g_signal_connect_data(
      toast, "button-clicked", G_CALLBACK(+[](AdwToast*, gpointer held) { (*static_cast<Pressed*>(held))(); }),
      new Pressed(std::move(pressed)), [](gpointer held, GClosure*) { delete static_cast<Pressed*>(held); },
      GConnectFlags(0));
  adw_toast_overlay_add_toast(ADW_TOAST_OVERLAY(toasts_), toast);
  return toast;
}

void GtkWindowHost::setPageBanner(std::function<GtkWidget*()> make) {
  makeBanner_ = std::move(make);
  for (const auto& [screen, page] : pages_) page->setBanner(makeBanner_());
}

TraitCollection GtkWindowHost::traitsFor(int width, int height) const {
  constexpr int compactBelow = 600;
  TraitCollection traits;
  traits.horizontalSizeClass = width < compactBelow ? SizeClass::Compact : SizeClass::Regular;
  traits.verticalSizeClass = height < compactBelow ? SizeClass::Compact : SizeClass::Regular;
  traits.idiom = width < compactBelow || height < compactBelow ? InterfaceIdiom::Phone : InterfaceIdiom::Slate;
  traits.displayScale = gtk_widget_get_scale_factor(GTK_WIDGET(window_));
  traits.layoutDirection =
      gtk_widget_get_default_direction() == GTK_TEXT_DIR_RTL ? LayoutDirection::RightToLeft : LayoutDirection::LeftToRight;
  return traits;
}

void GtkWindowHost::sizeChanged() {
  int width = 0;
  int height = 0;
  gtk_window_get_default_size(widget(), &width, &height);
  // With the whole screen, as a phone gives it, that is only what it would come back to.
  if (surface() && (gtk_window_is_maximized(widget()) || gtk_window_is_fullscreen(widget()))) {
    width = gdk_surface_get_width(surface());
    height = gdk_surface_get_height(surface());
  }
  if (width <= 0 || height <= 0) return;
  height = keyboard_.windowResized(width, height);
  setTraitCollection(traitsFor(width, height));
  for (const auto& [screen, page] : pages_) {
    page->setNarrow(traitCollection().horizontalSizeClass == SizeClass::Compact);
  }
  resize(Size{static_cast<double>(width), static_cast<double>(height)}, false);
  fitToasts(ADW_TOAST_OVERLAY(toasts_));
}

}  // namespace vaelo
