// SPDX-License-Identifier: GPL-3.0-or-later
#include "fileops/menu_enable_checks.h"

#include <gmock/gmock.h>

#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

class MenuEnableChecksTest : public AppFixture {
 protected:
  /// A list of the folder with these items, all selected.
  std::shared_ptr<DocumentListController> selecting(const URL& folder, const std::vector<URL>& items) {
    const auto list = std::make_shared<DocumentListController>(folder);
    list->itemsLoaded(items);
    list->setEditingAnimated(true, false);
    list->setSelectedItems(items);
    return list;
  }
  bool mayMove(const URL& folder, const std::vector<URL>& items) {
    return MenuEnableChecks::canShowMoveForSelectedItems(*selecting(folder, items));
  }
  bool mayDelete(const URL& folder, const std::vector<URL>& items) {
    return MenuEnableChecks::canShowDeleteForSelectedItems(*selecting(folder, items));
  }
  bool mayMakeFolder(const URL& folder) {
    return MenuEnableChecks::canEnableNewFolderForSelectedItems(*selecting(folder, {}));
  }
  /// The documents folder of a library that says this of its levels.
  URL addLibrary(const std::optional<std::string>& levels) {
    if (!library) library = memory.cloud.addContainer("org~example~Notes", "Notes");
    library->levels = levels;
    return *library->documentsFolderURL();
  }
  URL in(const URL& folder, const char* name) {
    const URL url = folder.appendingPathComponent(name);
    memory.disk.add(url.path());
    return url;
  }
  URL folderIn(const URL& folder, const char* name) {
    const URL url = folder.appendingPathComponent(name, true);
    memory.disk.addFolder(url.path());
    return url;
  }

  std::shared_ptr<MemoryContainer> library;
};

TEST_F(MenuEnableChecksTest, NothingSelectedAllowsNothing) {
  EXPECT_FALSE(mayMove(Drive, {}));
  EXPECT_FALSE(mayDelete(Drive, {}));
}

// The library is asked last, and its answer logged: a log without the line tells that something else decided.
TEST_F(MenuEnableChecksTest, TheLibraryIsAskedOnlyWhenNothingElseDecides) {
  const URL file = addFile("a.txt");
  const std::string line = "Container com~marrow~Kestrel has no depth. Enabling new folder button";
  EXPECT_FALSE(mayMove(Drive, {}));
  EXPECT_FALSE(mayMove(Drive, {file, addFolder("Desktop")}));
  EXPECT_FALSE(mayMove(Drive, {addLibrary(std::nullopt)}));
  EXPECT_FALSE(logged("DEBUG", line));
  EXPECT_TRUE(mayMove(Drive, {file})) << "a document would do without";
  EXPECT_TRUE(logged("DEBUG", line));
}

// Selecting all of 100,000 items asked the disk about each of them, four times.
TEST_F(MenuEnableChecksTest, ItemsThatTheListKnowsAreNotLookedAt) {
  const URL desktop = addFolder("Desktop");
  const auto list = std::make_shared<DocumentListController>(Drive);
  ItemHint hint = ItemHint::Document;
  list->itemsLoaded(URLList(
      1, [&desktop](std::size_t) { return desktop; }, [](const URL&, std::size_t) { return std::optional<std::size_t>(0); },
      [&hint](std::size_t) { return hint; }));
  list->selectAllItems();
  EXPECT_TRUE(MenuEnableChecks::canShowMoveForSelectedItems(*list)) << "it was told that this is a document";
  EXPECT_TRUE(MenuEnableChecks::canShowDeleteForSelectedItems(*list));
  hint = ItemHint::Unknown;
  EXPECT_FALSE(MenuEnableChecks::canShowMoveForSelectedItems(*list));
  EXPECT_FALSE(MenuEnableChecks::canShowDeleteForSelectedItems(*list));
}

TEST_F(MenuEnableChecksTest, TheDesktopAndDocumentsFoldersStay) {
  const URL desktop = addFolder("Desktop");
  const URL file = addFile("a.txt");
  EXPECT_FALSE(mayMove(Drive, {desktop, file}));
  EXPECT_FALSE(mayDelete(Drive, {desktop, file}));
  EXPECT_TRUE(mayMove(Drive, {file}));
  EXPECT_TRUE(mayDelete(Drive, {file}));
  EXPECT_TRUE(MenuEnableChecks::isDesktopOrDocumentsInURLArray({file, addFolder("Documents")}));
  EXPECT_FALSE(MenuEnableChecks::isDesktopOrDocumentsInURLArray({}));
}

TEST_F(MenuEnableChecksTest, LibrariesAreDeletedAloneAndNeverMoved) {
  const URL top = addLibrary(std::nullopt);
  const URL file = addFile("a.txt");
  EXPECT_FALSE(mayMove(Drive, {top, file}));
  EXPECT_FALSE(mayDelete(Drive, {top, file}));
  EXPECT_FALSE(mayMove(Drive, {top}));
  EXPECT_TRUE(mayDelete(Drive, {top}));
  EXPECT_EQ(MenuEnableChecks::numContainersInURLArray({top, file, top}), 2u);
}

