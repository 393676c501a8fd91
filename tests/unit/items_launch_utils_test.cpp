// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/launch_utils.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

using Lines = std::vector<std::string>;

const URL InDrive("/drive/mirror/com~marrow~Kestrel/a.txt");
const URL InLibrary("/drive/mirror/org~example~Sketchbook/Documents/a.txt");

ApplicationRecord app(const std::string& identifier, bool inPlace = true) {
  ApplicationRecord record;
  record.bundleIdentifier = identifier;
  record.localizedName = identifier + " (name)";
  record.isInstalled = true;
  record.supportsOpenInPlace = inPlace;
  return record;
}

class LaunchUtilsTest : public ItemsTest {
 protected:
  LaunchUtilsTest() {
    world.typeOfExtension = {{"txt", "public.text"}, {"png", "public.image"}};
    world.addFile(InDrive);
    world.addFile(InLibrary);
  }
  void own(std::vector<ApplicationRecord> owners) {
    world.ranked = DocumentRecord::Ranked{{HandlerRankOwner, std::move(owners)}};
  }
  void install(const ApplicationRecord& record) { world.applications.insert_or_assign(record.bundleIdentifier, record); }
  std::optional<std::string> chosen(const URL& document, bool requireOpenIn = true) {
    const auto record = LaunchUtils::defaultAppForDocumentRequireOpenIn(document, requireOpenIn);
    return record ? std::optional(record->bundleIdentifier) : std::nullopt;
  }
};

TEST_F(LaunchUtilsTest, onlyOwnersThatOpenInPlaceAreCandidates) {
  world.ranked = DocumentRecord::Ranked{{"Alternate", {app("alternate")}},
                                        {"Owner", {app("first"), app("copier", false), app("second")}}};
  const auto record = world.launch.documentRecord(InDrive, false);
  const auto candidates = LaunchUtils::availableAppsForDoc(*record);
  EXPECT_EQ(candidates, (std::vector{app("first"), app("second")}));
  EXPECT_EQ(messages(), (Lines{"DEBUG UTI public.text: Found non-Owner 'Alternate' app alternate",
                               "DEBUG UTI public.text: Found *perfect* app: first",
                               "DEBUG UTI public.text: Found non-OpenInPlace app copier",
                               "DEBUG UTI public.text: Found *perfect* app: second"}));
}

TEST_F(LaunchUtilsTest, anErrorGivesNoCandidates) {
  world.ranked = fileError(FileErrorCode::ReadUnknown);
  EXPECT_TRUE(LaunchUtils::availableAppsForDoc(*world.launch.documentRecord(InDrive, false)).empty());
}

TEST_F(LaunchUtilsTest, theDefaultContainer) {
  EXPECT_TRUE(LaunchUtils::isUrlInDefaultContainer(InDrive));
  EXPECT_FALSE(LaunchUtils::isUrlInDefaultContainer(InLibrary));
  EXPECT_FALSE(LaunchUtils::isUrlInDefaultContainer(URL("/outside/a.txt")));
}

TEST_F(LaunchUtilsTest, inTheDriveTheFirstOwnerOpensTheDocument) {
  ApplicationRecord record = app("first");
  record.itemName = "item";
  record.localizedShortName = "short";
  record.shortVersionString = "1.2";
  record.vendorName = "vendor";
  record.executableName = "exe";
  record.bundleContainerURL = "/apps";
  record.itemID = "id";
  own({record, app("second")});
  EXPECT_EQ(chosen(InDrive), "first");
  EXPECT_TRUE(world.called("record " + InDrive.path()));
  EXPECT_EQ(messages().back(), "DEBUG App for " + InDrive.absoluteString() +
                                   ": item, first (name), short, 1.2, vendor, first, exe, /apps, 1, id, first");
  EXPECT_FALSE(logged("DEBUG", "Assuming apps can open a promised document..."));
}

