// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/dr_item.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

using K = ResourceKey;

const URL Letter("/drive/mirror/com~marrow~Kestrel/letter.txt");

/// How a record comes to its values: the reads, their order, and what happens when one fails.
class DRItemCacheTest : public ItemsTest {
 protected:
  DRItemCacheTest() { world.addFile(Letter, {{K::Name, "letter.txt"}, {K::LocalizedName, "letter"}}); }
};

TEST_F(DRItemCacheTest, asksInOneCoordinatedReadOfMetadataAndStopsTheAccessLast) {
  world.securityScoped = true;
  world.tags.insert_or_assign(Letter.path(), std::vector<std::string>{"Red", "Blue"});
  const auto item = DRItem::initWithURL(Letter);
  ASSERT_TRUE(item);
  const std::string path = Letter.path();
  EXPECT_EQ(world.calls, (std::vector<std::string>{"start " + path, "coordinator", "read " + path, "promised " + path,
                                                   "canPreview " + path, "stop " + path}));
  EXPECT_EQ(world.lastOptions, ReadingImmediatelyAvailableMetadataOnly);
  EXPECT_EQ(item->localizedName(), "letter");
  EXPECT_EQ(item->tags(), (std::vector<std::string>{"Red", "Blue"}));
  EXPECT_TRUE(item->canPreview());
  EXPECT_TRUE(messages().empty());
}

TEST_F(DRItemCacheTest, readsTheFourteenKeysInTheirOrder) {
  DRItem::initWithURL(Letter);
  EXPECT_EQ(world.lastKeys,
            (std::vector{K::Name, K::LocalizedName, K::TypeIdentifier, K::LocalizedTypeDescription, K::FileSize,
                         K::CreationDate, K::ContentModificationDate, K::IsDirectory, K::IsPackage, K::HasHiddenExtension,
                         K::ParentDirectoryURL, K::IsShared, K::SharedItemRole, K::DownloadingStatus}));
  EXPECT_EQ(&DRItem::resourceKeys(), &DRItem::resourceKeys());
}

TEST_F(DRItemCacheTest, anAccessThatWasNotStartedIsNotStopped) {
  DRItem::initWithURL(Letter);
  EXPECT_TRUE(world.called("start " + Letter.path()));
  EXPECT_FALSE(world.called("stop " + Letter.path()));
}

TEST_F(DRItemCacheTest, earlyStopsKeepTheAccess) {
  world.securityScoped = true;
  world.unreachable.insert(Letter.path());
  DRItem::initWithURL(Letter);
  EXPECT_FALSE(world.called("stop " + Letter.path()));

  world.unreachable.clear();
  world.promisedAnswers.insert_or_assign(Letter.path(), fileError(FileErrorCode::NoSuchFile));
  DRItem::initWithURL(Letter);
  EXPECT_FALSE(world.called("stop " + Letter.path()));
}

TEST_F(DRItemCacheTest, theAccessOfALinkEndsOnTheLinkAndNotOnItsTarget) {
  world.securityScoped = true;
  world.items[Letter.path()].values[K::TypeIdentifier] = "public.symlink";
  world.linkTargets.insert_or_assign(Letter.path(), URL("/elsewhere/target"));
  const auto item = DRItem::initWithURL(Letter);
  EXPECT_EQ(item->resolvedURL(), URL("/elsewhere/target"));
  EXPECT_TRUE(world.called("stop " + Letter.path()));
  EXPECT_FALSE(world.called("stop /elsewhere/target"));
}

TEST_F(DRItemCacheTest, previewAndTagsAreThoseOfTheResolvedURL) {
  world.items[Letter.path()].values[K::TypeIdentifier] = "public.symlink";
  world.linkTargets.insert_or_assign(Letter.path(), URL("/elsewhere/target"));
  world.unpreviewable.insert("/elsewhere/target");
  world.tags.insert_or_assign("/elsewhere/target", std::vector<std::string>{"Green"});
  const auto item = DRItem::initWithURL(Letter);
  EXPECT_FALSE(item->canPreview());
  EXPECT_EQ(item->tags(), std::vector<std::string>{"Green"});
}

TEST_F(DRItemCacheTest, tagsThatCannotBeReadAreAbsent) {
  world.tags.insert_or_assign(Letter.path(), fileError(FileErrorCode::ReadUnknown));
  EXPECT_FALSE(DRItem::initWithURL(Letter)->tags());
}

