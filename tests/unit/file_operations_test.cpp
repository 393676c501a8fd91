// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "items/file_utils.h"
#include "tests/support/memory_platform.h"

namespace vaelo {
namespace {

class FileOperationsTest : public ::testing::Test {
 protected:
  bool wasCalled(const std::string& call) const { return platform.record.has(call); }
  MemoryPlatform platform;
  Error diskFull{FileErrorDomain, FileErrorCode::WriteOutOfSpace, {}, "full", {}};
  Error refused{FileErrorDomain, 1, {}, "refused", {}};
};

TEST_F(FileOperationsTest, ProbesTellFilesFoldersAndNothing) {
  platform.disk.add(DrivePath + "/a.txt");
  EXPECT_TRUE(FileUtils::exists(Drive));
  EXPECT_TRUE(FileUtils::isDir(Drive));
  EXPECT_FALSE(FileUtils::isFile(Drive));
  EXPECT_TRUE(FileUtils::isFile(URL(DrivePath + "/a.txt")));
  EXPECT_FALSE(FileUtils::isDir(URL(DrivePath + "/a.txt")));
  EXPECT_FALSE(FileUtils::isFile(URL(DrivePath + "/gone")));
  EXPECT_FALSE(FileUtils::isDir(URL(DrivePath + "/gone")));
}

TEST_F(FileOperationsTest, MkdirMakesAFolderInACoordinatedWrite) {
  EXPECT_EQ(FileUtils::mkdir(URL(DrivePath + "/x/y", true)), std::nullopt);
  EXPECT_TRUE(FileUtils::isDir(URL(DrivePath + "/x/y")));
  EXPECT_TRUE(wasCalled("write 0 " + DrivePath + "/x/y"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Creating directory: 'file://" + DrivePath + "/x/y/'"));
  EXPECT_TRUE(platform.log.has("INFO", "Created directory: 'file://" + DrivePath + "/x/y/'"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Coordinated Write returned (null)"));
}

TEST_F(FileOperationsTest, MkdirReturnsTheFailureAndTheCoordinatorsErrorWins) {
  platform.files.createError = diskFull;
  EXPECT_EQ(FileUtils::mkdir(URL(DrivePath + "/x"))->code, FileErrorCode::WriteOutOfSpace);
  EXPECT_TRUE(
      platform.log.has("ERROR", "failed to create directory:'file://" + DrivePath + "/x': " + diskFull.description()));
  platform.coordination.coordinatorError = refused;
  EXPECT_EQ(FileUtils::mkdir(URL(DrivePath + "/x"))->code, 1);
}

TEST_F(FileOperationsTest, RemoveDeletesAnUnchangedDocument) {
  const URL url(DrivePath + "/a.txt");
  platform.disk.add(url.path());
  EXPECT_EQ(FileUtils::remove(url), std::nullopt);
  EXPECT_FALSE(FileUtils::exists(url));
  EXPECT_TRUE(wasCalled("write 1 " + url.path()));
  EXPECT_TRUE(platform.log.has("INFO", "Deleted item: 'file://" + url.path() + "'"));
  EXPECT_TRUE(platform.log.has("INFO", "Coordinated Write returned (null)"));
}

TEST_F(FileOperationsTest, RemoveKeepsADocumentThatChangedMeanwhile) {
  const URL url(DrivePath + "/a.txt");
  MemoryItem& item = platform.disk.add(url.path());
  platform.coordination.beforeAccessor = [&] { item.attributes.modificationDate = Date(std::chrono::seconds(2000)); };
  EXPECT_EQ(FileUtils::remove(url)->code, FileErrorCode::UserCancelled);
  EXPECT_TRUE(FileUtils::exists(url));
  EXPECT_TRUE(platform.log.has(
      "INFO", "Date changed during delete (user chose Keep?) -- preserving document: 'file://" + url.path() + "'"));
}

TEST_F(FileOperationsTest, RemoveKeepsADocumentWithoutADate) {
  const URL url(DrivePath + "/a.txt");
  platform.disk.add(url.path()).attributes.modificationDate.reset();
  EXPECT_EQ(FileUtils::remove(url)->code, FileErrorCode::UserCancelled);
  EXPECT_TRUE(FileUtils::exists(url));
}

TEST_F(FileOperationsTest, RemoveReturnsTheDisksErrorAndTheCoordinatorsWins) {
  const URL url(DrivePath + "/a.txt");
  platform.disk.add(url.path());
  platform.files.removeError = diskFull;
  EXPECT_EQ(FileUtils::remove(url)->code, FileErrorCode::WriteOutOfSpace);
  EXPECT_TRUE(platform.log.has("ERROR", "failed to delete item:'file://" + url.path() + "': " + diskFull.description()));
  platform.coordination.coordinatorError = refused;
  EXPECT_EQ(FileUtils::remove(url)->code, 1);
}

TEST_F(FileOperationsTest, MoveToTheSamePathDoesNothingEvenWithoutTheItem) {
  EXPECT_EQ(FileUtils::moveTo(URL(DrivePath + "/gone"), URL(DrivePath + "/gone")), std::nullopt);
  EXPECT_TRUE(platform.log.has("DEBUG", "Move: src and dest are the same"));
  EXPECT_TRUE(platform.record.calls.empty());
}

TEST_F(FileOperationsTest, MoveTellsTheCoordinatorBeforeAndAfter) {
  const std::string a = DrivePath + "/a.txt";
  const std::string b = DrivePath + "/b.txt";
  platform.disk.add(a);
  EXPECT_EQ(FileUtils::moveTo(URL(a), URL(b)), std::nullopt);
  EXPECT_EQ(platform.record.calls,
            (std::vector<std::string>{"coordinator", "write 2 " + a + " 4 " + b, "willMove " + a + " " + b,
                                      "move " + a + " " + b, "didMove " + a + " " + b}));
  EXPECT_TRUE(platform.log.has("DEBUG", "Moving src1:  'file://" + a + "'"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Moving dest1: 'file://" + b + "'"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Moving src2:  'file://" + a + "'"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Moving dest2: 'file://" + b + "'"));
  EXPECT_TRUE(platform.log.has("INFO", "Move successful"));
}

TEST_F(FileOperationsTest, MoveOfAMissingSourceIsTriedAndFails) {
  const auto error = FileUtils::moveTo(URL(DrivePath + "/gone"), URL(DrivePath + "/b"));
  EXPECT_EQ(error->code, FileErrorCode::NoSuchFile);
  EXPECT_TRUE(platform.log.has("INFO", "Move: source filename does not exist, must be a fault."));
  EXPECT_TRUE(platform.log.has("WARNING", "KX Move failed: " + error->description()));
  EXPECT_TRUE(platform.log.has("WARNING", "Move failed: " + error->description()));
  EXPECT_FALSE(wasCalled("didMove " + DrivePath + "/gone " + DrivePath + "/b"));
}

TEST_F(FileOperationsTest, MoveRefusesAFileOntoAFolderAndAFolderOntoAFile) {
  platform.disk.add(DrivePath + "/file");
  platform.disk.add(DrivePath + "/folder", FileType::Directory);
  EXPECT_EQ(FileUtils::moveTo(URL(DrivePath + "/file"), URL(DrivePath + "/folder"))->code,
            FileErrorCode::FeatureUnsupported);
  EXPECT_TRUE(platform.log.has("ERROR", "Move: must move a file to a file (dest is a dir)"));
  EXPECT_EQ(FileUtils::moveTo(URL(DrivePath + "/folder"), URL(DrivePath + "/file"))->code,
            FileErrorCode::FeatureUnsupported);
  EXPECT_TRUE(platform.log.has("ERROR", "Move: must move a dir to a dir (dest is a file)"));
  EXPECT_TRUE(platform.record.calls.empty());
}

TEST_F(FileOperationsTest, TheDocumentsDirectoryIsTheFirstWithItsTildeExpanded) {
  EXPECT_EQ(FileUtils::docDir(), URL("/home/somebody/Documents"));
  platform.files.documentsDirectories.clear();
  EXPECT_EQ(FileUtils::docDir(), std::nullopt);
}

TEST_F(FileOperationsTest, EvictionThatFailsIsLogged) {
  platform.cloud.evictError.reset();
  EXPECT_TRUE(FileUtils::evictDocument(Drive));
  platform.cloud.evictError = refused;
  EXPECT_FALSE(FileUtils::evictDocument(Drive));
  EXPECT_TRUE(platform.log.has("WARNING", "Evict error: " + refused.description()));
}

TEST_F(FileOperationsTest, AResourceValueComesFromThePromiseElseFromTheDisk) {
  const URL url(DrivePath + "/a.txt");
  platform.disk.add(url.path());
  EXPECT_EQ(FileUtils::getResourceValueForURL(ResourceKey::Name, url), Value("a.txt"));
  EXPECT_FALSE(std::count(platform.record.calls.begin(), platform.record.calls.end(), "plain " + url.path()));
  platform.values.promisedReadError = refused;
  EXPECT_EQ(FileUtils::getResourceValueForURL(ResourceKey::Name, url), Value("a.txt"));
  EXPECT_FALSE(FileUtils::getResourceValueForURL(ResourceKey::Name, std::nullopt).isPresent());
  EXPECT_TRUE(platform.log.lines().empty());
}

TEST_F(FileOperationsTest, AttributesAreLoggedWithTheirAge) {
  platform.clock->origin = Date(std::chrono::seconds(1000));
  platform.disk.add(DrivePath + "/a").attributes.size = Value(std::uint64_t{7});
  platform.clock->advance(std::chrono::seconds(4000));
  FileUtils::logFileAttributes(DrivePath + "/a");
  EXPECT_TRUE(platform.log.has("DEBUG", "Date Created: 1000.000000 (4000.000000 seconds ago)"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Date Modified: 1000.000000 (4000.000000 seconds ago)"));
  EXPECT_TRUE(platform.log.has("DEBUG", "Size: 7 bytes"));
  // 5,000 s and the 2^63 ns from the clock's beginning to 1970, which is more than it counts.
  platform.disk.items.at(DrivePath + "/a").attributes.modificationDate = Date::min();
  FileUtils::logFileAttributes(DrivePath + "/a");
  EXPECT_TRUE(
      platform.log.has("DEBUG", "Date Modified: " + Value(Date::min()).description() + " (9223377036.854776 seconds ago)"));
  FileUtils::logFileAttributes("/gone");
  EXPECT_EQ(platform.log.lines().back().find("(VLO)[ERROR]"), 0u);
  EXPECT_NE(platform.log.lines().back().find("Cannot get attributes of /gone: "), std::string::npos);
}

}  // namespace
}  // namespace vaelo
