// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>
#include <unistd.h>

#include "host/gtk/list/folder_reader.h"
#include "host/gtk/list/folder_row.h"
#include "host/gtk/list/folder_view.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

using list_test::TestFolder;
using list_test::waitUntil;

/// A view in a window, where there is a display.
class FolderViewTest : public testing::Test {
 protected:
  void SetUp() override {
    if (!gtk_init_check()) GTEST_SKIP() << "no display";
    adw_init();
    view_ = std::make_unique<FolderView>();
    view_->setEvents({.activated = [this](const std::string& name) { activated_ = name; },
                      .itemsChanged = [this] { ++itemsChanges_; },
                      .selectionChanged = [this] { ++selectionChanges_; },
                      .folderRemoved = [this] { removed_ = true; },
                      .readFailed = [this](int error) { error_ = error; },
                      .refreshWanted = nullptr,
                      .commanded = nullptr,
                      .offersBySwipe = nullptr,
                      .contextRequested = nullptr});
    window_ = gtk_window_new();
    gtk_window_set_default_size(GTK_WINDOW(window_), 400, 500);
    gtk_window_set_child(GTK_WINDOW(window_), view_->widget());
    gtk_window_present(GTK_WINDOW(window_));
  }
  void TearDown() override {
    if (!window_) return;
    gtk_window_destroy(GTK_WINDOW(window_));
    view_.reset();
  }

  void open() {
    view_->setFolder(folder_.path());
    ASSERT_TRUE(waitUntil([&] { return view_->loaded(); }));
  }
  std::vector<std::string> names() const {
    std::vector<std::string> result;
    for (std::size_t i = 0; i < view_->itemCount(); ++i) result.push_back(view_->nameAt(i));
    return result;
  }
  GtkWidget* shownPage() const { return gtk_stack_get_visible_child(GTK_STACK(view_->widget())); }
  GtkWidget* list() const {
    GtkWidget* clamp = gtk_scrolled_window_get_child(GTK_SCROLLED_WINDOW(shownPage()));
    return adw_clamp_scrollable_get_child(ADW_CLAMP_SCROLLABLE(clamp));
  }

  /// Below the list.
  GtkWidget* addEntry() {
    GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
    GtkWidget* entry = gtk_entry_new();
    gtk_window_set_child(GTK_WINDOW(window_), nullptr);
    gtk_widget_set_vexpand(view_->widget(), TRUE);
    gtk_box_append(GTK_BOX(box), view_->widget());
    gtk_box_append(GTK_BOX(box), entry);
    gtk_window_set_child(GTK_WINDOW(window_), box);
    return entry;
  }
  std::string focusedRow() const {
    GtkWidget* focus = gtk_window_get_focus(GTK_WINDOW(window_));
    GtkWidget* row = focus && gtk_widget_is_ancestor(focus, list()) ? folderRowIn(focus) : nullptr;
    return row ? std::string(folderItemOf(folderRowItem(row)).name) : std::string();
  }
  /// As if it were pressed; whether the view took it.
  bool key(guint value) const {
    GListModel* controllers = gtk_widget_observe_controllers(view_->widget());
    gboolean taken = FALSE;
    for (guint i = 0; i < g_list_model_get_n_items(controllers); ++i) {
      auto* controller = static_cast<GtkEventController*>(g_list_model_get_item(controllers, i));
      if (GTK_IS_EVENT_CONTROLLER_KEY(controller))
        g_signal_emit_by_name(controller, "key-pressed", value, 0U, GdkModifierType(0), &taken);
      g_object_unref(controller);
    }
    g_object_unref(controllers);
    return taken;
  }

  TestFolder folder_;
  GtkWidget* window_ = nullptr;
  std::unique_ptr<FolderView> view_;
  std::string activated_;
  int itemsChanges_ = 0;
  int selectionChanges_ = 0;
  bool removed_ = false;
  int error_ = 0;
};

