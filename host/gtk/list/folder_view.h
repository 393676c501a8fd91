// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/gtk/list/details_loader.h"
#include "host/gtk/list/folder_model.h"
#include "host/gtk/list/folder_monitor.h"
#include "host/gtk/list/folder_row.h"
#include "host/gtk/list/icon_table.h"
#include "host/gtk/list/keyboard_row.h"
#include "host/gtk/list/mark_drag.h"
#include "host/gtk/list/range_selection.h"
#include "host/gtk/list/row_swipe.h"
#include "host/gtk/list/type_ahead.h"
#include "host/gtk/list/worker.h"

namespace vaelo {

/// What a key or a swipe means for a row, or a key for the selected ones while editing.
enum class ListCommand { Rename, Delete, Details, Move, Share };

/// What a FolderView tells its owner. All on the main thread; unset ones are not called. Names are bytes as they stand in
/// the folder (for promises the item's name), or the paths of supplied entries.
struct FolderViewEvents {
  /// A row was pressed, or Enter on it, outside of editing.
  std::function<void(const std::string& name)> activated;
  /// The list has other items, or others in another order, than before; also after the first reading.
  std::function<void()> itemsChanged;
  /// The user chose other rows, or selected ones are gone. Not called for setSelection().
  std::function<void()> selectionChanged;
  /// The folder was removed or moved away; the list keeps what it shows.
  std::function<void()> folderRemoved;
  /// The folder could not be read; the view shows that as well.
  std::function<void(int errorNumber)> readFailed;
  /// The user wants supplied entries to be looked up again.
  std::function<void()> refreshWanted;
  /// F2, Delete, Alt+Return or Control+M on a row, at a place in `view`'s coordinates; while editing, `name` may be empty.
  std::function<void(ListCommand command, const std::string& name, GtkWidget* view, const GdkRectangle& at)> commanded;
  /// Whether a finger that swipes a row is offered the command; unset: rows don't move.
  std::function<bool(ListCommand command)> offersBySwipe;
  /// A secondary click, a long press or the menu key on a row, at a place in `view`'s coordinates.
  std::function<void(const std::string& name, GtkWidget* view, const GdkRectangle& at)> contextRequested;
};

/// A list or icon grid of one folder, or of entries that the owner supplies. Main thread.
///
/// The phases of opening a folder: (1) a worker reads the names and sorts them, nothing else, 100,000 in some 60 ms; (2)
/// they are shown in their final order; (3) rows that are drawn ask for their details and icons, in batches on workers,
/// visible ones first; (4) what other programs do is gathered for 100 ms, looked up and merged on a worker, and comes as
/// splices. The main thread never touches the disk.
class FolderView {
 public:
  enum class Mode { List, Grid };

  FolderView();
  ~FolderView();
  FolderView(const FolderView&) = delete;
  FolderView& operator=(const FolderView&) = delete;

  /// Takes part in a container like any other; owned by this.
  GtkWidget* widget() const { return GTK_WIDGET(pages_); }
  void setEvents(FolderViewEvents events) { events_ = std::move(events); }

  /// Shows the folder at an absolute path: reads it, and follows its changes until another call.
  void setFolder(const std::string& path);
  /// Shows these entries in this order, until another call.
  void setEntries(std::vector<FolderEntry> entries);
  /// Instead of entries: that the folder they come from can't be read, with the system's error number.
  void setUnreadable(int errorNumber);
  /// What the page says when there is nothing to list; the default is of an empty folder.
  void setEmptyText(const char* icon, const std::string& title, const std::string& description);
  /// Reads the folder and the rows' details again. Rows keep their place and selection.
  void refresh();

  void setMode(Mode mode);
  Mode mode() const { return mode_; }
  /// Rows have check marks, and a press selects instead of opening. Leaving unselects all, without an event.
  void setEditing(bool editing);
  bool editing() const { return context_.editing; }

