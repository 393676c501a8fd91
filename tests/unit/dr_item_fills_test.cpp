// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/dr_item.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

using K = ResourceKey;

const URL Item("/drive/mirror/com~marrow~Kestrel/item");

std::uint64_t bytes(int count) { return static_cast<std::uint64_t>(count); }

/// What becomes of each resource value, and of each plain attribute.
class DRItemFillsTest : public ItemsTest {
 protected:
  std::shared_ptr<DRItem> filled(ResourceMap values) {
    const bool isFolder = values.contains(K::IsDirectory) || values.contains(K::IsPackage);
    MemoryItem& item = isFolder ? world.addFolder(Item) : world.addFile(Item);
    item.values = std::move(values);
    return DRItem::initWithURL(Item);
  }
  /// A record of what the disk tells, since its values can't be read.
  std::shared_ptr<DRItem> fromAttributes() {
    world.unreachable.insert(Item.path());
    return DRItem::initWithURL(Item);
  }
};

TEST_F(DRItemFillsTest, theNameIsTheLocalizedOneElseThePlainOne) {
  EXPECT_EQ(filled({{K::LocalizedName, "Zeichnung"}, {K::Name, "drawing"}})->localizedName(), "Zeichnung");
  EXPECT_EQ(filled({{K::Name, "drawing"}})->localizedName(), "drawing");
  EXPECT_FALSE(filled({})->localizedName());
}

TEST_F(DRItemFillsTest, theTypesDescriptionIsThePlatformsElseTheValue) {
  const ResourceMap values{{K::TypeIdentifier, "public.png"}, {K::LocalizedTypeDescription, "Picture file"}};
  EXPECT_EQ(filled(values)->localizedTypeDescription(), "Picture file");
  world.descriptions["public.png"] = "Portable picture";
  EXPECT_EQ(filled(values)->localizedTypeDescription(), "Portable picture");
  EXPECT_EQ(filled(values)->typeIdentifier(), "public.png");
}

TEST_F(DRItemFillsTest, aSymbolicLinkIsFollowed) {
  world.linkTargets.insert_or_assign(Item.path(), URL("/elsewhere/target"));
  const auto item = filled({{K::TypeIdentifier, "public.symlink"}, {K::LocalizedTypeDescription, "Alias"}});
  EXPECT_TRUE(item->isSymlink());
  EXPECT_EQ(item->resolvedURL(), URL("/elsewhere/target"));
  EXPECT_FALSE(item->symlinkTarget());
  EXPECT_FALSE(world.called("resolveAlias " + Item.path()));
}

TEST_F(DRItemFillsTest, aLinkToTheRootResolvesToNothing) {
  world.linkTargets.insert_or_assign(Item.path(), URL("/"));
  const auto item = filled({{K::TypeIdentifier, "public.symlink"}, {K::ParentDirectoryURL, Drive}});
  EXPECT_TRUE(item->isSymlink());
  EXPECT_FALSE(item->resolvedURL());
}

TEST_F(DRItemFillsTest, anAliasInAnyLetterCaseIsResolvedByTheRecordsOwnURL) {
  const URL given("/drive/mirror/com~marrow~Kestrel/given");
  world.addFile(given, {{K::LocalizedTypeDescription, "aLIAS"}});
  world.addFile(Item);
  world.redirected.insert_or_assign(Item.path(), given);
  world.aliasTargets.insert_or_assign(Item.path(), URL("/elsewhere/target"));
  const auto item = DRItem::initWithURL(Item);
  EXPECT_TRUE(item->isSymlink());
  EXPECT_EQ(item->resolvedURL(), URL("/elsewhere/target"));
  EXPECT_TRUE(messages().empty());
}

TEST_F(DRItemFillsTest, thePlatformsDescriptionDecidesWhetherItIsAnAlias) {
  world.descriptions["org.example.text"] = "Text";
  const auto item = filled({{K::TypeIdentifier, "org.example.text"}, {K::LocalizedTypeDescription, "Alias"}});
  EXPECT_FALSE(item->isSymlink());
  EXPECT_EQ(item->resolvedURL(), Item);
}