TEST_F(MenuEnableChecksTest, AFolderMovesWhereAnyDepthIsAllowed) {
  const URL top = addLibrary(FolderLevelsOne);
  const URL folder = folderIn(top, "Plans");
  const URL package = folderIn(top, "Draft.textbundle");
  const URL file = in(top, "a.txt");
  EXPECT_TRUE(mayMove(top, {package, file}));
  EXPECT_FALSE(mayMove(top, {folder}));
  EXPECT_EQ(MenuEnableChecks::numFoldersInURLArray({file, folder, folder}), 1u) << "0 or 1, never a count";
  EXPECT_EQ(MenuEnableChecks::numFoldersInURLArray({file, package}), 0u);
  EXPECT_TRUE(mayMove(Drive, {addFolder("Plans")}));
}

TEST_F(MenuEnableChecksTest, NewFoldersFollowTheLevelsOfTheLibrary) {
  const auto says = [this](const std::optional<std::string>& levels, const char* level, const std::string& line) {
    const bool may = mayMakeFolder(addLibrary(levels));
    EXPECT_TRUE(logged(level, line)) << line;
    return may;
  };
  EXPECT_TRUE(says(std::nullopt, "DEBUG", "Container org~example~Notes has no depth. Enabling new folder button"));
  EXPECT_FALSE(
      says(FolderLevelsNone, "DEBUG", "Container org~example~Notes supports no folders. Disabling new folder button"));
  EXPECT_TRUE(says(FolderLevelsAny, "DEBUG", "Container org~example~Notes supports any folder. Enabling new folder button"));
  EXPECT_TRUE(says(FolderLevelsOne, "DEBUG",
                   "Container org~example~Notes supports one folder. File is depth 0. Enabling new folder button"));
  EXPECT_FALSE(
      says("Two", "WARNING", "Container org~example~Notes has unknown depth option Two. Disabling new folder button"));
}

TEST_F(MenuEnableChecksTest, OneLevelOfFoldersMeansNoneInThem) {
  const URL top = addLibrary(FolderLevelsOne);
  const URL first = folderIn(top, "Plans");
  EXPECT_FALSE(mayMakeFolder(first));
  EXPECT_TRUE(
      logged("DEBUG", "Container org~example~Notes supports one folder. File is depth 1. Disabling new folder button"));
  EXPECT_FALSE(mayMakeFolder(folderIn(first, "2026")));
  EXPECT_TRUE(
      logged("DEBUG", "Container org~example~Notes supports one folder. File is depth 2. Disabling new folder button"));
}

TEST_F(MenuEnableChecksTest, AnUnknownPlaceAllowsNoNewFolder) {
  const URL outside = addOutsideFile("/home/user/x").deletingLastPathComponent();
  EXPECT_FALSE(mayMakeFolder(outside));
  EXPECT_FALSE(MenuEnableChecks::containerSupportsAnyDepth(*selecting(outside, {})));
  EXPECT_TRUE(loggedStarting("ERROR", "Couldn't get container for URL " + outside.absoluteString() + ": "));
  EXPECT_TRUE(MenuEnableChecks::containerHasSubfolders(outside)) << "an unknown container is taken to have some";
}

TEST_F(MenuEnableChecksTest, AnErrorCountsMoreThanTheContainerThatCameWithIt) {
  const Error error{CloudDocumentsErrorDomain, 7, {}, "not now", {}};
  memory.cloud.containerError = error;
  memory.cloud.containerErrorComesWithValue = true;
  const std::string line = "Couldn't get container for URL " + Drive.absoluteString() + ": " + error.description();
  EXPECT_FALSE(mayMakeFolder(Drive));
  EXPECT_EQ(log().count("ERROR", line), 1u);
  EXPECT_FALSE(MenuEnableChecks::containerSupportsAnyDepth(*selecting(Drive, {})));
  EXPECT_EQ(log().count("ERROR", line), 2u);
  EXPECT_TRUE(MenuEnableChecks::containerHasSubfolders(Drive));
}

TEST_F(MenuEnableChecksTest, AListOfNoFolderAllowsNothing) {
  const auto list = std::make_shared<DocumentListController>(std::nullopt);
  EXPECT_FALSE(MenuEnableChecks::canEnableNewFolderForSelectedItems(*list));
  EXPECT_TRUE(loggedStarting("ERROR", "Couldn't get container for URL "));
  EXPECT_FALSE(MenuEnableChecks::containerSupportsAnyDepth(*list));
}

TEST_F(MenuEnableChecksTest, WhereFoldersAreLimitedOrUnknownOnlyDocumentsMove) {
  for (const char* levels : {FolderLevelsNone, FolderLevelsOne, "Two"}) {
    const URL top = addLibrary(levels);
    EXPECT_FALSE(mayMove(top, {in(top, "a.txt"), folderIn(top, "Plans")})) << levels;
    EXPECT_TRUE(mayMove(top, {in(top, "a.txt")})) << levels;
  }
  const URL top = addLibrary(FolderLevelsAny);
  EXPECT_TRUE(mayMove(top, {folderIn(top, "Plans")}));
}