  std::size_t itemCount() const { return model_.itemCount(); }
  std::string nameAt(std::size_t i) const { return std::string(model_.nameAt(i)); }
  EntryKind kindAt(std::size_t i) const { return model_.kindAt(i); }
  /// True once the folder was read, or entries were supplied.
  bool loaded() const { return loaded_; }
  std::vector<std::string> selection() const { return model_.selectedNames(); }
  void setSelection(const std::vector<std::string>& names);
  /// The same for rows, ascending.
  void setSelectedRows(const std::vector<std::size_t>& rows);

  /// Brings the row on screen; false when it isn't listed.
  bool scrollTo(const std::string& name);
  /// Pixels from the top, for taking a place up again.
  double scrollPosition() const;
  void setScrollPosition(double position);
  /// Moves the keyboard's focus to the row that had it last, or what is there instead of rows.
  void grabFocus();
  /// An item was moved, or got another name. If it has the keyboard, it keeps it.
  void itemMoved(const std::string& fromPath, const std::string& toPath);
  /// The keyboard belongs to the item at the path, if it is listed.
  void setKeyboardItem(const std::string& path);
  /// The same as soon as there are rows, unless the user has gone elsewhere by then.
  void grabFocusWhenLoaded();
  /// The model behind the rows, for the owner's own tests and measurements.
  FolderModel& model() { return model_; }

 private:
  void makeList();
  void makePages();
  void connectKeys();
  void connectContextGestures();
  void showPage();
  /// While editing, a pointer that is dragged over rows selects them.
  void setRubberband();
  void setListModel(GtkSelectionModel* model);
  void follow();
  void read();
  void folderRead(std::shared_ptr<const FolderSnapshot> next, const std::vector<Splice>& splices, int errorNumber);
  void folderChanged(FolderChanges changes);
  void lookUpChanges();
  void pressed(guint position);
  bool keyPressed(guint key, GdkModifierType modifiers);
  void connectDrags();
  std::vector<RowSwipe::Button> swipeButtons(const FolderItem& item);
  void requestContext(double x, double y);
  void requestContextAtFocus();
  bool command(guint key, GdkModifierType modifiers);
  /// Where the row stands in the scroller, if it shows.
  std::optional<GdkRectangle> placeOf(const FolderItem& item) const;
  void detailsAreOld(FolderItem& item);
  void allDetailsAreOld();
  void redrawRows();
  void finishReveal();
  GtkAdjustment* adjustment() const;
  FolderItem* focusedItem() const;
  GtkWidget* focus() const;
  bool hasFocus() const;
  /// After the rows have changed; `hadFocus`: before, they had it.
  void keepFocus(bool hadFocus);
  /// The name of what lies at the path in this list, empty for what lies elsewhere.
  std::string nameOfPath(const std::string& path) const;
  /// Shift and a key moved the keyboard.
  void extendToFocus();

  FolderViewEvents events_;
  std::string folder_;  // empty: entries
  unsigned generation_ = 0;
  bool loaded_ = false;
  bool settingSelection_ = false;
  std::string revealed_;  // what scrollTo() is on the way to
  int framesToWait_ = 0;
  bool focusRevealed_ = false;
  bool takesFocus_ = false;
  const GtkWidget* focusBefore_ = nullptr;  // to compare with; may be gone
  bool extends_ = false;                    // the press that is under way has Shift
  double pressX_ = 0;                       // where it began
  double pressY_ = 0;
  int errorNumber_ = 0;
  FolderChanges pending_;
  bool updating_ = false;
  Mode mode_ = Mode::List;

  FolderModel model_;
  IconTable icons_;
  RangeSelection range_;
  RowContext context_;
  DetailsLoader details_;
  FolderMonitor monitor_;
  TypeAhead typeAhead_;
  Worker reader_;

  GtkStack* pages_;
  GtkWidget* scroller_;
  AdwClampScrollable* clamp_;
  GtkWidget* list_ = nullptr;
  GtkWidget* spinner_;
  AdwStatusPage* emptyPage_;
  AdwStatusPage* errorPage_;
  guint spinnerTimer_ = 0;
  gint64 lastPull_ = 0;
  std::unique_ptr<KeyboardRow> keyboardRow_;
  std::unique_ptr<RowSwipe> swipe_;
  std::unique_ptr<MarkDrag> markDrag_;
};

}  // namespace vaelo
