// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "items/file_utils.h"
#include "items/url_additions.h"
#include "tests/support/memory_platform.h"

namespace vaelo {
namespace {

using ::testing::_;
using ::testing::Return;

const std::string Drive = "/drive/mirror/com~marrow~Kestrel";

class NamesAndPlacesTest : public ::testing::Test {
 protected:
  NamesAndPlacesTest() { library = platform.drive.addContainer("org~example~Sketch", "Sketchbook"); }
  URL inLibrary(const std::string& path) const { return URL("/drive/mirror/org~example~Sketch/Documents/" + path); }
  MemoryPlatform platform;
  std::shared_ptr<MemoryContainer> library;
};

TEST_F(NamesAndPlacesTest, NamesAreJudged) {
  for (const char* good : {"Report.pdf", "   ", "a.b.c", "ünï"}) EXPECT_TRUE(FileUtils::isValidFilename(good)) << good;
  for (const char* bad : {"", ".hidden", "a/b", "a:b", "tab\there", "line\nbreak", "ill\x7f"}) {
    EXPECT_FALSE(FileUtils::isValidFilename(bad)) << bad;
  }
}

TEST_F(NamesAndPlacesTest, MediaAreToldByExtension) {
  for (const char* name : {"/a.png", "/a.mov", "/a.mp3", "/a.PDF"})
    EXPECT_TRUE(FileUtils::isAudioVideoImageFile(URL(name))) << name;
  EXPECT_TRUE(
      platform.log.has("DEBUG", "isAudioVideoImageFile: Extension png is public.png which conforms to UTI public.image"));
  platform.log.clear();
  EXPECT_FALSE(FileUtils::isAudioVideoImageFile(URL("/a.txt")));
  EXPECT_TRUE(platform.log.has("DEBUG", "isAudioVideoImageFile: Extension txt is type.txt which is not."));
  platform.log.clear();
  EXPECT_FALSE(FileUtils::isAudioVideoImageFile(URL("/plain")));
  EXPECT_TRUE(platform.log.lines().empty());
}

TEST_F(NamesAndPlacesTest, AContainerTakesTheTypesThatItDeclares) {
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(inLibrary("plain")));
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(inLibrary("a.untyped")));
  EXPECT_FALSE(FileUtils::isValidExtensionForContainer(URL("/outside/a.png")));
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(URL(Drive + "/a.png")));
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(inLibrary("a.txt")));

  library->types = {{Value(Array{Value("public.audio"), Value("public.image")})}};
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(inLibrary("a.png")));
  EXPECT_TRUE(platform.log.has("INFO", "Extension png conforms to UTI public.image"));
  EXPECT_FALSE(FileUtils::isValidExtensionForContainer(inLibrary("a.txt")));

  for (const char* all : {"public.data", "public.content"}) {
    library->types = {{Value(Array{Value(all)})}};
    platform.log.clear();
    EXPECT_TRUE(FileUtils::isValidExtensionForContainer(inLibrary("a.txt"))) << all;
    EXPECT_TRUE(platform.log.has("INFO", "Container supports all UTIs"));
  }
  library->types = {{Value("no list")}};
  EXPECT_FALSE(FileUtils::isValidExtensionForContainer(inLibrary("a.png")));
  EXPECT_TRUE(platform.log.has("ERROR", "Expected content types of Set"));
  library->types = {{Value(Array{Value(true), Value("public.image")})}};
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(inLibrary("a.png")));
  EXPECT_TRUE(platform.log.has("ERROR", "Expected array of strings"));
  library->folder.reset();
  EXPECT_FALSE(FileUtils::isValidExtensionForContainer(inLibrary("a.png")));
}

TEST_F(NamesAndPlacesTest, AURLSplitsIntoContainerAndNames) {
  platform.drive.add(inLibrary("Animals/Birds/Owl.png").path()).values[ResourceKey::LocalizedName] = Value("The Owl");
  CloudContainerRef container;
  std::vector<std::string> names;
  EXPECT_FALSE(FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(inLibrary("Animals/Birds/Owl.png"),
                                                                                        &container, &names));
  EXPECT_EQ(container, library);
  EXPECT_EQ(names, (std::vector<std::string>{"Animals", "Birds", "The Owl"}));
}