TEST_F(DRItemFillsTest, anAliasThatLeadsNowhereIsAnItemWithoutResolvedURL) {
  const auto item = filled({{K::LocalizedTypeDescription, "Alias"}});
  ASSERT_TRUE(item);
  EXPECT_TRUE(item->isSymlink());
  EXPECT_FALSE(item->resolvedURL());
  EXPECT_FALSE(item->canPreview());
  EXPECT_TRUE(logged("WARNING", "Error resolving Alias: " + world.values.resolveAliasFile(Item).error->description()));
}

TEST_F(DRItemFillsTest, aPromisedAliasIsToldOfAndTriedAllTheSame) {
  world.physicalOfLogical.insert_or_assign(Item.path(), URL("/drive/mirror/.item.vlopromise"));
  world.aliasTargets.insert_or_assign(Item.path(), URL("/elsewhere/target"));
  const auto item = filled({{K::LocalizedTypeDescription, "Alias"}});
  EXPECT_EQ(item->resolvedURL(), URL("/elsewhere/target"));
  EXPECT_TRUE(logged("WARNING",
                     "Rover Alias is promised -- unable to determine target without downloading: " + Item.absoluteString()));
}

TEST_F(DRItemFillsTest, theSizeIsANumberOrAbsent) {
  const auto item = filled({{K::FileSize, bytes(1500)}});
  EXPECT_EQ(item->fileSize(), bytes(1500));
  EXPECT_EQ(item->friendlyFileSize(), "2 KB");
  EXPECT_EQ(filled({{K::FileSize, bytes(0)}})->friendlyFileSize(), "0 bytes");
  for (const Value& none : {Value("1500"), Value(true), Value()}) {
    const auto without = filled({{K::FileSize, none}});
    EXPECT_FALSE(without->fileSize());
    EXPECT_FALSE(without->friendlyFileSize());
  }
}

TEST_F(DRItemFillsTest, datesParentAndHiddenExtension) {
  const auto item = filled({{K::CreationDate, Noon},
                            {K::ContentModificationDate, Noon + std::chrono::hours(1)},
                            {K::ParentDirectoryURL, Drive},
                            {K::HasHiddenExtension, true}});
  EXPECT_EQ(item->creationDate(), Noon);
  EXPECT_EQ(item->contentModificationDate(), Noon + std::chrono::hours(1));
  EXPECT_EQ(item->parentDirectoryURL(), Drive);
  EXPECT_TRUE(item->hasHiddenExtension());
  EXPECT_FALSE(filled({})->hasHiddenExtension());
}

TEST_F(DRItemFillsTest, aFolderIsADirectoryAndAPackageIsNot) {
  const auto folder = filled({{K::IsDirectory, true}});
  EXPECT_TRUE(folder->isDirectory());
  EXPECT_FALSE(folder->isPackage());
  const auto package = filled({{K::IsDirectory, true}, {K::IsPackage, true}});
  EXPECT_FALSE(package->isDirectory());
  EXPECT_TRUE(package->isPackage());
}

TEST_F(DRItemFillsTest, aPackageWithoutSizeHasThatOfItsContents) {
  world.addFile(Item.appendingPathComponent("a"), {{K::FileSize, bytes(20)}});
  world.addFolder(Item.appendingPathComponent("in"));
  world.addFile(Item.appendingPathComponent("in/.b"), {{K::FileSize, bytes(22)}}).isPromise = true;
  const auto item = filled({{K::IsPackage, true}});
  EXPECT_EQ(item->fileSize(), bytes(42));
  EXPECT_EQ(item->friendlyFileSize(), "42 bytes");
}

