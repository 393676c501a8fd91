// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/dr_item.h"
#include "tests/support/test_image.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

using K = ResourceKey;

const URL Item("/drive/mirror/com~marrow~Kestrel/item");
const URL LinkTarget("/elsewhere/target");

/// The corners of a record: refills, reads that don't come about, and fills by hand.
class ItemsReviewRecordTest : public ItemsTest {
 protected:
  std::shared_ptr<DRItem> filled(ResourceMap values = {}) {
    const bool isFolder = values.contains(K::IsDirectory) || values.contains(K::IsPackage);
    MemoryItem& item = isFolder ? world.addFolder(Item) : world.addFile(Item);
    item.values = std::move(values);
    return DRItem::initWithURL(Item);
  }
  /// A record whose link target is known, as only the plain attributes tell it.
  std::shared_ptr<DRItem> linkFromAttributes(const std::string& target) {
    WorldItem& link = world.addFile(Item);
    link.attributes.type = FileType::SymbolicLink;
    link.linkTarget = target;
    world.unreachable.insert(Item.path());
    const auto item = DRItem::initWithURL(Item);
    world.unreachable.clear();
    return item;
  }
};

// Fills.

TEST_F(ItemsReviewRecordTest, aFillWithoutValuesLeavesNothingOfTheFormerOne) {
  const auto item = filled({{K::LocalizedName, "item"},
                            {K::TypeIdentifier, "public.text"},
                            {K::LocalizedTypeDescription, "Text"},
                            {K::FileSize, std::uint64_t{5}},
                            {K::CreationDate, Noon},
                            {K::ContentModificationDate, Noon},
                            {K::ParentDirectoryURL, Drive},
                            {K::IsDirectory, true},
                            {K::HasHiddenExtension, true},
                            {K::IsShared, true},
                            {K::SharedItemRole, SharedItemRoleParticipant},
                            {K::DownloadingStatus, DownloadingStatusCurrent}});
  ASSERT_TRUE(item->isDirectory() && item->isDownloaded() && !item->renameable());
  item->initFromKeysAndValuesWithURL({}, Item);
  EXPECT_FALSE(item->localizedName() || item->typeIdentifier() || item->localizedTypeDescription());
  EXPECT_FALSE(item->fileSize() || item->friendlyFileSize());
  EXPECT_FALSE(item->creationDate() || item->contentModificationDate() || item->parentDirectoryURL());
  EXPECT_FALSE(item->isDirectory() || item->hasHiddenExtension() || item->isDownloaded());
  EXPECT_TRUE(item->renameable());
  EXPECT_EQ(item->resolvedURL(), Item) << "an item that is no link keeps it";
}

TEST_F(ItemsReviewRecordTest, valuesOfAnotherTypeAreAbsent) {
  const auto item = filled({{K::LocalizedName, std::int64_t{1}},
                            {K::Name, "item"},
                            {K::TypeIdentifier, true},
                            {K::LocalizedTypeDescription, std::int64_t{2}},
                            {K::CreationDate, "yesterday"},
                            {K::ContentModificationDate, "today"},
                            {K::ParentDirectoryURL, "/drive"}});
  EXPECT_EQ(item->localizedName(), "item");
  EXPECT_FALSE(item->typeIdentifier() || item->localizedTypeDescription() || item->creationDate() ||
               item->contentModificationDate() || item->parentDirectoryURL());
}

TEST_F(ItemsReviewRecordTest, aTargetOfOneComponentIsReadAgainstTheFolderThatIsKnownSoFar) {
  const auto item = linkFromAttributes("neighbour");
  ASSERT_EQ(item->symlinkTarget(), "neighbour");
  item->setParentDirectoryURL(LibraryDocuments);
  world.linkTargets.insert_or_assign(Item.path(), URL("/"));
  item->initFromKeysAndValuesWithURL({{K::TypeIdentifier, "public.symlink"}, {K::ParentDirectoryURL, Drive}}, Item);
  EXPECT_EQ(item->resolvedURL(), LibraryDocuments.appendingPathComponent("neighbour"));
  EXPECT_EQ(item->parentDirectoryURL(), Drive) << "the folder of the values comes later";
}

