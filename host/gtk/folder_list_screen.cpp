// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/folder_list_screen.h"

#include <adwaita.h>

#include "host/gtk/item_actions_menu.h"
#include "host/gtk/tags_popover.h"
#include "host/support/display_name.h"
#include "host/support/texts.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

int actionOf(ListCommand command) {
  switch (command) {
    case ListCommand::Rename:
      return ItemAction::Rename;
    case ListCommand::Delete:
      return ItemAction::Delete;
    case ListCommand::Details:
      return ItemAction::Info;
    case ListCommand::Share:
      return ItemAction::Share;
    case ListCommand::Move:
      break;
  }
  return ItemAction::Move;
}

std::string titleOf(const URL& folder, CloudDocuments& drive) {
  if (drive.isDocumentsContainer(folder)) {
    const Result<CloudContainerRef> container = drive.containerForURL(folder);
    if (container.value) return (*container.value)->localizedName();
  }
  return displayNameOf(folder);
}

}  // namespace

FolderListScreen::FolderListScreen(const URL& folder, CloudDocuments& drive, ScreenFactory& screens, DriveSyncedStore& tags,
                                   bool allContainers)
    : DocumentListController(folder, allContainers),
      drive_(drive),
      screens_(screens),
      tags_(tags),
      viewMode_([this](bool grid) { folderView().setMode(grid ? FolderView::Mode::Grid : FolderView::Mode::List); }) {
  setTitle(titleOf(folder, drive));
}

FolderListScreen::~FolderListScreen() {
  folderSearch_.stop();
  if (searchEntry_) g_signal_handlers_disconnect_by_data(searchEntry_, this);
  view_.reset();
  results_.reset();
  if (content_) g_object_unref(content_);
}

FolderView& FolderListScreen::folderView() {
  build();
  return *view_;
}

GtkWidget* FolderListScreen::contentWidget() {
  build();
  return content_;
}

void FolderListScreen::build() {
  if (content_) return;
  view_ = std::make_unique<FolderView>();
  content_ = GTK_WIDGET(g_object_ref_sink(gtk_box_new(GTK_ORIENTATION_VERTICAL, 0)));
  stack_ = gtk_stack_new();
  gtk_stack_add_child(GTK_STACK(stack_), view_->widget());
  gtk_widget_set_vexpand(stack_, TRUE);
  gtk_box_append(GTK_BOX(content_), stack_);
  FolderViewEvents events;
  events.activated = [this](const std::string& name) { activated(*view_, name, urlOf(name)); };
  events.itemsChanged = [this] { reportItems(); };
  events.folderRemoved = [this] { folderWasRemoved(); };
  events.selectionChanged = [this] { reportSelection(); };
  events.contextRequested = [this](const std::string& name, GtkWidget* over, const GdkRectangle& at) {
    offerActions(urlOf(name), name, over, at);
  };
  events.offersBySwipe = [this](ListCommand command) { return offers(command); };
  events.commanded = [this](ListCommand command, const std::string& name, GtkWidget* over, const GdkRectangle& at) {
    commanded(command, urlOf(name), over, at);
  };
  events.refreshWanted = [this] { refresh(); };
  view_->setEvents(std::move(events));
  editingToken_ =
      listChanged().connect([this](DocumentListController&, DocumentListChange change) { followEditing(change); });
  fill();
}

void FolderListScreen::followEditing(DocumentListChange change) {
  if (change == DocumentListChange::Editing) view_->setEditing(editing());
  if (change != DocumentListChange::Selection && change != DocumentListChange::Items) return;
  if (editing() && reportedRevision_ == view_->model().revision()) view_->setSelectedRows(selection());
}

void FolderListScreen::reportSelection() {
  // Rows that went took their selection along before they were reported.
  if (reportedRevision_ != view_->model().revision()) reportItems();
  userSelected(view_->model().selectedRows());
}

void FolderListScreen::beginSelecting(const std::string& row) {
  const BarButtonItemRef select = navigationItem().rightBarButtonItem();
  if (editing() || !select) return;
  select->press();
  if (!editing()) return;
  view_->setSelection({row});
  reportSelection();
}

void FolderListScreen::offerActions(const URL& url, const std::optional<std::string>& row, GtkWidget* over,
                                    const GdkRectangle& at) {
  if (editing()) return;
  const bool selects = row && navigationItem().rightBarButtonItem();
  const auto chosen = [self = sharedSelf(this), url, row, over, at](int action) {
    if (action == TagsEntry) return showTagsPopover(over, at, url, self->tags_);
    if (action == SelectEntry) return self->beginSelecting(*row);
    // What is opened is what a peek has prepared; what can't be peeked at, as a link, is opened as by a tap.
    if (action == ItemAction::FirmpressPop && !self->viewControllerForPreviewing(url)) return self->userSelectedItem(url);
    self->perform(action, url, over, at);
  };
  showItemActionsMenu(over, at, url.path(), availableActions(), selects, chosen);
}

