// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>

#include "items/launch_utils.h"
#include "items/url_additions.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

using K = ResourceKey;
using Lines = std::vector<std::string>;

const URL Document("/drive/mirror/com~marrow~Kestrel/a.txt");
const URL InLibrary("/drive/mirror/org~example~Sketchbook/Documents/a.txt");

ApplicationRecord app(const std::string& identifier) {
  ApplicationRecord record;
  record.bundleIdentifier = identifier;
  record.isInstalled = record.supportsOpenInPlace = true;
  return record;
}

/// The corners of references to documents, and of who opens them.
class ItemsReviewReferencesTest : public ItemsTest {
 protected:
  ItemsReviewReferencesTest() {
    world.typeOfExtension = {{"txt", "public.text"}};
    world.addFile(Document);
    world.addFile(InLibrary);
  }
  void own(std::vector<ApplicationRecord> owners) {
    world.ranked = DocumentRecord::Ranked{{HandlerRankOwner, std::move(owners)}};
  }
  bool open(const URL& document) {
    return LaunchUtils::openInDefaultAppViewControllerRequireOpenIn(document, nullptr, true);
  }
};

// References.

TEST_F(ItemsReviewReferencesTest, theFirstContainerThatTakesItemsAnswersForAll) {
  const auto first =
      std::make_shared<TestContainer>("org~example~First", "First", URL("/drive/mirror/org~example~First/Documents", true));
  const auto last =
      std::make_shared<TestContainer>("org~example~Last", "The last", URL("/drive/mirror/org~example~Last/Documents", true));
  world.containers = {first, world.drive, world.appLibrary, last};
  world.movableTo = {LibraryIdentifier, "org~example~Last"};
  EXPECT_TRUE(vlo_canCrossZoneMoveURLs({Document}));
  EXPECT_EQ(world.calls, (Lines{std::string("canMove ") + DriveIdentifier + " org~example~First",
                                std::string("canMove ") + DriveIdentifier + " " + LibraryIdentifier}));
  world.movableTo.clear();
  world.calls.clear();
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({Document, InLibrary}));
  EXPECT_EQ(world.calls.size(), 3u) << "all but its own";
}

TEST_F(ItemsReviewReferencesTest, theFolderTestAsksForTheContainerFirst) {
  const URL documents = Drive.appendingPathComponent("Documents");
  EXPECT_TRUE(vlo_isDesktopOrDocumentsFolder(documents));
  world.containerError = fileError(FileErrorCode::ReadUnknown);
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(documents));
  world.containerErrorComesWithValue = true;
  EXPECT_TRUE(vlo_isDesktopOrDocumentsFolder(documents));
}

TEST_F(ItemsReviewReferencesTest, aFolderOfAnotherContainerIsNeitherDesktopNorDocuments) {
  world.containerOfEverything = world.appLibrary;
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(Drive.appendingPathComponent("Documents")));
}

TEST_F(ItemsReviewReferencesTest, whereTheContainerIsUnknownNothingIsPromised) {
  world.movableTo = {LibraryIdentifier, DriveIdentifier};
  world.containerLookupTellsNothing = true;
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(Drive.appendingPathComponent("Documents")));
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({Document}));
}

TEST_F(ItemsReviewReferencesTest, theLargestNumbersAreReadToTheirLastDigit) {
  for (const char* number : {"18446744073709551614", "17000000000000000000", "9223372036854775808"}) {
    vlo_URLFromDocumentID(number);
    EXPECT_TRUE(world.called(std::string("resolve ") + number));
  }
}

TEST_F(ItemsReviewReferencesTest, anIdentifierIsReadAsASignedNumber) {
  world.addFile(Document, {{K::DocumentIdentifier, std::uint64_t{18446744073709551615u}}});
  EXPECT_EQ(vlo_DocumentID(Document), -1);
  world.promisedAnswers.insert_or_assign(Document.path(), ResourceMap{{K::DocumentIdentifier, Value()}});
  EXPECT_EQ(vlo_DocumentID(Document), -1) << "a promised value that is empty counts as none";
  EXPECT_EQ(world.lastKeys, std::vector{K::DocumentIdentifier});
  world.openAttributes.value = {-1, Document.path()};
  EXPECT_EQ(vlo_URLFromDocumentID("18446744073709551615"), Document);
}

