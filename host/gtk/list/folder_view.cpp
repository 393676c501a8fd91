// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/folder_view.h"

#include <algorithm>
#include <cerrno>
#include <utility>

#include "host/gtk/list/folder_reader.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {
namespace {

constexpr guint SpinnerMilliseconds = 250;
constexpr gint64 PullPause = G_USEC_PER_SEC;
// Wider rows are read with effort, from their name at one end to their sign at the other.
constexpr int WidestRows = 840;
constexpr int WidestGrid = 1600;

const char* reasonOf(int errorNumber) {
  switch (errorNumber) {
    case EACCES:
    case EPERM:
      return _("You don’t have permission to see its items.");
    case ENOENT:
    case ENOTDIR:
      return _("It is no longer there.");
    case ELOOP:
      return _("The links to it lead in a circle.");
    default:
      return g_strerror(errorNumber);
  }
}

RowContext& contextOf(gpointer data) { return *static_cast<RowContext*>(data); }

GtkListItemFactory* makeFactory(RowContext& context) {
  GtkListItemFactory* factory = gtk_signal_list_item_factory_new();
  g_signal_connect(factory, "setup", G_CALLBACK(+[](GtkListItemFactory*, GtkListItem* listItem, gpointer data) {
                     gtk_list_item_set_child(listItem, folderRowNew(contextOf(data)));
                   }),
                   &context);
  g_signal_connect(factory, "bind", G_CALLBACK(+[](GtkListItemFactory*, GtkListItem* listItem) {
                     folderRowSetItem(gtk_list_item_get_child(listItem), G_OBJECT(gtk_list_item_get_item(listItem)));
                   }),
                   nullptr);
  g_signal_connect(factory, "unbind", G_CALLBACK(+[](GtkListItemFactory*, GtkListItem* listItem) {
                     folderRowSetItem(gtk_list_item_get_child(listItem), nullptr);
                   }),
                   nullptr);
  return factory;
}

}  // namespace

FolderView::FolderView()
    : icons_([this] { redrawRows(); }),
      range_(model_),
      details_(model_,
               [](FolderItem& item) {
                 if (item.row) folderRowItemChanged(item.row);
               }),
      pages_(GTK_STACK(g_object_ref_sink(gtk_stack_new()))) {
  context_.icons = &icons_;
  context_.isSelected = [this](const FolderItem& item) {
    const auto i = model_.indexOf(item.name);
    return i && model_.isSelected(*i);
  };
  context_.drawn = [this](FolderItem& item) { details_.request(item); };
  model_.onSelectionChanged([this] {
    redrawRows();
    if (!settingSelection_ && events_.selectionChanged) events_.selectionChanged();
  });
  makePages();
  makeList();
  keyboardRow_ = std::make_unique<KeyboardRow>(widget(), model_, [this] { return focusedItem(); });
  model_.onRangeWished([this] { extendToFocus(); });
  connectKeys();
  connectContextGestures();
  connectDrags();
  // Whoever comes back to a list may have changed what its rows count.
  g_signal_connect_swapped(pages_, "map", G_CALLBACK(+[](FolderView* self) { self->allDetailsAreOld(); }), this);
  g_signal_connect_swapped(pages_, "unmap", G_CALLBACK(+[](FolderView* self) { self->details_.rest(); }), this);
}

FolderView::~FolderView() {
  if (spinnerTimer_) g_source_remove(spinnerTimer_);
  g_signal_handlers_disconnect_by_data(pages_, this);
  g_signal_handlers_disconnect_by_data(adjustment(), this);
  g_signal_handlers_disconnect_by_data(list_, this);
  keyboardRow_.reset();
  swipe_.reset();
  markDrag_.reset();
  // The window may hold the list that the pointer is over for a while, but what it lists goes now.
  setListModel(nullptr);
  adw_clamp_scrollable_set_child(clamp_, nullptr);
  folderRowsPart(context_);
  g_object_unref(pages_);
}