void FolderListScreen::perform(int action, const URL& url, GtkWidget* over, const GdkRectangle& at) {
  // What the action shows points at the item, or at where its menu was.
  graphene_point_t place;
  const graphene_point_t corner = {static_cast<float>(at.x), static_cast<float>(at.y)};
  GtkWidget* window = GTK_WIDGET(gtk_widget_get_root(over));
  if (!window || !gtk_widget_compute_point(over, window, &corner, &place)) return;
  anchor_ = std::make_shared<View>(Rect{static_cast<double>(place.x), static_cast<double>(place.y),
                                        static_cast<double>(at.width), static_cast<double>(at.height)});
  userChoseAction(action, url, anchor_, [] {});
}

bool FolderListScreen::offers(ListCommand command) const { return availableActions() & 1U << actionOf(command); }

void FolderListScreen::commanded(ListCommand command, const URL& url, GtkWidget* over, const GdkRectangle& at) {
  if (editing()) {
    // The toolbar's buttons act on what is selected: new folder, move and delete, with spaces between.
    constexpr std::size_t moveButton = 2;
    constexpr std::size_t deleteButton = 4;
    const std::size_t wanted = command == ListCommand::Delete ? deleteButton : moveButton;
    const bool known = command == ListCommand::Delete || command == ListCommand::Move;
    if (!known || toolbarItems().size() <= wanted) return;
    const BarButtonItemRef button = toolbarItems()[wanted];
    if (button->enabled()) button->press();
    return;
  }
  if (offers(command)) perform(actionOf(command), url, over, at);
}

void FolderListScreen::fill() { view_->setFolder(presentedURL()->path()); }

URL FolderListScreen::urlOf(const std::string& name) const { return presentedURL()->appendingPathComponent(name); }

std::vector<FolderSearch::Folder> FolderListScreen::searchedFolders() const { return {{presentedURL()->path(), ""}}; }

void FolderListScreen::reportItems() {
  reportedRevision_ = view_->model().revision();
  itemsLoaded(shownItems());
}

ItemHint FolderListScreen::hintFor(EntryKind kind, std::string_view name) {
  switch (kind) {
    case EntryKind::Folder:
      return name == "Desktop" || name == "Documents" ? ItemHint::Unknown : ItemHint::Folder;
    case EntryKind::Package:
    case EntryKind::Document:
    case EntryKind::Promise:
    case EntryKind::PromisedPackage:
      return ItemHint::Document;
    case EntryKind::FolderLink:
    case EntryKind::Symlink:
    case EntryKind::Alias:
    case EntryKind::Bookmark:
      break;
  }
  return ItemHint::Unknown;
}

URLList FolderListScreen::shownItems() {
  const auto snapshot = view_->model().snapshot();
  const URL folder = *presentedURL();
  const auto indexOf = [snapshot, start = folder.path() + "/"](const URL& url,
                                                               std::size_t guess) -> std::optional<std::size_t> {
    const std::string_view path = url.path();
    if (!path.starts_with(start)) return std::nullopt;
    const std::string_view name = path.substr(start.size());
    if (guess < snapshot->size() && snapshot->name(guess) == name) return guess;
    return name.find('/') == std::string_view::npos ? snapshot->indexOf(name) : std::nullopt;
  };
  URLList::Hint hint;
  // Outside of a library the folder may be the one that holds them.
  if (drive_.containerForURL(folder).value) {
    hint = [snapshot](std::size_t i) { return hintFor(snapshot->kind(i), snapshot->name(i)); };
  }
  return {snapshot->size(), [snapshot, folder](std::size_t i) { return folder.appendingPathComponent(snapshot->name(i)); },
          indexOf, hint};
}

void FolderListScreen::activated(FolderView& view, const std::string& name, const URL& url) {
  const std::optional<std::size_t> row = view.model().indexOf(name);
  if (row && view.kindAt(*row) == EntryKind::Folder) {
    userSelectedContainer(screens_.makeList(URL(url.path(), true)));
  } else {
    userSelectedItem(url);
  }
}

void FolderListScreen::takeFocus() {
  build();
  const bool showsResults = results_ && gtk_stack_get_visible_child(GTK_STACK(stack_)) == results_->widget();
  (showsResults ? *results_ : *view_).grabFocusWhenLoaded();
}

