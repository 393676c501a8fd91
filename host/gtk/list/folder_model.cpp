// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/folder_model.h"

#include <algorithm>
#include <utility>

namespace vaelo {
namespace {

struct ModelObject {
  GObject parent;
  FolderModel* model;  // null once that is gone
};

struct ModelClass {
  GObjectClass parent;
};

FolderModel* modelOf(gpointer object) { return static_cast<ModelObject*>(object)->model; }

void listInterface(gpointer interface, gpointer) {
  auto* list = static_cast<GListModelInterface*>(interface);
  list->get_item_type = [](GListModel*) { return folderItemGetType(); };
  list->get_n_items = [](GListModel* object) { return modelOf(object) ? modelOf(object)->shownCount() : 0; };
  list->get_item = [](GListModel* object, guint position) -> gpointer {
    return modelOf(object) ? modelOf(object)->makeShownItem(position) : nullptr;
  };
}

void selectionInterface(gpointer interface, gpointer) {
  auto* selection = static_cast<GtkSelectionModelInterface*>(interface);
  selection->is_selected = [](GtkSelectionModel* object, guint position) -> gboolean {
    return modelOf(object) && modelOf(object)->isShownSelected(position);
  };
  selection->get_selection_in_range = [](GtkSelectionModel* object, guint position, guint count) {
    GtkBitset* selected = gtk_bitset_new_empty();
    for (guint i = position; i < position + count; ++i) {
      if (gtk_selection_model_is_selected(object, i)) gtk_bitset_add(selected, i);
    }
    return selected;
  };
  // Pressing or moving to a row is no choice of it here.
  selection->select_item = [](GtkSelectionModel*, guint, gboolean) -> gboolean { return FALSE; };
  selection->unselect_item = [](GtkSelectionModel*, guint) -> gboolean { return FALSE; };
  selection->select_range = [](GtkSelectionModel* object, guint position, guint count, gboolean only) -> gboolean {
    return modelOf(object) && modelOf(object)->selectRange(position, count, only);
  };
  selection->set_selection = [](GtkSelectionModel* object, GtkBitset* selected, GtkBitset* mask) -> gboolean {
    return modelOf(object) && modelOf(object)->setSelection(selected, mask);
  };
}

GType modelGetType() {
  static const GType type = [] {
    const GType made = g_type_register_static_simple(G_TYPE_OBJECT, "VaeloFolderModel", sizeof(ModelClass), nullptr,
                                                     sizeof(ModelObject), nullptr, G_TYPE_FLAG_NONE);
    const GInterfaceInfo list{listInterface, nullptr, nullptr};
    const GInterfaceInfo selection{selectionInterface, nullptr, nullptr};
    g_type_add_interface_static(made, G_TYPE_LIST_MODEL, &list);
    g_type_add_interface_static(made, GTK_TYPE_SELECTION_MODEL, &selection);
    return made;
  }();
  return type;
}

std::string validUtf8(std::string_view bytes) {
  if (g_utf8_validate(bytes.data(), static_cast<gssize>(bytes.size()), nullptr)) return std::string(bytes);
  char* valid = g_utf8_make_valid(bytes.data(), static_cast<gssize>(bytes.size()));
  std::string result(valid);
  g_free(valid);
  return result;
}

/// What is shown for a name. The suffix of bookmarks and aliases says how they are stored, not what they are called.
std::string shownName(std::string_view name, EntryKind kind) {
  if (kind == EntryKind::Bookmark || kind == EntryKind::Alias) name = name.substr(0, name.rfind('.'));
  return validUtf8(name);
}

/// Splices with few unchanged rows between them as one. No more than some hundred gaps can be wide.
std::vector<Splice> joined(const std::vector<Splice>& splices, std::size_t size) {
  const std::size_t gap = size / 256;
  std::vector<Splice> result;
  for (const Splice& splice : splices) {
    if (!result.empty()) {
      Splice& last = result.back();
      const std::size_t between = splice.position - (last.position + last.added);
      if (between < gap) {
        last.removed += between + splice.removed;
        last.added += between + splice.added;
        continue;
      }
    }
    result.push_back(splice);
  }
  return result;
}

/// The positions that `selection` has after the splices.
GtkBitset* carried(GtkBitset* selection, const std::vector<Splice>& splices) {
  GtkBitset* result = gtk_bitset_new_empty();
  GtkBitsetIter iter;
  guint position = 0;
  auto next = splices.begin();
  std::size_t added = 0;
  std::size_t removed = 0;
  for (bool more = gtk_bitset_iter_init_first(&iter, selection, &position); more;
       more = gtk_bitset_iter_next(&iter, &position)) {
    // A splice stands behind everything that was added before it: its place among the old rows is without that.
    const auto oldPlace = [&] { return next->position - added + removed; };
    while (next != splices.end() && oldPlace() + next->removed <= position) {
      added += next->added;
      removed += next->removed;
      ++next;
    }
    if (next != splices.end() && oldPlace() <= position && position < oldPlace() + next->removed) continue;
    std::size_t before = added;
    // Rows put in right before this one, with nothing taken out.
    if (next != splices.end() && next->removed == 0 && oldPlace() == position) before += next->added;
    gtk_bitset_add(result, static_cast<guint>(position + before - removed));
  }
  return result;
}

}  // namespace

FolderModel::FolderModel()
    : object_(static_cast<GObject*>(g_object_new(modelGetType(), nullptr))),
      snapshot_(std::make_shared<FolderSnapshot>()),
      selection_(gtk_bitset_new_empty()),
      self_(std::make_shared<FolderModel*>(this)) {
  reinterpret_cast<ModelObject*>(object_)->model = this;
}

FolderModel::~FolderModel() {
  *self_ = nullptr;
  reinterpret_cast<ModelObject*>(object_)->model = nullptr;
  g_object_unref(object_);
  gtk_bitset_unref(selection_);
}

void FolderModel::replaceAll(std::size_t before) {
  ++revision_;
  gtk_bitset_remove_all(selection_);
  // Names of folders and paths of entries are not to be taken for one another.
  live_.clear();
  g_list_model_items_changed(G_LIST_MODEL(object_), 0, static_cast<guint>(before), static_cast<guint>(itemCount()));
}

void FolderModel::setSnapshot(std::shared_ptr<const FolderSnapshot> snapshot) {
  const std::size_t before = itemCount();
  entries_.reset();
  snapshot_ = std::move(snapshot);
  replaceAll(before);
}

void FolderModel::setEntries(std::vector<FolderEntry> entries) {
  const std::size_t before = itemCount();
  snapshot_ = std::make_shared<FolderSnapshot>();
  entries_ = std::make_shared<FolderEntries>(std::move(entries));
  replaceAll(before);
}

void FolderModel::applyChanges(std::shared_ptr<const FolderSnapshot> next, const std::vector<Splice>& splices) {
  GtkBitset* selection = carried(selection_, splices);
  const bool selectionLost = gtk_bitset_get_size(selection) != gtk_bitset_get_size(selection_);
  ++revision_;
  transition_ = Transition{std::exchange(snapshot_, std::move(next)), std::exchange(selection_, selection), 0, 0};
  for (const auto& [name, object] : live_) {
    if (const auto i = snapshot_->indexOf(name)) folderItemOf(object).kind = snapshot_->kind(*i);
  }
  for (const Splice& splice : joined(splices, snapshot_->size())) {
    transition_->oldStart += splice.position - transition_->newEnd + splice.removed;
    transition_->newEnd = splice.position + splice.added;
    g_list_model_items_changed(G_LIST_MODEL(object_), static_cast<guint>(splice.position),
                               static_cast<guint>(splice.removed), static_cast<guint>(splice.added));
  }
  gtk_bitset_unref(transition_->oldSelection);
  transition_.reset();
  if (selectionLost && selectionChanged_) selectionChanged_();
}

std::size_t FolderModel::itemCount() const { return entries_ ? entries_->size() : snapshot_->size(); }

std::string_view FolderModel::nameAt(std::size_t i) const { return entries_ ? (*entries_)[i].path : snapshot_->name(i); }

EntryKind FolderModel::kindAt(std::size_t i) const { return entries_ ? (*entries_)[i].kind : snapshot_->kind(i); }

std::string FolderModel::displayNameAt(std::size_t i) const {
  return entries_ ? (*entries_)[i].displayName : shownName(snapshot_->name(i), snapshot_->kind(i));
}

std::optional<std::size_t> FolderModel::indexOf(std::string_view name) const {
  return entries_ ? entries_->indexOf(name) : snapshot_->indexOf(name);
}

FolderItem* FolderModel::liveItem(std::string_view name) const {
  const auto found = live_.find(name);
  return found == live_.end() ? nullptr : &folderItemOf(found->second);
}

void FolderModel::forEachLiveItem(const std::function<void(FolderItem&)>& visit) const {
  for (const auto& [name, object] : live_) visit(folderItemOf(object));
}

guint FolderModel::shownCount() const {
  if (!transition_) return static_cast<guint>(itemCount());
  return static_cast<guint>(transition_->newEnd + transition_->old->size() - transition_->oldStart);
}

GObject* FolderModel::makeShownItem(guint position) {
  if (position >= shownCount()) return nullptr;
  const bool old = transition_ && position >= transition_->newEnd;
  const std::size_t i = old ? inOld(position) : position;
  const std::string_view name = old ? transition_->old->name(i) : nameAt(i);
  if (const auto found = live_.find(name); found != live_.end()) return G_OBJECT(g_object_ref(found->second));

  FolderItem item;
  item.name = name;
  item.displayName = old ? shownName(name, transition_->old->kind(i)) : displayNameAt(i);
  item.kind = old ? transition_->old->kind(i) : kindAt(i);
  if (entries_) {
    item.icon = (*entries_)[i].icon;
    item.place = (*entries_)[i].place;
  }
  item.finalized = [weak = std::weak_ptr(self_)](FolderItem& gone) {
    const auto self = weak.lock();
    if (!self || !*self) return;
    auto& live = (*self)->live_;
    const auto found = live.find(gone.name);
    if (found != live.end() && &folderItemOf(found->second) == &gone) live.erase(found);
  };
  GObject* object = folderItemNew(std::move(item));
  live_.emplace(folderItemOf(object).name, object);
  return object;
}

bool FolderModel::isShownSelected(guint position) const {
  if (!transition_ || position < transition_->newEnd) return gtk_bitset_contains(selection_, position);
  return gtk_bitset_contains(transition_->oldSelection, static_cast<guint>(inOld(position)));
}

void FolderModel::tellSelection(std::size_t first, std::size_t count) {
  if (count) gtk_selection_model_selection_changed(selectionModel(), static_cast<guint>(first), static_cast<guint>(count));
  if (selectionChanged_) selectionChanged_();
}

void FolderModel::setSelected(std::size_t i, bool selected) {
  if (i >= itemCount() || isSelected(i) == selected) return;
  if (selected) {
    gtk_bitset_add(selection_, static_cast<guint>(i));
  } else {
    gtk_bitset_remove(selection_, static_cast<guint>(i));
  }
  tellSelection(i, 1);
}

void FolderModel::select(const std::vector<std::string>& names) {
  GtkBitset* wanted = gtk_bitset_new_empty();
  for (const std::string& name : names) {
    if (const auto i = indexOf(name)) gtk_bitset_add(wanted, static_cast<guint>(*i));
  }
  replaceSelection(wanted);
}

void FolderModel::selectRows(const std::vector<std::size_t>& rows) {
  GtkBitset* wanted = gtk_bitset_new_empty();
  for (std::size_t i = 0; i < rows.size() && rows[i] < itemCount();) {
    const std::size_t first = i++;
    while (i < rows.size() && rows[i] == rows[i - 1] + 1) ++i;
    gtk_bitset_add_range(wanted, static_cast<guint>(rows[first]), static_cast<guint>(i - first));
  }
  replaceSelection(wanted);
}

void FolderModel::replaceSelection(GtkBitset* wanted) {
  const bool same = gtk_bitset_equals(wanted, selection_);
  gtk_bitset_unref(std::exchange(selection_, wanted));
  if (!same) tellSelection(0, itemCount());
}

std::vector<std::string> FolderModel::selectedNames() const {
  std::vector<std::string> names;
  forEachSelected([&](guint position) { names.emplace_back(nameAt(position)); });
  return names;
}

std::vector<std::size_t> FolderModel::selectedRows() const {
  std::vector<std::size_t> rows;
  rows.reserve(gtk_bitset_get_size(selection_));
  forEachSelected([&](guint position) { rows.push_back(position); });
  return rows;
}

void FolderModel::forEachSelected(const std::function<void(guint)>& visit) const {
  GtkBitsetIter iter;
  guint position = 0;
  for (bool more = gtk_bitset_iter_init_first(&iter, selection_, &position); more;
       more = gtk_bitset_iter_next(&iter, &position)) {
    visit(position);
  }
}

bool FolderModel::selectRange(guint position, guint count, bool only) {
  if (!selectable_) return false;
  if (only && rangeWished_) {
    rangeWished_();
    return true;
  }
  if (only) gtk_bitset_remove_all(selection_);
  gtk_bitset_add_range(selection_, position, count);
  tellSelection(0, itemCount());
  return true;
}

bool FolderModel::setSelection(GtkBitset* selected, GtkBitset* mask) {
  if (!selectable_) return false;
  GtkBitset* set = gtk_bitset_copy(selected);
  gtk_bitset_intersect(set, mask);
  gtk_bitset_subtract(selection_, mask);
  gtk_bitset_union(selection_, set);
  gtk_bitset_unref(set);
  tellSelection(0, itemCount());
  return true;
}

}  // namespace vaelo