void FolderView::makePages() {
  scroller_ = gtk_scrolled_window_new();
  gtk_scrolled_window_set_policy(GTK_SCROLLED_WINDOW(scroller_), GTK_POLICY_NEVER, GTK_POLICY_AUTOMATIC);
  g_signal_connect(scroller_, "edge-overshot", G_CALLBACK(+[](GtkScrolledWindow*, GtkPositionType edge, FolderView* self) {
                     const gint64 now = g_get_monotonic_time();
                     if (edge != GTK_POS_TOP || now - self->lastPull_ < PullPause) return;
                     self->lastPull_ = now;
                     self->refresh();
                   }),
                   this);
  clamp_ = ADW_CLAMP_SCROLLABLE(adw_clamp_scrollable_new());
  gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scroller_), GTK_WIDGET(clamp_));
  gtk_widget_add_css_class(scroller_, "view");  // what is beside the rows looks as they do
  const auto look = [](FolderView* self) { folderRowsScrolled(self->context_); };
  g_signal_connect_swapped(adjustment(), "value-changed", G_CALLBACK(+look), this);
  g_signal_connect_swapped(adjustment(), "value-changed", G_CALLBACK(+[](FolderView* self) { self->swipe_->close(); }),
                           this);
  g_signal_connect_swapped(adjustment(), "changed", G_CALLBACK(+look), this);

  spinner_ = gtk_spinner_new();
  gtk_widget_set_halign(spinner_, GTK_ALIGN_CENTER);
  gtk_widget_set_valign(spinner_, GTK_ALIGN_CENTER);
  gtk_widget_set_size_request(spinner_, 32, 32);
  emptyPage_ = ADW_STATUS_PAGE(adw_status_page_new());
  adw_status_page_set_icon_name(emptyPage_, "folder-symbolic");
  adw_status_page_set_title(emptyPage_, _("This folder is empty"));
  // Where there is no row, the keyboard would be left on a page that is out of sight.
  gtk_widget_set_focusable(GTK_WIDGET(emptyPage_), TRUE);
  errorPage_ = ADW_STATUS_PAGE(adw_status_page_new());
  adw_status_page_set_icon_name(errorPage_, "dialog-error-symbolic");
  adw_status_page_set_title(errorPage_, _("This folder can’t be read"));
  GtkWidget* retry = gtk_button_new_with_label(_("Try Again"));
  gtk_widget_add_css_class(retry, "pill");
  gtk_widget_set_halign(retry, GTK_ALIGN_CENTER);
  g_signal_connect_swapped(retry, "clicked", G_CALLBACK(+[](FolderView* self) { self->refresh(); }), this);
  adw_status_page_set_child(errorPage_, retry);
  for (GtkWidget* page : {scroller_, spinner_, GTK_WIDGET(emptyPage_), GTK_WIDGET(errorPage_)})
    gtk_stack_add_child(pages_, page);
}

void FolderView::makeList() {
  auto* model = GTK_SELECTION_MODEL(g_object_ref(model_.selectionModel()));
  GtkListItemFactory* factory = makeFactory(context_);
  context_.grid = mode_ == Mode::Grid;
  details_.setThumbnailPixels((context_.grid ? GridIconSize : ListIconSize) * gtk_widget_get_scale_factor(widget()));
  const auto press = [](FolderView* self, guint position) { self->pressed(position); };
  if (context_.grid) {
    list_ = gtk_grid_view_new(model, factory);
    gtk_grid_view_set_max_columns(GTK_GRID_VIEW(list_), 10);
    gtk_grid_view_set_single_click_activate(GTK_GRID_VIEW(list_), TRUE);
  } else {
    list_ = gtk_list_view_new(model, factory);
    gtk_list_view_set_single_click_activate(GTK_LIST_VIEW(list_), TRUE);
  }
  g_signal_connect_swapped(list_, "activate", G_CALLBACK(+press), this);
  context_.list = list_;
  setRubberband();
  const int widest = context_.grid ? WidestGrid : WidestRows;
  adw_clamp_scrollable_set_maximum_size(clamp_, widest);
  adw_clamp_scrollable_set_tightening_threshold(clamp_, widest);
  adw_clamp_scrollable_set_child(clamp_, list_);
}

void FolderView::setMode(Mode mode) {
  if (mode == mode_) return;
  std::string top;
  if (GtkWidget* at = gtk_widget_pick(list_, gtk_widget_get_width(list_) / 2.0, 1, GTK_PICK_DEFAULT)) {
    GtkWidget* row = folderRowAt(at);
    if (!row) row = folderRowAt(gtk_widget_get_first_child(at) ? gtk_widget_get_first_child(at) : at);
    if (row && folderRowItem(row)) top = folderItemOf(folderRowItem(row)).name;
  }
  mode_ = mode;
  revealed_.clear();
  makeList();
  // Thumbnails were made for the other size.
  allDetailsAreOld();
  if (!top.empty()) scrollTo(top);
}

