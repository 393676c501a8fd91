// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include <random>
#include <set>

#include "host/gtk/list/folder_snapshot.h"

namespace vaelo {
namespace {

using Entries = std::vector<std::pair<std::string, EntryKind>>;

std::shared_ptr<const FolderSnapshot> snapshotOf(const Entries& entries) {
  FolderSnapshot::Draft draft;
  for (const auto& [name, kind] : entries) draft.add(name, kind);
  return FolderSnapshot::sorted(std::move(draft));
}

std::vector<std::string> snapshotNames(const FolderSnapshot& snapshot) {
  std::vector<std::string> names;
  for (std::size_t i = 0; i < snapshot.size(); ++i) names.emplace_back(snapshot.name(i));
  return names;
}

/// Does to `names` what the splices say.
std::vector<std::string> spliced(std::vector<std::string> names, const std::vector<Splice>& splices,
                                 const FolderSnapshot& next) {
  for (const Splice& splice : splices) {
    const auto at = names.begin() + static_cast<std::ptrdiff_t>(splice.position);
    names.erase(at, at + static_cast<std::ptrdiff_t>(splice.removed));
    for (std::size_t i = 0; i < splice.added; ++i) {
      const std::size_t place = splice.position + i;
      names.insert(names.begin() + static_cast<std::ptrdiff_t>(place), std::string(next.name(place)));
    }
  }
  return names;
}

TEST(FolderSnapshot, FoldersComeFirst) {
  const auto snapshot = snapshotOf({{"b", EntryKind::Document},
                                    {"z", EntryKind::Folder},
                                    {"a.rtfd", EntryKind::Package},
                                    {"y", EntryKind::FolderLink},
                                    {"c", EntryKind::Promise}});
  EXPECT_EQ(snapshotNames(*snapshot), (std::vector<std::string>{"y", "z", "a.rtfd", "b", "c"}));
  EXPECT_EQ(snapshot->indexOf("b"), 3U);
  EXPECT_EQ(snapshot->indexOf("z"), 1U);
  EXPECT_EQ(snapshot->indexOf("x"), std::nullopt);
}

TEST(FolderSnapshot, DownloadedItemHidesItsPromise) {
  const auto snapshot = snapshotOf({{"a", EntryKind::Promise}, {"a", EntryKind::Document}, {"b", EntryKind::Promise}});
  EXPECT_EQ(snapshotNames(*snapshot), (std::vector<std::string>{"a", "b"}));
  EXPECT_EQ(snapshot->kind(0), EntryKind::Document);
}

TEST(FolderSnapshot, KindsByName) {
  EXPECT_EQ(kindOfName("a.rtfd", true), EntryKind::Package);
  EXPECT_EQ(kindOfName("a.rtfd", false), EntryKind::Document);
  EXPECT_EQ(kindOfName("a", true), EntryKind::Folder);
  EXPECT_EQ(kindOfName("a.pdf.vaelobookmark", false), EntryKind::Bookmark);
  EXPECT_EQ(kindOfName("a.desktop", false), EntryKind::Alias);
}

TEST(FolderSnapshot, ChangeOfKindMovesAnEntry) {
  const auto before = snapshotOf({{"a", EntryKind::Document}, {"b", EntryKind::Promise}, {"x", EntryKind::Folder}});
  const auto after = before->with({{"x", EntryKind::Document}, {"b", EntryKind::Document}});
  EXPECT_EQ(snapshotNames(*after), (std::vector<std::string>{"a", "b", "x"}));
  EXPECT_EQ(after->kind(1), EntryKind::Document);
  EXPECT_EQ(before->splicesTo(*after), (std::vector<Splice>{{0, 1, 0}, {2, 0, 1}}));
}

TEST(FolderSnapshot, RandomChangesAgreeWithReadingAnew) {
  std::mt19937 random(5);
  std::set<std::string> present;
  auto snapshot = snapshotOf({});
  for (int round = 0; round < 200; ++round) {
    std::vector<EntryChange> changes;
    for (unsigned i = random() % 8; i > 0; --i) {
      const std::string name = "n\u00e4me " + std::to_string(random() % 60);
      if (random() % 2) {
        changes.push_back({name, EntryKind::Document});
      } else {
        changes.push_back({name, std::nullopt});
      }
    }
    std::set<std::string> seen;
    for (const EntryChange& change : changes) {
      if (!seen.insert(change.name).second) continue;  // one name has one state, the first
      if (change.kind) {
        present.insert(change.name);
      } else {
        present.erase(change.name);
      }
    }
    Entries entries;
    for (const std::string& name : present) entries.emplace_back(name, EntryKind::Document);
    const auto next = snapshot->with(changes);
    ASSERT_EQ(snapshotNames(*next), snapshotNames(*snapshotOf(entries)));
    ASSERT_EQ(spliced(snapshotNames(*snapshot), snapshot->splicesTo(*next), *next), snapshotNames(*next));
    snapshot = next;
  }
}

}  // namespace
}  // namespace vaelo
