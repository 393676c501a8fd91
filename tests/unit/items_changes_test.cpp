// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/file_utils.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

using K = ResourceKey;

const URL A("/drive/mirror/com~marrow~Kestrel/a");
const URL B("/drive/mirror/com~marrow~Kestrel/b");

std::string text(const URL& url) { return url.absoluteString(); }

/// Probing, making, deleting and moving.
class FileChangesTest : public ItemsTest {
 protected:
  void addDatedFile(const URL& url, Date date) { world.addFile(url, {{K::ContentModificationDate, date}}); }
};

TEST_F(FileChangesTest, whatDoesNotExistIsNeitherFileNorFolder) {
  EXPECT_FALSE(FileUtils::exists(A) || FileUtils::isFile(A) || FileUtils::isDir(A));
  world.addFile(A);
  EXPECT_TRUE(FileUtils::exists(A) && FileUtils::isFile(A) && !FileUtils::isDir(A));
  world.addFolder(B);
  EXPECT_TRUE(FileUtils::exists(B) && !FileUtils::isFile(B) && FileUtils::isDir(B));
}

TEST_F(FileChangesTest, aFolderIsMadeWhereTheCoordinatorSays) {
  world.redirected.insert_or_assign(A.path(), B);
  EXPECT_FALSE(FileUtils::mkdir(A));
  EXPECT_EQ(world.calls, (std::vector<std::string>{"coordinator", "write 0 " + A.path(), "create " + B.path()}));
  EXPECT_EQ(messages(), (std::vector<std::string>{"DEBUG Creating directory: '" + text(A) + "'",
                                                  "INFO Created directory: '" + text(B) + "'",
                                                  "DEBUG Coordinated Write returned (null)"}));
}

TEST_F(FileChangesTest, aFolderThatCannotBeMade) {
  world.createError = fileError(FileErrorCode::WriteNoPermission);
  const auto error = FileUtils::mkdir(A);
  ASSERT_TRUE(error);
  EXPECT_EQ(error->code, FileErrorCode::WriteNoPermission);
  EXPECT_TRUE(logged("ERROR", "failed to create directory:'" + text(A) + "': " + world.createError->description()));
  EXPECT_TRUE(logged("DEBUG", "Coordinated Write returned " + world.createError->description()));
}

TEST_F(FileChangesTest, theCoordinatorsErrorWinsWhateverIsDone) {
  addDatedFile(A, Noon);
  world.createError = world.removeError = world.moveError = fileError(FileErrorCode::WriteUnknown);
  world.coordinatorError = fileError(FileErrorCode::UserCancelled);
  world.errorAfterAccessor = true;
  EXPECT_EQ(FileUtils::mkdir(A)->code, FileErrorCode::UserCancelled);
  EXPECT_EQ(FileUtils::remove(A)->code, FileErrorCode::UserCancelled);
  EXPECT_EQ(FileUtils::moveTo(A, B)->code, FileErrorCode::UserCancelled);
  EXPECT_TRUE(world.called("create " + A.path()) && world.called("remove " + A.path()) &&
              world.called("move " + A.path() + " " + B.path()));
}

TEST_F(FileChangesTest, anItemIsDeletedWhereTheCoordinatorSays) {
  addDatedFile(A, Noon);
  addDatedFile(B, Noon);
  world.redirected.insert_or_assign(A.path(), B);
  EXPECT_FALSE(FileUtils::remove(A));
  EXPECT_EQ(world.calls, (std::vector<std::string>{"promised " + A.path(), "coordinator", "write 1 " + A.path(),
                                                   "promised " + B.path(), "remove " + B.path()}));
  EXPECT_EQ(messages(),
            (std::vector<std::string>{"DEBUG Removing item: '" + text(A) + "'", "INFO Deleted item: '" + text(B) + "'",
                                      "INFO Coordinated Write returned (null)"}));
}

TEST_F(FileChangesTest, anItemThatCannotBeDeleted) {
  addDatedFile(A, Noon);
  world.removeError = fileError(FileErrorCode::WriteNoPermission);
  EXPECT_EQ(FileUtils::remove(A)->code, FileErrorCode::WriteNoPermission);
  EXPECT_TRUE(logged("ERROR", "failed to delete item:'" + text(A) + "': " + world.removeError->description()));
  EXPECT_TRUE(logged("INFO", "Coordinated Write returned " + world.removeError->description()));
}