TEST_F(ItemsReviewReferencesTest, aHandleOfZeroIsOneLikeAnother) {
  world.openedHandle = {0, {}};
  world.openAttributes.value = {42, Document.path()};
  EXPECT_EQ(vlo_URLFromDocumentID("42"), Document);
  EXPECT_TRUE(world.called("attributes 0") && world.called("close 0"));
}

TEST_F(ItemsReviewReferencesTest, theFileIsClosedWhenItHasBeenAsked) {
  world.openAttributes.value = {42, Document.path()};
  vlo_URLFromDocumentID("42");
  EXPECT_EQ(world.indexOf("close 7"), world.indexOf("attributes 7") + 1);
  EXPECT_EQ(std::count(world.calls.begin(), world.calls.end(), "close 7"), 1);
}

TEST_F(ItemsReviewReferencesTest, textWithoutDigitsIsNoIdentifierOfAnything) {
  world.resolvedFile = {std::nullopt, {2, "No such file"}};
  EXPECT_FALSE(vlo_URLFromDocumentID("none"));
  EXPECT_TRUE(world.called("resolve 0"));
  EXPECT_EQ(messages(), Lines{"ERROR TBLibraryResolveDocumentId2 failed, errno:2(No such file)"});
}

TEST_F(ItemsReviewReferencesTest, anEndOfTheProgramSaysWhy) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  world.recordedLog.echoes = true;
  world.openedHandle = {-1, {}};
  EXPECT_DEATH(vlo_URLFromDocumentID("42"), "\\(VLO\\)\\[ERROR\\] .* fd >= 0\n");
  world.device_ = std::nullopt;
  EXPECT_DEATH(vlo_URLFromDocumentID("42"), "\\(VLO\\)\\[ERROR\\] .* could not get device ID\n");
}

// Who opens a document.

TEST_F(ItemsReviewReferencesTest, aDocumentCountsAsOpenedOnceItWasHandedOver) {
  own({app("first")});
  world.opensInPlace = false;
  EXPECT_TRUE(open(Document)) << "whatever became of it";
}

TEST_F(ItemsReviewReferencesTest, inALibraryTheBrowserMayBeAnOwner) {
  own({app("com.marrow.VaeloDrive")});
  world.applications.insert_or_assign("com.marrow.VaeloDrive", app("com.marrow.VaeloDrive"));
  world.appLibrary->owners = {"com.marrow.VaeloDrive"};
  EXPECT_TRUE(open(InLibrary));
  EXPECT_FALSE(open(Document));
}

TEST_F(ItemsReviewReferencesTest, inALibraryTheDocumentOfABookmarkIsJudged) {
  const URL letter("/home/somebody/b.txt");
  world.bookmarks.insert_or_assign(InLibrary.path(), letter);
  own({app("main")});
  world.applications.insert_or_assign("main", app("main"));
  world.appLibrary->owners = {"main"};
  EXPECT_TRUE(open(InLibrary));
  EXPECT_TRUE(world.called("record " + letter.path()) && world.called("open " + letter.path() + " with main"));
  EXPECT_EQ(LaunchUtils::defaultAppForDocumentRequireOpenIn(InLibrary, false)->bundleIdentifier, "main");
}

TEST_F(ItemsReviewReferencesTest, withoutItsContainerNobodyIsAskedForADocument) {
  own({app("other")});
  world.containers.clear();
  EXPECT_FALSE(open(InLibrary));
  EXPECT_FALSE(world.called("record " + InLibrary.path()));
}

TEST_F(ItemsReviewReferencesTest, anOwnerThatIsUnknownIsNotInstalledEvenWhereOthersOwnTheType) {
  own({app("other")});
  world.appLibrary->owners = {"gone"};
  EXPECT_FALSE(open(InLibrary)) << "the first candidate stands in for an installed owner only";
  EXPECT_EQ(messages().back(), "DEBUG Container Sketchbook: Default app (gone) not installed");
}

TEST_F(ItemsReviewReferencesTest, theFirstOwnerThatAnswersEndsTheSearch) {
  own({app("second"), app("first")});
  for (const char* owner : {"first", "second"}) world.applications.insert_or_assign(owner, app(owner));
  world.appLibrary->owners = {"first", "second"};
  EXPECT_EQ(LaunchUtils::defaultAppForDocumentRequireOpenIn(InLibrary, true)->bundleIdentifier, "first");
  EXPECT_FALSE(logged("DEBUG", "Container Sketchbook: Default app (second) supports open in place"));
}

}  // namespace
}  // namespace vaelo
