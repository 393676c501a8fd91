// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/url_additions.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

using K = ResourceKey;
using Lines = std::vector<std::string>;

const URL Link("/drive/mirror/com~marrow~Kestrel/report.vaelobookmark");
const URL Target("/home/somebody/report.pdf");
const URL Physical("/home/somebody/.report.pdf.vlopromise");
const URL Found("/drive/mirror/com~marrow~Kestrel/found.txt");

class URLAdditionsTest : public ItemsTest {};

TEST_F(URLAdditionsTest, aBookmarkIsResolvedAndWhatItLeadsToIsNoPromiseAnyMore) {
  world.bookmarks.insert_or_assign(Link.path(), Target);
  EXPECT_EQ(vlo_URLByResolvingBookmark(Link), Target);
  world.bookmarks.insert_or_assign(Link.path(), Physical);
  world.logicalOfPromise.insert_or_assign(Physical.path(), Target);
  EXPECT_EQ(vlo_URLByResolvingBookmark(Link), Target);
  EXPECT_EQ(vlo_URLByResolvingAlias(Link), Target);
}

TEST_F(URLAdditionsTest, whatIsNoBookmarkComesBackUnchangedPromisesToo) {
  world.logicalOfPromise.insert_or_assign(Physical.path(), Target);
  const auto answer = vlo_URLByResolvingBookmark(Physical);
  ASSERT_TRUE(answer);
  EXPECT_TRUE(answer->sameObject(Physical));
  EXPECT_TRUE(vlo_URLByResolvingAlias(Physical).sameObject(Physical));
}

TEST_F(URLAdditionsTest, aBookmarkThatLeadsNowhereIsNothingAndAsAnAliasItself) {
  world.bookmarks.insert_or_assign(Link.path(), fileError(FileErrorCode::NoSuchFile));
  EXPECT_FALSE(vlo_URLByResolvingBookmark(Link));
  EXPECT_EQ(vlo_URLByResolvingAlias(Link), Link);
}

TEST_F(URLAdditionsTest, anErrorBesideAURLMattersToTheAliasFormOnly) {
  Result<URL> both(Target);
  both.error = fileError(FileErrorCode::ReadUnknown);
  world.bookmarks.insert_or_assign(Link.path(), both);
  EXPECT_EQ(vlo_URLByResolvingBookmark(Link), Target);
  EXPECT_EQ(vlo_URLByResolvingAlias(Link), Link);
}

TEST_F(URLAdditionsTest, promises) {
  world.logicalOfPromise.insert_or_assign(Physical.path(), Target);
  EXPECT_EQ(vlo_URLByResolvingPromise(Physical), Target);
  EXPECT_EQ(vlo_URLByResolvingPromise(Link), Link);
}

TEST_F(URLAdditionsTest, onlyTheTwoFoldersOfTheDriveItself) {
  EXPECT_TRUE(vlo_isDesktopOrDocumentsFolder(Drive.appendingPathComponent("Desktop")));
  EXPECT_TRUE(vlo_isDesktopOrDocumentsFolder(Drive.appendingPathComponent("Documents")));
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(Drive.appendingPathComponent("Documents/Documents")));
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(Drive.appendingPathComponent("documents")));
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(Drive));
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(LibraryDocuments));
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(URL("/outside/Documents")));
}

TEST_F(URLAdditionsTest, movingAcrossContainersAsksForTheContainerOfTheFirst) {
  const URL inDrive = Drive.appendingPathComponent("a");
  const URL inLibrary = LibraryDocuments.appendingPathComponent("b");
  world.movableTo = {LibraryIdentifier};
  EXPECT_TRUE(vlo_canCrossZoneMoveURLs({inDrive}));
  EXPECT_EQ(world.calls, Lines{std::string("canMove ") + DriveIdentifier + " " + LibraryIdentifier});
  EXPECT_TRUE(vlo_canCrossZoneMoveURLs({inDrive, inLibrary}));
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({inLibrary, inDrive}));
}

TEST_F(URLAdditionsTest, movingAcrossContainersNeedsItemsAndContainers) {
  world.movableTo = {LibraryIdentifier, DriveIdentifier};
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({}));
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({URL("/outside/a")}));
  world.containers.clear();
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({Drive.appendingPathComponent("a")}));
}

TEST_F(URLAdditionsTest, theDocumentIdentifierIsThePromisedItemsElseTheFiles) {
  world.addFile(Found, {{K::DocumentIdentifier, std::int64_t{-5}}});
  EXPECT_EQ(vlo_DocumentID(Found), -5);
  EXPECT_EQ(world.recordedLog.lines(), Lines{"URL"});
  EXPECT_EQ(world.recordedLog.types(), std::vector{LogType::Default});
  EXPECT_FALSE(world.called("plain " + Found.path()));
  for (const Result<ResourceMap>& answer :
       {Result<ResourceMap>(ResourceMap{}), Result<ResourceMap>(fileError(FileErrorCode::ReadUnknown))}) {
    world.promisedAnswers.insert_or_assign(Found.path(), answer);
    EXPECT_EQ(vlo_DocumentID(Found), -5);
  }
  EXPECT_EQ(vlo_DocumentID(URL("/nowhere")), 0);
}