TEST_F(ItemsReviewRecordTest, aTargetOfOneComponentNeedsBothTheStoredTargetAndTheFolder) {
  world.linkTargets.insert_or_assign(Item.path(), URL("/"));
  const ResourceMap link{{K::TypeIdentifier, "public.symlink"}};
  const auto without = filled();
  without->setParentDirectoryURL(Drive);
  without->initFromKeysAndValuesWithURL(link, Item);
  EXPECT_FALSE(without->resolvedURL());
  const auto item = linkFromAttributes("neighbour");
  item->setParentDirectoryURL(std::nullopt);
  item->initFromKeysAndValuesWithURL(link, Item);
  EXPECT_FALSE(item->resolvedURL());
}

TEST_F(ItemsReviewRecordTest, aPromiseURLWithoutAResolvedOneIsAPromise) {
  const auto item = filled();
  item->setResolvedURL(std::nullopt);
  EXPECT_TRUE(item->isPromise());
  item->setPromiseURL(std::nullopt);
  EXPECT_FALSE(item->isPromise());
}

TEST_F(ItemsReviewRecordTest, aTargetOfMoreComponentsStaysAsItIs) {
  const auto item = linkFromAttributes("neighbour");
  world.linkTargets.insert_or_assign(Item.path(), LinkTarget);
  item->initFromKeysAndValuesWithURL({{K::TypeIdentifier, "public.symlink"}}, Item);
  EXPECT_EQ(item->resolvedURL(), LinkTarget);
}

TEST_F(ItemsReviewRecordTest, aLinkIsFollowedFromTheURLThatTheReadGives) {
  const URL given("/drive/mirror/com~marrow~Kestrel/given");
  world.addFile(given, {{K::TypeIdentifier, "public.symlink"}});
  world.addFile(Item);
  world.redirected.insert_or_assign(Item.path(), given);
  world.linkTargets.insert_or_assign(given.path(), LinkTarget);
  EXPECT_EQ(DRItem::initWithURL(Item)->resolvedURL(), LinkTarget);
}

TEST_F(ItemsReviewRecordTest, aFollowedLinkIsNoLongerTheObjectOfItsPromiseURL) {
  world.linkTargets.insert_or_assign(Item.path(), LinkTarget);
  const auto item = filled({{K::TypeIdentifier, "public.symlink"}});
  EXPECT_EQ(item->promiseURL(), Item) << "asked for before the link was followed";
  EXPECT_TRUE(item->isPromise());
}

TEST_F(ItemsReviewRecordTest, theSizeOfAPackageBehindALinkIsThatOfTheTarget) {
  world.linkTargets.insert_or_assign(Item.path(), LinkTarget);
  world.addFile(LinkTarget.appendingPathComponent("a"), {{K::FileSize, std::uint64_t{3}}});
  world.addFile(Item.appendingPathComponent("b"), {{K::FileSize, std::uint64_t{50}}});
  const auto item = filled({{K::TypeIdentifier, "public.symlink"}, {K::IsPackage, true}});
  EXPECT_EQ(item->fileSize(), 3u);
}

TEST_F(ItemsReviewRecordTest, aPackageBehindABrokenAliasHasNoSize) {
  const auto item = filled({{K::LocalizedTypeDescription, "Alias"}, {K::IsPackage, true}});
  EXPECT_FALSE(item->fileSize() || item->friendlyFileSize());
  EXPECT_TRUE(logged("ERROR", "sizeOfPackage: null URL"));
}

TEST_F(ItemsReviewRecordTest, whatHasNoSizeAddsNothingToASum) {
  world.addFile(Item.appendingPathComponent("a"), {{K::FileSize, std::uint64_t{3}}});
  world.addFile(Item.appendingPathComponent("b"), {{K::FileSize, "many"}});
  world.addFile(Item.appendingPathComponent("c"));
  world.promisedAnswers.insert_or_assign(Item.appendingPathComponent("c").path(), fileError(FileErrorCode::ReadUnknown));
  world.addFolder(Item.appendingPathComponent("d"));
  EXPECT_EQ(filled({{K::IsDirectory, true}})->sizeOfPackage(Item), 3u);
}