TEST_F(FolderViewTest, FollowsTheFolder) {
  folder_.write("file 10");
  folder_.write("file 2");
  open();
  EXPECT_EQ(names(), (std::vector<std::string>{"file 2", "file 10"}));
  view_->setSelection({"file 10"});
  EXPECT_EQ(selectionChanges_, 0);

  folder_.write("file 3");
  folder_.makeFolder("z");
  ASSERT_TRUE(waitUntil([&] { return view_->itemCount() == 4; }));
  EXPECT_EQ(names(), (std::vector<std::string>{"z", "file 2", "file 3", "file 10"}));
  EXPECT_EQ(view_->selection(), (std::vector<std::string>{"file 10"}));

  folder_.remove("file 10");
  ASSERT_TRUE(waitUntil([&] { return view_->itemCount() == 3; }));
  EXPECT_TRUE(view_->selection().empty());
  EXPECT_EQ(selectionChanges_, 1);
  EXPECT_GE(itemsChanges_, 3);
}

TEST_F(FolderViewTest, ManyChangesASecondAllArrive) {
  open();
  for (int i = 0; i < 5000; ++i) folder_.write("file " + std::to_string(i));
  ASSERT_TRUE(waitUntil([&] { return view_->itemCount() == 5000; }));
  for (int i = 0; i < 5000; i += 2) folder_.remove("file " + std::to_string(i));
  ASSERT_TRUE(waitUntil([&] { return view_->itemCount() == 2500; }));
  EXPECT_EQ(view_->nameAt(0), "file 1");
}

TEST_F(FolderViewTest, ARowFollowsWhatComesIntoAndLeavesItsFolder) {
  folder_.makeFolder("Plans");
  folder_.write("Plans/a");
  open();
  const auto counts = [&](const std::string& text) {
    return waitUntil([&] {
      FolderItem* item = view_->model().liveItem("Plans");
      return item && item->details && item->details->secondLine == text;
    });
  };
  ASSERT_TRUE(counts("1 item"));
  folder_.write("Plans/b");
  EXPECT_TRUE(counts("2 items"));
  folder_.remove("Plans/a");
  folder_.remove("Plans/b");
  EXPECT_TRUE(counts("0 items"));
  std::filesystem::rename(folder_.path() + "/Plans", folder_.path() + "/Beds");
  ASSERT_TRUE(waitUntil([&] { return names() == std::vector<std::string>{"Beds"}; }));
  folder_.makeFolder("Plans");
  folder_.write("Plans/c");
  EXPECT_TRUE(counts("1 item"));
}

TEST_F(FolderViewTest, ARowThatWasOutOfSightFollowsAgain) {
  folder_.makeFolder("Plans");
  open();
  const auto counts = [&](const std::string& text) {
    return waitUntil([&] {
      FolderItem* item = view_->model().liveItem("Plans");
      return item && item->details && item->details->secondLine == text;
    });
  };
  ASSERT_TRUE(counts("0 items"));
  gtk_widget_set_visible(view_->widget(), FALSE);
  folder_.write("Plans/a");
  gtk_widget_set_visible(view_->widget(), TRUE);
  EXPECT_TRUE(counts("1 item"));
  folder_.write("Plans/b");
  EXPECT_TRUE(counts("2 items"));
}

TEST_F(FolderViewTest, RowsOfSuppliedEntriesFollowTheirFolders) {
  folder_.makeFolder("Library");
  folder_.makeFolder("Library/Documents");
  folder_.write("Library/Documents/a");
  const std::string path = folder_.path() + "/Library/Documents";
  view_->setEntries({{"Notes", path, EntryKind::Folder}});
  const auto counts = [&](const std::string& text) {
    return waitUntil([&] {
      FolderItem* item = view_->model().liveItem(path);
      return item && item->details && item->details->secondLine == text;
    });
  };
  ASSERT_TRUE(counts("1 item"));
  folder_.remove("Library/Documents");
  folder_.makeFolder("Library/Documents");
  EXPECT_TRUE(counts("0 items")) << "another folder stands in its place";
  folder_.write("Library/Documents/b");
  EXPECT_TRUE(counts("1 item"));
}