void FolderView::setListModel(GtkSelectionModel* model) {
  if (context_.grid) {
    gtk_grid_view_set_model(GTK_GRID_VIEW(list_), model);
  } else {
    gtk_list_view_set_model(GTK_LIST_VIEW(list_), model);
  }
}

void FolderView::setEditing(bool editing) {
  if (editing == context_.editing) return;
  context_.editing = editing;
  swipe_->close();
  range_.forget();
  model_.setSelectable(editing);
  setRubberband();
  if (!editing) setSelection({});
  redrawRows();
}

void FolderView::setRubberband() {
  if (context_.grid) {
    gtk_grid_view_set_enable_rubberband(GTK_GRID_VIEW(list_), context_.editing);
  } else {
    gtk_list_view_set_enable_rubberband(GTK_LIST_VIEW(list_), context_.editing);
  }
}

void FolderView::setSelection(const std::vector<std::string>& names) {
  settingSelection_ = true;
  model_.select(names);
  settingSelection_ = false;
}

void FolderView::setSelectedRows(const std::vector<std::size_t>& rows) {
  settingSelection_ = true;
  model_.selectRows(rows);
  settingSelection_ = false;
}

void FolderView::redrawRows() {
  for (GtkWidget* row : context_.rows) gtk_widget_queue_draw(row);
}

void FolderView::detailsAreOld(FolderItem& item) {
  item.detailsAreFresh = false;
  if (item.row) gtk_widget_queue_draw(item.row);
}

void FolderView::allDetailsAreOld() {
  model_.forEachLiveItem([this](FolderItem& item) { detailsAreOld(item); });
}

void FolderView::setEmptyText(const char* icon, const std::string& title, const std::string& description) {
  adw_status_page_set_icon_name(emptyPage_, icon);
  const auto markupOf = [](const std::string& text) { return takeString(g_markup_escape_text(text.c_str(), -1)); };
  adw_status_page_set_title(emptyPage_, markupOf(title).c_str());
  adw_status_page_set_description(emptyPage_, markupOf(description).c_str());
}

void FolderView::setUnreadable(int errorNumber) {
  setEntries({});
  errorNumber_ = errorNumber;
  showPage();
}

void FolderView::setEntries(std::vector<FolderEntry> entries) {
  ++generation_;
  monitor_.stop();
  folder_.clear();
  details_.setFolder({});
  errorNumber_ = 0;
  loaded_ = true;
  // All rows are made anew, and the keyboard would be left without one.
  const bool hadFocus = hasFocus();
  keyboardRow_->hold(true);
  model_.setEntries(std::move(entries));
  showPage();
  keyboardRow_->hold(false);
  keepFocus(hadFocus);
  if (events_.itemsChanged) events_.itemsChanged();
}

void FolderView::setFolder(const std::string& path) {
  ++generation_;
  folder_ = path;
  details_.setFolder(path);
  loaded_ = false;
  updating_ = false;
  pending_ = {};
  model_.setSnapshot(std::make_shared<FolderSnapshot>());
  follow();
  read();
  showPage();
}

void FolderView::follow() {
  monitor_.start(
      folder_, [this](FolderChanges changes) { folderChanged(std::move(changes)); },
      [this] {
        if (events_.folderRemoved) events_.folderRemoved();
      });
}

void FolderView::refresh() {
  allDetailsAreOld();
  if (folder_.empty()) {
    if (events_.refreshWanted) events_.refreshWanted();
    return;
  }
  // What can't be read can't be followed either.
  if (errorNumber_) follow();
  folderChanged({{}, true});
}

void FolderView::read() {
  updating_ = true;
  reader_.run([this, generation = generation_, path = folder_, before = model_.snapshot()]() -> std::function<void()> {
    FolderReading reading = readFolder(path);
    std::vector<Splice> splices;
    if (reading.snapshot) splices = before->splicesTo(*reading.snapshot);
    return [this, generation, reading = std::move(reading), splices = std::move(splices)] {
      if (generation == generation_) folderRead(reading.snapshot, splices, reading.errorNumber);
    };
  });
}

