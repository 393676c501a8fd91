// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/dr_item.h"

#include <gtest/gtest.h>

#include "tests/support/memory_platform.h"
#include "tests/support/test_image.h"

namespace vaelo {
namespace {

class DRItemTest : public ::testing::Test {
 protected:
  std::shared_ptr<DRItem> make(const std::string& path) { return DRItem::initWithURL(URL(path)); }
  MemoryPlatform platform;
};

TEST_F(DRItemTest, ThePlainInitialiserIsForbidden) {
  try {
    DRItem::init();
    FAIL();
  } catch (const std::invalid_argument& error) {
    EXPECT_STREQ(error.what(), "Don't call -[DRItem init].");
  }
}

TEST_F(DRItemTest, WithoutAURLOrAnItemThereIsNoRecord) {
  EXPECT_EQ(DRItem::initWithURL(std::nullopt), nullptr);
  EXPECT_TRUE(platform.log.has("ERROR", "Failed to cache values for URL (null)"));
  EXPECT_EQ(make(DrivePath + "/gone"), nullptr);
  EXPECT_TRUE(platform.log.has("ERROR", "Failed to cache values for URL file://" + DrivePath + "/gone"));
}

TEST_F(DRItemTest, FieldsComeFromTheResourceValues) {
  platform.clock->origin = Date(std::chrono::seconds(1000));
  auto& item = platform.disk.add(DrivePath + "/a.txt");
  item.values[ResourceKey::FileSize] = Value(std::uint64_t{1234});
  item.values[ResourceKey::LocalizedTypeDescription] = Value("Text");
  item.values[ResourceKey::DownloadingStatus] = Value(DownloadingStatusCurrent);
  item.values[ResourceKey::HasHiddenExtension] = Value(true);
  item.tags = {"Red", "Blue"};
  const auto record = make(DrivePath + "/a.txt");
  ASSERT_TRUE(record);
  EXPECT_EQ(record->localizedName(), "a.txt");
  EXPECT_EQ(record->typeIdentifier(), "public.plain-text");
  EXPECT_EQ(record->localizedTypeDescription(), "Text");
  EXPECT_EQ(record->fileSize(), 1234u);
  EXPECT_EQ(record->friendlyFileSize(), "1 KB");
  EXPECT_EQ(record->parentDirectoryURL(), Drive);
  EXPECT_EQ(record->tags(), (std::vector<std::string>{"Red", "Blue"}));
  EXPECT_TRUE(record->canPreview());
  EXPECT_TRUE(record->isDownloaded());
  EXPECT_TRUE(record->hasHiddenExtension());
  EXPECT_TRUE(record->renameable());
  EXPECT_FALSE(record->isPromise());
  EXPECT_EQ(record->friendlyCreationDate(DateStyle::Long), "1000 s, date 3, time 1...");
  EXPECT_EQ(record->friendlyContentModificationDate(DateStyle::Short), "1000 s, date 1, time 1.");
}

TEST_F(DRItemTest, AbsentValuesHaveTheirDefaults) {
  auto& item = platform.disk.add(DrivePath + "/a.txt");
  item.values = {{ResourceKey::Name, "a.txt"}, {ResourceKey::FileSize, Value("no number")}};
  item.hasOnlyValues = true;
  const auto record = make(DrivePath + "/a.txt");
  EXPECT_EQ(record->localizedName(), "a.txt");
  EXPECT_EQ(record->fileSize(), std::nullopt);
  EXPECT_FALSE(record->isDownloaded());
  EXPECT_FALSE(record->hasHiddenExtension());
  EXPECT_EQ(record->friendlyCreationDate(DateStyle::Long), std::nullopt);
}

TEST_F(DRItemTest, TheNotDownloadedStatusIsNotDownloaded) {
  platform.disk.add(DrivePath + "/a").values[ResourceKey::DownloadingStatus] = Value(DownloadingStatusNotDownloaded);
  EXPECT_FALSE(make(DrivePath + "/a")->isDownloaded());
}

TEST_F(DRItemTest, ThePlatformsTypeDescriptionWins) {
  platform.disk.add(DrivePath + "/f", FileType::Directory).values[ResourceKey::LocalizedTypeDescription] = Value("other");
  const auto record = make(DrivePath + "/f");
  EXPECT_EQ(record->localizedTypeDescription(), "Folder");
  EXPECT_TRUE(record->isDirectory());
}

TEST_F(DRItemTest, APackageIsNoDirectoryAndSumsItsContents) {
  auto& package = platform.disk.add(DrivePath + "/p.bundle", FileType::Directory);
  package.values[ResourceKey::IsPackage] = Value(true);
  EXPECT_EQ(make(DrivePath + "/p.bundle")->fileSize(), std::nullopt);
  platform.disk.add(DrivePath + "/p.bundle/one").values[ResourceKey::FileSize] = Value(std::uint64_t{30});
  platform.disk.add(DrivePath + "/p.bundle/in/.two").values[ResourceKey::FileSize] = Value(std::uint64_t{12});
  const auto record = make(DrivePath + "/p.bundle");
  EXPECT_TRUE(record->isPackage());
  EXPECT_FALSE(record->isDirectory());
  EXPECT_EQ(record->fileSize(), 42u);
  EXPECT_EQ(record->friendlyFileSize(), "42 bytes");
  package.values[ResourceKey::FileSize] = Value(std::uint64_t{7});
  EXPECT_EQ(make(DrivePath + "/p.bundle")->fileSize(), 7u);
}

TEST_F(DRItemTest, SizeOfAPackageGoesOnPastErrors) {
  platform.disk.add(DrivePath + "/x");
  const auto record = make(DrivePath + "/x");
  EXPECT_EQ(record->sizeOfPackage(std::nullopt), 0u);
  EXPECT_TRUE(platform.log.has("ERROR", "sizeOfPackage: null URL"));
  EXPECT_EQ(record->sizeOfPackage(URL("/gone")), 0u);
  EXPECT_NE(platform.log.lines().back().find("Error enumerating file:///gone: "), std::string::npos);
}

TEST_F(DRItemTest, ALinkIsResolvedAndAnAliasOfAnyLetterCaseToo) {
  platform.disk.add(DrivePath + "/target");
  platform.disk.add(DrivePath + "/link", FileType::SymbolicLink).linkTarget = DrivePath + "/target";
  const auto link = make(DrivePath + "/link");
  EXPECT_TRUE(link->isSymlink());
  EXPECT_EQ(link->resolvedURL(), URL(DrivePath + "/target"));

  auto& alias = platform.disk.add(DrivePath + "/alias");
  alias.values[ResourceKey::LocalizedTypeDescription] = Value("aLIAS");
  alias.aliasTarget = URL(DrivePath + "/target");
  EXPECT_EQ(make(DrivePath + "/alias")->resolvedURL(), URL(DrivePath + "/target"));
  alias.aliasTarget.reset();
  const auto broken = make(DrivePath + "/alias");
  EXPECT_TRUE(broken->isSymlink());
  EXPECT_EQ(broken->resolvedURL(), std::nullopt);
}

TEST_F(DRItemTest, APromisedAliasIsTriedWithAWarning) {
  auto& alias = platform.disk.add(DrivePath + "/alias");
  alias.isPromise = true;
  alias.values[ResourceKey::LocalizedTypeDescription] = Value("Alias");
  make(DrivePath + "/alias");
  EXPECT_TRUE(platform.log.has(
      "WARNING",
      "Rover Alias is promised -- unable to determine target without downloading: file://" + DrivePath + "/alias"));
}

TEST_F(DRItemTest, ALinkToTheRootLeavesNothing) {
  platform.disk.add(DrivePath + "/link", FileType::SymbolicLink).linkTarget = "/";
  const auto link = make(DrivePath + "/link");
  EXPECT_TRUE(link->isSymlink());
  EXPECT_EQ(link->resolvedURL(), std::nullopt);
}

TEST_F(DRItemTest, ContainersHaveTheirNameAndStayAsTheyAre) {
  const auto container = platform.cloud.addContainer("org~example~Notes", "Notes");
  const auto record = make(container->folder->path());
  EXPECT_TRUE(record->isContainer());
  EXPECT_FALSE(record->renameable());
  EXPECT_EQ(record->localizedName(), "Notes");
  platform.cloud.containerError = Error{FileErrorDomain, 1, {}, {}, {}};
  EXPECT_EQ(make(container->folder->path())->localizedName(), "Documents");
}

TEST_F(DRItemTest, OnlyAParticipantMayNotRename) {
  auto& item = platform.disk.add(DrivePath + "/shared");
  item.values[ResourceKey::IsShared] = Value(true);
  item.values[ResourceKey::SharedItemRole] = Value(SharedItemRoleOwner);
  EXPECT_TRUE(make(DrivePath + "/shared")->renameable());
  item.values[ResourceKey::SharedItemRole] = Value(SharedItemRoleParticipant);
  EXPECT_FALSE(make(DrivePath + "/shared")->renameable());
  item.values[ResourceKey::IsShared] = Value(false);
  EXPECT_TRUE(make(DrivePath + "/shared")->renameable());
}

TEST_F(DRItemTest, APromiseIsToldByIdentity) {
  platform.disk.add(DrivePath + "/p").isPromise = true;
  const auto record = make(DrivePath + "/p");
  EXPECT_EQ(record->promiseURL(), URL(DrivePath + "/.p.vlopromise"));
  EXPECT_TRUE(record->isPromise());
  record->setPromiseURL(URL(record->resolvedURL()->path()));
  EXPECT_TRUE(record->isPromise()) << "an equal URL is another object";
}

TEST_F(DRItemTest, ValuesThatCannotBeReadAsPromisedAreReadPlainly) {
  platform.disk.add(DrivePath + "/a");
  platform.values.promisedReadError = Error{FileErrorDomain, 99, {}, {}, {}};
  EXPECT_EQ(make(DrivePath + "/a")->localizedName(), "a");
  EXPECT_EQ(platform.log.count("WARNING", "promisedItemResourceValuesForKeys failed on file://" + DrivePath + "/a"), 1u);
}

TEST_F(DRItemTest, TheAttributesAreTheLastResort) {
  auto& item = platform.disk.add(DrivePath + "/a");
  item.attributes.size = Value(std::uint64_t{5});
  platform.values.promisedReadError = platform.values.plainReadError = Error{FileErrorDomain, 99, {}, {}, {}};
  const auto record = make(DrivePath + "/a");
  EXPECT_EQ(record->localizedName(), "a");
  EXPECT_EQ(record->typeIdentifier(), std::nullopt);
  EXPECT_EQ(record->fileSize(), 5u);
  EXPECT_FALSE(record->hasHiddenExtension());
  item.attributes.type = FileType::Other;
  EXPECT_EQ(make(DrivePath + "/a"), nullptr);
  item.attributes.type = FileType::Directory;
  EXPECT_TRUE(make(DrivePath + "/a")->isDirectory());
  item.attributes.type = FileType::SymbolicLink;
  item.linkTarget = "beside";
  const auto link = make(DrivePath + "/a");
  EXPECT_EQ(link->typeIdentifier(), "public.symlink");
  EXPECT_EQ(link->symlinkTarget(), "beside");
}

TEST_F(DRItemTest, ACoordinationThatNeverRunsLeavesABareRecord) {
  platform.disk.add(DrivePath + "/a");
  platform.coordination.coordinatorError = Error{FileErrorDomain, 1, {}, {}, {}};
  const auto record = make(DrivePath + "/a");
  ASSERT_TRUE(record);
  EXPECT_EQ(record->localizedName(), std::nullopt);
  EXPECT_EQ(record->resolvedURL(), URL(DrivePath + "/a"));
}

TEST_F(DRItemTest, TheSecurityScopeIsClosedOnlyWhenTheReadWorked) {
  platform.values.securityScoped = true;
  platform.disk.add(DrivePath + "/a");
  make(DrivePath + "/a");
  EXPECT_EQ(platform.values.openScopes, 0);
  make(DrivePath + "/gone");
  EXPECT_EQ(platform.values.openScopes, 1);
}

TEST_F(DRItemTest, SettingAnEqualURLDoesNotRefill) {
  platform.disk.add(DrivePath + "/a");
  platform.disk.add(DrivePath + "/b");
  const auto record = make(DrivePath + "/a");
  platform.record.calls.clear();
  record->setUrl(URL(DrivePath + "/a"));
  EXPECT_TRUE(platform.record.calls.empty());
  record->setUrl(URL(DrivePath + "/b"));
  EXPECT_EQ(record->localizedName(), "b");
}

TEST_F(DRItemTest, TheThumbnailIsLookedForOnceAFill) {
  const ImageRef image = std::make_shared<TestImage>();
  platform.disk.add(DrivePath + "/a").values[ResourceKey::ThumbnailDictionary] =
      Value(Dictionary{{Thumbnail1024SizeKey, Value(image)}});
  platform.disk.add(DrivePath + "/b");
  const auto record = make(DrivePath + "/a");
  EXPECT_FALSE(record->thumbnailFetched());
  EXPECT_EQ(record->thumbnail(), image);
  platform.record.calls.clear();
  EXPECT_EQ(record->thumbnail(), image);
  EXPECT_TRUE(platform.record.calls.empty());
  record->setUrl(URL(DrivePath + "/b"));
  EXPECT_EQ(record->thumbnail(), nullptr);
  record->updateThumbnailImage(Value("no dictionary"));
  EXPECT_FALSE(record->canGenerateThumbnail());
  bool called = false;
  record->generateThumbnail([&](ImageRef none) { called = none == nullptr; });
  EXPECT_TRUE(called);
}

TEST_F(DRItemTest, TheDescriptionRunsItsFlagsTogether) {
  auto& folder = platform.disk.add(DrivePath + "/f", FileType::Directory);
  const auto record = make(DrivePath + "/f");
  const std::string start = "Name=f, Size=(null), URL=file://" + DrivePath + "/f, ResURL=<same>, PromiseURL=<same>, ";
  EXPECT_EQ(record->description(), start + "Directory, Local,");
  folder.values[ResourceKey::IsPackage] = Value(true);
  const auto package = make(DrivePath + "/f");
  package->setIsPromise(true);
  EXPECT_EQ(package->description(), start + "Package, Promise, ");
}

TEST_F(DRItemTest, FourteenKeysInTheirOrder) {
  ASSERT_EQ(DRItem::resourceKeys().size(), 14u);
  EXPECT_EQ(DRItem::resourceKeys().front(), ResourceKey::Name);
  EXPECT_EQ(DRItem::resourceKeys()[10], ResourceKey::ParentDirectoryURL);
  EXPECT_EQ(DRItem::resourceKeys().back(), ResourceKey::DownloadingStatus);
}

}  // namespace
}  // namespace vaelo
