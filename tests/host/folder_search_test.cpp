// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/folder_search.h"

#include <gtest/gtest.h>

#include <map>
#include <set>

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
    order_.clear();
    FolderSearch search;
    search.start({{folder_.path(), name}}, query, [&](const FolderSearch::Report& report) {
      order_.clear();
      for (const FolderEntry& entry : report.entries) {
        order_.push_back(entry.path.substr(std::min(entry.path.size(), folder_.path().size() + 1)));
        places[entry.path.substr(std::min(entry.path.size(), folder_.path().size() + 1))] = entry.place;
      }
      finished = report.finished;
    });
    EXPECT_TRUE(waitUntil([&] { return finished; }));
    return places;
  }

  TestFolder folder_;
  std::vector<std::string> order_;  // of what was found last
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

TEST_F(FolderSearchTest, WhatIsFoundStandsAsInAList) {
  folder_.makeFolder("Plans");
  folder_.makeFolder("Plans/Dill beds");
  folder_.write("Plans/dill 2");
  folder_.write("Plans/Dill 1");
  folder_.write("dill 10");
  folder_.write("Plans/Dill beds/dill 2");
  found("dill");
  EXPECT_EQ(order_, (std::vector<std::string>{"Plans/Dill beds", "Plans/Dill 1", "Plans/Dill beds/dill 2", "Plans/dill 2",
                                              "dill 10"}));
}

// Each report holds all of the earlier ones: that they come in order is worth nothing if some are lost or told twice.
TEST_F(FolderSearchTest, ManyComeInOrderAndOnce) {
  std::set<std::string> written;
  for (int folder = 0; folder < 20; ++folder) {
    const std::string path = "f" + std::to_string(folder);
    folder_.makeFolder(path);
    for (int i = 0; i < 100; ++i) {
      written.insert(path + "/dill " + std::to_string(i * 20 + folder));
      folder_.write(path + "/dill " + std::to_string(i * 20 + folder));
    }
  }
  found("dill");
  ASSERT_EQ(order_.size(), 2000U);
  EXPECT_EQ(std::set<std::string>(order_.begin(), order_.end()), written);
  for (int i = 0; i < 2000; ++i) {
    ASSERT_EQ(order_[static_cast<std::size_t>(i)].substr(order_[static_cast<std::size_t>(i)].find('/')),
              "/dill " + std::to_string(i));
  }
}

}  // namespace

}  // namespace vaelo
