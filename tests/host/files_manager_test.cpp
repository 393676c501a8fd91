// SPDX-License-Identifier: GPL-3.0-or-later
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "host/drive/promise_file.h"
#include "host/files/local_file_manager.h"
#include "host/files/tree_copy.h"
#include "host/support/unique_fd.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {

namespace {

class FilesManagerTest : public drive_test::DriveTest {
 protected:
  FilesManagerTest() {
    makeFolder(drive);
    std::string pattern = "/dev/shm/vaelo-files-XXXXXX";
    if (const char* made = ::mkdtemp(pattern.data())) other = made;
  }
  ~FilesManagerTest() override { std::filesystem::remove_all(other); }

  /// False where the machine has no second file system to write to.
  bool hasOtherFileSystem() const {
    struct stat a {};
    struct stat b {};
    return !other.empty() && stat(other.c_str(), &a) == 0 && stat(root.c_str(), &b) == 0 && a.st_dev != b.st_dev;
  }
  void promise(const std::string& folder, const std::string& name, const std::string& tag = "Red") {
    makeFolder(folder);
    PromiseInfo info;
    info.name = name;
    info.size = 4711;
    info.tags = {tag};
    ASSERT_FALSE(writePromise(folder, info));
  }
  static std::vector<std::string> namesIn(const std::string& folder) {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(folder)) names.push_back(entry.path().filename());
    std::sort(names.begin(), names.end());
    return names;
  }
  static std::string destinationOf(const std::optional<Error>& error) {
    const auto at = error->userInfo.find(DestinationFilePathErrorKey);
    return at == error->userInfo.end() ? "" : *at->second.get<std::string>();
  }
  std::optional<Error> move(const std::string& from, const std::string& to) {
    return files.moveItemAtURL(URL(from), URL(to));
  }

  std::string other;
  LocalFileManager files;
};

TEST_F(FilesManagerTest, ExistenceFollowsLinksAndAttributesDoNot) {
  write(drive + "/a", "12345");
  link(drive + "/a", drive + "/link");
  link("nowhere", drive + "/lost");
  bool isDirectory = true;
  EXPECT_TRUE(files.fileExistsAtPath(drive + "/link", &isDirectory));
  EXPECT_FALSE(isDirectory);
  EXPECT_TRUE(files.fileExistsAtPath(drive, &isDirectory));
  EXPECT_TRUE(isDirectory);
  EXPECT_FALSE(files.fileExistsAtPath(drive + "/lost"));
  EXPECT_EQ(files.attributesOfItemAtPath(drive + "/a").value->size.unsignedValue(), 5u);
  EXPECT_EQ(files.attributesOfItemAtPath(drive + "/link").value->type, FileType::SymbolicLink);
  EXPECT_EQ(files.attributesOfItemAtPath(drive).value->type, FileType::Directory);
  EXPECT_EQ(files.destinationOfSymbolicLinkAtPath(drive + "/lost").value, "nowhere");
  EXPECT_FALSE(files.destinationOfSymbolicLinkAtPath(drive + "/a"));
}

TEST_F(FilesManagerTest, FailuresHaveACodeAPathAndWords) {
  write(drive + "/file");
  link("b", drive + "/a");
  link("a", drive + "/b");
  const std::string longName = drive + "/" + std::string(256, 'x');
  const auto missing = files.attributesOfItemAtPath(drive + "/missing").error;
  EXPECT_EQ(missing->code, FileErrorCode::ReadNoSuchFile);
  EXPECT_EQ(*missing->userInfo.at(FilePathErrorKey).get<std::string>(), drive + "/missing");
  EXPECT_NE(missing->localizedDescription->find("“missing”"), std::string::npos);
  EXPECT_EQ(missing->domain, FileErrorDomain);
  EXPECT_EQ(files.attributesOfItemAtPath(drive + "/file/below").error->code, FileErrorCode::ReadNoSuchFile);
  EXPECT_EQ(files.attributesOfItemAtPath(drive + "/a/below").error->code, FileErrorCode::ReadUnknown);
  EXPECT_EQ(files.removeItemAtURL(URL(drive + "/missing"))->code, FileErrorCode::NoSuchFile);
  EXPECT_EQ(files.createDirectoryAtURL(URL(longName))->code, FileErrorCode::WriteUnknown);
  EXPECT_EQ(files.createDirectoryAtURL(URL(drive + "/file"))->code, FileErrorCode::WriteFileExists);
  EXPECT_EQ(files.createDirectoryAtURL(URL("/sys/vaelo-test"))->code, FileErrorCode::WriteNoPermission);
  EXPECT_EQ(move(drive + "/file", longName)->code, FileErrorCode::WriteUnknown);
  EXPECT_EQ(move(drive + "/file", drive + "/missing/file")->code, FileErrorCode::NoSuchFile);
  EXPECT_EQ(read(drive + "/file"), "content");
}