TEST_F(NamesAndPlacesTest, ANameThatCannotBeReadIsThatOfThePath) {
  std::vector<std::string> names;
  EXPECT_FALSE(
      FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(inLibrary("gone.png"), nullptr, &names));
  EXPECT_EQ(names, std::vector<std::string>{"gone.png"});
  EXPECT_NE(platform.log.lines().back().find("Can't get localizedName for URL file://"), std::string::npos);
}

TEST_F(NamesAndPlacesTest, TheTopFolderItselfHasNoNamesAndAboveItIsAnError) {
  std::vector<std::string> names{"untouched"};
  EXPECT_FALSE(FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(*library->folder, nullptr, &names));
  EXPECT_EQ(names, std::vector<std::string>{"untouched"});
  const auto error = FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(
      URL("/drive/mirror/org~example~Sketch"), nullptr, &names);
  EXPECT_EQ(error->code, FileErrorCode::Formatting);
  EXPECT_EQ(names, std::vector<std::string>{"untouched"});
}

TEST_F(NamesAndPlacesTest, ALookupErrorIsReturnedEvenWhenTheTableKnowsTheContainer) {
  platform.drive.containerLookupError = Error{FileErrorDomain, 99, {}, {}, {}};
  CloudContainerRef container;
  EXPECT_EQ(
      FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(inLibrary("a"), &container, nullptr)->code,
      99);
  EXPECT_EQ(container, library);
  container.reset();
  EXPECT_EQ(
      FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(URL("/outside"), &container, nullptr)->code,
      99);
  EXPECT_EQ(container, nullptr);
  EXPECT_NE(platform.log.lines().back().find("(VLO)[WARNING]"), std::string::npos);
}

TEST_F(NamesAndPlacesTest, TheLocationLineNamesWhatIsAboveTheItem) {
  platform.drive.add(Drive + "/top.txt");
  EXPECT_EQ(FileUtils::displayableLocationForURL(URL(Drive + "/top.txt")), "\u2068Vaelo Drive\u2069");
  platform.drive.add(inLibrary("Animals/Birds/Owl.png").path());
  EXPECT_EQ(FileUtils::displayableLocationForURL(inLibrary("Animals/Birds/Owl.png")),
            "\u2068Vaelo Drive\u2069 ▸ \u2068Sketchbook\u2069 ▸ \u2068Animals\u2069 ▸ \u2068Birds\u2069");
  ON_CALL(platform.application, isRightToLeft).WillByDefault(Return(true));
  EXPECT_EQ(FileUtils::displayableLocationForURL(inLibrary("Animals/Birds")),
            "\u200F\u2068Vaelo Drive\u2069 ◂ \u2068Sketchbook\u2069 ◂ \u2068Animals\u2069");
  EXPECT_EQ(FileUtils::displayableLocationForURL(URL("/outside")), std::nullopt);
}

TEST_F(NamesAndPlacesTest, BookmarksResolveOrAreNothingAndAliasesStay) {
  const URL bookmark(Drive + "/a.vaelobookmark");
  platform.drive.add(bookmark.path()).bookmarkTarget = URL("/outside/doc.promise");
  platform.drive.promises.insert("/outside/doc.promise");
  EXPECT_EQ(vlo_URLByResolvingBookmark(bookmark), URL("/outside/doc.promise.logical"));
  platform.drive.items.erase(bookmark.path());
  EXPECT_EQ(vlo_URLByResolvingBookmark(bookmark), std::nullopt);
  EXPECT_EQ(vlo_URLByResolvingAlias(bookmark), bookmark);
  platform.drive.promises.insert(Drive + "/p");
  EXPECT_EQ(vlo_URLByResolvingBookmark(URL(Drive + "/p")), URL(Drive + "/p"));
  EXPECT_EQ(vlo_URLByResolvingPromise(URL(Drive + "/p")), URL(Drive + "/p.logical"));
}

TEST_F(NamesAndPlacesTest, OnlyTheDrivesOwnDesktopAndDocumentsAreSpecial) {
  EXPECT_TRUE(vlo_isDesktopOrDocumentsFolder(URL(Drive + "/Documents")));
  EXPECT_TRUE(vlo_isDesktopOrDocumentsFolder(URL(Drive + "/Desktop", true)));
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(URL(Drive + "/Documents/Work")));
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(URL(Drive + "/documents")));
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(*library->folder));
}