TEST_F(LaunchUtilsTest, aDocumentThatIsNotDownloadedIsStillOffered) {
  own({app("first")});
  world.items[InDrive.path()].isPromise = true;
  EXPECT_EQ(chosen(InDrive), "first");
  EXPECT_EQ(messages().front(), "DEBUG Assuming apps can open a promised document...");
}

TEST_F(LaunchUtilsTest, aPictureInTheDriveIsShownHere) {
  const URL picture = Drive.appendingPathComponent("a.png");
  world.addFile(picture);
  own({app("painter")});
  EXPECT_FALSE(chosen(picture));
  EXPECT_TRUE(logged("DEBUG", "Preferring GL due to file type, over default app to open " + picture.absoluteString()));
  EXPECT_FALSE(world.called("record " + picture.path()));
}

TEST_F(LaunchUtilsTest, theDocumentOfABookmarkIsJudged) {
  const URL target("/home/somebody/b.png");
  world.bookmarks.insert_or_assign(InDrive.path(), target);
  own({app("first")});
  EXPECT_FALSE(chosen(InDrive));
  const URL letter("/home/somebody/b.txt");
  world.bookmarks.insert_or_assign(InDrive.path(), letter);
  EXPECT_EQ(chosen(InDrive), "first");
  EXPECT_TRUE(world.called("record " + letter.path()));
  EXPECT_TRUE(messages().back().starts_with("DEBUG App for " + InDrive.absoluteString() + ": "));
  world.bookmarks.insert_or_assign(InDrive.path(), fileError(FileErrorCode::NoSuchFile));
  EXPECT_FALSE(chosen(InDrive));
}

TEST_F(LaunchUtilsTest, noOwnerInTheDrive) {
  EXPECT_FALSE(chosen(InDrive));
  EXPECT_EQ(messages().back(), "DEBUG No default app to open " + InDrive.absoluteString());
}

TEST_F(LaunchUtilsTest, theBrowserNeverOpensInItself) {
  own({app("com.marrow.VaeloDrive"), app("second")});
  EXPECT_FALSE(chosen(InDrive));
  EXPECT_EQ(messages().back(), "DEBUG Ignoring com.marrow.VaeloDrive as default app");
}

TEST_F(LaunchUtilsTest, inALibraryItsOwnerOpensWhatItOwns) {
  world.appLibrary->owners = {"main"};
  install(app("main"));
  own({app("other"), app("main")});
  EXPECT_EQ(chosen(InLibrary), "main");
  EXPECT_EQ(messages().back(), "DEBUG Container Sketchbook: Default app (main) supports open in place");
}

TEST_F(LaunchUtilsTest, inALibraryTheDocumentOfABookmarkIsJudged) {
  const URL letter("/home/somebody/b.txt");
  world.bookmarks.insert_or_assign(InLibrary.path(), letter);
  world.appLibrary->owners = {"main"};
  install(app("main"));
  own({app("main")});
  EXPECT_EQ(chosen(InLibrary), "main");
  EXPECT_TRUE(world.called("record " + letter.path()));
  EXPECT_FALSE(world.called("record " + InLibrary.path()));
}

TEST_F(LaunchUtilsTest, inALibraryPicturesOpenInTheOwnerToo) {
  const URL picture = LibraryDocuments.appendingPathComponent("a.png");
  world.addFile(picture);
  world.appLibrary->owners = {"main"};
  install(app("main"));
  own({app("main")});
  EXPECT_EQ(chosen(picture), "main");
}

TEST_F(LaunchUtilsTest, anOwnerThatDoesNotOwnTheTypeGivesWayToTheFirstCandidate) {
  world.appLibrary->owners = {"main"};
  install(app("main"));
  own({app("other"), app("third")});
  EXPECT_EQ(chosen(InLibrary), "other");
  Lines lines = messages();
  EXPECT_EQ(lines[lines.size() - 2], "DEBUG Container Sketchbook: Default app does NOT support/own this document type.");
  EXPECT_EQ(lines.back(), "DEBUG Falling back to default open-in-place app instead: other");
}

