// SPDX-License-Identifier: GPL-3.0-or-later
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include "host/gtk/folder_search.h"
#include "host/gtk/list/folder_view.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

using list_test::TestFolder;
using list_test::waitUntil;

/// A view in a window, where there is a display.
class BadInputListTest : public testing::Test {
 protected:
  void SetUp() override {
    if (!gtk_init_check()) GTEST_SKIP() << "no display";
    adw_init();
    view_ = std::make_unique<FolderView>();
    FolderViewEvents events;
    events.readFailed = [this](int error) { error_ = error; };
    events.refreshWanted = [this] { ++refreshes_; };
    view_->setEvents(std::move(events));
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

  std::string shownText(bool description) const {
    GtkWidget* page = gtk_stack_get_visible_child(GTK_STACK(view_->widget()));
    if (!ADW_IS_STATUS_PAGE(page)) return "";
    const char* text = description ? adw_status_page_get_description(ADW_STATUS_PAGE(page))
                                   : adw_status_page_get_title(ADW_STATUS_PAGE(page));
    return text ? text : "";
  }
  GtkWidget* firstRow() const {
    GtkWidget* scroller = gtk_stack_get_visible_child(GTK_STACK(view_->widget()));
    GtkWidget* clamp =
        GTK_IS_SCROLLED_WINDOW(scroller) ? gtk_scrolled_window_get_child(GTK_SCROLLED_WINDOW(scroller)) : nullptr;
    GtkWidget* list = clamp ? adw_clamp_scrollable_get_child(ADW_CLAMP_SCROLLABLE(clamp)) : nullptr;
    GtkWidget* item = list ? gtk_widget_get_first_child(list) : nullptr;
    return item ? gtk_widget_get_first_child(item) : nullptr;
  }

  TestFolder folder_;
  GtkWidget* window_ = nullptr;
  std::unique_ptr<FolderView> view_;
  int error_ = 0;
  int refreshes_ = 0;
};

TEST_F(BadInputListTest, AFolderThatCanBeReadAgainIsFollowedAgain) {
  const std::string path = folder_.path() + "/later";
  view_->setFolder(path);
  ASSERT_TRUE(waitUntil([&] { return error_ == ENOENT; }));
  EXPECT_EQ(shownText(false), "This folder can’t be read");
  EXPECT_EQ(shownText(true), "It is no longer there.");
  folder_.makeFolder("later");
  view_->refresh();
  ASSERT_TRUE(waitUntil([&] { return shownText(false) == "This folder is empty"; }));
  folder_.write("later/appeared");
  EXPECT_TRUE(waitUntil([&] { return view_->itemCount() == 1; }));
}

TEST_F(BadInputListTest, EachReasonHasItsWords) {
  for (const auto& [number, words] :
       {std::pair(EACCES, std::string("You don’t have permission to see its items.")),
        std::pair(EPERM, std::string("You don’t have permission to see its items.")),
        std::pair(ENOTDIR, std::string("It is no longer there.")),
        std::pair(ELOOP, std::string("The links to it lead in a circle.")), std::pair(EIO, std::string(g_strerror(EIO)))}) {
    view_->setUnreadable(number);
    EXPECT_EQ(shownText(false), "This folder can’t be read");
    EXPECT_EQ(shownText(true), words);
  }
  view_->refresh();
  EXPECT_EQ(refreshes_, 1);
  view_->setEntries({});
  EXPECT_EQ(shownText(false), "This folder is empty");
}

TEST_F(BadInputListTest, AFolderBehindACircleOfLinksSaysSo) {
  ASSERT_EQ(symlink("b", (folder_.path() + "/a").c_str()), 0);
  ASSERT_EQ(symlink("a", (folder_.path() + "/b").c_str()), 0);
  view_->setFolder(folder_.path() + "/a");
  ASSERT_TRUE(waitUntil([&] { return error_ == ELOOP; }));
  EXPECT_EQ(shownText(true), "The links to it lead in a circle.");
}

// A press on a link to another folder replaces the whole stack while GTK still holds on to the row that was pressed.
TEST_F(BadInputListTest, ARowThatOutlivesItsListShowsNothing) {
  folder_.write("file");
  view_->setFolder(folder_.path());
  ASSERT_TRUE(waitUntil([&] { return firstRow() != nullptr; }));
  GtkWidget* row = GTK_WIDGET(g_object_ref(firstRow()));
  gtk_window_set_child(GTK_WINDOW(window_), nullptr);
  view_.reset();
  EXPECT_EQ(folderRowItem(row), nullptr);
  g_object_unref(row);
}

TEST_F(BadInputListTest, ASearchTellsWhatItPassesOverAndEnds) {
  folder_.makeFolder("inner");
  folder_.write("inner/wanted");
  ASSERT_EQ(symlink(".", (folder_.path() + "/inner/wanted circle").c_str()), 0);
  FolderSearch search;
  std::vector<FolderEntry> found;
  std::vector<std::pair<std::string, std::string>> unreadable;
  bool finished = false;
  search.start({{folder_.path() + "/gone", ""}, {folder_.path(), ""}}, "wanted", [&](const FolderSearch::Report& report) {
    found = report.entries;
    unreadable.insert(unreadable.end(), report.unreadable.begin(), report.unreadable.end());
    finished = report.finished;
  });
  ASSERT_TRUE(waitUntil([&] { return finished; }));
  EXPECT_EQ(found.size(), 2u);
  ASSERT_EQ(unreadable.size(), 1u);
  EXPECT_EQ(unreadable[0].first, folder_.path() + "/gone");
  EXPECT_EQ(unreadable[0].second, g_strerror(ENOENT));
}

}  // namespace
}  // namespace vaelo