TEST_F(NamesAndPlacesTest, AMoveAcrossContainersIsJudgedByTheFirstItem) {
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({}));
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({URL(Drive + "/a")}));
  platform.drive.movable = {{"com~marrow~Kestrel", "org~example~Sketch"}};
  EXPECT_TRUE(vlo_canCrossZoneMoveURLs({URL(Drive + "/a"), inLibrary("b")}));
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({inLibrary("b"), URL(Drive + "/a")}));
}

TEST_F(NamesAndPlacesTest, DocumentIdentifiersComeFromThePromiseElseFromTheDisk) {
  platform.drive.add(Drive + "/a").values[ResourceKey::DocumentIdentifier] = Value(std::int64_t{-5});
  EXPECT_EQ(vlo_DocumentID(URL(Drive + "/a")), -5);
  platform.drive.promisedReadError = Error{FileErrorDomain, 1, {}, {}, {}};
  EXPECT_EQ(vlo_DocumentID(URL(Drive + "/a")), -5);
  EXPECT_EQ(vlo_DocumentID(URL(Drive + "/gone")), 0);
}

class DocumentIdentifierTest : public NamesAndPlacesTest {
 protected:
  DocumentIdentifierTest() {
    ON_CALL(platform.documentStore, deviceOf).WillByDefault(Return(std::optional<DocumentStore::Device>(3)));
    ON_CALL(platform.documentStore, resolveDocumentID)
        .WillByDefault(Return(SystemResult<DocumentStore::FileID>{std::optional<DocumentStore::FileID>(77), {}}));
    ON_CALL(platform.documentStore, openByID).WillByDefault(Return(SystemResult<int>{0, {}}));
    ON_CALL(platform.documentStore, attributesOfOpenFile)
        .WillByDefault(Return(SystemResult<DocumentStore::OpenFileAttributes>{{{42, "/drive/mirror/found.txt"}}, {}}));
  }
};

TEST_F(DocumentIdentifierTest, LeadsToTheDocumentAndClosesIt) {
  // The device is asked for once a process, so another test may have given it.
  EXPECT_CALL(platform.documentStore, resolveDocumentID(_, 42));
  EXPECT_CALL(platform.documentStore, openByID(_, 77));
  EXPECT_CALL(platform.documentStore, close(0));
  EXPECT_EQ(vlo_URLFromDocumentID("42"), URL("/drive/mirror/found.txt"));
}

TEST_F(DocumentIdentifierTest, EachFailedStepIsLogged) {
  EXPECT_EQ(vlo_URLFromDocumentID(std::nullopt), std::nullopt);
  EXPECT_TRUE(platform.log.has("ERROR", "vlo_URLFromDocumentID: missing document ID"));

  EXPECT_CALL(platform.documentStore, close(_)).Times(2);
  EXPECT_EQ(vlo_URLFromDocumentID("43"), std::nullopt);
  EXPECT_TRUE(platform.log.has("ERROR", "document IDs didn't match (42 v/s 43)"));

  ON_CALL(platform.documentStore, attributesOfOpenFile)
      .WillByDefault(Return(SystemResult<DocumentStore::OpenFileAttributes>{std::nullopt, {61, "no data"}}));
  EXPECT_EQ(vlo_URLFromDocumentID("42"), std::nullopt);
  EXPECT_TRUE(platform.log.has("ERROR", "fgetattrlist failed, error:61(no data)"));

  ON_CALL(platform.documentStore, openByID).WillByDefault(Return(SystemResult<int>{std::nullopt, {13, "denied"}}));
  EXPECT_EQ(vlo_URLFromDocumentID("42"), std::nullopt);
  EXPECT_TRUE(platform.log.has("ERROR", "openbyid_np failed, errno:13(denied)"));

  ON_CALL(platform.documentStore, resolveDocumentID)
      .WillByDefault(Return(SystemResult<DocumentStore::FileID>{std::nullopt, {2, "none"}}));
  EXPECT_EQ(vlo_URLFromDocumentID("42"), std::nullopt);
  EXPECT_TRUE(platform.log.has("ERROR", "TBLibraryResolveDocumentId2 failed, errno:2(none)"));
}

TEST_F(DocumentIdentifierTest, TextWithoutLeadingDigitsIsZero) {
  EXPECT_CALL(platform.documentStore, resolveDocumentID(_, 0));
  vlo_URLFromDocumentID("x42");
}

}  // namespace
}  // namespace vaelo