TEST_F(DRItemCacheTest, readsTheURLThatTheCoordinatorGives) {
  const URL moved("/drive/mirror/com~marrow~Kestrel/moved.txt");
  world.addFile(moved, {{K::LocalizedName, "moved"}});
  world.redirected.insert_or_assign(Letter.path(), moved);
  const auto item = DRItem::initWithURL(Letter);
  EXPECT_EQ(item->localizedName(), "moved");
  EXPECT_EQ(item->url(), Letter);
  EXPECT_TRUE(world.called("canPreview " + Letter.path()));
}

TEST_F(DRItemCacheTest, anUnreachableItemIsFilledFromItsAttributes) {
  world.unreachable.insert(Letter.path());
  const auto item = DRItem::initWithURL(Letter);
  ASSERT_TRUE(item);
  EXPECT_EQ(item->localizedName(), "letter.txt");
  EXPECT_FALSE(world.called("promised " + Letter.path()));
}

TEST_F(DRItemCacheTest, aMissingFileIsNotReadThePlainWayButFromItsAttributes) {
  world.promisedAnswers.insert_or_assign(Letter.path(), fileError(FileErrorCode::NoSuchFile));
  const auto item = DRItem::initWithURL(Letter);
  EXPECT_EQ(item->localizedName(), "letter.txt");
  EXPECT_FALSE(world.called("plain " + Letter.path()));
  EXPECT_TRUE(messages().empty());
}

TEST_F(DRItemCacheTest, anyOtherFailureIsLoggedAndReadThePlainWay) {
  for (const Result<ResourceMap>& answer :
       {Result<ResourceMap>(fileError(FileErrorCode::ReadUnknown)), Result<ResourceMap>(),
        Result<ResourceMap>(Error{CloudDocumentsErrorDomain, FileErrorCode::NoSuchFile, {}, {}, {}})}) {
    world.calls.clear();
    world.recordedLog.clear();
    world.promisedAnswers.insert_or_assign(Letter.path(), answer);
    const auto item = DRItem::initWithURL(Letter);
    EXPECT_EQ(item->localizedName(), "letter");
    EXPECT_TRUE(world.called("plain " + Letter.path()));
    EXPECT_EQ(world.lastKeys, DRItem::resourceKeys());
    EXPECT_EQ(messages(),
              std::vector<std::string>{"WARNING promisedItemResourceValuesForKeys failed on " + Letter.absoluteString()});
  }
}

TEST_F(DRItemCacheTest, whenBothReadsFailTheAttributesServeAndTheWarningComesOnce) {
  world.promisedAnswers.insert_or_assign(Letter.path(), fileError(FileErrorCode::ReadUnknown));
  world.plainAnswers.insert_or_assign(Letter.path(), fileError(FileErrorCode::ReadUnknown));
  const auto item = DRItem::initWithURL(Letter);
  EXPECT_EQ(item->localizedName(), "letter.txt");
  EXPECT_EQ(world.recordedLog.count("WARNING", "promisedItemResourceValuesForKeys failed on " + Letter.absoluteString()),
            1u);
}

TEST_F(DRItemCacheTest, aReadThatNeverComesAboutIsSuccessWithWhatIsKnown) {
  world.coordinatorError = fileError(FileErrorCode::ReadUnknown);
  const auto item = DRItem::initWithURL(Letter);
  ASSERT_TRUE(item);
  EXPECT_EQ(item->resolvedURL(), Letter);
  EXPECT_EQ(item->promiseURL(), Letter);
  EXPECT_FALSE(item->localizedName());
  EXPECT_TRUE(item->hasHiddenExtension());
}

TEST_F(DRItemCacheTest, aBookmarkThatLeadsNowhereIsARecordOfNothingButTheBookmark) {
  world.bookmarks.insert_or_assign(Letter.path(), fileError(FileErrorCode::NoSuchFile));
  const auto item = DRItem::initWithURL(Letter);
  ASSERT_TRUE(item);
  EXPECT_TRUE(item->isBookmark());
  EXPECT_EQ(item->url(), Letter);
  EXPECT_FALSE(item->resolvedURL());
  EXPECT_FALSE(item->promiseURL());
  EXPECT_FALSE(item->isPromise());
  EXPECT_FALSE(item->localizedName());
}

TEST_F(DRItemCacheTest, aBookmarkIsReadWhereItLeads) {
  const URL outside("/home/somebody/report.pdf");
  world.addFile(outside, {{K::LocalizedName, "report"}});
  world.bookmarks.insert_or_assign(Letter.path(), outside);
  const auto item = DRItem::initWithURL(Letter);
  EXPECT_TRUE(item->isBookmark());
  EXPECT_EQ(item->url(), Letter);
  EXPECT_EQ(item->resolvedURL(), outside);
  EXPECT_EQ(item->localizedName(), "report");
}