std::vector<GtkWidget*> FolderListScreen::headerWidgets(bool narrow) {
  GtkWidget* search = gtk_button_new_from_icon_name("system-search-symbolic");
  gtk_widget_set_tooltip_text(search, _("Search"));
  gtk_accessible_update_property(GTK_ACCESSIBLE(search), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Search"), -1);
  gtk_actionable_set_action_name(GTK_ACTIONABLE(search), "win.search");
  if (narrow) return {search};
  return {viewMode_.makeButton(), search};
}

const char* FolderListScreen::narrowIcon(const BarButtonItem& item) {
  const bool selects = !item.systemItem() && &item == navigationItem().rightBarButtonItem().get();
  return selects ? "selection-mode-symbolic" : nullptr;
}

bool FolderListScreen::toggleSearch() {
  if (closeSearch()) return true;
  startSearchWithQueryStringBecomeFirstResponder("", true);
  return true;
}

bool FolderListScreen::closeSearch() {
  if (!search_) return false;
  dismissViewControllerAnimated(true);
  return true;
}

void FolderListScreen::showSearch(const std::shared_ptr<SearchController>& search) {
  build();
  search_ = search;
  if (!searchBar_) {
    searchBar_ = gtk_search_bar_new();
    searchEntry_ = gtk_search_entry_new();
    gtk_accessible_update_property(GTK_ACCESSIBLE(searchEntry_), GTK_ACCESSIBLE_PROPERTY_LABEL,
                                   _("Search below this folder"), -1);
    g_object_set(searchEntry_, "placeholder-text", _("Search below this folder"), nullptr);
    GtkWidget* clamp = adw_clamp_new();
    gtk_widget_set_hexpand(clamp, TRUE);
    adw_clamp_set_child(ADW_CLAMP(clamp), searchEntry_);
    gtk_search_bar_set_child(GTK_SEARCH_BAR(searchBar_), clamp);
    gtk_box_prepend(GTK_BOX(content_), searchBar_);
    results_ = std::make_unique<FolderView>();
    gtk_stack_add_child(GTK_STACK(stack_), results_->widget());
    results_->setEmptyText("system-search-symbolic", _("Nothing found"), _("No item below this folder has such a name."));
    FolderViewEvents events;
    events.activated = [this](const std::string& path) { activated(*results_, path, URL(path)); };
    events.contextRequested = [this](const std::string& path, GtkWidget* over, const GdkRectangle& at) {
      offerActions(URL(path), std::nullopt, over, at);
    };
    events.offersBySwipe = [this](ListCommand command) { return offers(command); };
    events.commanded = [this](ListCommand command, const std::string& path, GtkWidget* over, const GdkRectangle& at) {
      commanded(command, URL(path), over, at);
    };
    results_->setEvents(std::move(events));
    g_signal_connect_swapped(searchEntry_, "search-changed", G_CALLBACK(+[](FolderListScreen* self) { self->queryTyped(); }),
                             this);
    g_signal_connect_swapped(searchEntry_, "stop-search", G_CALLBACK(+[](FolderListScreen* self) { self->closeSearch(); }),
                             this);
  }
  gtk_editable_set_text(GTK_EDITABLE(searchEntry_), search->query().c_str());
  gtk_search_bar_set_search_mode(GTK_SEARCH_BAR(searchBar_), TRUE);
  queryToken_ = search->queryChanged().connect([this](SearchController& changed) {
    if (changed.query() != gtk_editable_get_text(GTK_EDITABLE(searchEntry_))) {
      gtk_editable_set_text(GTK_EDITABLE(searchEntry_), changed.query().c_str());
    }
    beginSearch();
  });
  if (search->wantsFocus()) gtk_widget_grab_focus(searchEntry_);
  beginSearch();
}

void FolderListScreen::hideSearch() {
  folderSearch_.stop();
  search_.reset();
  queryToken_.reset();
  gtk_search_bar_set_search_mode(GTK_SEARCH_BAR(searchBar_), FALSE);
  gtk_stack_set_visible_child(GTK_STACK(stack_), view_->widget());
  view_->grabFocus();
}

void FolderListScreen::queryTyped() {
  if (search_) search_->setQuery(gtk_editable_get_text(GTK_EDITABLE(searchEntry_)));
}

void FolderListScreen::beginSearch() {
  folderSearch_.stop();
  if (!search_ || search_->query().empty()) {
    gtk_stack_set_visible_child(GTK_STACK(stack_), view_->widget());
    return;
  }
  folderSearch_.start(searchedFolders(), search_->query(), [this](const FolderSearch::Report& report) {
    for (const auto& [folder, reason] : report.unreadable) {
      Platform::current().log.write(LogType::Default, "search: can't read " + folder + ": " + reason);
    }
    if (report.entries.empty() && !report.finished) return;
    results_->setEntries(report.entries);
    gtk_stack_set_visible_child(GTK_STACK(stack_), results_->widget());
  });
}

}  // namespace vaelo