TEST_F(DRItemFillsTest, aPackageThatHasASizeKeepsItAndAnEmptyOneHasNone) {
  EXPECT_EQ(filled({{K::IsPackage, true}, {K::FileSize, bytes(0)}})->fileSize(), bytes(0));
  EXPECT_FALSE(world.called("enumerate " + Item.path()));
  const auto empty = filled({{K::IsPackage, true}});
  EXPECT_TRUE(world.called("enumerate " + Item.path()));
  EXPECT_FALSE(empty->fileSize());
  EXPECT_FALSE(empty->friendlyFileSize());
}

TEST_F(DRItemFillsTest, aSumGoesOnPastWhatCannotBeRead) {
  world.addFile(Item.appendingPathComponent("a"), {{K::FileSize, bytes(20)}});
  world.enumerationError = fileError(FileErrorCode::ReadNoPermission);
  const auto item = filled({{K::IsDirectory, true}});
  EXPECT_EQ(item->sizeOfPackage(Item), bytes(20));
  EXPECT_TRUE(logged("INFO", "Error enumerating " + Item.appendingPathComponent("locked").absoluteString() + ": " +
                                 world.enumerationError->description()));
}

TEST_F(DRItemFillsTest, aSumPrefetchesAndSkipsNothing) {
  const auto item = filled({});
  item->sizeOfPackage(Item);
  EXPECT_EQ(world.lastKeys, (std::vector{K::IsDirectory, K::IsPackage, K::TotalFileSize, K::FileSize}));
  EXPECT_EQ(world.lastOptions, EnumerateAll);
  EXPECT_EQ(item->sizeOfPackage(std::nullopt), 0u);
  EXPECT_TRUE(logged("ERROR", "sizeOfPackage: null URL"));
}

TEST_F(DRItemFillsTest, aSharedItemIsRenamedByItsOwnerOnly) {
  EXPECT_TRUE(filled({})->renameable());
  EXPECT_TRUE(filled({{K::IsShared, true}, {K::SharedItemRole, SharedItemRoleOwner}})->renameable());
  EXPECT_FALSE(filled({{K::IsShared, true}, {K::SharedItemRole, SharedItemRoleParticipant}})->renameable());
  EXPECT_TRUE(filled({{K::IsShared, false}, {K::SharedItemRole, SharedItemRoleParticipant}})->renameable());
}

TEST_F(DRItemFillsTest, aContainerHasItsOwnNameAndIsNotRenamed) {
  world.addFolder(LibraryDocuments, {{K::LocalizedName, "Documents"}, {K::IsDirectory, true}});
  const auto item = DRItem::initWithURL(LibraryDocuments);
  EXPECT_TRUE(item->isContainer());
  EXPECT_FALSE(item->renameable());
  EXPECT_EQ(item->localizedName(), "Sketchbook");
  EXPECT_FALSE(filled({})->isContainer());
}

TEST_F(DRItemFillsTest, aContainerThatCannotBeLookedUpKeepsTheNameOfItsFolder) {
  world.addFolder(LibraryDocuments, {{K::LocalizedName, "Documents"}});
  world.containerError = fileError(FileErrorCode::ReadUnknown);
  for (const bool withValue : {false, true}) {
    world.containerErrorComesWithValue = withValue;
    const auto item = DRItem::initWithURL(LibraryDocuments);
    EXPECT_EQ(item->localizedName(), "Documents");
    EXPECT_FALSE(item->renameable());
  }
}

TEST_F(DRItemFillsTest, theContainerTestIsOfTheURLThatIsRead) {
  world.addFolder(LibraryDocuments);
  world.addFile(Item);
  world.redirected.insert_or_assign(Item.path(), LibraryDocuments);
  EXPECT_TRUE(DRItem::initWithURL(Item)->isContainer());
}

TEST_F(DRItemFillsTest, downloadedNeedsAStatusThatIsNotTheOneOfNothing) {
  EXPECT_FALSE(filled({})->isDownloaded());
  EXPECT_FALSE(filled({{K::DownloadingStatus, DownloadingStatusNotDownloaded}})->isDownloaded());
  EXPECT_TRUE(filled({{K::DownloadingStatus, DownloadingStatusDownloaded}})->isDownloaded());
  EXPECT_TRUE(filled({{K::DownloadingStatus, DownloadingStatusCurrent}})->isDownloaded());
}