TEST_F(DRItemCacheTest, noURLOrNothingThereIsNoRecordAndLogged) {
  EXPECT_FALSE(DRItem::initWithURL(std::nullopt));
  EXPECT_TRUE(logged("ERROR", "Failed to cache values for URL (null)"));
  EXPECT_FALSE(DRItem::initWithURL(URL("/nowhere")));
  EXPECT_TRUE(logged("ERROR", "Failed to cache values for URL file:///nowhere"));
}

TEST_F(DRItemCacheTest, aPromiseIsKnownByTheIdentityOfItsURLs) {
  const URL physical("/drive/mirror/com~marrow~Kestrel/.letter.txt.vlopromise");
  EXPECT_FALSE(DRItem::initWithURL(Letter)->isPromise());
  world.physicalOfLogical.insert_or_assign(Letter.path(), physical);
  const auto item = DRItem::initWithURL(Letter);
  EXPECT_TRUE(item->isPromise());
  EXPECT_EQ(item->promiseURL(), physical);
  // An equal URL that is another object counts as one too.
  item->setPromiseURL(URL(Letter.path()));
  EXPECT_TRUE(item->isPromise());
  item->setPromiseURL(item->resolvedURL());
  EXPECT_FALSE(item->isPromise());
  item->setIsPromise(true);
  EXPECT_FALSE(item->isPromise());
}

TEST_F(DRItemCacheTest, anEqualURLDoesNotRefillAndAnotherOneDoes) {
  const auto item = DRItem::initWithURL(Letter);
  world.calls.clear();
  item->setUrl(URL(Letter.path()));
  EXPECT_TRUE(world.calls.empty());

  const URL other("/drive/mirror/com~marrow~Kestrel/other.txt");
  world.addFile(other, {{K::Name, "other.txt"}});
  item->setThumbnailFetched(true);
  item->setUrl(other);
  EXPECT_EQ(item->url(), other);
  EXPECT_EQ(item->localizedName(), "other.txt");
  EXPECT_FALSE(item->thumbnailFetched());
}

TEST_F(DRItemCacheTest, aRefillThatFailsKeepsTheNewURLAndTheClearedDefaults) {
  const auto item = DRItem::initWithURL(Letter);
  item->setUrl(URL("/nowhere"));
  EXPECT_EQ(item->url(), URL("/nowhere"));
  EXPECT_FALSE(item->localizedName());
  EXPECT_TRUE(item->renameable());
}

TEST_F(DRItemCacheTest, clearingRestoresTheDefaultsAndLeavesTheRest) {
  const auto item = DRItem::initWithURL(Letter);
  item->setIsPromise(true);
  item->setFileSize(3);
  item->setFriendlyFileSize("3 bytes");
  item->setCreationDate(Date());
  item->setContentModificationDate(Date());
  item->setParentDirectoryURL(Drive);
  item->setTypeIdentifier("public.text");
  item->setLocalizedTypeDescription("Text");
  item->setTags(std::vector<std::string>{"Red"});
  item->setIsContainer(true);
  item->setIsDirectory(true);
  item->setIsBookmark(true);
  item->setIsDownloaded(true);
  item->setHasHiddenExtension(false);
  item->setRenameable(false);
  item->setThumbnailFetched(true);
  item->clearValues();
  EXPECT_FALSE(item->resolvedURL() || item->localizedName() || item->typeIdentifier() || item->promiseURL() ||
               item->localizedTypeDescription() || item->fileSize() || item->friendlyFileSize() || item->creationDate() ||
               item->contentModificationDate() || item->parentDirectoryURL() || item->tags() || item->symlinkTarget());
  EXPECT_FALSE(item->isContainer() || item->isDirectory() || item->isPackage() || item->thumbnailFetched() ||
               item->isBookmark() || item->isDownloaded() || item->isSymlink());
  EXPECT_TRUE(item->hasHiddenExtension());
  EXPECT_TRUE(item->renameable());
  EXPECT_EQ(item->url(), Letter);
  EXPECT_TRUE(item->canPreview());
  EXPECT_NE(item->description().find("Promise, "), std::string::npos);
}

TEST_F(DRItemCacheTest, thePlainInitialiserIsForbidden) {
  try {
    DRItem::init();
    FAIL();
  } catch (const std::invalid_argument& error) {
    EXPECT_STREQ(error.what(), "Don't call -[DRItem init].");
  }
}

}  // namespace
}  // namespace vaelo