TEST_F(FilesManagerTest, WordsNameAFileWhoseNameIsNoText) {
  const auto error = files.attributesOfItemAtPath(drive + "/\xff\xfe%s").error;
  EXPECT_TRUE(g_utf8_validate(error->localizedDescription->c_str(), -1, nullptr));
}

TEST_F(FilesManagerTest, FoldersAreMadeWithThoseAboveThem) {
  EXPECT_FALSE(files.createDirectoryAtURL(URL(drive + "/a/b/\xff")));
  EXPECT_FALSE(files.createDirectoryAtURL(URL(drive + "/a/b/\xff")));
  EXPECT_TRUE(std::filesystem::is_directory(drive + "/a/b/\xff"));
}

TEST_F(FilesManagerTest, AFolderDoesNotTakeTheNameOfWhatIsNotDownloaded) {
  promise(drive, "a");
  link("nowhere", drive + "/lost");
  EXPECT_EQ(files.createDirectoryAtURL(URL(drive + "/a"))->code, FileErrorCode::WriteFileExists);
  EXPECT_EQ(files.createDirectoryAtURL(URL(drive + "/lost"))->code, FileErrorCode::WriteFileExists);
}

TEST_F(FilesManagerTest, RemovalTakesTheWholeTreeAndNoLinkTarget) {
  write(root + "/outside/kept");
  write(drive + "/tree/a/b/file");
  link(root + "/outside", drive + "/tree/a/link");
  link(root + "/outside/kept", drive + "/tree/file-link");
  link("..", drive + "/tree/a/up");
  promise(drive + "/tree/a", "far");
  EXPECT_FALSE(files.removeItemAtURL(URL(drive + "/tree", true)));
  EXPECT_FALSE(exists(drive + "/tree"));
  EXPECT_TRUE(exists(root + "/outside/kept"));
  link(root + "/outside", drive + "/link");
  EXPECT_FALSE(files.removeItemAtURL(URL(drive + "/link")));
  EXPECT_FALSE(exists(drive + "/link"));
  EXPECT_TRUE(exists(root + "/outside/kept"));
}

TEST_F(FilesManagerTest, RemovalTakesADeepTree) {
  std::string path = drive + "/deep";
  for (int level = 0; level < 100; ++level) path += "/d";
  makeFolder(path);
  EXPECT_FALSE(files.removeItemAtURL(URL(drive + "/deep")));
  EXPECT_FALSE(exists(drive + "/deep"));
}

TEST_F(FilesManagerTest, RemovingWhatIsNotDownloadedRemovesItsPromise) {
  promise(drive, "a");
  EXPECT_FALSE(files.removeItemAtURL(URL(drive + "/a")));
  EXPECT_TRUE(namesIn(drive).empty());
}

TEST_F(FilesManagerTest, AMoveNeverReplaces) {
  write(drive + "/a", "source");
  write(drive + "/b", "there");
  makeFolder(drive + "/folder");
  promise(drive, "far");
  link("nowhere", drive + "/lost");
  for (const std::string name : {"/b", "/folder", "/far", "/lost"}) {
    const auto error = move(drive + "/a", drive + name);
    ASSERT_TRUE(error) << name;
    EXPECT_EQ(error->code, FileErrorCode::WriteFileExists) << name;
    EXPECT_EQ(destinationOf(error), drive + name);
  }
  EXPECT_EQ(read(drive + "/a"), "source");
  EXPECT_EQ(read(drive + "/b"), "there");
}