TEST_F(FileChangesTest, whatChangedWhileTheUserWasAskedIsKept) {
  addDatedFile(A, Noon);
  world.beforeAccessor = [this] { addDatedFile(A, Noon + std::chrono::seconds(1)); };
  const auto error = FileUtils::remove(A);
  ASSERT_TRUE(error);
  EXPECT_EQ(error->domain, FileErrorDomain);
  EXPECT_EQ(error->code, 3072);
  EXPECT_TRUE(error->userInfo.empty());
  EXPECT_FALSE(world.called("remove " + A.path()));
  EXPECT_TRUE(logged("INFO", "Date changed during delete (user chose Keep?) -- preserving document: '" + text(A) + "'"));
  EXPECT_TRUE(logged("INFO", "Coordinated Write returned " + error->description()));
}

TEST_F(FileChangesTest, absentDatesAreNeverEqual) {
  world.addFile(A);
  EXPECT_EQ(FileUtils::remove(A)->code, 3072);
  world.beforeAccessor = [this] { addDatedFile(A, Noon); };
  EXPECT_EQ(FileUtils::remove(A)->code, 3072);
  world.beforeAccessor = [this] { world.addFile(A); };
  EXPECT_EQ(FileUtils::remove(A)->code, 3072);
  EXPECT_FALSE(world.called("remove " + A.path()));
}

TEST_F(FileChangesTest, aMoveToTheSamePathIsSuccessEvenWithNothingThere) {
  EXPECT_FALSE(FileUtils::moveTo(A, URL(A.path(), true)));
  EXPECT_TRUE(world.calls.empty());
  EXPECT_EQ(messages(),
            (std::vector<std::string>{"DEBUG Moving src1:  '" + text(A) + "'", "DEBUG Moving dest1: '" + text(A) + "/'",
                                      "DEBUG Move: src and dest are the same"}));
}

TEST_F(FileChangesTest, aMoveTellsTheCoordinatorBeforeAndAfter) {
  world.addFile(A);
  const URL newA("/drive/mirror/com~marrow~Kestrel/a2");
  const URL newB("/drive/mirror/com~marrow~Kestrel/b2");
  world.addFile(newA);
  world.redirected.insert_or_assign(A.path(), newA);
  world.redirected.insert_or_assign(B.path(), newB);
  EXPECT_FALSE(FileUtils::moveTo(A, B));
  const std::string both = newA.path() + " " + newB.path();
  EXPECT_EQ(world.calls, (std::vector<std::string>{"coordinator", "write 2 " + A.path() + " 4 " + B.path(),
                                                   "willMove " + both, "move " + both, "didMove " + both}));
  EXPECT_EQ(messages(),
            (std::vector<std::string>{"DEBUG Moving src1:  '" + text(A) + "'", "DEBUG Moving dest1: '" + text(B) + "'",
                                      "DEBUG Moving src2:  '" + text(newA) + "'", "DEBUG Moving dest2: '" + text(newB) + "'",
                                      "INFO Move successful"}));
}

TEST_F(FileChangesTest, aMoveThatFailsIsNotToldOfAsDone) {
  world.addFile(A);
  world.moveError = fileError(FileErrorCode::WriteFileExists);
  EXPECT_EQ(FileUtils::moveTo(A, B)->code, FileErrorCode::WriteFileExists);
  EXPECT_TRUE(logged("WARNING", "KX Move failed: " + world.moveError->description()));
  EXPECT_TRUE(logged("WARNING", "Move failed: " + world.moveError->description()));
  EXPECT_FALSE(world.called("didMove " + A.path() + " " + B.path()));
}

TEST_F(FileChangesTest, aMissingSourceIsToldOfAndTried) {
  world.moveError = fileError(FileErrorCode::NoSuchFile);
  EXPECT_EQ(FileUtils::moveTo(A, B)->code, FileErrorCode::NoSuchFile);
  EXPECT_TRUE(logged("INFO", "Move: source filename does not exist, must be a fault."));
  EXPECT_TRUE(world.called("move " + A.path() + " " + B.path()));
}

