// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/name_search.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {

namespace {

class DesktopSearchTest : public drive_test::DriveTest {
 protected:
  std::vector<std::string> find(const std::vector<std::string>& terms, std::size_t most = 20) {
    std::vector<std::string> names;
    for (const SearchHit& hit :
         NameSearch(terms).run({{root + "/a", ""}, {root + "/b", "Sketchbook"}}, most, budget, stopped)) {
      names.push_back(hit.path.substr(root.size() + 1));
    }
    return names;
  }
  using Names = std::vector<std::string>;
  std::chrono::milliseconds budget{10000};
  std::atomic<bool> stopped = false;
};

TEST_F(DesktopSearchTest, TheBestComeFirst) {
  for (const char* name :
       {"a/deep/er/plan", "a/The plan.txt", "a/plan b.txt", "a/explanation.txt", "a/other.txt", "b/plan"}) {
    write(root + "/" + name, "x");
  }
  EXPECT_EQ(find({"plan"}), (Names{"b/plan", "a/deep/er/plan", "a/plan b.txt", "a/The plan.txt", "a/explanation.txt"}));
  EXPECT_EQ(find({"plan"}, 2), (Names{"b/plan", "a/deep/er/plan"}));
}

TEST_F(DesktopSearchTest, AllTermsAreToBeFoundInAnyOrderWithoutRegardToCaseAndAccents) {
  write(root + "/a/Café Menü 2026.txt", "x");
  write(root + "/a/Cafe 2025.txt", "x");
  EXPECT_EQ(find({"MENU", "cafe"}), (Names{"a/Café Menü 2026.txt"}));
  EXPECT_EQ(find({"CAFÉ"}).size(), 2u);
}

TEST_F(DesktopSearchTest, ALibraryIsFoundByItsName) {
  write(root + "/b/Owl.png", "x");
  EXPECT_EQ(find({"sketch"}), (Names{"b"}));
}

TEST_F(DesktopSearchTest, ItemsNotDownloadedAreFoundUnderTheirNameAndHiddenOnesNever) {
  write(root + "/a/.Thesis.pdf.vlopromise", "[Promise]\nName=Thesis.pdf\n");
  write(root + "/a/.secret thesis", "x");
  EXPECT_EQ(find({"thesis"}), (Names{"a/Thesis.pdf"}));
  EXPECT_EQ(find({"vlopromise"}), Names{});
}

TEST_F(DesktopSearchTest, LinksToFoldersAreNotFollowed) {
  write(root + "/a/inner/Found.txt", "x");
  std::filesystem::create_directory_symlink(root + "/a", root + "/a/inner/circle");
  EXPECT_EQ(find({"found"}), (Names{"a/inner/Found.txt"}));
}

TEST_F(DesktopSearchTest, OddTermsFindNothing) {
  write(root + "/a/x", "x");
  for (const Names& terms : {Names{}, Names{""}, Names{std::string(5000, 'x')}, Names(1000, "x"), Names{"\xff\xfe"}}) {
    EXPECT_EQ(find(terms), Names{});
  }
}

TEST_F(DesktopSearchTest, EndsWhenItIsStoppedOrItsTimeIsUp) {
  write(root + "/a/plan", "x");
  stopped = true;
  EXPECT_EQ(find({"plan"}), Names{});
  stopped = false;
  budget = std::chrono::milliseconds(0);
  EXPECT_EQ(find({"plan"}), Names{});
}

}  // namespace

}  // namespace vaelo