// The disk tells the names apart, the store would keep one of the items only.
TEST_F(FilesManagerTest, NamesThatTheStoreTakesForOneAreTaken) {
  const std::string one = drive + "/Caf\u00E9";
  const std::string two = drive + "/Cafe\u0301";
  write(one);
  promise(drive, "FAR");
  write(drive + "/a");
  const auto codeOf = [this](NameRules rules, const std::string& to) {
    const auto error = LocalFileManager(nullptr, rules).moveItemAtURL(URL(drive + "/a"), URL(to));
    return error ? error->code : 0;
  };
  EXPECT_EQ(codeOf({true, false}, drive + "/caf\u00E9"), FileErrorCode::WriteFileExists);
  EXPECT_EQ(codeOf({true, false}, drive + "/far"), FileErrorCode::WriteFileExists);
  EXPECT_EQ(codeOf({false, true}, two), FileErrorCode::WriteFileExists);
  EXPECT_EQ(codeOf({true, true}, drive + "/CAFE\u0301"), FileErrorCode::WriteFileExists);
  LocalFileManager folding(nullptr, {true, true});
  EXPECT_EQ(folding.createDirectoryAtURL(URL(two))->code, FileErrorCode::WriteFileExists);
  EXPECT_FALSE(folding.moveItemAtURL(URL(one), URL(two))) << "another spelling of its own name";
  EXPECT_TRUE(exists(two));
  EXPECT_FALSE(folding.moveItemAtURL(URL(drive + "/a"), URL(drive + "/A")));
  EXPECT_EQ(codeOf({}, drive + "/a"), FileErrorCode::NoSuchFile) << "it has moved";
  EXPECT_FALSE(move(drive + "/A", one)) << "where they are told apart, they may stand side by side";
}

TEST_F(FilesManagerTest, WhatTheStoreFoldsStandsInTheAccountsFile) {
  write(root + "/account.ini", "[Account]\nName=x\n");
  EXPECT_FALSE(readNameRules(root + "/account.ini").foldAny());
  EXPECT_FALSE(readNameRules(root + "/none").foldAny());
  write(root + "/account.ini", "[Account]\nName=x\n[Store]\nFoldsCase=true\n");
  EXPECT_TRUE(readNameRules(root + "/account.ini").foldsCase);
  EXPECT_FALSE(readNameRules(root + "/account.ini").foldsNormalization);
}

TEST_F(FilesManagerTest, AHardLinkIsAnotherItem) {
  write(drive + "/a");
  ASSERT_EQ(::link((drive + "/a").c_str(), (drive + "/b").c_str()), 0);
  EXPECT_EQ(move(drive + "/a", drive + "/b")->code, FileErrorCode::WriteFileExists);
  EXPECT_EQ(namesIn(drive).size(), 2u);
}

TEST_F(FilesManagerTest, AFolderDoesNotMoveIntoItself) {
  makeFolder(drive + "/a/b");
  EXPECT_EQ(move(drive + "/a", drive + "/a/b/c")->code, FileErrorCode::WriteUnknown);
  EXPECT_TRUE(exists(drive + "/a/b"));
}

TEST_F(FilesManagerTest, AMovedLinkStaysALink) {
  link("target", drive + "/a");
  EXPECT_FALSE(move(drive + "/a", drive + "/b"));
  EXPECT_EQ(std::filesystem::read_symlink(drive + "/b"), "target");
}

TEST_F(FilesManagerTest, WhatIsNotDownloadedMovesWithItsPromise) {
  write(drive + "/.a.vlopromise", "[Promise]\nName=a\nSize=9\nFuture=kept\n");
  makeFolder(drive + "/sub");
  EXPECT_FALSE(move(drive + "/a", drive + "/sub/b"));
  EXPECT_EQ(namesIn(drive), std::vector<std::string>{"sub"});
  EXPECT_EQ(readPromise(drive + "/sub/.b.vlopromise").value->size, 9u);
  EXPECT_NE(read(drive + "/sub/.b.vlopromise").find("Future=kept"), std::string::npos);
  const std::string longName = drive + "/" + std::string(250, 'y');
  EXPECT_FALSE(move(drive + "/sub/b", longName));
  EXPECT_TRUE(namesIn(drive + "/sub").empty());
  EXPECT_EQ(readPromise(promisePathFor(longName)).value->size, 9u);
  EXPECT_FALSE(move(longName, longName));
  EXPECT_EQ(physicalPathOf(longName), promisePathFor(longName));
}