TEST_F(ItemsReviewRecordTest, onlyAPackageIsSummedUp) {
  filled({{K::IsDirectory, true}});
  EXPECT_FALSE(world.called("enumerate " + Item.path()));
}

TEST_F(ItemsReviewRecordTest, aContainerIsNotRenamedWhoeverOwnsIt) {
  world.addFolder(LibraryDocuments, {{K::IsShared, true}, {K::SharedItemRole, SharedItemRoleOwner}});
  EXPECT_FALSE(DRItem::initWithURL(LibraryDocuments)->renameable());
}

TEST_F(ItemsReviewRecordTest, aContainerOfWhichNothingIsToldKeepsTheNameOfItsFolder) {
  world.addFolder(LibraryDocuments, {{K::LocalizedName, "Documents"}});
  world.containerLookupTellsNothing = true;
  EXPECT_EQ(DRItem::initWithURL(LibraryDocuments)->localizedName(), "Documents");
}

TEST_F(ItemsReviewRecordTest, fromAttributesNothingIsAContainerNorShared) {
  world.addFolder(LibraryDocuments);
  world.unreachable.insert(LibraryDocuments.path());
  const auto item = DRItem::initWithURL(LibraryDocuments);
  EXPECT_FALSE(item->isContainer());
  EXPECT_TRUE(item->renameable());
  EXPECT_EQ(item->localizedName(), "Documents");
  EXPECT_FALSE(item->tags());
  EXPECT_FALSE(item->isDownloaded());
}

TEST_F(ItemsReviewRecordTest, aSizeAttributeThatIsNoNumberIsAbsent) {
  world.addFile(Item).attributes.size = "12";
  world.unreachable.insert(Item.path());
  const auto item = DRItem::initWithURL(Item);
  EXPECT_FALSE(item->fileSize() || item->friendlyFileSize());
}

TEST_F(ItemsReviewRecordTest, attributesAreReadOfTheURLAsGiven) {
  world.bookmarks.insert_or_assign(Item.path(), LinkTarget);
  world.addFile(Item).attributes.size = std::uint64_t{4};
  const auto item = DRItem::initWithURL(Item);
  EXPECT_EQ(item->localizedName(), "item");
  EXPECT_EQ(item->parentDirectoryURL(), Drive);
  EXPECT_EQ(item->fileSize(), 4u);
  EXPECT_EQ(item->resolvedURL(), LinkTarget);
}

TEST_F(ItemsReviewRecordTest, withoutAResolvedURLThereIsNoPromiseURLEither) {
  const auto item = filled();
  item->setResolvedURL(std::nullopt);
  EXPECT_TRUE(item->initFromAttributes());
  EXPECT_FALSE(item->promiseURL());
}

TEST_F(ItemsReviewRecordTest, anAliasIsFollowedOnlyWithoutAnError) {
  Result<URL> both(LinkTarget);
  both.error = fileError(FileErrorCode::ReadUnknown);
  world.aliasTargets.insert_or_assign(Item.path(), both);
  EXPECT_FALSE(filled({{K::LocalizedTypeDescription, "Alias"}})->resolvedURL());
  EXPECT_TRUE(logged("WARNING", "Error resolving Alias: " + both.error->description()));
  EXPECT_FALSE(filled()->resolveRoverAlias(std::nullopt));
}

// Refills.

TEST_F(ItemsReviewRecordTest, aRefillForgetsTheTargetOfALink) {
  const auto item = linkFromAttributes("neighbour");
  ASSERT_TRUE(item->symlinkTarget() && item->isSymlink());
  item->clearValues();
  EXPECT_FALSE(item->symlinkTarget() || item->isSymlink());
}

TEST_F(ItemsReviewRecordTest, withoutAURLThereIsNothingToFillFrom) {
  const auto item = filled({{K::Name, "item"}});
  world.calls.clear();
  item->setUrl(std::nullopt);
  EXPECT_FALSE(item->url() || item->resolvedURL() || item->localizedName());
  EXPECT_TRUE(item->hasHiddenExtension());
  EXPECT_FALSE(item->cacheValues());
  EXPECT_FALSE(item->initFromAttributes());
  EXPECT_TRUE(world.calls.empty());
  EXPECT_EQ(item->description(), "Name=(null), Size=(null), URL=(null), ResURL=<same>, PromiseURL=<same>, Local,");
}

