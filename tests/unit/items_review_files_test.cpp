// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>

#include "items/file_utils.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

using K = ResourceKey;
using Lines = std::vector<std::string>;

const URL A("/drive/mirror/com~marrow~Kestrel/a");
const URL B("/drive/mirror/com~marrow~Kestrel/b");
const Date Noon{std::chrono::hours(12)};

std::string text(const URL& url) { return url.absoluteString(); }

/// The corners of changing files, of judging types and of telling places.
class ItemsReviewFilesTest : public ItemsTest {
 protected:
  void addDatedFile(const URL& url, Date date) { world.addFile(url, {{K::ContentModificationDate, date}}); }
  std::optional<Error> split(const URL& url) {
    return FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(url, &container, &names);
  }
  bool isValidInLibrary(const std::string& name) {
    return FileUtils::isValidExtensionForContainer(LibraryDocuments.appendingPathComponent(name));
  }

  CloudContainerRef container;
  Lines names{"untouched"};
};

// Changes.

TEST_F(ItemsReviewFilesTest, whatTheCoordinatorRefusesIsNotTried) {
  addDatedFile(A, Noon);
  world.coordinatorError = fileError(FileErrorCode::WriteNoPermission);
  const std::string refusal = world.coordinatorError->description();
  for (const auto& error : {FileUtils::mkdir(A), FileUtils::remove(A), FileUtils::moveTo(A, B)}) {
    ASSERT_TRUE(error);
    EXPECT_EQ(error->code, FileErrorCode::WriteNoPermission);
  }
  EXPECT_EQ(world.calls, (Lines{"coordinator", "write 0 " + A.path(), "promised " + A.path(), "coordinator",
                                "write 1 " + A.path(), "coordinator", "write 2 " + A.path() + " 4 " + B.path()}))
      << "each with a coordinator of its own that tells every presenter";
  EXPECT_EQ(messages(), (Lines{"DEBUG Creating directory: '" + text(A) + "'", "DEBUG Coordinated Write returned " + refusal,
                               "DEBUG Removing item: '" + text(A) + "'", "INFO Coordinated Write returned " + refusal,
                               "DEBUG Moving src1:  '" + text(A) + "'", "DEBUG Moving dest1: '" + text(B) + "'",
                               "WARNING Move failed: " + refusal}));
}

TEST_F(ItemsReviewFilesTest, theDateBeforeIsThatOfTheItemAndTheDateAfterThatOfWhereTheCoordinatorSays) {
  addDatedFile(A, Noon);
  addDatedFile(B, Noon + std::chrono::seconds(1));
  world.redirected.insert_or_assign(A.path(), B);
  EXPECT_EQ(FileUtils::remove(A)->code, FileErrorCode::UserCancelled);
  EXPECT_FALSE(world.called("remove " + B.path()));
  EXPECT_TRUE(logged("INFO", "Date changed during delete (user chose Keep?) -- preserving document: '" + text(B) + "'"));
}

TEST_F(ItemsReviewFilesTest, theDateIsReadBeforeTheCoordination) {
  addDatedFile(A, Noon);
  world.beforeAccessor = [this] {
    addDatedFile(A, Noon + std::chrono::seconds(1));
    addDatedFile(B, Noon);
  };
  EXPECT_TRUE(FileUtils::remove(A));
  EXPECT_EQ(world.calls.front(), "promised " + A.path());
}

TEST_F(ItemsReviewFilesTest, datesThatOnlyTheFileItselfKnowsServeAsWell) {
  addDatedFile(A, Noon);
  world.promisedAnswers.insert_or_assign(A.path(), fileError(FileErrorCode::ReadUnknown));
  EXPECT_FALSE(FileUtils::remove(A));
  EXPECT_TRUE(world.called("remove " + A.path()));
}

TEST_F(ItemsReviewFilesTest, aFileThatIsNotDownloadedIsNeitherFileNorFolder) {
  world.addFile(A).isPromise = true;
  EXPECT_FALSE(FileUtils::exists(A) || FileUtils::isFile(A) || FileUtils::isDir(A));
  world.addFolder(B);
  FileUtils::moveTo(A, B);
  EXPECT_TRUE(world.called("move " + A.path() + " " + B.path())) << "left to the file manager";
  EXPECT_TRUE(logged("INFO", "Move: source filename does not exist, must be a fault."));
}

TEST_F(ItemsReviewFilesTest, aMoveToANewPlaceIsTriedForFilesAndFoldersAlike) {
  world.addFile(A);
  EXPECT_FALSE(FileUtils::moveTo(A, B));
  world.items.erase(B.path());
  world.addFolder(A);
  EXPECT_FALSE(FileUtils::moveTo(A, B));
  EXPECT_EQ(std::count(world.calls.begin(), world.calls.end(), "move " + A.path() + " " + B.path()), 2);
  EXPECT_FALSE(logged("INFO", "Move: source filename does not exist, must be a fault."));
}

