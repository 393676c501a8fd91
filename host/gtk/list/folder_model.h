// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "host/gtk/list/folder_entries.h"
#include "host/gtk/list/folder_item.h"
#include "host/gtk/list/folder_snapshot.h"

namespace vaelo {

/// The rows of a list and which of them are selected: a snapshot, and objects made of it on demand. Main thread.
///
/// Holding a snapshot costs no object; get_item makes one, and gives the same one while anybody holds it. A change of the
/// snapshot tells the lists about the rows that differ, keeps the others' objects, and carries the selection along. Rows are
/// selected by the view's own rules only: what the toolkit's lists wish to select on a press is ignored, except ranges and
/// "all" while `selectable` is set.
class FolderModel {
 public:
  FolderModel();
  ~FolderModel();
  FolderModel(const FolderModel&) = delete;
  FolderModel& operator=(const FolderModel&) = delete;

  /// Implements GListModel (of FolderItem objects) and GtkSelectionModel; owned by this.
  GtkSelectionModel* selectionModel() const { return GTK_SELECTION_MODEL(object_); }

  /// Everything anew; nothing is selected then.
  void setSnapshot(std::shared_ptr<const FolderSnapshot> snapshot);
  /// As they are given, in their order.
  void setEntries(std::vector<FolderEntry> entries);
  /// `splices` as FolderSnapshot::splicesTo() gave them. Near ones are told as one, so that a storm of changes costs some
  /// hundred notices at most.
  void applyChanges(std::shared_ptr<const FolderSnapshot> next, const std::vector<Splice>& splices);

  const std::shared_ptr<const FolderSnapshot>& snapshot() const { return snapshot_; }
  /// What setEntries() gave; null for a folder.
  const std::shared_ptr<const FolderEntries>& entries() const { return entries_; }
  /// Another number whenever the rows are others, or stand elsewhere.
  unsigned revision() const { return revision_; }
  std::size_t itemCount() const;
  /// Valid until the next change.
  std::string_view nameAt(std::size_t i) const;
  EntryKind kindAt(std::size_t i) const;
  std::string displayNameAt(std::size_t i) const;
  std::optional<std::size_t> indexOf(std::string_view name) const;
  /// The item when an object of it is alive.
  FolderItem* liveItem(std::string_view name) const;
  void forEachLiveItem(const std::function<void(FolderItem&)>& visit) const;

  bool isSelected(std::size_t i) const { return gtk_bitset_contains(selection_, static_cast<guint>(i)); }
  void setSelected(std::size_t i, bool selected);
  /// Replaces the selection; names that are not listed are ignored.
  void select(const std::vector<std::string>& names);
  /// The same for rows, ascending.
  void selectRows(const std::vector<std::size_t>& rows);
  /// In the order of the list.
  std::vector<std::string> selectedNames() const;
  std::vector<std::size_t> selectedRows() const;
  void setSelectable(bool selectable) { selectable_ = selectable; }
  /// Called when the toolkit's lists wish a range of rows alone to be selected; without it they get it.
  void onRangeWished(std::function<void()> handler) { rangeWished_ = std::move(handler); }
  /// Called after the selection changed, whoever changed it.
  void onSelectionChanged(std::function<void()> handler) { selectionChanged_ = std::move(handler); }

  // For the object that the lists see.
  guint shownCount() const;
  GObject* makeShownItem(guint position);
  bool isShownSelected(guint position) const;
  bool selectRange(guint position, guint count, bool only);
  bool setSelection(GtkBitset* selected, GtkBitset* mask);

 private:
  /// While the lists hear of the splices one after another, they see the new rows before `newEnd`, and the old ones from
  /// `oldStart` on behind them.
  struct Transition {
    std::shared_ptr<const FolderSnapshot> old;
    GtkBitset* oldSelection;
    std::size_t newEnd;
    std::size_t oldStart;
  };

  void replaceAll(std::size_t before);
  void replaceSelection(GtkBitset* wanted);
  void forEachSelected(const std::function<void(guint)>& visit) const;
  void tellSelection(std::size_t first, std::size_t count);
  std::size_t inOld(guint position) const { return transition_->oldStart + (position - transition_->newEnd); }

  GObject* object_;
  std::shared_ptr<const FolderSnapshot> snapshot_;
  std::shared_ptr<const FolderEntries> entries_;
  unsigned revision_ = 0;
  std::unordered_map<std::string_view, GObject*> live_;  // keys are the items' own names
  GtkBitset* selection_;
  bool selectable_ = false;
  std::optional<Transition> transition_;
  std::function<void()> selectionChanged_;
  std::function<void()> rangeWished_;
  std::shared_ptr<FolderModel*> self_;  // for items that outlive this
};

}  // namespace vaelo
