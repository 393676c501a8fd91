// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/file_utils.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

using K = ResourceKey;
using Names = std::vector<std::string>;

const URL Deep("/drive/mirror/org~example~Sketchbook/Documents/one/two/deep.png");

/// Where an item is, as its container and the names below it.
class LocationsTest : public ItemsTest {
 protected:
  LocationsTest() {
    for (URL at = Deep; !(at == LibraryDocuments); at = at.deletingLastPathComponent()) {
      world.addFolder(at, {{K::LocalizedName, "<" + at.lastPathComponent() + ">"}});
    }
  }
  std::optional<Error> split(const URL& url) {
    return FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(url, &container, &names);
  }

  CloudContainerRef container;
  Names names{"untouched"};
};

TEST_F(LocationsTest, separators) {
  EXPECT_EQ(FileUtils::pathBarArrowCharacter(true), " \u25C2 ");
  EXPECT_EQ(FileUtils::pathBarArrowCharacter(false), " \u25B8 ");
}

TEST_F(LocationsTest, namesRunFromTheFirstFolderToTheItem) {
  EXPECT_FALSE(split(Deep));
  EXPECT_EQ(container, world.appLibrary);
  EXPECT_EQ(names, (Names{"<one>", "<two>", "<deep.png>"}));
}

TEST_F(LocationsTest, slotsAreOptional) {
  EXPECT_FALSE(FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(Deep, nullptr, &names));
  EXPECT_EQ(names.size(), 3u);
  EXPECT_FALSE(FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(Deep, &container, nullptr));
  EXPECT_EQ(container, world.appLibrary);
}

TEST_F(LocationsTest, theDocumentsFolderItselfWritesNoNames) {
  EXPECT_FALSE(split(LibraryDocuments));
  EXPECT_EQ(container, world.appLibrary);
  EXPECT_EQ(names, Names{"untouched"});
}

TEST_F(LocationsTest, aNameThatCannotBeReadIsThatOfThePath) {
  const Error error = fileError(FileErrorCode::ReadNoPermission);
  const URL two = Deep.deletingLastPathComponent();
  world.promisedAnswers.insert_or_assign(two.path(), error);
  EXPECT_FALSE(split(Deep));
  EXPECT_EQ(names, (Names{"<one>", "two", "<deep.png>"}));
  EXPECT_EQ(messages(),
            Names{"DEBUG Can't get localizedName for URL " + two.absoluteString() + ": err " + error.description()});
}

TEST_F(LocationsTest, aFailedLookupIsTriedByIdentifierAndStillReported) {
  world.containerError = fileError(FileErrorCode::ReadUnknown);
  for (const bool withValue : {false, true}) {
    world.containerErrorComesWithValue = withValue;
    container = nullptr;
    const auto error = split(Deep);
    ASSERT_TRUE(error);
    EXPECT_EQ(error->code, FileErrorCode::ReadUnknown);
    EXPECT_EQ(container, world.appLibrary);
    EXPECT_EQ(names.size(), 3u);
    EXPECT_EQ(split(LibraryDocuments)->code, FileErrorCode::ReadUnknown);
  }
  EXPECT_TRUE(messages().empty());
}

TEST_F(LocationsTest, outsideAllContainersNothingIsWritten) {
  const auto error = split(URL("/outside/a"));
  ASSERT_TRUE(error);
  EXPECT_EQ(error->domain, CloudDocumentsErrorDomain);
  EXPECT_FALSE(container);
  EXPECT_EQ(names, Names{"untouched"});
  EXPECT_EQ(messages(), Names{"WARNING Split URL: " + error->description()});
}

TEST_F(LocationsTest, pathsThatCannotBeSplitAreAFormattingError) {
  for (const std::optional<URL>& folder :
       {std::optional<URL>(), std::optional(URL("/outside")), std::optional(Deep.appendingPathComponent("below"))}) {
    world.appLibrary->folder = folder;
    if (folder) world.addFolder(*folder);
    const auto error = split(Deep);
    ASSERT_TRUE(error);
    EXPECT_EQ(error->domain, FileErrorDomain);
    EXPECT_EQ(error->code, 2048);
    EXPECT_EQ(container, world.appLibrary);
    EXPECT_EQ(names, Names{"untouched"});
  }
}

TEST_F(LocationsTest, theLineOfAnItemAtTheTopOfTheDriveIsTheDrivesName) {
  const URL top = Drive.appendingPathComponent("top.txt");
  world.addFile(top, {{K::LocalizedName, "top"}});
  EXPECT_EQ(FileUtils::displayableLocationForURL(top), "\u2068Vaelo Drive\u2069");
  EXPECT_EQ(FileUtils::displayableLocationForURL(Drive), "\u2068Vaelo Drive\u2069");
}

TEST_F(LocationsTest, theLineOfAnItemDeepInALibraryLeavesTheItemOut) {
  EXPECT_EQ(FileUtils::displayableLocationForURL(Deep),
            "\u2068Vaelo Drive\u2069 \u25B8 \u2068Sketchbook\u2069 \u25B8 \u2068<one>\u2069 \u25B8 \u2068<two>\u2069");
}

TEST_F(LocationsTest, theLineRunsTheOtherWayInARightToLeftLayout) {
  world.rightToLeft = true;
  EXPECT_EQ(FileUtils::displayableLocationForURL(LibraryDocuments.appendingPathComponent("one")),
            "\u200F\u2068Vaelo Drive\u2069 \u25C2 \u2068Sketchbook\u2069");
}

TEST_F(LocationsTest, anErrorLeavesNoLine) {
  EXPECT_FALSE(FileUtils::displayableLocationForURL(URL("/outside/a")));
  world.containerError = fileError(FileErrorCode::ReadUnknown);
  world.containerErrorComesWithValue = true;
  EXPECT_FALSE(FileUtils::displayableLocationForURL(Deep));
}

}  // namespace
}  // namespace vaelo