TEST_F(FileChangesTest, filesDoNotMoveOntoFoldersNorFoldersOntoFiles) {
  world.addFile(A);
  world.addFolder(B);
  for (const auto& [source, destination, message] : {std::tuple{A, B, "Move: must move a file to a file (dest is a dir)"},
                                                     std::tuple{B, A, "Move: must move a dir to a dir (dest is a file)"}}) {
    const auto error = FileUtils::moveTo(source, destination);
    ASSERT_TRUE(error);
    EXPECT_EQ(error->domain, FileErrorDomain);
    EXPECT_EQ(error->code, 3328);
    EXPECT_TRUE(error->userInfo.empty());
    EXPECT_TRUE(logged("ERROR", message));
  }
  EXPECT_TRUE(world.calls.empty());
}

TEST_F(FileChangesTest, aFileOntoAFileAndAFolderOntoAFolderAreLeftToTheFileManager) {
  world.addFile(A);
  world.addFile(B);
  EXPECT_EQ(FileUtils::moveTo(A, B)->code, FileErrorCode::WriteFileExists);
  EXPECT_TRUE(world.called("move " + A.path() + " " + B.path()));
  world.calls.clear();
  world.addFolder(A);
  world.addFolder(B);
  EXPECT_EQ(FileUtils::moveTo(A, B)->code, FileErrorCode::WriteFileExists);
  EXPECT_TRUE(world.called("move " + A.path() + " " + B.path()));
}

TEST_F(FileChangesTest, theDocumentsDirectoryIsTheFirstWithItsTildeExpanded) {
  EXPECT_FALSE(FileUtils::docDir());
  world.documentsDirectories = {"~/Documents", "/other"};
  const auto folder = FileUtils::docDir();
  ASSERT_TRUE(folder);
  EXPECT_EQ(folder->path(), "/home/somebody/Documents");
  EXPECT_TRUE(folder->hasDirectoryPath());
}

TEST_F(FileChangesTest, eviction) {
  EXPECT_TRUE(FileUtils::evictDocument(A));
  EXPECT_TRUE(world.called("evict " + A.path()));
  EXPECT_TRUE(messages().empty());
  world.evictError = fileError(FileErrorCode::WriteUnknown);
  EXPECT_FALSE(FileUtils::evictDocument(A));
  EXPECT_TRUE(logged("WARNING", "Evict error: " + world.evictError->description()));
}

TEST_F(FileChangesTest, aValueIsThatOfThePromisedItemElseOfTheFile) {
  world.addFile(A, {{K::Name, "a"}});
  EXPECT_EQ(FileUtils::getResourceValueForURL(K::Name, A), Value("a"));
  EXPECT_FALSE(world.called("plain " + A.path()));
  // Without a value, and with an error.
  for (const Result<ResourceMap>& answer :
       {Result<ResourceMap>(ResourceMap{}), Result<ResourceMap>(fileError(FileErrorCode::ReadUnknown))}) {
    world.promisedAnswers.insert_or_assign(A.path(), answer);
    EXPECT_EQ(FileUtils::getResourceValueForURL(K::Name, A), Value("a"));
  }
  EXPECT_FALSE(FileUtils::getResourceValueForURL(K::FileSize, A).isPresent());
  world.calls.clear();
  EXPECT_FALSE(FileUtils::getResourceValueForURL(K::Name, std::nullopt).isPresent());
  EXPECT_TRUE(world.calls.empty() && messages().empty());
}

TEST_F(FileChangesTest, attributesAreLoggedWithTheirAge) {
  world.now_ = Noon;
  FileAttributes& attributes = world.addFile(A).attributes;
  attributes.creationDate = Noon - std::chrono::seconds(90);
  attributes.modificationDate = Noon + std::chrono::seconds(30);
  attributes.size = std::uint64_t{12};
  FileUtils::logFileAttributes(A.path());
  EXPECT_EQ(messages(),
            (std::vector<std::string>{
                "DEBUG Date Created: " + Value(*attributes.creationDate).description() + " (90.000000 seconds ago)",
                "DEBUG Date Modified: " + Value(*attributes.modificationDate).description() + " (-30.000000 seconds ago)",
                "DEBUG Size: 12 bytes"}));
  FileUtils::logFileAttributes("/nowhere");
  EXPECT_TRUE(logged(
      "ERROR", "Cannot get attributes of /nowhere: " + world.files.attributesOfItemAtPath("/nowhere").error->description()));
}

TEST_F(FileChangesTest, theDumpDoesNothing) {
  FileUtils::dumpURLResourceValues(A);
  EXPECT_TRUE(world.calls.empty() && messages().empty());
}

}  // namespace
}  // namespace vaelo
