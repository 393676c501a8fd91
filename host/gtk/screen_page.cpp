// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/screen_page.h"

#include <utility>

#include "host/gtk/bar_item_widget.h"
#include "host/gtk/details_tags.h"
#include "host/gtk/host_screen.h"
#include "host/gtk/menu_tooltip.h"
#include "host/gtk/mirror/view_mirror.h"
#include "host/gtk/pango_graphics.h"
#include "host/gtk/preview/preview_page.h"
#include "host/gtk/style.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "preview/preview_details_view_controller.h"

namespace vaelo {

namespace {
constexpr const char* NarrowActions = "narrow";
constexpr double LargeText = 1.3;  // times the usual size
constexpr const char* TightClass = "vaelo-tight";
constexpr const char* TightStyle =
    ".vaelo-tight headerbar button.text-button, .vaelo-tight .toolbar button { padding-left: 6px; padding-right: 6px; }"
    ".vaelo-tight headerbar windowtitle .title { font-size: 70%; }";
constexpr int MostTitleLines = 2;

void setLines(GtkWidget* title, int lines) {
  for (GtkWidget* child = gtk_widget_get_first_child(title); child; child = gtk_widget_get_next_sibling(child)) {
    setLines(child, lines);
    if (!GTK_IS_LABEL(child)) continue;
    gtk_label_set_wrap(GTK_LABEL(child), lines > 1);
    gtk_label_set_lines(GTK_LABEL(child), lines);
    gtk_label_set_justify(GTK_LABEL(child), GTK_JUSTIFY_CENTER);
  }
}

}  // namespace

ScreenPage::ScreenPage(ViewControllerRef screen, std::function<void()> goBack, GMenuModel* menu, DriveSyncedStore& tags)
    : screen_(std::move(screen)),
      hostScreen_(dynamic_cast<HostScreen*>(screen_.get())),
      box_(GTK_WIDGET(g_object_ref_sink(gtk_box_new(GTK_ORIENTATION_VERTICAL, 0)))),
      header_(adw_header_bar_new()),
      title_(adw_window_title_new(nullptr, nullptr)),
      back_(gtk_button_new_from_icon_name("go-previous-symbolic")),
      toolbarEdge_(gtk_separator_new(GTK_ORIENTATION_HORIZONTAL)),
      toolbar_(gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 6)),
      goBack_(std::move(goBack)) {
  addStyle(TightStyle);
  // What is in the page looks for its actions here only if this has had a place for them from the beginning.
  gtk_widget_insert_action_group(box_, NarrowActions, nullptr);
  adw_header_bar_set_title_widget(ADW_HEADER_BAR(header_), title_);
  // A title exactly in the middle would need as much room on its other side as the buttons take: more than a phone has.
  adw_header_bar_set_centering_policy(ADW_HEADER_BAR(header_), ADW_CENTERING_POLICY_LOOSE);
  gtk_widget_set_tooltip_text(back_, _("Back"));
  gtk_accessible_update_property(GTK_ACCESSIBLE(back_), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Back"), -1);
  g_signal_connect_swapped(back_, "clicked", G_CALLBACK(+[](ScreenPage* self) { self->goBack_(); }), this);
  adw_header_bar_pack_start(ADW_HEADER_BAR(header_), back_);
  if (menu) {
    GtkWidget* button = gtk_menu_button_new();
    gtk_menu_button_set_icon_name(GTK_MENU_BUTTON(button), "open-menu-symbolic");
    gtk_menu_button_set_menu_model(GTK_MENU_BUTTON(button), menu);
    gtk_menu_button_set_primary(GTK_MENU_BUTTON(button), TRUE);  // F10 opens it
    setTooltipWhileClosed(GTK_MENU_BUTTON(button), _("Main Menu"));
    gtk_accessible_update_property(GTK_ACCESSIBLE(button), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Main Menu"), -1);
    adw_header_bar_pack_end(ADW_HEADER_BAR(header_), button);
    menuButton_ = button;
  }
  gtk_box_append(GTK_BOX(box_), header_);
  if (hostScreen_) {
    showHostWidgets();
    GtkWidget* content = hostScreen_->contentWidget();
    gtk_widget_set_vexpand(content, TRUE);
    gtk_box_append(GTK_BOX(box_), content);
  } else if (const auto preview = std::dynamic_pointer_cast<PreviewController>(screen_)) {
    preview_ = std::make_unique<PreviewPage>(preview, [this] { showBar(); });
    gtk_widget_set_vexpand(preview_->widget(), TRUE);
    gtk_box_append(GTK_BOX(box_), preview_->widget());
  } else {
    mirror_ = std::make_unique<ViewMirror>(screen_->view());
    gtk_widget_set_vexpand(mirror_->widget(), TRUE);
    gtk_box_append(GTK_BOX(box_), mirror_->widget());
    if (const auto details = std::dynamic_pointer_cast<PreviewDetailsViewController>(screen_)) {
      tags_ = std::make_unique<DetailsTags>(details, mirror_->widget(), tags);
      // For the window's menu: an item without tags has no row of them to be pressed.
      const GRef<GSimpleActionGroup> actions(g_simple_action_group_new());
      const GRef<GSimpleAction> show(g_simple_action_new("tags", nullptr));
      g_signal_connect_swapped(show.get(), "activate", G_CALLBACK(+[](ScreenPage* self) { self->showTags(); }), this);
      g_action_map_add_action(G_ACTION_MAP(actions.get()), G_ACTION(show.get()));
      gtk_widget_insert_action_group(box_, "details", G_ACTION_GROUP(actions.get()));
    }
  }
  gtk_widget_add_css_class(toolbar_, "toolbar");
  gtk_widget_set_size_request(toolbar_, -1, 46);
  gtk_box_append(GTK_BOX(box_), toolbarEdge_);
  gtk_box_append(GTK_BOX(box_), toolbar_);

  barToken_ = screen_->navigationItem().changed().connect([this](NavigationItem&) { showBar(); });
  screenToken_ = screen_->changed().connect([this](ViewController&, ViewControllerChange change) {
    if (change == ViewControllerChange::ToolbarItems) showToolbar();
    if (change == ViewControllerChange::Title) showBar();
  });
  showBar();
  showToolbar();
}

ScreenPage::~ScreenPage() {
  preview_.reset();  // while there is a bar that it may change
  gtk_widget_insert_action_group(box_, "details", nullptr);
  tags_.reset();
  mirror_.reset();
  g_signal_handlers_disconnect_by_data(back_, this);
  if (hostScreen_ && gtk_widget_get_parent(hostScreen_->contentWidget()) == box_) {
    gtk_box_remove(GTK_BOX(box_), hostScreen_->contentWidget());
  }
  g_object_unref(box_);
}

void ScreenPage::setCanGoBack(bool can) {
  canGoBack_ = can;
  showBar();
}

void ScreenPage::setToolbarHidden(bool hidden) {
  toolbarHidden_ = hidden;
  showToolbar();
}

int ScreenPage::toolbarHeight() const {
  int height = 0;
  for (GtkWidget* widget : {toolbarEdge_, toolbar_}) {
    int natural = 0;
    if (gtk_widget_get_visible(widget))
      gtk_widget_measure(widget, GTK_ORIENTATION_VERTICAL, -1, nullptr, &natural, nullptr, nullptr);
    height += natural;
  }
  return height;
}

void ScreenPage::setNarrow(bool narrow) {
  if (narrow == narrow_) return;
  narrow_ = narrow;
  // Large letters need the room of the last of the window's own buttons, of some of the others' edges, and of a second line.
  const bool tight = narrow && textScale() > LargeText;
  adw_header_bar_set_decoration_layout(ADW_HEADER_BAR(header_), tight ? ":" : narrow ? ":close" : nullptr);
  (tight ? gtk_widget_add_css_class : gtk_widget_remove_css_class)(box_, TightClass);
  setLines(title_, tight ? MostTitleLines : 1);
  if (hostScreen_) {
    // The menu hides what it finds no action for.
    gtk_widget_insert_action_group(box_, NarrowActions, narrow ? hostScreen_->narrowActions() : nullptr);
    showHostWidgets();
  }
  showBar();
}

void ScreenPage::setBanner(GtkWidget* banner) { gtk_box_insert_child_after(GTK_BOX(box_), banner, header_); }

bool ScreenPage::toggleSearch() { return hostScreen_ ? hostScreen_->toggleSearch() : preview_ && preview_->toggleFind(); }

bool ScreenPage::closeSearch() { return hostScreen_ ? hostScreen_->closeSearch() : preview_ && preview_->closeFind(); }

void ScreenPage::showTags() {
  if (tags_) tags_->showTags();
}

void ScreenPage::refresh() {
  if (hostScreen_) hostScreen_->refresh();
  if (preview_) preview_->refresh();
}

void ScreenPage::showHostWidgets() {
  for (GtkWidget* widget : hostWidgets_) adw_header_bar_remove(ADW_HEADER_BAR(header_), widget);
  hostWidgets_ = hostScreen_->headerWidgets(narrow_);
  for (GtkWidget* widget : hostWidgets_) adw_header_bar_pack_end(ADW_HEADER_BAR(header_), widget);
}

void ScreenPage::takeFocus() {
  GtkRoot* root = gtk_widget_get_root(box_);
  GtkWidget* focus = root ? gtk_root_get_focus(root) : nullptr;
  GtkWidget* content = hostScreen_ ? hostScreen_->contentWidget() : mirror_ ? mirror_->widget() : nullptr;
  if (!content || (focus && gtk_widget_is_ancestor(focus, content))) return;
  if (hostScreen_) {
    hostScreen_->takeFocus();
  } else {
    mirror_->takeFocus();
  }
}

void ScreenPage::returnFocus(GtkWidget* before) {
  // A row may show another item by now.
  const bool wasRow = hostScreen_ && before && gtk_widget_is_ancestor(before, hostScreen_->contentWidget());
  if (before && !wasRow && gtk_widget_get_mapped(before)) {
    gtk_widget_grab_focus(before);
  } else {
    takeFocus();
  }
}

void ScreenPage::showBar() {
  NavigationItem& item = screen_->navigationItem();
  adw_window_title_set_title(ADW_WINDOW_TITLE(title_), item.title().c_str());
  const bool leftTakesPlace = !item.leftBarButtonItems().empty() && !item.leftItemsSupplementBackButton();
  gtk_widget_set_visible(back_, canGoBack_ && !item.hidesBackButton() && !leftTakesPlace);
  // Who selects on a phone needs the room to read how many.
  for (GtkWidget* widget : hostWidgets_) gtk_widget_set_visible(widget, !narrow_ || !item.hidesBackButton());
  for (GtkWidget* widget : barWidgets_) adw_header_bar_remove(ADW_HEADER_BAR(header_), widget);
  barWidgets_.clear();
  for (const BarButtonItemRef& left : item.leftBarButtonItems()) {
    barWidgets_.push_back(makeBarItemWidget(left));
    adw_header_bar_pack_start(ADW_HEADER_BAR(header_), barWidgets_.back());
  }
  for (const BarButtonItemRef& right : item.rightBarButtonItems()) {
    const char* icon = narrow_ && hostScreen_ ? hostScreen_->narrowIcon(*right) : nullptr;
    barWidgets_.push_back(makeBarItemWidget(right, icon));
    adw_header_bar_pack_end(ADW_HEADER_BAR(header_), barWidgets_.back());
  }
  // Where there is Cancel in the place of the way back, there is Done as well; items are selected by help of the menu.
  const bool mustBeAnswered = leftTakesPlace || item.hidesBackButton();
  if (menuButton_) gtk_widget_set_visible(menuButton_, !narrow_ || hostScreen_ || !mustBeAnswered);
  if (preview_) showPreviewWidgets();
  keepFocus();
}

void ScreenPage::showPreviewWidgets() {
  std::vector<GtkWidget*> inHeader;
  if (!narrow_) inHeader = preview_->buttons();
  for (GtkWidget* widget : preview_->viewWidgets()) inHeader.push_back(widget);
  for (GtkWidget* widget : inHeader) {
    barWidgets_.push_back(widget);
    adw_header_bar_pack_end(ADW_HEADER_BAR(header_), widget);
  }
  showToolbar();
}

void ScreenPage::keepFocus() {
  GtkRoot* root = gtk_widget_get_root(box_);
  GtkWidget* focus = root ? gtk_root_get_focus(root) : nullptr;
  if (gtk_widget_get_mapped(box_) && !(focus && gtk_widget_get_mapped(focus))) takeFocus();
}

void ScreenPage::showToolbar() {
  while (GtkWidget* child = gtk_widget_get_first_child(toolbar_)) gtk_box_remove(GTK_BOX(toolbar_), child);
  for (const BarButtonItemRef& item : screen_->toolbarItems()) gtk_box_append(GTK_BOX(toolbar_), makeBarItemWidget(item));
  std::vector<GtkWidget*> buttons;
  if (preview_ && narrow_) buttons = preview_->buttons();
  for (GtkWidget* button : buttons) {
    gtk_widget_set_hexpand(button, TRUE);
    gtk_widget_set_halign(button, GTK_ALIGN_CENTER);
    gtk_box_append(GTK_BOX(toolbar_), button);
  }
  const bool shows = !buttons.empty() || (!toolbarHidden_ && !screen_->toolbarItems().empty());
  for (GtkWidget* widget : {toolbarEdge_, toolbar_}) gtk_widget_set_visible(widget, shows);
  keepFocus();
  if (toolbarShown_) toolbarShown_();
}

}  // namespace vaelo