TEST_F(MenuEnableChecksTest, AnyDepthIsSaidOnlyWhereItIsAllowed) {
  const auto any = [this](const std::optional<std::string>& levels) {
    const URL top = addLibrary(levels);
    log().clear();
    return MenuEnableChecks::containerSupportsAnyDepth(*selecting(top, {}));
  };
  EXPECT_TRUE(any(std::nullopt));
  EXPECT_TRUE(logged("DEBUG", "Container org~example~Notes has no depth. Enabling new folder button"));
  EXPECT_TRUE(any(FolderLevelsAny));
  EXPECT_TRUE(logged("DEBUG", "Container org~example~Notes supports any folder. Enabling new folder button"));
  for (const char* levels : {FolderLevelsNone, FolderLevelsOne, "Two"}) {
    EXPECT_FALSE(any(levels));
    EXPECT_TRUE(log().lines().empty());
  }
}

TEST_F(MenuEnableChecksTest, OnlyRealFoldersAtTheTopCountAsSubfolders) {
  const URL top = addLibrary(std::nullopt);
  const URL file = in(top, "a.txt");
  EXPECT_FALSE(MenuEnableChecks::containerHasSubfolders(file));
  folderIn(top, ".hidden");
  folderIn(top, "Draft.textbundle");
  EXPECT_FALSE(MenuEnableChecks::containerHasSubfolders(file));
  EXPECT_EQ(memory.record.lastOptions, 7u) << "the top level alone";
  EXPECT_EQ(memory.record.lastKeys, (std::vector<ResourceKey>{ResourceKey::IsDirectory, ResourceKey::IsPackage}));
  folderIn(top, "Plans");
  EXPECT_TRUE(MenuEnableChecks::containerHasSubfolders(file));
  EXPECT_TRUE(MenuEnableChecks::containerHasSubfolders(top));
}

TEST_F(MenuEnableChecksTest, TheFirstSubfolderEndsTheSearch) {
  const URL top = addLibrary(std::nullopt);
  folderIn(top, "Plans");
  const URL zebra = in(top, "Zebra.txt");
  memory.record.calls.clear();
  EXPECT_TRUE(MenuEnableChecks::containerHasSubfolders(top));
  EXPECT_TRUE(memory.record.has("promised " + top.appendingPathComponent("Plans").path()));
  EXPECT_FALSE(memory.record.has("promised " + zebra.path()));
}

TEST_F(MenuEnableChecksTest, AContainerWithoutATopFolderHasNoSubfolders) {
  const URL file = in(addLibrary(std::nullopt), "a.txt");
  library->folder.reset();
  EXPECT_FALSE(MenuEnableChecks::containerHasSubfolders(file));
}

TEST_F(MenuEnableChecksTest, ALookupThatTellsNothingKnowsNoContainer) {
  const URL outside = addOutsideFile("/home/user/x");
  memory.cloud.containerLookupTellsNothing = true;
  EXPECT_TRUE(MenuEnableChecks::containerHasSubfolders(outside));
  EXPECT_FALSE(mayMakeFolder(outside));
  EXPECT_TRUE(loggedStarting("ERROR", "Couldn't get container for URL " + outside.absoluteString() + ": "));
}

TEST_F(MenuEnableChecksTest, SubfoldersAreThoseOfTheContainersTop) {
  const URL top = addLibrary(std::nullopt);
  const URL package = folderIn(top, "Draft.textbundle");
  folderIn(package, "assets");
  EXPECT_FALSE(MenuEnableChecks::containerHasSubfolders(package));
  folderIn(top, "Plans");
  EXPECT_TRUE(MenuEnableChecks::containerHasSubfolders(package));
}

TEST_F(MenuEnableChecksTest, WhatIsNotDownloadedIsJudgedByItsMetadata) {
  const URL top = addLibrary(std::nullopt);
  const URL far = top.appendingPathComponent("Far");
  memory.disk.addPromise(far.path()).values[ResourceKey::IsDirectory] = Value(true);
  EXPECT_TRUE(MenuEnableChecks::containerHasSubfolders(top));
  memory.disk.items.at(far.path()).values[ResourceKey::IsPackage] = Value(true);
  EXPECT_FALSE(MenuEnableChecks::containerHasSubfolders(top));
}

TEST_F(MenuEnableChecksTest, EntriesThatCannotBeReadAreLoggedAndPassed) {
  const URL top = addLibrary(std::nullopt);
  folderIn(top, "Plans");
  memory.files.enumerationError = Error{FileErrorDomain, FileErrorCode::ReadNoPermission, {}, "locked", {}};
  EXPECT_TRUE(MenuEnableChecks::containerHasSubfolders(top));
  EXPECT_TRUE(loggedStarting("INFO", "Error enumerating "));
}

}  // namespace
}  // namespace vaelo
