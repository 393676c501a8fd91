// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "items/file_utils.h"
#include "tests/support/memory_platform.h"

namespace vaelo {
namespace {

const std::string Drive = "/drive/mirror/com~marrow~Kestrel";

class FileOperationsTest : public ::testing::Test {
 protected:
  bool wasCalled(const std::string& call) const {
    return std::find(platform.drive.calls.begin(), platform.drive.calls.end(), call) != platform.drive.calls.end();
  }
  MemoryPlatform platform;
  Error diskFull{FileErrorDomain, FileErrorCode::WriteOutOfSpace, {}, "full", {}};
  Error refused{FileErrorDomain, 1, {}, "refused", {}};
};

TEST_F(FileOperationsTest, ProbesTellFilesFoldersAndNothing) {
  platform.drive.add(Drive + "/a.txt");
  EXPECT_TRUE(FileUtils::exists(URL(Drive)));
  EXPECT_TRUE(FileUtils::isDir(URL(Drive)));
  EXPECT_FALSE(FileUtils::isFile(URL(Drive)));
  EXPECT_TRUE(FileUtils::isFile(URL(Drive + "/a.txt")));
  EXPECT_FALSE(FileUtils::isDir(URL(Drive + "/a.txt")));
  EXPECT_FALSE(FileUtils::isFile(URL(Drive + "/gone")));
  EXPECT_FALSE(FileUtils::isDir(URL(Drive + "/gone")));
}

TEST_F(FileOperationsTest, MkdirMakesAFolderInACoordinatedWrite) {
  EXPECT_EQ(FileUtils::mkdir(URL(Drive + "/x/y", true)), std::nullopt);
  EXPECT_TRUE(FileUtils::isDir(URL(Drive + "/x/y")));
  EXPECT_TRUE(wasCalled("write " + Drive + "/x/y 0"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Creating directory: 'file://" + Drive + "/x/y/'"));
  EXPECT_TRUE(platform.log.has("INFO", "Created directory: 'file://" + Drive + "/x/y/'"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Coordinated Write returned (null)"));
}

TEST_F(FileOperationsTest, MkdirReturnsTheFailureAndTheCoordinatorsErrorWins) {
  platform.drive.changeError = diskFull;
  EXPECT_EQ(FileUtils::mkdir(URL(Drive + "/x"))->code, FileErrorCode::WriteOutOfSpace);
  EXPECT_TRUE(platform.log.has("ERROR", "failed to create directory:'file://" + Drive + "/x': " + diskFull.description()));
  platform.drive.coordinationError = refused;
  EXPECT_EQ(FileUtils::mkdir(URL(Drive + "/x"))->code, 1);
}

TEST_F(FileOperationsTest, RemoveDeletesAnUnchangedDocument) {
  const URL url(Drive + "/a.txt");
  platform.drive.add(url.path());
  EXPECT_EQ(FileUtils::remove(url), std::nullopt);
  EXPECT_FALSE(FileUtils::exists(url));
  EXPECT_TRUE(wasCalled("write " + url.path() + " 1"));
  EXPECT_TRUE(platform.log.has("INFO", "Deleted item: 'file://" + url.path() + "'"));
  EXPECT_TRUE(platform.log.has("INFO", "Coordinated Write returned (null)"));
}

TEST_F(FileOperationsTest, RemoveKeepsADocumentThatChangedMeanwhile) {
  const URL url(Drive + "/a.txt");
  MemoryDrive::Item& item = platform.drive.add(url.path());
  platform.drive.beforeAccessor = [&] {
    item.values[ResourceKey::ContentModificationDate] = Value(Date(std::chrono::seconds(2000)));
  };
  EXPECT_EQ(FileUtils::remove(url)->code, FileErrorCode::UserCancelled);
  EXPECT_TRUE(FileUtils::exists(url));
  EXPECT_TRUE(platform.log.has(
      "INFO", "Date changed during delete (user chose Keep?) -- preserving document: 'file://" + url.path() + "'"));
}

TEST_F(FileOperationsTest, RemoveKeepsADocumentWithoutADate) {
  const URL url(Drive + "/a.txt");
  platform.drive.add(url.path()).values.erase(ResourceKey::ContentModificationDate);
  EXPECT_EQ(FileUtils::remove(url)->code, FileErrorCode::UserCancelled);
  EXPECT_TRUE(FileUtils::exists(url));
}

TEST_F(FileOperationsTest, RemoveReturnsTheDisksErrorAndTheCoordinatorsWins) {
  const URL url(Drive + "/a.txt");
  platform.drive.add(url.path());
  platform.drive.changeError = diskFull;
  EXPECT_EQ(FileUtils::remove(url)->code, FileErrorCode::WriteOutOfSpace);
  EXPECT_TRUE(platform.log.has("ERROR", "failed to delete item:'file://" + url.path() + "': " + diskFull.description()));
  platform.drive.coordinationError = refused;
  EXPECT_EQ(FileUtils::remove(url)->code, 1);
}

TEST_F(FileOperationsTest, MoveToTheSamePathDoesNothingEvenWithoutTheItem) {
  EXPECT_EQ(FileUtils::moveTo(URL(Drive + "/gone"), URL(Drive + "/gone")), std::nullopt);
  EXPECT_TRUE(platform.log.has("DEBUG", "Move: src and dest are the same"));
  EXPECT_TRUE(platform.drive.calls.empty());
}

TEST_F(FileOperationsTest, MoveTellsTheCoordinatorBeforeAndAfter) {
  const std::string a = Drive + "/a.txt";
  const std::string b = Drive + "/b.txt";
  platform.drive.add(a);
  EXPECT_EQ(FileUtils::moveTo(URL(a), URL(b)), std::nullopt);
  EXPECT_EQ(platform.drive.calls, (std::vector<std::string>{"write " + a + " 2 " + b + " 4", "will move " + a + " " + b,
                                                            "did move " + a + " " + b}));
  EXPECT_TRUE(platform.log.has("DEBUG", "Moving src1:  'file://" + a + "'"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Moving dest1: 'file://" + b + "'"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Moving src2:  'file://" + a + "'"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Moving dest2: 'file://" + b + "'"));
  EXPECT_TRUE(platform.log.has("INFO", "Move successful"));
}

TEST_F(FileOperationsTest, MoveOfAMissingSourceIsTriedAndFails) {
  const auto error = FileUtils::moveTo(URL(Drive + "/gone"), URL(Drive + "/b"));
  EXPECT_EQ(error->code, FileErrorCode::NoSuchFile);
  EXPECT_TRUE(platform.log.has("INFO", "Move: source filename does not exist, must be a fault."));
  EXPECT_TRUE(platform.log.has("WARNING", "KX Move failed: " + error->description()));
  EXPECT_TRUE(platform.log.has("WARNING", "Move failed: " + error->description()));
  EXPECT_FALSE(wasCalled("did move " + Drive + "/gone " + Drive + "/b"));
}

TEST_F(FileOperationsTest, MoveRefusesAFileOntoAFolderAndAFolderOntoAFile) {
  platform.drive.add(Drive + "/file");
  platform.drive.add(Drive + "/folder", FileType::Directory);
  EXPECT_EQ(FileUtils::moveTo(URL(Drive + "/file"), URL(Drive + "/folder"))->code, FileErrorCode::FeatureUnsupported);
  EXPECT_TRUE(platform.log.has("ERROR", "Move: must move a file to a file (dest is a dir)"));
  EXPECT_EQ(FileUtils::moveTo(URL(Drive + "/folder"), URL(Drive + "/file"))->code, FileErrorCode::FeatureUnsupported);
  EXPECT_TRUE(platform.log.has("ERROR", "Move: must move a dir to a dir (dest is a file)"));
  EXPECT_TRUE(platform.drive.calls.empty());
}

TEST_F(FileOperationsTest, TheDocumentsDirectoryIsTheFirstWithItsTildeExpanded) {
  EXPECT_EQ(FileUtils::docDir(), URL("/home/me/Documents"));
  platform.drive.documentsDirectories.clear();
  EXPECT_EQ(FileUtils::docDir(), std::nullopt);
}

TEST_F(FileOperationsTest, EvictionThatFailsIsLogged) {
  EXPECT_TRUE(FileUtils::evictDocument(URL(Drive)));
  platform.drive.changeError = refused;
  EXPECT_FALSE(FileUtils::evictDocument(URL(Drive)));
  EXPECT_TRUE(platform.log.has("WARNING", "Evict error: " + refused.description()));
}

TEST_F(FileOperationsTest, AResourceValueComesFromThePromiseElseFromTheDisk) {
  const URL url(Drive + "/a.txt");
  platform.drive.add(url.path());
  EXPECT_EQ(FileUtils::getResourceValueForURL(ResourceKey::Name, url), Value("a.txt"));
  EXPECT_FALSE(std::count(platform.drive.calls.begin(), platform.drive.calls.end(), "plain values " + url.path()));
  platform.drive.promisedReadError = refused;
  EXPECT_EQ(FileUtils::getResourceValueForURL(ResourceKey::Name, url), Value("a.txt"));
  EXPECT_FALSE(FileUtils::getResourceValueForURL(ResourceKey::Name, std::nullopt).isPresent());
  EXPECT_TRUE(platform.log.lines().empty());
}

TEST_F(FileOperationsTest, AttributesAreLoggedWithTheirAge) {
  platform.drive.add(Drive + "/a").attributes.size = Value(std::uint64_t{7});
  FileUtils::logFileAttributes(Drive + "/a");
  EXPECT_TRUE(platform.log.has("DEBUG", "Date Created: 1000.000000 (4000.000000 seconds ago)"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Date Modified: 1000.000000 (4000.000000 seconds ago)"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Size: 7 bytes"));
  FileUtils::logFileAttributes("/gone");
  EXPECT_EQ(platform.log.lines().back().find("(VLO)[ERROR]"), 0u);
  EXPECT_NE(platform.log.lines().back().find("Cannot get attributes of /gone: "), std::string::npos);
}

}  // namespace
}  // namespace vaelo