TEST_F(FilesManagerTest, APromiseDoesNotReplaceEither) {
  promise(drive, "a", "A");
  promise(drive, "b", "B");
  const auto error = move(drive + "/a", drive + "/b");
  EXPECT_EQ(error->code, FileErrorCode::WriteFileExists);
  EXPECT_EQ(destinationOf(error), drive + "/b");
  EXPECT_EQ(readPromise(promisePathFor(drive + "/b")).value->tags, std::vector<std::string>{"B"});
}

// The promise of such a name can be written, and was: an item that could never be downloaded.
TEST_F(FilesManagerTest, WhatIsNotDownloadedTakesNoNameThatIsTooLong) {
  promise(drive, "a");
  EXPECT_EQ(move(drive + "/a", drive + "/" + std::string(256, 'x'))->localizedDescription,
            "The name is too long by 1 character.");
  EXPECT_EQ(namesIn(drive), std::vector<std::string>{".a.vlopromise"});
  EXPECT_FALSE(move(drive + "/a", drive + "/" + std::string(255, 'x')));
}

// A person reads of the item that was to move, or of the folder that doesn't take it, whichever it is; and never of the file
// that stands for an item that is not downloaded.
TEST_F(FilesManagerTest, AFailedMoveNamesWhatIsInItsWay) {
  write(drive + "/a", "a");
  write(drive + "/file", "x");
  promise(drive, "far");
  promise(drive, std::string(250, 'y'));
  makeFolder(drive + "/Plans");
  const auto words = [&](const std::string& from, const std::string& to) {
    const auto error = move(drive + "/" + from, drive + "/" + to);
    EXPECT_EQ(destinationOf(error), drive + "/" + to);
    return error->localizedDescription.value_or("");
  };
  const std::string folderIsGone = "The folder “Gone” doesn’t exist any more.";
  EXPECT_EQ(words("a", "Gone/a"), folderIsGone);
  EXPECT_EQ(words("Plans", "Gone/Plans"), folderIsGone);
  EXPECT_EQ(words("far", "Gone/far"), folderIsGone);
  EXPECT_EQ(words("a", "file/a"), "The folder “file” doesn’t exist any more.");
  EXPECT_EQ(words("gone", "Plans/gone"), "The file “gone” doesn’t exist any more.");
  EXPECT_EQ(words("gone", "Gone/gone"), "The file “gone” doesn’t exist any more.");
  EXPECT_EQ(words("Plans", "Plans/Plans"), "A folder can’t be moved into itself.");
  promise(drive + "/Plans", "far");
  EXPECT_EQ(words("far", "Plans/far"), "An item named “far” already exists.");
  EXPECT_EQ(read(drive + "/a"), "a");
  EXPECT_TRUE(physicalPathOf(drive + "/far"));
}

TEST_F(FilesManagerTest, BetweenFileSystemsEverythingComesAlong) {
  if (!hasOtherFileSystem()) GTEST_SKIP() << "one file system only";
  write(other + "/tree/a/file", std::string(300000, 'x') + "end");
  write(other + "/tree/empty", "");
  link("a/file", other + "/tree/link");
  promise(other + "/tree", "far");
  chmod((other + "/tree/a/file").c_str(), 0640);
  const struct timespec times[2] = {{1000000000, 0}, {1000000001, 500000000}};
  ASSERT_EQ(utimensat(AT_FDCWD, (other + "/tree/a/file").c_str(), times, 0), 0);
  ASSERT_EQ(utimensat(AT_FDCWD, (other + "/tree").c_str(), times, 0), 0);
  EXPECT_FALSE(move(other + "/tree", drive + "/moved"));
  EXPECT_TRUE(namesIn(other).empty());
  EXPECT_EQ(namesIn(drive), std::vector<std::string>{"moved"});
  EXPECT_EQ(read(drive + "/moved/a/file"), std::string(300000, 'x') + "end");
  EXPECT_TRUE(exists(drive + "/moved/empty"));
  EXPECT_EQ(std::filesystem::read_symlink(drive + "/moved/link"), "a/file");
  EXPECT_TRUE(physicalPathOf(drive + "/moved/far"));
  struct stat info {};
  ASSERT_EQ(stat((drive + "/moved/a/file").c_str(), &info), 0);
  EXPECT_EQ(info.st_mode & 07777, 0640u);
  EXPECT_EQ(info.st_mtim.tv_sec, 1000000001);
  EXPECT_EQ(info.st_mtim.tv_nsec, 500000000);
  ASSERT_EQ(stat((drive + "/moved").c_str(), &info), 0);
  EXPECT_EQ(info.st_mtim.tv_sec, 1000000001);
}

