// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/file_utils.h"
#include "tests/host/platform_fixture.h"

namespace vaelo {

namespace {

/// On the whole platform, since moves come from all over the application.
class FilesHistoryTest : public drive_test::PlatformTest {
 protected:
  FilesHistoryTest() {
    platform.moves().setOffer([this](const auto& batch) { offers.push_back(batch); });
    write(drive + "/a", "a");
    write(drive + "/b", "b");
    makeFolder(drive + "/Folder");
  }
  void move(const std::string& from, const std::string& to) {
    EXPECT_FALSE(FileUtils::moveTo(URL(drive + from), URL(drive + to)));
  }

  std::vector<std::shared_ptr<const MoveHistory::Batch>> offers;
};

TEST_F(FilesHistoryTest, WhatMovesInOneGoIsOfferedAndMovedBackTogether) {
  move("/a", "/Folder/a");
  move("/b", "/Folder/b");
  EXPECT_TRUE(offers.empty());
  runMainLoop();
  ASSERT_EQ(offers.size(), 1u);
  ASSERT_EQ(offers[0]->size(), 2u);
  EXPECT_TRUE(platform.moves().undo(*offers[0]).empty());
  EXPECT_EQ(read(drive + "/a"), "a");
  EXPECT_EQ(read(drive + "/b"), "b");
  EXPECT_FALSE(exists(drive + "/Folder/a"));
  runMainLoop();
  EXPECT_EQ(offers.size(), 1u) << "moving back is no move to be taken back";
}

TEST_F(FilesHistoryTest, AMoveThatFailsIsNotOffered) {
  EXPECT_TRUE(FileUtils::moveTo(URL(drive + "/a"), URL(drive + "/b")));
  runMainLoop();
  EXPECT_TRUE(offers.empty());
}

TEST_F(FilesHistoryTest, MovesUponEachOtherAreTakenBackInTurn) {
  move("/a", "/Folder/a");
  move("/b", "/a");
  runMainLoop();
  EXPECT_TRUE(platform.moves().undo(*offers.at(0)).empty());
  EXPECT_EQ(read(drive + "/a"), "a");
  EXPECT_EQ(read(drive + "/b"), "b");
}

TEST_F(FilesHistoryTest, APlaceThatIsTakenMeanwhileIsNotReplaced) {
  move("/a", "/Folder/a");
  move("/b", "/Folder/b");
  runMainLoop();
  write(drive + "/a", "another");
  const std::vector<Error> errors = platform.moves().undo(*offers.at(0));
  ASSERT_EQ(errors.size(), 1u);
  EXPECT_EQ(errors[0].code, FileErrorCode::WriteFileExists);
  EXPECT_EQ(read(drive + "/a"), "another");
  EXPECT_EQ(read(drive + "/Folder/a"), "a");
  EXPECT_EQ(read(drive + "/b"), "b");
}

TEST_F(FilesHistoryTest, AnotherItemInThePlaceOfTheMovedOneStays) {
  move("/a", "/Folder/a");
  runMainLoop();
  write(root + "/new", "new");
  std::filesystem::rename(root + "/new", drive + "/Folder/a");
  EXPECT_EQ(platform.moves().undo(*offers.at(0)).size(), 1u);
  EXPECT_EQ(read(drive + "/Folder/a"), "new");
  EXPECT_FALSE(exists(drive + "/a"));
  std::filesystem::remove(drive + "/Folder/a");
  EXPECT_EQ(platform.moves().undo(*offers.at(0)).size(), 1u) << "nothing is there any more";
}

}  // namespace

}  // namespace vaelo