TEST_F(LaunchUtilsTest, withoutCandidatesTheNextOwnerIsTried) {
  world.appLibrary->owners = {"main", "second"};
  install(app("main"));
  install(app("second"));
  EXPECT_FALSE(chosen(InLibrary));
  EXPECT_EQ(world.recordedLog.count("DEBUG", "No fallback app, using Glimpse"), 2u);
  EXPECT_TRUE(logged("DEBUG", "Container Sketchbook: Default app (second) supports open in place"));
}

TEST_F(LaunchUtilsTest, anOwnerThatIsNotInstalledOrCopiesGivesWayToTheNext) {
  world.appLibrary->owners = {"gone", "removed", "copier", "second"};
  ApplicationRecord removed = app("removed", false);
  removed.isInstalled = false;
  install(removed);
  install(app("copier", false));
  install(app("second"));
  own({app("second")});
  EXPECT_EQ(chosen(InLibrary, false), "second");
  EXPECT_TRUE(logged("DEBUG", "Container Sketchbook: Default app (gone) not installed"));
  EXPECT_TRUE(logged("DEBUG", "Container Sketchbook: Default app (removed) not installed"));
  EXPECT_TRUE(logged("DEBUG", "Container Sketchbook: Default app (copier) doesn't support open in place"));
}

TEST_F(LaunchUtilsTest, aLibraryWithoutOwnersOrOutsideTheTableHasNoDefault) {
  own({app("other")});
  EXPECT_FALSE(chosen(InLibrary));
  EXPECT_FALSE(chosen(URL("/outside/a.txt")));
  world.appLibrary->owners = {"other"};
  install(app("other"));
  world.containers = {world.drive};
  EXPECT_FALSE(chosen(InLibrary));
}

TEST_F(LaunchUtilsTest, theNameIsTheLocalizedOneOfTheChosen) {
  EXPECT_FALSE(LaunchUtils::defaultAppNameForDocumentRequireOpenIn(InDrive, true));
  own({app("first")});
  EXPECT_EQ(LaunchUtils::defaultAppNameForDocumentRequireOpenIn(InDrive, true), "first (name)");
}

TEST_F(LaunchUtilsTest, openingHandsTheDocumentOverInPlace) {
  own({app("first")});
  const URL letter("/home/somebody/b.txt");
  world.bookmarks.insert_or_assign(InDrive.path(), letter);
  const auto presenter = std::make_shared<ViewController>();
  EXPECT_TRUE(LaunchUtils::openInDefaultAppViewControllerRequireOpenIn(InDrive, presenter, true));
  EXPECT_EQ(messages().front(), "INFO Opening document " + InDrive.absoluteString() + " in default app");
  EXPECT_LT(world.indexOf("preOpenAlert " + letter.path()), world.indexOf("open " + letter.path() + " with first"));
  EXPECT_TRUE(world.called("open " + letter.path() + " with first"));
  EXPECT_EQ(world.openingPresenter, presenter);
}

TEST_F(LaunchUtilsTest, withoutAnApplicationNothingIsOpened) {
  EXPECT_FALSE(LaunchUtils::openInDefaultAppViewControllerRequireOpenIn(InDrive, nullptr, true));
  EXPECT_FALSE(world.called("preOpenAlert " + InDrive.path()));
}

TEST_F(LaunchUtilsTest, anOpeningThatWaitsForAnAnswerCountsAsNotOpened) {
  own({app("first")});
  world.holdsOpening = true;
  EXPECT_FALSE(LaunchUtils::openInDefaultAppViewControllerRequireOpenIn(InDrive, nullptr, true));
  world.heldOpening();
  EXPECT_TRUE(world.called("open " + InDrive.path() + " with first"));
}

}  // namespace
}  // namespace vaelo