TEST_F(ItemsReviewRecordTest, aFailedRefillLogsNothing) {
  const auto item = filled();
  item->setUrl(URL("/nowhere"));
  EXPECT_TRUE(messages().empty());
}

TEST_F(ItemsReviewRecordTest, aRefillThatFallsBackLeavesThePreviewAnswerAlone) {
  const auto item = filled();
  ASSERT_TRUE(item->canPreview());
  world.unreachable.insert(Item.path());
  EXPECT_TRUE(item->cacheValues());
  EXPECT_TRUE(item->canPreview());
}

// Reads that don't come about.

TEST_F(ItemsReviewRecordTest, aFailedPlainReadKeepsTheAccess) {
  world.securityScoped = true;
  world.promisedAnswers.insert_or_assign(Item.path(), fileError(FileErrorCode::ReadUnknown));
  world.plainAnswers.insert_or_assign(Item.path(), fileError(FileErrorCode::ReadUnknown));
  EXPECT_TRUE(filled());
  EXPECT_TRUE(world.called("start " + Item.path()));
  EXPECT_FALSE(world.called("stop " + Item.path()));
}

TEST_F(ItemsReviewRecordTest, anAccessForAReadThatNeverComesAboutIsNotStopped) {
  world.securityScoped = true;
  world.coordinatorError = fileError(FileErrorCode::ReadUnknown);
  const auto item = filled({{K::Name, "item"}});
  ASSERT_TRUE(item);
  EXPECT_FALSE(item->localizedName()) << "the attributes are not asked either";
  EXPECT_FALSE(item->thumbnail());
  EXPECT_TRUE(item->thumbnailFetched());
  EXPECT_FALSE(world.called("stop " + Item.path()));
  world.calls.clear();
  EXPECT_FALSE(item->thumbnail());
  EXPECT_TRUE(world.calls.empty());
}

TEST_F(ItemsReviewRecordTest, aThumbnailIsReadWhereTheCoordinatorSaysAndClosedWhereItWasOpened) {
  const auto image = std::make_shared<TestImage>();
  const URL given("/drive/mirror/com~marrow~Kestrel/given");
  world.addFile(given, {{K::ThumbnailDictionary, Dictionary{{Thumbnail1024SizeKey, ImageRef(image)}}}});
  const auto item = filled();
  world.redirected.insert_or_assign(Item.path(), given);
  world.securityScoped = true;
  EXPECT_EQ(item->thumbnail(), image);
  EXPECT_TRUE(world.called("stop " + Item.path()));
}

TEST_F(ItemsReviewRecordTest, theThumbnailIsThatOfTheLinksTarget) {
  world.linkTargets.insert_or_assign(Item.path(), LinkTarget);
  const auto image = std::make_shared<TestImage>();
  world.addFile(LinkTarget, {{K::ThumbnailDictionary, Dictionary{{Thumbnail1024SizeKey, ImageRef(image)}}}});
  const auto item = filled({{K::TypeIdentifier, "public.symlink"}});
  EXPECT_EQ(item->thumbnail(), image);
  const auto broken = filled({{K::LocalizedTypeDescription, "Alias"}});
  EXPECT_FALSE(broken->thumbnail()) << "there is nothing to read";
}

TEST_F(ItemsReviewRecordTest, aRefillForgetsTheThumbnail) {
  const auto item = filled();
  item->setThumbnail(std::make_shared<TestImage>());
  item->setThumbnailFetched(true);
  ASSERT_TRUE(item->thumbnail());
  item->clearValues();
  item->setThumbnailFetched(true);
  EXPECT_FALSE(item->thumbnail());
}

TEST_F(ItemsReviewRecordTest, whatIsSetIsKept) {
  const auto item = filled();
  item->setResolvedURL(LinkTarget);
  item->setLocalizedName("name");
  item->setThumbnail(nullptr);
  item->setThumbnailFetched(true);
  EXPECT_EQ(item->resolvedURL(), LinkTarget);
  EXPECT_EQ(item->localizedName(), "name");
  EXPECT_FALSE(item->thumbnail());
  EXPECT_EQ(item->url(), Item);
}

}  // namespace
}  // namespace vaelo