TEST_F(FilesManagerTest, AFailedMoveBetweenFileSystemsLeavesTheSourceWholeAndNothingElse) {
  if (!hasOtherFileSystem()) GTEST_SKIP() << "one file system only";
  write(other + "/tree/a");
  ASSERT_EQ(::mkfifo((other + "/tree/pipe").c_str(), 0600), 0);
  EXPECT_TRUE(move(other + "/tree", drive + "/moved"));
  EXPECT_EQ(namesIn(other + "/tree").size(), 2u);
  EXPECT_TRUE(namesIn(drive).empty());
  write(drive + "/there", "kept");
  EXPECT_EQ(move(other + "/tree/a", drive + "/there")->code, FileErrorCode::WriteFileExists);
  EXPECT_EQ(read(drive + "/there"), "kept");
  EXPECT_TRUE(exists(other + "/tree/a"));
}

TEST_F(FilesManagerTest, APromiseMovesBetweenFileSystems) {
  if (!hasOtherFileSystem()) GTEST_SKIP() << "one file system only";
  promise(other, "far");
  EXPECT_FALSE(move(other + "/far", drive + "/near"));
  EXPECT_TRUE(namesIn(other).empty());
  EXPECT_EQ(readPromise(promisePathFor(drive + "/near")).value->size, 4711u);
}

// A program that saves while its folder is copied must not find its document gone with the source.
TEST_F(FilesManagerTest, ACopyKnowsWhenItsSourceChanged) {
  write(drive + "/tree/a");
  TreeCopy copy(drive + "/tree", drive + "/copy");
  ASSERT_EQ(copy.run(), 0);
  EXPECT_TRUE(copy.sourceIsUnchanged());
  write(drive + "/tree/b");
  EXPECT_FALSE(copy.sourceIsUnchanged());
  TreeCopy second(drive + "/tree", drive + "/second");
  ASSERT_EQ(second.run(), 0);
  write(drive + "/tree/a", "changed");
  EXPECT_FALSE(second.sourceIsUnchanged());
}

TEST_F(FilesManagerTest, ACopyKnowsWhoMayStillWriteToItsSource) {
  write(drive + "/tree/a", "1");
  TreeCopy copy(drive + "/tree", drive + "/copy");
  EXPECT_EQ(copy.run(), 0);
  {
    const UniqueFd reader(::open((drive + "/tree/a").c_str(), O_RDONLY));
    EXPECT_TRUE(copy.sourceIsUnchanged()) << "whoever reads takes nothing away";
    const UniqueFd writer(::open((drive + "/tree/a").c_str(), O_WRONLY));
    EXPECT_FALSE(copy.sourceIsUnchanged());
    EXPECT_EQ(TreeCopy(drive + "/tree", drive + "/second").run(), EBUSY);
  }
  EXPECT_TRUE(copy.sourceIsUnchanged());
}