void FolderView::folderRead(std::shared_ptr<const FolderSnapshot> next, const std::vector<Splice>& splices,
                            int errorNumber) {
  updating_ = false;
  const bool first = !loaded_;
  const bool hadFocus = hasFocus();
  keyboardRow_->hold(true);
  if (next) {
    loaded_ = true;
    errorNumber_ = 0;
    if (first) {
      model_.setSnapshot(std::move(next));
    } else {
      model_.applyChanges(std::move(next), splices);
    }
  } else if (loaded_ && errorNumber == ENOENT) {
    if (events_.folderRemoved) events_.folderRemoved();
  } else {
    errorNumber_ = errorNumber;
    if (events_.readFailed) events_.readFailed(errorNumber);
  }
  showPage();
  keyboardRow_->hold(false);
  keepFocus(hadFocus);
  if (errorNumber_ == 0 && (first || !splices.empty()) && events_.itemsChanged) events_.itemsChanged();
  if (pending_.everything || !pending_.names.empty()) lookUpChanges();
}

void FolderView::folderChanged(FolderChanges changes) {
  pending_.everything |= changes.everything;
  pending_.names.insert(pending_.names.end(), changes.names.begin(), changes.names.end());
  if (!updating_) lookUpChanges();
}

void FolderView::lookUpChanges() {
  FolderChanges changes = std::exchange(pending_, {});
  if (changes.everything || !loaded_) {
    allDetailsAreOld();
    read();
    return;
  }
  updating_ = true;
  reader_.run([this, generation = generation_, path = folder_, names = std::move(changes.names),
               before = model_.snapshot()]() -> std::function<void()> {
    std::shared_ptr<const FolderSnapshot> next = before->with(lookUpNames(path, names));
    std::vector<Splice> splices = before->splicesTo(*next);
    return [this, generation, names, next = std::move(next), splices = std::move(splices)] {
      if (generation != generation_) return;
      for (const std::string& name : names) {
        if (FolderItem* item = model_.liveItem(name)) detailsAreOld(*item);
      }
      folderRead(next, splices, 0);
    };
  });
}

void FolderView::showPage() {
  if (spinnerTimer_) g_source_remove(std::exchange(spinnerTimer_, 0));
  gtk_spinner_stop(GTK_SPINNER(spinner_));
  if (errorNumber_) {
    adw_status_page_set_description(errorPage_, reasonOf(errorNumber_));
    gtk_stack_set_visible_child(pages_, GTK_WIDGET(errorPage_));
  } else if (loaded_ && !model_.itemCount()) {
    gtk_stack_set_visible_child(pages_, GTK_WIDGET(emptyPage_));
  } else {
    gtk_stack_set_visible_child(pages_, scroller_);
  }
  if (loaded_ || errorNumber_) return;
  // Most folders are there before a spinner could be seen; one that flashes up looks slower than none.
  spinnerTimer_ = g_timeout_add(
      SpinnerMilliseconds,
      [](gpointer data) -> gboolean {
        auto* self = static_cast<FolderView*>(data);
        self->spinnerTimer_ = 0;
        gtk_spinner_start(GTK_SPINNER(self->spinner_));
        gtk_stack_set_visible_child(self->pages_, self->spinner_);
        return G_SOURCE_REMOVE;
      },
      this);
}

void FolderView::pressed(guint position) {
  if (swipe_->takesPress() || position >= model_.itemCount()) return;
  if (context_.editing) {
    if (std::exchange(extends_, false) && range_.extendTo(position)) return;
    range_.begin(position);
    model_.setSelected(position, !model_.isSelected(position));
  } else if (events_.activated) {
    events_.activated(nameAt(position));
  }
}

GtkAdjustment* FolderView::adjustment() const { return gtk_scrolled_window_get_vadjustment(GTK_SCROLLED_WINDOW(scroller_)); }