TEST_F(ItemsReviewFilesTest, nothingIsSaidOfFailureWhenAMoveWorks) {
  world.addFile(A);
  FileUtils::moveTo(A, B);
  EXPECT_EQ(messages().back(), "INFO Move successful");
}

TEST_F(ItemsReviewFilesTest, aDocumentsDirectoryWithoutATildeStaysAsItIs) {
  world.documentsDirectories = {"/data/Documents", "~/Documents"};
  EXPECT_EQ(FileUtils::docDir()->path(), "/data/Documents");
}

TEST_F(ItemsReviewFilesTest, aValueThatIsThereButEmptyCountsAsNone) {
  world.addFile(A, {{K::Name, "a"}});
  world.promisedAnswers.insert_or_assign(A.path(), ResourceMap{{K::Name, Value()}});
  EXPECT_EQ(FileUtils::getResourceValueForURL(K::Name, A), Value("a"));
  EXPECT_EQ(world.lastKeys, std::vector{K::Name});
  world.plainAnswers.insert_or_assign(A.path(), fileError(FileErrorCode::ReadUnknown));
  EXPECT_FALSE(FileUtils::getResourceValueForURL(K::Name, A).isPresent());
  EXPECT_TRUE(messages().empty()) << "errors are discarded";
}

TEST_F(ItemsReviewFilesTest, attributesThatAreNotKnownAreLoggedAsNone) {
  world.now_ = Noon;
  world.addFile(A);
  FileUtils::logFileAttributes(A.path());
  EXPECT_EQ(messages(), (Lines{"DEBUG Date Created: (null) (0.000000 seconds ago)",
                               "DEBUG Date Modified: (null) (0.000000 seconds ago)", "DEBUG Size: (null) bytes"}));
}

// Types.

TEST_F(ItemsReviewFilesTest, mediaTypesAreTriedInTheirOrder) {
  const Lines media{"public.image", "public.movie", "public.audio", "com.adobe.pdf"};
  world.typeOfExtension["all"] = "org.example.all";
  std::set<std::string>& conforms = world.conformances["org.example.all"];
  conforms = {media.begin(), media.end()};
  for (const std::string& first : media) {
    world.recordedLog.clear();
    EXPECT_TRUE(FileUtils::isAudioVideoImageFile(URL("/x/y.all")));
    EXPECT_EQ(messages(),
              Lines{"DEBUG isAudioVideoImageFile: Extension all is org.example.all which conforms to UTI " + first});
    conforms.erase(first);
  }
  EXPECT_FALSE(FileUtils::isAudioVideoImageFile(URL("/x/y.all")));
}

TEST_F(ItemsReviewFilesTest, aDeclaredTypeIsWelcomeWhereAnotherEntryIsBroken) {
  world.typeOfExtension["png"] = "public.png";
  world.appLibrary->types.emplace({DeclaredDocumentType{Array{std::int64_t{3}, "public.png"}}});
  EXPECT_TRUE(isValidInLibrary("a.png"));
  EXPECT_EQ(messages(), (Lines{"ERROR Expected array of strings", "INFO Extension png conforms to UTI public.png"}));
  world.recordedLog.clear();
  world.appLibrary->types.emplace({DeclaredDocumentType{Array{std::int64_t{3}, "public.data"}}});
  EXPECT_TRUE(isValidInLibrary("a.png"));
  EXPECT_EQ(messages(), (Lines{"ERROR Expected array of strings", "INFO Container supports all UTIs"}));
}

TEST_F(ItemsReviewFilesTest, aTypeIsLookedAtOnceHoweverManyStandBetween) {
  world.typeOfExtension["png"] = "public.png";
  world.appLibrary->types.emplace({DeclaredDocumentType{Array{std::int64_t{3}, std::int64_t{4}}},
                                   DeclaredDocumentType{Array{std::int64_t{3}, "public.movie"}}});
  EXPECT_FALSE(isValidInLibrary("a.png"));
  EXPECT_EQ(messages(), (Lines{"ERROR Expected array of strings", "ERROR Expected array of strings"}));
}

TEST_F(ItemsReviewFilesTest, aLineThatBreaksWithoutAControlCharacterIsNoName) {
  EXPECT_FALSE(FileUtils::isValidFilename("a\xE2\x80\xA8z"));
  EXPECT_TRUE(FileUtils::isValidFilename("aXz"));
}

TEST_F(ItemsReviewFilesTest, anEmptyTypeIsWelcomeEverywhere) {
  world.typeOfExtension["empty"] = "";
  world.appLibrary->types.emplace({DeclaredDocumentType{Array{"public.png"}}});
  EXPECT_TRUE(isValidInLibrary("a.empty"));
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(URL("/outside/a.empty")));
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(URL("/outside/plain")));
}

// Places.