TEST_F(DRItemFillsTest, attributesOfAFile) {
  FileAttributes& attributes = world.addFile(Item).attributes;
  attributes.size = bytes(7);
  attributes.creationDate = Noon;
  attributes.modificationDate = Noon + std::chrono::hours(2);
  attributes.extensionHidden = true;
  const URL physical("/drive/mirror/.item.vlopromise");
  world.physicalOfLogical.insert_or_assign(Item.path(), physical);
  const auto item = fromAttributes();
  EXPECT_EQ(item->localizedName(), "item");
  EXPECT_EQ(item->parentDirectoryURL(), Drive);
  EXPECT_FALSE(item->typeIdentifier());
  EXPECT_FALSE(item->localizedTypeDescription());
  EXPECT_FALSE(item->isDirectory() || item->isSymlink());
  EXPECT_EQ(item->resolvedURL(), Item);
  EXPECT_EQ(item->promiseURL(), physical);
  EXPECT_EQ(item->fileSize(), bytes(7));
  EXPECT_EQ(item->friendlyFileSize(), "7 bytes");
  EXPECT_EQ(item->creationDate(), Noon);
  EXPECT_EQ(item->contentModificationDate(), Noon + std::chrono::hours(2));
  EXPECT_TRUE(item->hasHiddenExtension());
}

TEST_F(DRItemFillsTest, attributesOfAFolder) {
  world.addFolder(Item);
  world.descriptions["public.folder"] = "Folder";
  const auto item = fromAttributes();
  EXPECT_EQ(item->typeIdentifier(), "public.folder");
  EXPECT_EQ(item->localizedTypeDescription(), "Folder");
  EXPECT_TRUE(item->isDirectory());
  EXPECT_FALSE(item->fileSize());
  EXPECT_FALSE(item->hasHiddenExtension());
}

TEST_F(DRItemFillsTest, attributesOfALinkFollowItsStoredTarget) {
  struct Case {
    const char* target;
    const char* resolved;
  };
  for (const Case& link : {Case{"/elsewhere/target", "/elsewhere/target"}, Case{"up/there", "up/there"},
                           Case{"neighbour", "/drive/mirror/com~marrow~Kestrel/neighbour"},
                           Case{"folder/", "/drive/mirror/com~marrow~Kestrel/folder"}, Case{"/", "/"}}) {
    MemoryItem& linkItem = world.addFile(Item);
    linkItem.attributes.type = FileType::SymbolicLink;
    linkItem.linkTarget = link.target;
    const URL physical("/physical");
    world.physicalOfLogical.insert_or_assign(link.resolved, physical);
    const auto item = fromAttributes();
    EXPECT_TRUE(item->isSymlink());
    EXPECT_EQ(item->typeIdentifier(), "public.symlink");
    EXPECT_EQ(item->symlinkTarget(), link.target);
    EXPECT_EQ(item->resolvedURL(), URL(link.resolved)) << link.target;
    EXPECT_EQ(item->promiseURL(), physical);
  }
}

TEST_F(DRItemFillsTest, aLinkWhoseTargetCannotBeReadKeepsItsResolvedURL) {
  world.addFile(Item).attributes.type = FileType::SymbolicLink;
  const auto item = fromAttributes();
  EXPECT_TRUE(item->isSymlink());
  EXPECT_FALSE(item->symlinkTarget());
  EXPECT_EQ(item->resolvedURL(), Item);
}

TEST_F(DRItemFillsTest, anyOtherKindOfFileIsNoItemAndAnUnknownOneIsTakenForAFile) {
  world.addFile(Item).attributes.type = FileType::Other;
  EXPECT_FALSE(fromAttributes());
  world.addFile(Item).attributes.type = std::nullopt;
  EXPECT_TRUE(fromAttributes());
}

}  // namespace
}  // namespace vaelo
