// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include <random>

#include "host/gtk/list/folder_model.h"

namespace vaelo {
namespace {

std::shared_ptr<const FolderSnapshot> numbered(const std::vector<int>& numbers) {
  FolderSnapshot::Draft draft;
  for (const int number : numbers) draft.add("file " + std::to_string(number), EntryKind::Document);
  return FolderSnapshot::sorted(std::move(draft));
}

/// Sees what a list sees: it follows the notices, and asks at each for all rows.
class Watcher {
 public:
  explicit Watcher(FolderModel& model) : list_(G_LIST_MODEL(model.selectionModel())) {
    handler_ = g_signal_connect(list_, "items-changed", G_CALLBACK(changed), this);
  }
  ~Watcher() { g_signal_handler_disconnect(list_, handler_); }
  Watcher(const Watcher&) = delete;
  Watcher& operator=(const Watcher&) = delete;

  std::vector<std::string> names;
  int notices = 0;

 private:
  static void changed(GListModel* list, guint position, guint removed, guint added, Watcher* self) {
    ++self->notices;
    auto& names = self->names;
    const auto at = names.begin() + position;
    names.erase(at, at + removed);
    names.insert(names.begin() + position, added, "");
    ASSERT_EQ(names.size(), g_list_model_get_n_items(list));
    for (guint i = 0; i < names.size(); ++i) {
      auto* item = g_list_model_get_item(list, i);
      ASSERT_NE(item, nullptr);
      const std::string& name = folderItemOf(item).name;
      // Rows that were not part of the change are the same as before it.
      if (i < position || i >= position + added) {
        EXPECT_EQ(names[i], name);
      }
      names[i] = name;
      g_object_unref(item);
    }
  }

  GListModel* list_;
  gulong handler_;
};

std::vector<std::string> namesOf(const FolderModel& model) {
  std::vector<std::string> names;
  for (std::size_t i = 0; i < model.itemCount(); ++i) names.emplace_back(model.nameAt(i));
  return names;
}

void change(FolderModel& model, std::shared_ptr<const FolderSnapshot> next) {
  const std::vector<Splice> splices = model.snapshot()->splicesTo(*next);
  model.applyChanges(std::move(next), splices);
}

TEST(FolderModel, GivesTheSameObjectWhileItIsHeld) {
  FolderModel model;
  model.setSnapshot(numbered({1, 2, 3}));
  auto* list = G_LIST_MODEL(model.selectionModel());
  auto* item = g_list_model_get_item(list, 1);
  auto* again = g_list_model_get_item(list, 1);
  EXPECT_EQ(item, again);
  EXPECT_EQ(model.liveItem("file 2"), &folderItemOf(item));
  change(model, numbered({0, 1, 2, 3}));
  auto* moved = g_list_model_get_item(list, 2);
  EXPECT_EQ(moved, item);
  for (auto* object : {item, again, moved}) g_object_unref(object);
  EXPECT_EQ(model.liveItem("file 2"), nullptr);
}

TEST(FolderModel, EveryNoticeIsTrueWhenItComes) {
  std::mt19937 random(8);
  FolderModel model;
  Watcher watcher(model);
  for (int round = 0; round < 60; ++round) {
    std::vector<int> numbers;
    for (int i = 0; i < 80; ++i) {
      if (random() % 4) numbers.push_back(i);
    }
    change(model, numbered(numbers));
    ASSERT_EQ(watcher.names, namesOf(model));
  }
}

TEST(FolderModel, SelectionFollowsItsRows) {
  std::mt19937 random(9);
  for (int round = 0; round < 60; ++round) {
    FolderModel model;
    std::vector<int> before;
    std::vector<int> after;
    std::vector<std::string> selected;
    std::vector<std::string> remaining;
    for (int i = 0; i < 60; ++i) {
      const bool was = random() % 3;
      const bool is = random() % 3;
      if (was) before.push_back(i);
      if (is) after.push_back(i);
      if (was && random() % 2) {
        selected.push_back("file " + std::to_string(i));
        if (is) remaining.push_back(selected.back());
      }
    }
    model.setSnapshot(numbered(before));
    model.select(selected);
    ASSERT_EQ(model.selectedNames(), selected);
    int reports = 0;
    model.onSelectionChanged([&] { ++reports; });
    change(model, numbered(after));
    ASSERT_EQ(model.selectedNames(), remaining);
    ASSERT_EQ(reports, selected == remaining ? 0 : 1);
  }
}

TEST(FolderModel, StormOfChangesIsFewNotices) {
  std::vector<int> even;
  std::vector<int> all;
  for (int i = 0; i < 20000; ++i) {
    all.push_back(i);
    if (i % 2) even.push_back(i);
  }
  FolderModel model;
  model.setSnapshot(numbered(even));
  model.select({"file 1", "file 19999"});
  int notices = 0;
  g_signal_connect(model.selectionModel(), "items-changed",
                   G_CALLBACK(+[](GListModel*, guint, guint, guint, int* count) { ++*count; }), &notices);
  change(model, numbered(all));
  EXPECT_LE(notices, 257);
  EXPECT_EQ(model.selectedNames(), (std::vector<std::string>{"file 1", "file 19999"}));
}

TEST(FolderModel, PressingARowSelectsNothing) {
  FolderModel model;
  model.setSnapshot(numbered({1, 2, 3}));
  EXPECT_FALSE(gtk_selection_model_select_item(model.selectionModel(), 0, TRUE));
  EXPECT_FALSE(gtk_selection_model_select_all(model.selectionModel()));
  EXPECT_TRUE(model.selectedNames().empty());
  model.setSelectable(true);
  EXPECT_TRUE(gtk_selection_model_select_all(model.selectionModel()));
  EXPECT_EQ(model.selectedNames().size(), 3U);
}

TEST(FolderModel, NamesThatAreNotUtf8AreShownAndKept) {
  FolderSnapshot::Draft draft;
  draft.add("bad\xff", EntryKind::Document);
  FolderModel model;
  model.setSnapshot(FolderSnapshot::sorted(std::move(draft)));
  EXPECT_EQ(model.nameAt(0), "bad\xff");
  EXPECT_EQ(model.displayNameAt(0), "bad\uFFFD");
  EXPECT_EQ(model.indexOf("bad\xff"), 0U);
}

TEST(FolderModel, SuppliedEntriesKeepTheirOrder) {
  FolderModel model;
  model.setEntries({{"Zoo", "/a/b", EntryKind::Folder, "folder"}, {"Ant", "/c", EntryKind::Document, ""}});
  EXPECT_EQ(model.itemCount(), 2U);
  EXPECT_EQ(model.nameAt(0), "/a/b");
  EXPECT_EQ(model.displayNameAt(0), "Zoo");
  EXPECT_EQ(model.indexOf("/c"), 1U);
}

}  // namespace
}  // namespace vaelo