TEST_F(FolderViewTest, VisibleRowsGetTheirDetails) {
  for (int i = 0; i < 300; ++i) folder_.write("file " + std::to_string(i), std::string(2500, 'x'));
  open();
  const auto detailsOf = [&](const std::string& name) {
    FolderItem* item = view_->model().liveItem(name);
    return item && item->details ? item->details->secondLine : std::string();
  };
  EXPECT_TRUE(waitUntil([&] { return !detailsOf("file 0").empty(); }));
  EXPECT_NE(detailsOf("file 0").find("3 KB"), std::string::npos);
  EXPECT_EQ(detailsOf("file 299"), "");
  folder_.write("file 0", "four");
  EXPECT_TRUE(waitUntil([&] { return detailsOf("file 0").find("4 bytes") != std::string::npos; }));
}

TEST_F(FolderViewTest, PressOpensAndSelectsWhileEditing) {
  folder_.write("a");
  folder_.write("b");
  open();
  g_signal_emit_by_name(list(), "activate", 1U);
  EXPECT_EQ(activated_, "b");
  activated_.clear();
  view_->setEditing(true);
  g_signal_emit_by_name(list(), "activate", 0U);
  EXPECT_EQ(activated_, "");
  EXPECT_EQ(view_->selection(), (std::vector<std::string>{"a"}));
  EXPECT_EQ(selectionChanges_, 1);
  g_signal_emit_by_name(list(), "activate", 0U);
  EXPECT_TRUE(view_->selection().empty());
  view_->setSelection({"b"});
  view_->setEditing(false);
  EXPECT_TRUE(view_->selection().empty());
  EXPECT_EQ(selectionChanges_, 2);
}

TEST_F(FolderViewTest, RowsAreSelectedByPlaceAndAllAtOnce) {
  for (int i = 0; i < 20; ++i) folder_.write("file " + std::to_string(i));
  open();
  GtkSelectionModel* model = view_->model().selectionModel();
  EXPECT_FALSE(gtk_selection_model_select_all(model));
  view_->setEditing(true);
  EXPECT_TRUE(gtk_selection_model_select_all(model));
  EXPECT_EQ(view_->model().selectedRows().size(), 20u);
  EXPECT_EQ(selectionChanges_, 1);
  view_->setSelectedRows({1, 2, 3, 7, 99});
  EXPECT_EQ(view_->selection(), (std::vector<std::string>{"file 1", "file 2", "file 3", "file 7"}));
  EXPECT_EQ(selectionChanges_, 1) << "not by the user";
}

TEST_F(FolderViewTest, EmptyUnreadableAndRemovedFoldersAreSaid) {
  open();
  EXPECT_TRUE(ADW_IS_STATUS_PAGE(shownPage()));
  EXPECT_STREQ(adw_status_page_get_title(ADW_STATUS_PAGE(shownPage())), "This folder is empty");
  folder_.write("file");
  ASSERT_TRUE(waitUntil([&] { return view_->itemCount() == 1; }));
  EXPECT_TRUE(GTK_IS_SCROLLED_WINDOW(shownPage()));
  std::filesystem::remove_all(folder_.path());
  EXPECT_TRUE(waitUntil([&] { return removed_; }));

  folder_.write("file");
  view_->setFolder(folder_.path());
  EXPECT_TRUE(waitUntil([&] { return error_ != 0; }));
  EXPECT_EQ(error_, ENOENT);
  EXPECT_STREQ(adw_status_page_get_title(ADW_STATUS_PAGE(shownPage())), "This folder can’t be read");
}

TEST_F(FolderViewTest, GridShowsTheSameRows) {
  for (int i = 0; i < 50; ++i) folder_.write("file " + std::to_string(i));
  open();
  view_->setSelection({"file 3"});
  view_->setMode(FolderView::Mode::Grid);
  EXPECT_TRUE(GTK_IS_GRID_VIEW(list()));
  EXPECT_EQ(view_->selection(), (std::vector<std::string>{"file 3"}));
  EXPECT_TRUE(waitUntil([&] {
    FolderItem* item = view_->model().liveItem("file 0");
    return item && item->details;
  }));
}

