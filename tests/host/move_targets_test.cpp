// SPDX-License-Identifier: GPL-3.0-or-later
// Where items may move to, as the picker of folders offers it.
#include "host/gtk/move_targets.h"

#include <gmock/gmock.h>

#include "tests/host/platform_fixture.h"

namespace vaelo::drive_test {

namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::UnorderedElementsAre;

class MoveTargetsTest : public PlatformTest {
 protected:
  void addLibrary(const std::string& identifier, const std::string& manifest) {
    makeFolder(mirror + "/" + identifier + "/Documents");
    write(mirror + "/" + identifier + "/.vaelo-container", "[Container]\n" + manifest);
  }
  MoveTarget look(const std::string& folder, const std::vector<std::string>& items, bool libraries = false) {
    std::vector<URL> urls;
    for (const std::string& item : items) urls.emplace_back(item);
    return moveTargetAt(URL(folder, true), urls, libraries, platform.drive());
  }
  static std::vector<std::string> titles(const MoveTarget& target) {
    std::vector<std::string> found;
    for (const FolderEntry& entry : target.folders) found.push_back(entry.displayName);
    return found;
  }
  const std::string notes = mirror + "/org~example~Notes/Documents";
};

TEST_F(MoveTargetsTest, TheWayLeadsThroughFoldersButNotThoseThatMove) {
  makeFolder(drive + "/Plans");
  makeFolder(drive + "/Trips/Rome");
  makeFolder(drive + "/.hidden");
  makeFolder(drive + "/Drawing.sketchbundle");
  write(drive + "/a.txt");
  const MoveTarget target = look(drive, {drive + "/Trips", drive + "/a.txt"});
  EXPECT_THAT(titles(target), ElementsAre("Plans"));
  EXPECT_EQ(target.folders.front().path, drive + "/Plans");
  EXPECT_THAT(titles(look(drive, {drive + "/a.txt"})), ElementsAre("Plans", "Trips"));
}

TEST_F(MoveTargetsTest, OtherLibrariesAreOfferedWhereTheyMayBe) {
  addLibrary("org~example~Notes", "Name=Notes\n");
  addLibrary("org~example~Sketches", "Name=Sketches\n");
  write(drive + "/a.txt");
  EXPECT_THAT(titles(look(drive, {drive + "/a.txt"})), IsEmpty());
  const MoveTarget target = look(drive, {drive + "/a.txt"}, true);
  EXPECT_THAT(titles(target), UnorderedElementsAre("Notes", "Sketches"));
  EXPECT_EQ(target.folders.front().path, notes);
}

TEST_F(MoveTargetsTest, WhatIsHereAlreadyStays) {
  write(drive + "/a.txt");
  write(drive + "/b.txt");
  write(drive + "/Plans/c.txt");
  EXPECT_EQ(look(drive, {drive + "/a.txt"}).refusal, "The item is in this folder already.");
  EXPECT_EQ(look(drive, {drive + "/a.txt", drive + "/b.txt"}).refusal, "The items are in this folder already.");
  EXPECT_EQ(look(drive, {drive + "/a.txt", drive + "/Plans/c.txt"}).refusal, "") << "one of them would move";
  EXPECT_EQ(look(drive + "/Plans", {drive + "/a.txt"}).refusal, "");
}

TEST_F(MoveTargetsTest, AFolderIsNoTargetOfItself) {
  makeFolder(drive + "/Plans/Deep");
  for (const char* inside : {"/Plans", "/Plans/Deep"}) {
    EXPECT_EQ(look(drive + inside, {drive + "/Plans"}).refusal, "A folder can’t be moved into itself.") << inside;
  }
  makeFolder(drive + "/Plans 2");
  EXPECT_EQ(look(drive + "/Plans 2", {drive + "/Plans"}).refusal, "");
}

TEST_F(MoveTargetsTest, ALibraryTakesItsTypesOfDocuments) {
  addLibrary("org~example~Notes", "Name=Notes\nDocumentTypes=public.plain-text;\n");
  write(drive + "/a.txt");
  write(drive + "/a.png");
  EXPECT_EQ(look(notes, {drive + "/a.txt"}).refusal, "");
  EXPECT_EQ(look(notes, {drive + "/a.txt", drive + "/a.png"}).refusal, "This library doesn’t take documents of this type.");
}

TEST_F(MoveTargetsTest, ALibraryTakesFoldersAsDeepAsItSays) {
  makeFolder(drive + "/Trips");
  write(drive + "/a.txt");
  struct Case {
    const char* levels;
    bool atTop;
    bool deeper;
  };
  for (const Case& each : {Case{"None", false, false}, Case{"One", true, false}, Case{"Any", true, true}}) {
    addLibrary("org~example~Notes", std::string("Name=Notes\nFolderLevels=") + each.levels + "\n");
    makeFolder(notes + "/Folder");
    const std::string places[] = {notes, notes + "/Folder"};
    for (const std::string& place : places) {
      const bool takes = place == notes ? each.atTop : each.deeper;
      const MoveTarget target = look(place, {drive + "/Trips"});
      EXPECT_EQ(target.refusal, takes ? "" : "This library doesn’t take folders here.") << each.levels << place;
      EXPECT_EQ(target.takesFolders, takes) << each.levels << place;
      EXPECT_EQ(look(place, {drive + "/a.txt"}).refusal, "") << "documents may go there";
    }
  }
}

TEST_F(MoveTargetsTest, WhatIsNoFolderOfTheDriveTakesNothing) {
  write(drive + "/a.txt");
  makeFolder(root + "/elsewhere");
  const MoveTarget elsewhere = look(root + "/elsewhere", {drive + "/a.txt"});
  EXPECT_EQ(elsewhere.refusal, "This folder can’t be used.");
  EXPECT_FALSE(elsewhere.takesFolders);
  const MoveTarget gone = look(drive + "/gone", {drive + "/a.txt"});
  EXPECT_EQ(gone.refusal, "This folder can’t be read: No such file or directory");
  EXPECT_THAT(gone.folders, IsEmpty());
  EXPECT_FALSE(gone.takesFolders);
}

TEST_F(MoveTargetsTest, ALinkThatLeadsToTheFolderItselfMovesNothing) {
  makeFolder(drive + "/Plans");
  std::filesystem::create_directory_symlink(drive + "/Plans", drive + "/Link");
  // The way may lead there under another name; the move itself refuses.
  const auto error = platform.fileManager().moveItemAtURL(URL(drive + "/Plans"), URL(drive + "/Link/Plans"));
  ASSERT_TRUE(error);
  EXPECT_TRUE(exists(drive + "/Plans"));
}

}  // namespace

}  // namespace vaelo::drive_test