bool FolderView::scrollTo(const std::string& name) {
  const auto i = model_.indexOf(name);
  if (!i) return false;
  gtk_widget_activate_action(list_, "list.scroll-to-item", "u", static_cast<guint>(*i));
  // The list reckons with heights that it guessed, and may end a row short. Its true places are known after a frame.
  framesToWait_ = 1;
  if (revealed_.empty()) {
    gtk_widget_add_tick_callback(
        list_,
        [](GtkWidget*, GdkFrameClock*, gpointer data) -> gboolean {
          auto* self = static_cast<FolderView*>(data);
          if (self->framesToWait_-- > 0) return G_SOURCE_CONTINUE;
          self->finishReveal();
          return G_SOURCE_REMOVE;
        },
        this, nullptr);
  }
  revealed_ = name;
  return true;
}

void FolderView::finishReveal() {
  FolderItem* item = model_.liveItem(std::exchange(revealed_, {}));
  const bool focuses = std::exchange(focusRevealed_, false);
  graphene_rect_t bounds;
  if (!item || !item->row || !gtk_widget_compute_bounds(gtk_widget_get_parent(item->row), list_, &bounds)) return;
  const double top = static_cast<double>(bounds.origin.y);
  const double bottom = top + static_cast<double>(bounds.size.height) - gtk_widget_get_height(list_);
  if (top < 0 || bottom > 0) setScrollPosition(scrollPosition() + (top < 0 ? top : bottom));
  if (focuses) gtk_widget_grab_focus(gtk_widget_get_parent(item->row));
}

double FolderView::scrollPosition() const { return gtk_adjustment_get_value(adjustment()); }

void FolderView::setScrollPosition(double position) { gtk_adjustment_set_value(adjustment(), position); }

bool FolderView::hasFocus() const {
  GtkWidget* now = focus();
  return now && gtk_widget_is_ancestor(now, widget());
}

void FolderView::grabFocus() {
  GtkWidget* shown = gtk_stack_get_visible_child(pages_);
  if (shown == GTK_WIDGET(errorPage_)) {
    gtk_widget_child_focus(shown, GTK_DIR_TAB_FORWARD);
    return;
  }
  const std::optional<std::size_t> row = keyboardRow_->position();
  if (shown != scroller_ || !row) {
    gtk_widget_grab_focus(shown == scroller_ ? list_ : shown);
    return;
  }
  const FolderItem* item = model_.liveItem(nameAt(*row));
  GtkWidget* listItem = item && item->row ? gtk_widget_get_parent(item->row) : nullptr;
  // A row that has no place yet would make the list scroll to where it guesses it.
  if (listItem && gtk_widget_get_height(listItem) > 0) {
    gtk_widget_grab_focus(listItem);
  } else {
    focusRevealed_ = scrollTo(nameAt(*row));
  }
}

std::string FolderView::nameOfPath(const std::string& path) const {
  if (folder_.empty()) return path;
  const std::size_t slash = path.rfind('/');
  return slash != std::string::npos && path.substr(0, slash) == folder_ ? path.substr(slash + 1) : "";
}

void FolderView::itemMoved(const std::string& fromPath, const std::string& toPath) {
  const std::string from = nameOfPath(fromPath);
  const std::string to = nameOfPath(toPath);
  if (!from.empty() && !to.empty()) keyboardRow_->renamed(from, to);
}

void FolderView::setKeyboardItem(const std::string& path) { keyboardRow_->set(nameOfPath(path)); }

GtkWidget* FolderView::focus() const {
  GtkRoot* root = gtk_widget_get_root(widget());
  return root ? gtk_root_get_focus(root) : nullptr;
}

void FolderView::grabFocusWhenLoaded() {
  if (loaded_) return grabFocus();
  takesFocus_ = true;
  focusBefore_ = focus();
}

void FolderView::keepFocus(bool hadFocus) {
  GtkWidget* now = focus();
  // A window that comes up gives the focus to its first button by itself.
  const bool stayed = now == focusBefore_ || (!focusBefore_ && !GTK_IS_EDITABLE(now));
  const bool takes = std::exchange(takesFocus_, false) && stayed;
  const FolderItem* focused = focusedItem();
  const bool misplaced = hadFocus && (!focused || model_.indexOf(focused->name) != keyboardRow_->position());
  // Whoever types a name meanwhile goes to its row in the next frame.
  const bool goesElsewhere = focusRevealed_ && model_.indexOf(revealed_);
  if (takes || (misplaced && !goesElsewhere)) grabFocus();
}

}  // namespace vaelo