TEST_F(ItemsReviewFilesTest, aPathThatCannotBeSplitWinsOverAFailedLookup) {
  world.containerError = fileError(FileErrorCode::ReadUnknown);
  world.appLibrary->folder = std::nullopt;
  EXPECT_EQ(split(LibraryDocuments.appendingPathComponent("a"))->code, FileErrorCode::Formatting);
  EXPECT_EQ(container, world.appLibrary);
}

TEST_F(ItemsReviewFilesTest, aFailedLookupIsReportedWithoutComponentsToo) {
  world.containerError = fileError(FileErrorCode::ReadUnknown);
  const URL item = LibraryDocuments.appendingPathComponent("a");
  EXPECT_EQ(FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(item, &container, nullptr)->code,
            FileErrorCode::ReadUnknown);
  EXPECT_EQ(container, world.appLibrary);
}

TEST_F(ItemsReviewFilesTest, aLookupThatGivesAContainerAndAnErrorNeedsTheTableOfContainers) {
  world.containers.clear();
  world.containerError = fileError(FileErrorCode::ReadUnknown);
  EXPECT_EQ(split(LibraryDocuments.appendingPathComponent("a"))->code, FileErrorCode::ReadUnknown);
  EXPECT_FALSE(container);
  EXPECT_EQ(messages(), Lines{"WARNING Split URL: " + world.containerError->description()});
}

TEST_F(ItemsReviewFilesTest, aContainerBesideAnErrorDoesNotServeByItself) {
  world.containerOfEverything = world.appLibrary;
  world.containers.clear();
  world.containerError = fileError(FileErrorCode::ReadUnknown);
  world.containerErrorComesWithValue = true;
  EXPECT_EQ(split(LibraryDocuments.appendingPathComponent("a"))->code, FileErrorCode::ReadUnknown);
  EXPECT_FALSE(container);
  EXPECT_EQ(names, Lines{"untouched"});
}

TEST_F(ItemsReviewFilesTest, aLookupThatTellsNothingIsTriedByIdentifierAndIsNoError) {
  world.containerLookupTellsNothing = true;
  const URL item = LibraryDocuments.appendingPathComponent("a.txt");
  world.addFile(item, {{K::LocalizedName, "a"}});
  EXPECT_FALSE(split(item));
  EXPECT_EQ(container, world.appLibrary);
  EXPECT_EQ(names, Lines{"a"});
  world.containers.clear();
  container = nullptr;
  EXPECT_FALSE(split(item)) << "no error, and no container either";
  EXPECT_FALSE(container);
  EXPECT_EQ(messages(), Lines{"WARNING Split URL: (null)"});
  EXPECT_FALSE(FileUtils::displayableLocationForURL(item));
  world.typeOfExtension["txt"] = "public.text";
  EXPECT_FALSE(FileUtils::isValidExtensionForContainer(item));
}

TEST_F(ItemsReviewFilesTest, anItemOutsideTheMirrorCannotBeSplitWhateverItsContainer) {
  world.containerOfEverything = world.appLibrary;
  EXPECT_EQ(split(URL("/outside/a"))->code, FileErrorCode::Formatting);
  EXPECT_EQ(container, world.appLibrary);
  EXPECT_EQ(names, Lines{"untouched"});
}

TEST_F(ItemsReviewFilesTest, aNameThatIsAbsentIsThatOfThePath) {
  const URL item = LibraryDocuments.appendingPathComponent("a.txt");
  world.addFile(item);
  EXPECT_FALSE(split(item));
  EXPECT_EQ(names, Lines{"a.txt"});
  EXPECT_EQ(messages(), Lines{"DEBUG Can't get localizedName for URL " + text(item) + ": err (null)"});
}

TEST_F(ItemsReviewFilesTest, theLineOfAnItemAtTheTopOfALibraryIsTheDriveAndTheLibrary) {
  const URL item = LibraryDocuments.appendingPathComponent("a.txt");
  world.addFile(item, {{K::LocalizedName, "a"}});
  EXPECT_EQ(FileUtils::displayableLocationForURL(item), "\u2068Vaelo Drive\u2069 \u25B8 \u2068Sketchbook\u2069");
  EXPECT_EQ(FileUtils::displayableLocationForURL(LibraryDocuments), "\u2068Vaelo Drive\u2069 \u25B8 \u2068Sketchbook\u2069");
}

TEST_F(ItemsReviewFilesTest, theLineOfAnItemInAFolderOfTheDriveHasTheDriveAndTheFolder) {
  const URL folder = Drive.appendingPathComponent("Plans");
  world.addFolder(folder, {{K::LocalizedName, "Pläne"}});
  EXPECT_EQ(FileUtils::displayableLocationForURL(folder.appendingPathComponent("a")),
            "\u2068Vaelo Drive\u2069 \u25B8 \u2068Pläne\u2069");
}

}  // namespace
}  // namespace vaelo
