// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/drive_layout.h"

#include "tests/host/drive_test_support.h"

namespace vaelo::drive_test {

class DriveLayoutTest : public DriveTest {
 protected:
  DriveLayoutTest() {
    makeFolder(drive + "/Folder");
    makeFolder(mirror + "/.Trash");
    makeFolder(mirror + "2/Folder");
    makeFolder(root + "/outside");
    write(drive + "/Folder/note.txt");
  }
  DriveLayout layout{data};
};

TEST_F(DriveLayoutTest, PlainPathsAreToldApart) {
  EXPECT_TRUE(layout.isInMirror(mirror));
  EXPECT_TRUE(layout.isInMirror(drive + "/Folder/note.txt"));
  EXPECT_TRUE(layout.isInMirror(drive + "/not there/at all"));
  EXPECT_FALSE(layout.isInMirror(data));
  EXPECT_FALSE(layout.isInMirror("/"));
  EXPECT_EQ(layout.relativeToMirror(mirror), "");
  EXPECT_EQ(layout.relativeToMirror(drive + "/Desktop"), "com~marrow~Kestrel/Desktop");
  EXPECT_EQ(layout.relativeToMirror(root), std::nullopt);
}

TEST_F(DriveLayoutTest, LookAlikePrefixesAreOutside) {
  EXPECT_FALSE(layout.isInMirror(mirror + "2/Folder"));
  EXPECT_FALSE(layout.isInMirror(mirror + "2"));
  EXPECT_FALSE(layout.isInMirror(mirror + "/../mirror2"));
  EXPECT_FALSE(layout.isInTrash(mirror + "/.Trash2/a"));
  EXPECT_FALSE(layout.isInTrash(mirror + "/.Trashes"));
}

TEST_F(DriveLayoutTest, PathsThatAreNoPathsAreOutside) {
  EXPECT_FALSE(layout.isInMirror(""));
  EXPECT_FALSE(layout.isInMirror("mirror/com~marrow~Kestrel"));
  EXPECT_FALSE(layout.isInMirror(drive + std::string("/a\0/../../../..", 15)));
}

TEST_F(DriveLayoutTest, ClimbingPathsLeaveTheMirror) {
  EXPECT_FALSE(layout.isInMirror(drive + "/../../../outside"));
  EXPECT_FALSE(layout.isInMirror(drive + "/missing/../../../../outside"));
  EXPECT_TRUE(layout.isInMirror(root + "/outside/../data/mirror/x"));
  EXPECT_EQ(layout.relativeToMirror(drive + "/./Folder/../missing/../b"), "com~marrow~Kestrel/b");
}

TEST_F(DriveLayoutTest, LinksThatLeaveTheMirrorAreFollowed) {
  link(root + "/outside", drive + "/absolute");
  link("../../../outside", drive + "/relative");
  EXPECT_FALSE(layout.isInMirror(drive + "/absolute"));
  EXPECT_FALSE(layout.isInMirror(drive + "/absolute/new file"));
  EXPECT_FALSE(layout.isInMirror(drive + "/relative/x/y"));
  // The link is met only once the ".." before it is gone.
  EXPECT_FALSE(layout.isInMirror(drive + "/missing/../absolute/x"));
  // ".." after a link climbs from where the link leads.
  EXPECT_EQ(realLocation(drive + "/absolute/../data"), data);
}

TEST_F(DriveLayoutTest, ALinkToNowhereLeadsToWhereItSays) {
  link(root + "/not yet", drive + "/dangling");
  EXPECT_EQ(realLocation(drive + "/dangling"), root + "/not yet");
  EXPECT_FALSE(layout.isInMirror(drive + "/dangling"));
}

TEST_F(DriveLayoutTest, LinksIntoTheMirrorCount) {
  link(drive, root + "/outside/shortcut");
  EXPECT_EQ(layout.relativeToMirror(root + "/outside/shortcut/Folder"), "com~marrow~Kestrel/Folder");
}

TEST_F(DriveLayoutTest, LinksInACircleStayWhereTheyAre) {
  link("b", drive + "/a");
  link("a", drive + "/b");
  link("self/self", drive + "/self");
  EXPECT_EQ(realLocation(drive + "/a"), drive + "/a");
  EXPECT_EQ(realLocation(drive + "/a/x"), drive + "/a/x");
  EXPECT_TRUE(layout.isInMirror(drive + "/self"));
}

TEST_F(DriveLayoutTest, TheTrashIsFoundThroughLinks) {
  EXPECT_TRUE(layout.isInTrash(mirror + "/.Trash"));
  EXPECT_TRUE(layout.isInTrash(mirror + "/.Trash/a"));
  EXPECT_FALSE(layout.isInTrash(drive + "/.Trash/a"));
  EXPECT_FALSE(layout.isInTrash(mirror + "/.Trash/../com~marrow~Kestrel"));
  link(mirror + "/.Trash", drive + "/bin");
  EXPECT_TRUE(layout.isInTrash(drive + "/bin/a"));
}

TEST_F(DriveLayoutTest, ADataFolderBehindALinkIsTheSameDrive) {
  link(data, root + "/other");
  const DriveLayout other(root + "/other");
  EXPECT_EQ(other.mirrorRoot(), mirror);
  EXPECT_TRUE(other.isInMirror(root + "/other/mirror/x"));
  EXPECT_TRUE(other.isInMirror(drive));
}

TEST_F(DriveLayoutTest, TheContainerIsTheFirstVisibleFolder) {
  EXPECT_EQ(layout.containerOf(drive), "com~marrow~Kestrel");
  EXPECT_EQ(layout.containerOf(drive + "/Folder/note.txt"), "com~marrow~Kestrel");
  EXPECT_EQ(layout.containerOf(mirror), std::nullopt);
  EXPECT_EQ(layout.containerOf(mirror + "/.Trash/a"), std::nullopt);
  EXPECT_EQ(layout.containerOf(root), std::nullopt);
}

}  // namespace vaelo::drive_test