TEST_F(URLAdditionsTest, anIdentifierLeadsToAFile) {
  world.openAttributes.value = {42, Found.path()};
  EXPECT_EQ(vlo_URLFromDocumentID("42"), Found);
  // The device is asked for once in a process, which may have been before.
  std::erase(world.calls, "deviceOf " + Drive.path());
  EXPECT_EQ(world.calls, (Lines{"resolve 42", "openByID 7", "attributes 7", "close 7"}));
  EXPECT_EQ(world.devices.size(), 1u);
  EXPECT_TRUE(messages().empty());
  world.calls.clear();
  vlo_URLFromDocumentID("42");
  EXPECT_FALSE(world.called("deviceOf " + Drive.path()));
}

TEST_F(URLAdditionsTest, theDigitsAtTheStartAreTheIdentifier) {
  struct Case {
    const char* text;
    const char* number;
  };
  for (const Case& scanned :
       {Case{" 17 apples", "17"}, Case{"apples 17", "0"}, Case{"", "0"}, Case{"-4", "0"},
        Case{"18446744073709551615", "18446744073709551615"}, Case{"18446744073709551616", "18446744073709551615"}}) {
    world.calls.clear();
    vlo_URLFromDocumentID(scanned.text);
    EXPECT_TRUE(world.called(std::string("resolve ") + scanned.number)) << scanned.text;
  }
}

TEST_F(URLAdditionsTest, noIdentifier) {
  EXPECT_FALSE(vlo_URLFromDocumentID(std::nullopt));
  EXPECT_EQ(messages(), Lines{"ERROR vlo_URLFromDocumentID: missing document ID"});
  EXPECT_TRUE(world.calls.empty());
}

TEST_F(URLAdditionsTest, eachStepThatFailsIsLoggedWithItsNumberAndText) {
  world.resolvedFile = {std::nullopt, {2, "No such file"}};
  EXPECT_FALSE(vlo_URLFromDocumentID("42"));
  EXPECT_EQ(messages(), Lines{"ERROR TBLibraryResolveDocumentId2 failed, errno:2(No such file)"});

  world.recordedLog.clear();
  world.resolvedFile = {DocumentStore::FileID{7}, {}};
  world.openedHandle = {std::nullopt, {13, "Permission denied"}};
  EXPECT_FALSE(vlo_URLFromDocumentID("42"));
  EXPECT_EQ(messages(), Lines{"ERROR openbyid_np failed, errno:13(Permission denied)"});
  EXPECT_FALSE(world.called("close 7"));

  world.recordedLog.clear();
  world.openedHandle = {7, {}};
  world.openAttributes = {std::nullopt, {5, "Input/output error"}};
  EXPECT_FALSE(vlo_URLFromDocumentID("42"));
  EXPECT_EQ(messages(), Lines{"ERROR fgetattrlist failed, error:5(Input/output error)"});
  EXPECT_TRUE(world.called("close 7"));
}

TEST_F(URLAdditionsTest, aFileThatSaysItIsAnotherIsRefused) {
  world.openAttributes.value = {43, Found.path()};
  EXPECT_FALSE(vlo_URLFromDocumentID("42"));
  EXPECT_EQ(messages(), Lines{"ERROR document IDs didn't match (43 v/s 42)"});
  EXPECT_TRUE(world.called("close 7"));
}

using URLAdditionsDeathTest = URLAdditionsTest;

TEST_F(URLAdditionsDeathTest, aHandleBelowZeroEndsTheProgram) {
  world.openedHandle = {-1, {}};
  EXPECT_DEATH(vlo_URLFromDocumentID("42"), "");
}

// The device is kept, so that what is said of it is tried in processes of their own.

TEST_F(URLAdditionsDeathTest, theDeviceIsThatOfTheDrivesOwnFolder) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  world.device_ = 77;
  const auto devicesAreRight = [this] {
    vlo_URLFromDocumentID("42");
    return world.devices == std::set<DocumentStore::Device>{77} && world.called("deviceOf " + Drive.path());
  };
  EXPECT_EXIT(std::exit(devicesAreRight() ? 0 : 1), ::testing::ExitedWithCode(0), "");
}

TEST_F(URLAdditionsDeathTest, aDriveWithoutDeviceEndsTheProgram) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  world.device_ = std::nullopt;
  EXPECT_DEATH(vlo_URLFromDocumentID("42"), "");
}

TEST_F(URLAdditionsTest, soundAndFilmPlayInThePlatformsPlayer) { EXPECT_TRUE(wantsDefaultMediaPlayer(Found)); }

}  // namespace
}  // namespace vaelo
