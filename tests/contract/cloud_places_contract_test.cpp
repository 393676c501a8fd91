// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/contract/contract_test.h"

namespace vaelo::contract {
namespace {

/// Where an item is, and what stands for another: promises both ways, bookmarks.
class CloudPlacesContract : public ContractTest {
 protected:
  CloudDocuments& cloud() { return platform->cloud(); }
  URL inMirror(const std::string& path, bool isFolder = false) const {
    return URL(platform->mirror() + "/" + path, isFolder);
  }
};

VAELO_CONTRACT_SUITE(CloudPlacesContract);

TEST_P(CloudPlacesContract, TheMirrorHoldsItsRootTheContainersAndTheTrash) {
  platform->addFile(inMirror(".Trash/a").path());
  for (const URL& url :
       {inMirror(""), inDrive(""), inDrive("a/b"), inMirror(".Trash"), inMirror(".Trash/a"), inMirror("x")}) {
    EXPECT_TRUE(cloud().URLIsInDriveMirror(url)) << url.path();
  }
  for (const URL& url : {outside("a"), URL("/"), URL(platform->mirror()).deletingLastPathComponent()}) {
    EXPECT_FALSE(cloud().URLIsInDriveMirror(url)) << url.path();
  }
}

TEST_P(CloudPlacesContract, TheTrashIsTheTrashAlone) {
  platform->addFile(inMirror(".Trash/in/a").path());
  EXPECT_TRUE(cloud().URLIsInDriveTrash(inMirror(".Trash")));
  EXPECT_TRUE(cloud().URLIsInDriveTrash(inMirror(".Trash/in/a")));
  for (const URL& url : {inMirror(".Trash2/a"), inMirror(".Tras"), inDrive(".Trash/a"), inMirror(""), outside(".Trash/a")}) {
    EXPECT_FALSE(cloud().URLIsInDriveTrash(url)) << url.path();
  }
}

TEST_P(CloudPlacesContract, LookAlikePrefixesDoNotFool) {
  const URL beside(platform->mirror() + "-other/a");
  platform->addFile(beside.path());
  EXPECT_FALSE(cloud().URLIsInDriveMirror(beside));
  EXPECT_FALSE(cloud().pathRelativeToMirror(beside));
  platform->addFile(platform->drive() + "-other/a");
  EXPECT_NE(cloud().containerIdentifierForURL(URL(platform->drive() + "-other/a")), "com~marrow~Kestrel");
}

TEST_P(CloudPlacesContract, DotsDoNotFool) {
  platform->addFile(outside("a").path());
  EXPECT_FALSE(cloud().URLIsInDriveMirror(URL(platform->drive() + "/../../../outside/a")));
  EXPECT_TRUE(cloud().URLIsInDriveMirror(URL(platform->drive() + "/../.Trash/./a")));
  EXPECT_TRUE(cloud().URLIsInDriveTrash(URL(platform->drive() + "/../.Trash/./a")));
  EXPECT_FALSE(cloud().URLIsInDriveTrash(inMirror(".Trash/../com~marrow~Kestrel/a")));
}

TEST_P(CloudPlacesContract, LinksDoNotFool) {
  platform->addFile(outside("folder/a").path());
  platform->addFile(inDrive("real/a").path());
  platform->addLink(inDrive("out").path(), outside("folder").path());
  platform->addLink(outside("in").path(), inDrive("real").path());
  platform->addFolder(inMirror(".Trash").path());
  platform->addLink(inDrive("trash").path(), inMirror(".Trash").path());
  EXPECT_FALSE(cloud().URLIsInDriveMirror(inDrive("out/a")));
  EXPECT_FALSE(cloud().URLIsInDriveMirror(inDrive("out")));
  EXPECT_FALSE(cloud().pathRelativeToMirror(inDrive("out/a")));
  EXPECT_FALSE(cloud().containerIdentifierForURL(inDrive("out/a")));
  EXPECT_TRUE(cloud().URLIsInDriveMirror(outside("in/a")));
  EXPECT_EQ(cloud().pathRelativeToMirror(outside("in/a")), "com~marrow~Kestrel/real/a");
  EXPECT_EQ(cloud().containerIdentifierForURL(outside("in/a")), "com~marrow~Kestrel");
  EXPECT_TRUE(cloud().URLIsInDriveTrash(inDrive("trash/x")));
}

TEST_P(CloudPlacesContract, WhatDoesNotExistIsWhereItWouldBe) {
  EXPECT_TRUE(cloud().URLIsInDriveMirror(inDrive("no/such/item")));
  EXPECT_EQ(cloud().pathRelativeToMirror(inDrive("no/such")), "com~marrow~Kestrel/no/such");
  platform->addLink(inDrive("dangling").path(), outside("gone").path());
  EXPECT_FALSE(cloud().URLIsInDriveMirror(inDrive("dangling")));
  platform->addLink(inDrive("circle").path(), "circle");
  EXPECT_TRUE(cloud().URLIsInDriveMirror(inDrive("circle")));
}

TEST_P(CloudPlacesContract, PathsBelowTheMirrorBeginWithTheContainer) {
  EXPECT_EQ(cloud().pathRelativeToMirror(inMirror("")), "");
  EXPECT_EQ(cloud().pathRelativeToMirror(inDrive("")), "com~marrow~Kestrel");
  EXPECT_EQ(cloud().pathRelativeToMirror(inDrive("a b/c", true)), "com~marrow~Kestrel/a b/c");
  EXPECT_FALSE(cloud().pathRelativeToMirror(outside("a")));
}

TEST_P(CloudPlacesContract, TheRealPathHasItsLinksFollowed) {
  platform->addFile(inDrive("real/a").path());
  platform->addLink(inDrive("link").path(), "real");
  platform->addLink(inDrive("dangling").path(), "gone");
  platform->addLink(inDrive("circle").path(), "circle");
  EXPECT_EQ(cloud().realPathURL(inDrive("link/a")), inDrive("real/a"));
  EXPECT_EQ(cloud().realPathURL(inDrive("link/no/such")), inDrive("real/no/such"));
  EXPECT_EQ(cloud().realPathURL(inDrive("link/../real/./a")), inDrive("real/a"));
  EXPECT_EQ(cloud().realPathURL(inDrive("dangling/x")), inDrive("gone/x"));
  EXPECT_EQ(cloud().realPathURL(inDrive("circle")), inDrive("circle"));
  EXPECT_TRUE(cloud().realPathURL(inDrive("link", true)).hasDirectoryPath());
  const URL plain = inDrive("real/a");
  EXPECT_TRUE(cloud().realPathURL(plain).sameObject(plain));
}

// Promises.

TEST_P(CloudPlacesContract, APromiseLeadsToItsItemAndBack) {
  for (const std::string& name :
       {std::string("far.txt"), std::string("far"), std::string("a.vlopromise"), std::string(".far"),
        std::string("not\xffutf8"), std::string(235, 'y'), std::string(255, 'x')}) {
    const URL logical = inDrive(name);
    platform->addPromise(logical.path());
    const URL physical = cloud().physicalURL(logical);
    EXPECT_FALSE(physical == logical) << name;
    EXPECT_LE(physical.lastPathComponent().size(), 255u);
    EXPECT_EQ(physical.lastPathComponent().front(), '.');
    EXPECT_EQ(physical.deletingLastPathComponent(), inDrive(""));
    EXPECT_TRUE(cloud().isPromise(physical)) << name;
    EXPECT_EQ(cloud().logicalURLOfPromise(physical), logical) << name;
  }
}

TEST_P(CloudPlacesContract, LongNamesOfPromisesAreTold) {
  const URL one = inDrive(std::string(254, 'x') + "1"), two = inDrive(std::string(254, 'x') + "2");
  platform->addPromise(one.path());
  platform->addPromise(two.path());
  EXPECT_FALSE(cloud().physicalURL(one) == cloud().physicalURL(two));
  ASSERT_FALSE(platform->files().moveItemAtURL(one, inDrive("short")));
  EXPECT_EQ(cloud().logicalURLOfPromise(cloud().physicalURL(inDrive("short"))), inDrive("short"));
  EXPECT_EQ(cloud().logicalURLOfPromise(cloud().physicalURL(two)), two);
}

TEST_P(CloudPlacesContract, WhatIsDownloadedOrMissingIsItsOwnPhysicalObject) {
  platform->addFile(inDrive("near").path());
  for (const char* name : {"near", "gone"}) {
    const URL url = inDrive(name);
    EXPECT_TRUE(cloud().physicalURL(url).sameObject(url)) << name;
    EXPECT_TRUE(cloud().logicalURLOfPromise(url).sameObject(url)) << name;
    EXPECT_FALSE(cloud().isPromise(url)) << name;
  }
  const URL physical = [&] {
    platform->addPromise(inDrive("far").path());
    return cloud().physicalURL(inDrive("far"));
  }();
  EXPECT_TRUE(cloud().physicalURL(physical).sameObject(physical));
}

TEST_P(CloudPlacesContract, APromiseIsToldByItsName) {
  EXPECT_TRUE(cloud().isPromise(inDrive(".gone.vlopromise")));
  for (const char* name : {"a.vlopromise", ".vlopromise", "..vlopromis", ".a.vlopromise.txt"}) {
    EXPECT_FALSE(cloud().isPromise(inDrive(name))) << name;
  }
}

TEST_P(CloudPlacesContract, WhatIsDownloadedIsNoLongerPromised) {
  platform->addPromise(inDrive("a").path());
  ASSERT_FALSE(platform->files().removeItemAtURL(inDrive("a")));
  platform->addFile(inDrive("a").path());
  const URL url = inDrive("a");
  EXPECT_TRUE(cloud().physicalURL(url).sameObject(url));
}

// Bookmarks.

TEST_P(CloudPlacesContract, ABookmarkLeadsOutOfTheDrive) {
  platform->addFile(outside("some report.pdf").path());
  const URL bookmark = inDrive("report.vaelobookmark");
  platform->addBookmark(bookmark.path(), outside("some report.pdf"));
  EXPECT_TRUE(cloud().isExternalDocumentReference(bookmark));
  const auto target = cloud().resolveExternalDocumentReference(bookmark);
  EXPECT_EQ(target.value, outside("some report.pdf"));
  EXPECT_FALSE(target.error);
}

TEST_P(CloudPlacesContract, ABookmarkOfAnItemThatIsNotDownloadedIsGood) {
  platform->addPromise(inDrive("far").path());
  platform->addBookmark(inDrive("far.vaelobookmark").path(), inDrive("far"));
  EXPECT_EQ(cloud().resolveExternalDocumentReference(inDrive("far.vaelobookmark")).value, inDrive("far"));
}

TEST_P(CloudPlacesContract, ABookmarkOfNothingIsError4) {
  platform->addBookmark(inDrive("gone.vaelobookmark").path(), outside("gone"));
  EXPECT_TRUE(cloud().isExternalDocumentReference(inDrive("gone.vaelobookmark")));
  const auto target = cloud().resolveExternalDocumentReference(inDrive("gone.vaelobookmark"));
  EXPECT_FALSE(target.value);
  EXPECT_EQ(code(target.error), FileErrorCode::NoSuchFile);
}

TEST_P(CloudPlacesContract, WhatIsNoBookmarkIsNone) {
  platform->addFile(inDrive("plain.txt").path());
  platform->addFolder(inDrive("folder.vaelobookmark").path());
  platform->addFile(inDrive(".vaelobookmark").path());
  platform->addBookmark(inDrive("a.vaelobookmark").path(), outside("a"));
  platform->addLink(inDrive("link.vaelobookmark").path(), "a.vaelobookmark");
  for (const char* name :
       {"plain.txt", "folder.vaelobookmark", ".vaelobookmark", "link.vaelobookmark", "gone.vaelobookmark"}) {
    EXPECT_FALSE(cloud().isExternalDocumentReference(inDrive(name))) << name;
  }
  EXPECT_EQ(code(cloud().resolveExternalDocumentReference(inDrive("plain.txt")).error), FileErrorCode::ReadUnknown);
  EXPECT_EQ(code(cloud().resolveExternalDocumentReference(inDrive("gone.vaelobookmark")).error),
            FileErrorCode::ReadNoSuchFile);
}

TEST_P(CloudPlacesContract, ABookmarkWithoutATargetIsBroken) {
  platform->addFile(inDrive("broken.vaelobookmark").path(), "anything");
  EXPECT_TRUE(cloud().isExternalDocumentReference(inDrive("broken.vaelobookmark")));
  EXPECT_EQ(code(cloud().resolveExternalDocumentReference(inDrive("broken.vaelobookmark")).error),
            FileErrorCode::ReadUnknown);
}

}  // namespace
}  // namespace vaelo::contract
