// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "items/file_utils.h"
#include "items/url_additions.h"
#include "tests/support/memory_platform.h"

namespace vaelo {
namespace {

class NamesAndPlacesTest : public ::testing::Test {
 protected:
  NamesAndPlacesTest() { library = platform.cloud.addContainer("org~example~Sketch", "Sketchbook"); }
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
  EXPECT_TRUE(platform.log.has("DEBUG", "isAudioVideoImageFile: Extension txt is public.plain-text which is not."));
  platform.log.clear();
  EXPECT_FALSE(FileUtils::isAudioVideoImageFile(URL("/plain")));
  EXPECT_TRUE(platform.log.lines().empty());
}

TEST_F(NamesAndPlacesTest, AContainerTakesTheTypesThatItDeclares) {
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(inLibrary("plain")));
  platform.types.makesTypes = false;
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(inLibrary("a.untyped")));
  EXPECT_FALSE(FileUtils::isValidExtensionForContainer(URL("/outside/a.png")));
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(URL(DrivePath + "/a.png")));
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
  platform.disk.add(inLibrary("Animals/Birds/Owl.png").path()).values[ResourceKey::LocalizedName] = Value("The Owl");
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
  platform.cloud.containerError = Error{FileErrorDomain, 99, {}, {}, {}};
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
  platform.disk.add(DrivePath + "/top.txt");
  EXPECT_EQ(FileUtils::displayableLocationForURL(URL(DrivePath + "/top.txt")), "\u2068Vaelo Drive\u2069");
  platform.disk.add(inLibrary("Animals/Birds/Owl.png").path());
  EXPECT_EQ(FileUtils::displayableLocationForURL(inLibrary("Animals/Birds/Owl.png")),
            "\u2068Vaelo Drive\u2069 ▸ \u2068Sketchbook\u2069 ▸ \u2068Animals\u2069 ▸ \u2068Birds\u2069");
  platform.application.rightToLeft = true;
  EXPECT_EQ(FileUtils::displayableLocationForURL(inLibrary("Animals/Birds")),
            "\u200F\u2068Vaelo Drive\u2069 ◂ \u2068Sketchbook\u2069 ◂ \u2068Animals\u2069");
  EXPECT_EQ(FileUtils::displayableLocationForURL(URL("/outside")), std::nullopt);
}

TEST_F(NamesAndPlacesTest, BookmarksResolveOrAreNothingAndAliasesStay) {
  const URL bookmark(DrivePath + "/a.vaelobookmark");
  platform.disk.addPromise("/outside/doc");
  platform.disk.add(bookmark.path()).bookmarkTarget = URL("/outside/.doc.vlopromise");
  EXPECT_EQ(vlo_URLByResolvingBookmark(bookmark), URL("/outside/doc"));
  platform.disk.items.erase("/outside/doc");
  EXPECT_EQ(vlo_URLByResolvingBookmark(bookmark), std::nullopt);
  EXPECT_EQ(vlo_URLByResolvingAlias(bookmark), bookmark);
  platform.disk.addPromise(DrivePath + "/p");
  EXPECT_EQ(vlo_URLByResolvingBookmark(URL(DrivePath + "/.p.vlopromise")), URL(DrivePath + "/.p.vlopromise"));
  EXPECT_EQ(vlo_URLByResolvingPromise(URL(DrivePath + "/.p.vlopromise")), URL(DrivePath + "/p"));
}

TEST_F(NamesAndPlacesTest, OnlyTheDrivesOwnDesktopAndDocumentsAreSpecial) {
  EXPECT_TRUE(vlo_isDesktopOrDocumentsFolder(URL(DrivePath + "/Documents")));
  EXPECT_TRUE(vlo_isDesktopOrDocumentsFolder(URL(DrivePath + "/Desktop", true)));
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(URL(DrivePath + "/Documents/Work")));
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(URL(DrivePath + "/documents")));
  EXPECT_FALSE(vlo_isDesktopOrDocumentsFolder(*library->folder));
}