TEST_F(FolderViewTest, RowsFillANarrowWindowAndStandInTheMiddleOfAWideOne) {
  folder_.write("file");
  open();
  const auto place = [this] {
    graphene_rect_t bounds;
    return gtk_widget_compute_bounds(list(), view_->widget(), &bounds) ? bounds : *graphene_rect_zero();
  };
  gtk_widget_set_size_request(view_->widget(), 600, 400);
  EXPECT_TRUE(waitUntil([&] { return place().size.width == 600; })) << place().size.width;
  gtk_widget_set_size_request(view_->widget(), 1200, 400);
  EXPECT_TRUE(waitUntil([&] { return place().size.width == 840; })) << place().size.width;
  EXPECT_EQ(place().origin.x, 180);
}

TEST_F(FolderViewTest, ScrollsToRowsFarAway) {
  for (int i = 0; i < 1000; ++i) folder_.write("file " + std::to_string(i));
  open();
  const auto shown = [&](const std::string& name) {
    FolderItem* item = view_->model().liveItem(name);
    graphene_rect_t bounds;
    return item && item->row && gtk_widget_compute_bounds(item->row, list(), &bounds) && bounds.origin.y >= 0 &&
           bounds.origin.y + bounds.size.height <= static_cast<float>(gtk_widget_get_height(list()));
  };
  ASSERT_TRUE(waitUntil([&] { return shown("file 0"); }));
  for (const char* name : {"file 777", "file 12", "file 999", "file 0"}) {
    ASSERT_TRUE(view_->scrollTo(name));
    EXPECT_TRUE(waitUntil([&] { return shown(name); })) << name;
  }
  EXPECT_FALSE(view_->scrollTo("nothing"));
}

TEST_F(FolderViewTest, SuppliedEntriesReplaceTheFolder) {
  folder_.write("file");
  open();
  view_->setEntries({{"Library", "/nowhere/one", EntryKind::Folder, ""}, {"Alpha", "/nowhere/two", EntryKind::Folder, ""}});
  EXPECT_EQ(names(), (std::vector<std::string>{"/nowhere/one", "/nowhere/two"}));
  g_signal_emit_by_name(list(), "activate", 1U);
  EXPECT_EQ(activated_, "/nowhere/two");
}

TEST_F(FolderViewTest, TheKeyboardComesToTheFirstRowWhenItIsThere) {
  folder_.write("a");
  folder_.write("b");
  view_->grabFocusWhenLoaded();
  open();
  EXPECT_EQ(focusedRow(), "a");
}

TEST_F(FolderViewTest, TheKeyboardStaysWhereTheUserTookItMeanwhile) {
  GtkWidget* elsewhere = addEntry();
  folder_.write("a");
  view_->grabFocusWhenLoaded();
  gtk_widget_grab_focus(elsewhere);
  open();
  EXPECT_EQ(focusedRow(), "");
  // The next one to come is no reason either.
  folder_.write("b");
  ASSERT_TRUE(waitUntil([&] { return view_->itemCount() == 2; }));
  EXPECT_EQ(focusedRow(), "");
}

TEST_F(FolderViewTest, TheKeyboardStaysInTheListWhenItsRowGoes) {
  for (const char* name : {"a", "b", "c"}) folder_.write(name);
  view_->grabFocusWhenLoaded();
  open();
  folder_.remove("a");
  ASSERT_TRUE(waitUntil([&] { return view_->itemCount() == 2; }));
  EXPECT_EQ(focusedRow(), "b");
}

TEST_F(FolderViewTest, TheKeyboardGoesWithAnItemThatGetsAnotherName) {
  for (const char* name : {"a", "b", "c"}) folder_.write(name);
  view_->grabFocusWhenLoaded();
  open();
  view_->itemMoved(folder_.path() + "/a", folder_.path() + "/z");
  folder_.write("z");
  folder_.remove("a");
  EXPECT_TRUE(waitUntil([&] { return focusedRow() == "z"; })) << focusedRow();
}

TEST_F(FolderViewTest, AnEmptyFolderKeepsTheKeyboardForTheFirstItem) {
  view_->grabFocusWhenLoaded();
  open();
  folder_.write("a");
  EXPECT_TRUE(waitUntil([&] { return focusedRow() == "a"; })) << focusedRow();
}