TEST_F(FilesManagerTest, ACopyEndsWhereverItIsToldTo) {
  write(drive + "/tree/a", std::string(300000, 'x'));
  write(drive + "/tree/b", "b");
  int questions = 0;
  TreeCopy whole(drive + "/tree", drive + "/whole", [&] { return ++questions > 0; });
  ASSERT_EQ(whole.run(), 0);
  // The folder and two files, and of each file what is copied, in one step and a last one, and what is compared: of the
  // first in two blocks and the end, of the second in one and the end.
  EXPECT_EQ(questions, 3 + 2 + 2 + 3 + 2);
  for (int last = 0; last < questions; ++last) {
    int asked = 0;
    TreeCopy copy(drive + "/tree", drive + "/copy " + std::to_string(last), [&] { return asked++ < last; });
    EXPECT_EQ(copy.run(), ECANCELED) << last;
  }
}

TEST_F(FilesManagerTest, TheWalkSeesEveryItemOnceAndFollowsNoLink) {
  write(drive + "/a/file");
  write(drive + "/a/.hidden/x");
  write(drive + "/doc.bundle/inside");
  write(drive + "/both");
  promise(drive, "both");
  promise(drive + "/a", "far");
  promise(drive, ".secret");
  promise(drive, std::string(255, 'z'));
  link(drive, drive + "/a/round");
  const auto walk = [&](unsigned options) {
    std::vector<std::string> found;
    files.enumerate(
        URL(drive), {}, options,
        [&](const URL& url) {
          found.push_back(url.path().substr(drive.size() + 1));
          return true;
        },
        [](const URL&, const Error&) { return true; });
    std::sort(found.begin(), found.end());
    return found;
  };
  const std::string longName(255, 'z');
  using Names = std::vector<std::string>;
  EXPECT_EQ(walk(EnumerateAll), (Names{".secret", "a", "a/.hidden", "a/.hidden/x", "a/far", "a/file", "a/round", "both",
                                       "doc.bundle", "doc.bundle/inside", longName}));
  EXPECT_EQ(walk(SkipsHiddenFiles | SkipsPackageDescendants),
            (Names{"a", "a/far", "a/file", "a/round", "both", "doc.bundle", longName}));
  EXPECT_EQ(walk(SkipsHiddenFiles | SkipsSubdirectoryDescendants), (Names{"a", "both", "doc.bundle", longName}));
}

TEST_F(FilesManagerTest, TheWalkStaysInItsTreeWhenAFolderIsReplacedByALink) {
  write(root + "/outside/secret");
  makeFolder(drive + "/a");
  std::vector<std::string> found;
  int errors = 0;
  files.enumerate(
      URL(drive), {}, EnumerateAll,
      [&](const URL& url) {
        found.push_back(url.path().substr(drive.size() + 1));
        if (url.lastPathComponent() == "a") {
          std::filesystem::remove(drive + "/a");
          link(root + "/outside", drive + "/a");
        }
        return true;
      },
      [&](const URL&, const Error&) { return ++errors > 0; });
  EXPECT_EQ(found, std::vector<std::string>{"a"});
  EXPECT_EQ(errors, 1);
}

TEST_F(FilesManagerTest, TheWalkCanBeEndedAndTellsOfWhatItCannotRead) {
  write(drive + "/a/1");
  write(drive + "/b");
  int visits = 0;
  const auto count = [&](const URL&) { return ++visits < 2; };
  files.enumerate(URL(drive), {}, EnumerateAll, count, [](const URL&, const Error&) { return true; });
  EXPECT_EQ(visits, 2);
  int errors = 0;
  files.enumerate(
      URL(drive + "/b"), {}, EnumerateAll, [](const URL&) { return true; },
      [&](const URL& url, const Error& error) {
        ++errors;
        EXPECT_EQ(url.path(), drive + "/b");
        EXPECT_EQ(error.code, FileErrorCode::ReadNoSuchFile);
        return true;
      });
  EXPECT_EQ(errors, 1);
}

TEST_F(FilesManagerTest, TheTildeIsTheUsersOwn) {
  EXPECT_EQ(files.expandingTilde("~/x"), std::string(g_get_home_dir()) + "/x");
  EXPECT_EQ(files.expandingTilde("~"), g_get_home_dir());
  EXPECT_EQ(files.expandingTilde("~other/x"), "~other/x");
  EXPECT_EQ(files.expandingTilde("/~/x"), "/~/x");
  EXPECT_FALSE(files.userDocumentsDirectories().empty());
}

}  // namespace

}  // namespace vaelo
