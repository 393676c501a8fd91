// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/folder_search.h"

#include <gtest/gtest.h>

#include <map>

#include "tests/host/list_test_folder.h"

namespace vaelo {

namespace {

using list_test::TestFolder;
using list_test::waitUntil;

class FolderSearchTest : public ::testing::Test {
 protected:
  /// Where each item that is found lies, by its path below the folder.
  std::map<std::string, std::string> found(const std::string& query, const std::string& name = "") {
    std::map<std::string, std::string> places;
    bool finished = false;
    FolderSearch search;
    search.start({{folder_.path(), name}}, query, [&](const FolderSearch::Report& report) {
      for (const FolderEntry& entry : report.entries) {
        places[entry.path.substr(std::min(entry.path.size(), folder_.path().size() + 1))] = entry.place;
      }
      finished = report.finished;
    });
    EXPECT_TRUE(waitUntil([&] { return finished; }));
    return places;
  }

  TestFolder folder_;
};

using Places = std::map<std::string, std::string>;

TEST_F(FolderSearchTest, EachItemIsToldWithTheFoldersThatLeadToIt) {
  folder_.makeFolder("Plans");
  folder_.makeFolder("Plans/Beds");
  folder_.write("dill");
  folder_.write("Plans/dill");
  folder_.write("Plans/Beds/dill.txt");
  EXPECT_EQ(found("DILL"), (Places{{"dill", ""},
                                   {"Plans/dill", "\u2068Plans\u2069"},
                                   {"Plans/Beds/dill.txt", "\u2068Plans\u2069 ▸ \u2068Beds\u2069"}}));
  EXPECT_EQ(found("beds"), (Places{{"Plans/Beds", "\u2068Plans\u2069"}}));
}

TEST_F(FolderSearchTest, AFolderThatHasANameIsFoundByItAndIsAPlace) {
  folder_.write("Sketch of a sketch");
  EXPECT_EQ(found("sketch", "Sketchbook"), (Places{{"", ""}, {"Sketch of a sketch", "\u2068Sketchbook\u2069"}}));
  EXPECT_EQ(found("sketch of", "Sketchbook"), (Places{{"Sketch of a sketch", "\u2068Sketchbook\u2069"}}));
}

}  // namespace

}  // namespace vaelo