TEST_F(NamesAndPlacesTest, AMoveAcrossContainersIsJudgedByTheFirstItem) {
  platform.cloud.movesAreFree = false;
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({}));
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({URL(DrivePath + "/a")}));
  platform.cloud.movable = {{"com~marrow~Kestrel", "org~example~Sketch"}};
  EXPECT_TRUE(vlo_canCrossZoneMoveURLs({URL(DrivePath + "/a"), inLibrary("b")}));
  EXPECT_FALSE(vlo_canCrossZoneMoveURLs({inLibrary("b"), URL(DrivePath + "/a")}));
}

TEST_F(NamesAndPlacesTest, DocumentIdentifiersComeFromThePromiseElseFromTheDisk) {
  platform.disk.add(DrivePath + "/a").values[ResourceKey::DocumentIdentifier] = Value(std::int64_t{-5});
  EXPECT_EQ(vlo_DocumentID(URL(DrivePath + "/a")), -5);
  platform.values.promisedReadError = Error{FileErrorDomain, 1, {}, {}, {}};
  EXPECT_EQ(vlo_DocumentID(URL(DrivePath + "/a")), -5);
  EXPECT_EQ(vlo_DocumentID(URL(DrivePath + "/gone")), 0);
}

class DocumentIdentifierTest : public NamesAndPlacesTest {
 protected:
  DocumentIdentifierTest() { platform.disk.add("/drive/mirror/found.txt").documentID = 42; }
  static SystemResult<DocumentStore::FileID> noFile() { return {std::nullopt, {2, "none"}}; }
};

TEST_F(DocumentIdentifierTest, LeadsToTheDocumentAndClosesIt) {
  platform.documents.resolvedFile = {DocumentStore::FileID{77}, {}};
  platform.documents.openedHandle = SystemResult<int>{0, {}};
  platform.documents.openAttributes = {DocumentStore::OpenFileAttributes{42, "/drive/mirror/found.txt"}, {}};
  EXPECT_EQ(vlo_URLFromDocumentID("42"), URL("/drive/mirror/found.txt"));
  // The device is asked for once a process, so another test may have given it.
  for (const char* call : {"resolve 42", "openByID 77", "close 0"}) EXPECT_TRUE(platform.record.has(call)) << call;
}

TEST_F(DocumentIdentifierTest, FindsTheDocumentWhereverItIs) {
  platform.files.moveItemAtURL(URL("/drive/mirror/found.txt"), Drive.appendingPathComponent("moved.txt"));
  EXPECT_EQ(vlo_URLFromDocumentID("42"), Drive.appendingPathComponent("moved.txt"));
}

TEST_F(DocumentIdentifierTest, EachFailedStepIsLogged) {
  EXPECT_EQ(vlo_URLFromDocumentID(std::nullopt), std::nullopt);
  EXPECT_TRUE(platform.log.has("ERROR", "vlo_URLFromDocumentID: missing document ID"));

  platform.documents.openAttributes = {DocumentStore::OpenFileAttributes{43, "/drive/mirror/found.txt"}, {}};
  EXPECT_EQ(vlo_URLFromDocumentID("42"), std::nullopt);
  EXPECT_TRUE(platform.log.has("ERROR", "document IDs didn't match (43 v/s 42)"));

  platform.documents.openAttributes = {std::nullopt, {61, "no data"}};
  EXPECT_EQ(vlo_URLFromDocumentID("42"), std::nullopt);
  EXPECT_TRUE(platform.log.has("ERROR", "fgetattrlist failed, error:61(no data)"));
  EXPECT_EQ(std::count(platform.record.calls.begin(), platform.record.calls.end(), "close 3"), 2);

  platform.documents.openedHandle = {std::nullopt, {13, "denied"}};
  EXPECT_EQ(vlo_URLFromDocumentID("42"), std::nullopt);
  EXPECT_TRUE(platform.log.has("ERROR", "openbyid_np failed, errno:13(denied)"));

  platform.documents.resolvedFile = noFile();
  EXPECT_EQ(vlo_URLFromDocumentID("42"), std::nullopt);
  EXPECT_TRUE(platform.log.has("ERROR", "TBLibraryResolveDocumentId2 failed, errno:2(none)"));
}

TEST_F(DocumentIdentifierTest, TextWithoutLeadingDigitsIsZero) {
  vlo_URLFromDocumentID("x42");
  EXPECT_TRUE(platform.record.has("resolve 0"));
}

}  // namespace
}  // namespace vaelo