TEST_F(FolderViewTest, TheKeyboardComesBackToTheRowAtItsPlaceWhenThatWentMeanwhile) {
  GtkWidget* elsewhere = addEntry();
  for (const char* name : {"a", "b", "c"}) folder_.write(name);
  view_->grabFocusWhenLoaded();
  open();
  view_->setKeyboardItem(folder_.path() + "/b");
  view_->setKeyboardItem("/elsewhere/c");
  gtk_widget_grab_focus(elsewhere);
  folder_.remove("b");
  ASSERT_TRUE(waitUntil([&] { return view_->itemCount() == 2; }));
  EXPECT_EQ(focusedRow(), "");
  view_->grabFocus();
  EXPECT_TRUE(waitUntil([&] { return focusedRow() == "c"; })) << focusedRow();
}

TEST_F(FolderViewTest, TabLeavesTheListAtOnce) {
  GtkWidget* elsewhere = addEntry();
  for (int i = 0; i < 20; ++i) folder_.write("file " + std::to_string(i));
  open();
  view_->grabFocus();
  ASSERT_EQ(focusedRow(), "file 0");
  EXPECT_TRUE(key(GDK_KEY_Tab));
  GtkWidget* focus = gtk_window_get_focus(GTK_WINDOW(window_));
  ASSERT_NE(focus, nullptr);
  EXPECT_TRUE(gtk_widget_is_ancestor(focus, elsewhere));
  EXPECT_FALSE(key(GDK_KEY_Tab)) << "which is no longer the list's";
}

TEST_F(FolderViewTest, WhoTypesANameSeesWhereTheKeyboardIs) {
  for (const char* name : {"alpha", "beta"}) folder_.write(name);
  open();
  view_->grabFocus();
  // As after a press or a tap.
  gtk_window_set_focus_visible(GTK_WINDOW(window_), FALSE);
  EXPECT_TRUE(key(GDK_KEY_b));
  EXPECT_TRUE(gtk_window_get_focus_visible(GTK_WINDOW(window_)));
}

TEST_F(FolderViewTest, GoesAwayWhileReading) {
  for (int i = 0; i < 1000; ++i) folder_.write("file " + std::to_string(i));
  view_->setFolder(folder_.path());
  gtk_window_destroy(GTK_WINDOW(window_));
  window_ = nullptr;
  view_.reset();
  // Another reading of the folder ends later than the one that nobody waits for any longer.
  bool later = false;
  Worker worker;
  worker.run([&later, path = folder_.path()]() -> std::function<void()> {
    readFolder(path);
    return [&later] { later = true; };
  });
  EXPECT_TRUE(waitUntil([&] { return later; }));
}

TEST(TypeAhead, FindsBeginnings) {
  FolderSnapshot::Draft draft;
  for (const char* name : {"Alpha", "alpine", "beta", "\u00c9tude", "\u4e2d\u6587", "Zebra"})
    draft.add(name, EntryKind::Document);
  FolderModel model;
  model.setSnapshot(FolderSnapshot::sorted(std::move(draft)));
  const auto typed = [&](const std::string& letters, std::size_t from) {
    TypeAhead typeAhead;
    std::optional<std::size_t> found;
    for (std::size_t i = 0; i < letters.size();) {
      const auto length = static_cast<std::size_t>(g_utf8_next_char(letters.c_str() + i) - (letters.c_str() + i));
      found = typeAhead.type(model, letters.substr(i, length), 1000, from);
      if (found) from = *found;
      i += length;
    }
    return found ? std::string(model.nameAt(*found)) : std::string();
  };
  const std::size_t last = model.itemCount() - 1;
  EXPECT_EQ(typed("a", last), "Alpha");
  EXPECT_EQ(typed("ALPI", last), "alpine");
  EXPECT_EQ(typed("aa", last), "alpine");
  EXPECT_EQ(typed("z", last), "Zebra");
  EXPECT_EQ(typed("\u00e9t", last), "\u00c9tude");
  EXPECT_EQ(typed("\u4e2d", last), "\u4e2d\u6587");
  EXPECT_EQ(typed("q", last), "");
}

}  // namespace
}  // namespace vaelo
