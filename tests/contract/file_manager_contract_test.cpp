// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/contract/contract_test.h"

namespace vaelo::contract {
namespace {

using Names = std::vector<std::string>;

class FileManagerContract : public ContractTest {
 protected:
  FileManager& files() { return platform->files(); }
  bool exists(const URL& url) { return files().fileExistsAtPath(url.path()); }
  /// Entries below `folder` by their paths below it, in the order of the walk.
  Names walk(const URL& folder, unsigned options = EnumerateAll, const std::string& lastEntry = {}) {
    Names found;
    files().enumerate(
        folder, {}, options,
        [&](const URL& entry) {
          found.push_back(entry.path().substr(folder.path().size() + 1));
          return found.back() != lastEntry;
        },
        [&](const URL& entry, const Error& error) {
          found.push_back("error " + std::to_string(error.code) + " " + entry.lastPathComponent());
          return true;
        });
    return found;
  }
  static std::string destinationIn(const std::optional<Error>& error) {
    if (!error) return "no error";
    const auto at = error->userInfo.find(DestinationFilePathErrorKey);
    const std::string* path = at == error->userInfo.end() ? nullptr : at->second.get<std::string>();
    return path ? *path : "no destination";
  }
};

VAELO_CONTRACT_SUITE(FileManagerContract);

TEST_P(FileManagerContract, ExistenceFollowsLinks) {
  bool isDirectory = true;
  platform->addFile(inDrive("file").path());
  EXPECT_TRUE(files().fileExistsAtPath(inDrive("file").path(), &isDirectory));
  EXPECT_FALSE(isDirectory);
  platform->addFolder(inDrive("folder").path());
  platform->addLink(inDrive("link").path(), "folder");
  EXPECT_TRUE(files().fileExistsAtPath(inDrive("link").path(), &isDirectory));
  EXPECT_TRUE(isDirectory);
  platform->addLink(inDrive("dangling").path(), "nowhere");
  EXPECT_FALSE(exists(inDrive("dangling")));
  EXPECT_FALSE(exists(inDrive("file/below")));
}

TEST_P(FileManagerContract, WhatIsNotThereIsNoFolder) {
  bool isDirectory = true;
  EXPECT_FALSE(files().fileExistsAtPath(inDrive("gone").path(), &isDirectory));
  EXPECT_FALSE(isDirectory);
}

TEST_P(FileManagerContract, AnItemThatIsNotDownloadedIsNotOnTheDiskButItsPromiseIs) {
  platform->addPromise(inDrive("far.txt").path());
  EXPECT_FALSE(exists(inDrive("far.txt")));
  EXPECT_TRUE(exists(platform->cloud().physicalURL(inDrive("far.txt"))));
}

TEST_P(FileManagerContract, AttributesAreThoseOfTheItemItself) {
  platform->addFile(inDrive("five").path(), "12345");
  platform->addLink(inDrive("link").path(), "five");
  const Date noon{std::chrono::hours(12)};
  platform->setModified(inDrive("five").path(), noon);
  const auto file = files().attributesOfItemAtPath(inDrive("five").path());
  ASSERT_TRUE(file);
  EXPECT_EQ(file.value->type, FileType::Regular);
  EXPECT_EQ(file.value->size, Value(std::uint64_t{5}));
  EXPECT_EQ(file.value->modificationDate, noon);
  EXPECT_EQ(files().attributesOfItemAtPath(inDrive("link").path()).value->type, FileType::SymbolicLink);
  EXPECT_EQ(files().attributesOfItemAtPath(platform->drive()).value->type, FileType::Directory);
}

TEST_P(FileManagerContract, AttributesOfNothingAreAnError260InTheFileDomain) {
  const auto missing = files().attributesOfItemAtPath(inDrive("gone").path());
  ASSERT_TRUE(missing.error);
  EXPECT_FALSE(missing.value);
  EXPECT_EQ(missing.error->domain, FileErrorDomain);
  EXPECT_EQ(missing.error->code, FileErrorCode::ReadNoSuchFile);
  EXPECT_TRUE(missing.error->localizedDescription);
}

TEST_P(FileManagerContract, ALinkTellsItsTextUnchanged) {
  platform->addLink(inDrive("up").path(), "../elsewhere/./x");
  EXPECT_EQ(files().destinationOfSymbolicLinkAtPath(inDrive("up").path()).value, "../elsewhere/./x");
  platform->addFile(inDrive("file").path());
  EXPECT_EQ(code(files().destinationOfSymbolicLinkAtPath(inDrive("file").path()).error), FileErrorCode::ReadUnknown);
  EXPECT_EQ(code(files().destinationOfSymbolicLinkAtPath(inDrive("gone").path()).error), FileErrorCode::ReadNoSuchFile);
}

TEST_P(FileManagerContract, AFolderIsMadeWithThoseAboveIt) {
  EXPECT_EQ(code(files().createDirectoryAtURL(inDrive("a/b/c"))), 0);
  bool isDirectory = false;
  EXPECT_TRUE(files().fileExistsAtPath(inDrive("a/b").path(), &isDirectory) && isDirectory);
  EXPECT_TRUE(files().fileExistsAtPath(inDrive("a/b/c").path(), &isDirectory) && isDirectory);
}

TEST_P(FileManagerContract, AFolderThatIsThereIsNoErrorAndKeepsItsContent) {
  platform->addFile(inDrive("a/file").path());
  EXPECT_EQ(code(files().createDirectoryAtURL(inDrive("a", true))), 0);
  EXPECT_TRUE(exists(inDrive("a/file")));
  platform->addLink(inDrive("link").path(), "a");
  EXPECT_EQ(code(files().createDirectoryAtURL(inDrive("link"))), 0);
}

TEST_P(FileManagerContract, AFolderTakesNoNameThatIsTaken) {
  platform->addFile(inDrive("file").path());
  platform->addPromise(inDrive("far").path());
  platform->addLink(inDrive("dangling").path(), "nowhere");
  for (const char* taken : {"file", "far", "dangling"}) {
    EXPECT_EQ(code(files().createDirectoryAtURL(inDrive(taken))), FileErrorCode::WriteFileExists) << taken;
  }
  EXPECT_FALSE(exists(inDrive("far"))) << "nothing hides the item that is not downloaded";
  EXPECT_EQ(code(files().createDirectoryAtURL(inDrive(std::string(256, 'x')))), FileErrorCode::WriteUnknown);
}

TEST_P(FileManagerContract, AFolderCannotBeMadeInAFile) {
  platform->addFile(inDrive("file").path());
  const auto error = files().createDirectoryAtURL(inDrive("file/folder"));
  ASSERT_TRUE(error);
  EXPECT_EQ(error->domain, FileErrorDomain);
  EXPECT_FALSE(exists(inDrive("file/folder")));
}

TEST_P(FileManagerContract, RemovingTakesAllBelow) {
  platform->addFile(inDrive("tree/in/file").path());
  platform->addPromise(inDrive("tree/far").path());
  EXPECT_EQ(code(files().removeItemAtURL(inDrive("tree"))), 0);
  EXPECT_FALSE(exists(inDrive("tree")));
  EXPECT_FALSE(isThere(inDrive("tree/far")));
}

TEST_P(FileManagerContract, RemovingNeverFollowsALink) {
  platform->addFile(outside("kept/file").path());
  platform->addLink(inDrive("tree/link").path(), outside("kept").path());
  platform->addLink(inDrive("alone").path(), outside("kept").path());
  EXPECT_EQ(code(files().removeItemAtURL(inDrive("tree"))), 0);
  EXPECT_EQ(code(files().removeItemAtURL(inDrive("alone"))), 0);
  EXPECT_FALSE(isThere(inDrive("alone")));
  EXPECT_TRUE(exists(outside("kept/file")));
}

TEST_P(FileManagerContract, RemovingAnItemThatIsNotDownloadedTakesItsPromise) {
  platform->addPromise(inDrive("far").path());
  platform->addPromise(inDrive("farther").path());
  EXPECT_EQ(code(files().removeItemAtURL(inDrive("far"))), 0);
  EXPECT_FALSE(isThere(inDrive("far")));
  EXPECT_EQ(code(files().removeItemAtURL(platform->cloud().physicalURL(inDrive("farther")))), 0);
  EXPECT_FALSE(isThere(inDrive("farther")));
}

TEST_P(FileManagerContract, RemovingNothingIsAnError) {
  const auto error = files().removeItemAtURL(inDrive("gone"));
  ASSERT_TRUE(error);
  EXPECT_EQ(error->domain, FileErrorDomain);
  EXPECT_EQ(error->code, FileErrorCode::NoSuchFile);
}

TEST_P(FileManagerContract, AMoveTakesAWholeTree) {
  platform->addFile(inDrive("from/in/file").path(), "12345");
  platform->addFolder(inDrive("to").path());
  EXPECT_EQ(code(files().moveItemAtURL(inDrive("from"), inDrive("to/here"))), 0);
  EXPECT_FALSE(exists(inDrive("from")));
  EXPECT_EQ(files().attributesOfItemAtPath(inDrive("to/here/in/file").path()).value->size, Value(std::uint64_t{5}));
}

TEST_P(FileManagerContract, AMoveNeverReplaces) {
  platform->addFile(inDrive("a").path(), "12345");
  platform->addFile(inDrive("taken").path(), "1");
  platform->addFolder(inDrive("folder").path());
  platform->addPromise(inDrive("far").path());
  platform->addLink(inDrive("dangling").path(), "nowhere");
  for (const char* taken : {"taken", "folder", "far", "dangling"}) {
    const auto error = files().moveItemAtURL(inDrive("a"), inDrive(taken));
    EXPECT_EQ(code(error), FileErrorCode::WriteFileExists) << taken;
    EXPECT_EQ(destinationIn(error), inDrive(taken).path());
  }
  EXPECT_EQ(files().attributesOfItemAtPath(inDrive("a").path()).value->size, Value(std::uint64_t{5}));
  EXPECT_EQ(files().attributesOfItemAtPath(inDrive("taken").path()).value->size, Value(std::uint64_t{1}));
}

TEST_P(FileManagerContract, AMoveOfNothingIsAnErrorThatNamesTheDestination) {
  const auto error = files().moveItemAtURL(inDrive("gone"), inDrive("b"));
  EXPECT_EQ(code(error), FileErrorCode::NoSuchFile);
  EXPECT_EQ(destinationIn(error), inDrive("b").path());
}

TEST_P(FileManagerContract, AMoveMakesNoFolders) {
  platform->addFile(inDrive("a").path());
  EXPECT_EQ(code(files().moveItemAtURL(inDrive("a"), inDrive("no/such/b"))), FileErrorCode::NoSuchFile);
  EXPECT_TRUE(exists(inDrive("a")));
}

TEST_P(FileManagerContract, AFolderDoesNotMoveIntoItself) {
  platform->addFile(inDrive("folder/file").path());
  EXPECT_EQ(code(files().moveItemAtURL(inDrive("folder"), inDrive("folder/in"))), FileErrorCode::WriteUnknown);
  EXPECT_TRUE(exists(inDrive("folder/file")));
}

TEST_P(FileManagerContract, AMoveOntoItselfIsNoError) {
  platform->addFile(inDrive("a").path());
  EXPECT_EQ(code(files().moveItemAtURL(inDrive("a"), inDrive("a"))), 0);
  EXPECT_TRUE(exists(inDrive("a")));
}

TEST_P(FileManagerContract, AnItemThatIsNotDownloadedMovesWithItsPromise) {
  platform->addPromise(inDrive("far.txt").path(), PromiseFacts{42, {}, {}, false, {}, {}});
  platform->addFolder(inDrive("to").path());
  EXPECT_EQ(code(files().moveItemAtURL(inDrive("far.txt"), inDrive("to/new.txt"))), 0);
  EXPECT_FALSE(isThere(inDrive("far.txt")));
  const auto values = platform->values().promisedItemResourceValues(inDrive("to/new.txt"), {ResourceKey::FileSize});
  ASSERT_TRUE(values);
  EXPECT_EQ(values.value->at(ResourceKey::FileSize), Value(std::uint64_t{42}));
  EXPECT_FALSE(exists(inDrive("to/new.txt")));
}

TEST_P(FileManagerContract, ALinkMovesItself) {
  platform->addFile(inDrive("target").path());
  platform->addLink(inDrive("link").path(), inDrive("target").path());
  EXPECT_EQ(code(files().moveItemAtURL(inDrive("link"), inDrive("moved"))), 0);
  EXPECT_TRUE(exists(inDrive("target")));
  EXPECT_EQ(files().destinationOfSymbolicLinkAtPath(inDrive("moved").path()).value, inDrive("target").path());
}

TEST_P(FileManagerContract, NamesThatAreTooLongAreInvalid) {
  platform->addFile(inDrive("a").path());
  EXPECT_EQ(code(files().moveItemAtURL(inDrive("a"), inDrive(std::string(256, 'x')))), FileErrorCode::WriteUnknown);
  EXPECT_EQ(code(files().moveItemAtURL(inDrive("a"), inDrive(std::string(255, 'x')))), 0);
}

TEST_P(FileManagerContract, AWalkVisitsParentsBeforeChildren) {
  platform->addFile(inDrive("w/b/c/d").path());
  platform->addFile(inDrive("w/a").path());
  EXPECT_EQ(walk(inDrive("w")), (Names{"a", "b", "b/c", "b/c/d"}));
  EXPECT_EQ(walk(inDrive("w"), SkipsSubdirectoryDescendants), (Names{"a", "b"}));
}

TEST_P(FileManagerContract, AWalkEndsWhenTheVisitorSaysSo) {
  platform->addFile(inDrive("w/a/b").path());
  platform->addFile(inDrive("w/c").path());
  EXPECT_EQ(walk(inDrive("w"), EnumerateAll, "a/b"), (Names{"a", "a/b"}));
}

TEST_P(FileManagerContract, AWalkShowsItemsThatAreNotDownloadedUnderTheirOwnNames) {
  platform->addPromise(inDrive("w/far.txt").path());
  platform->addFile(inDrive("w/near.txt").path());
  EXPECT_EQ(walk(inDrive("w")), (Names{"far.txt", "near.txt"}));
  EXPECT_EQ(walk(inDrive("w"), SkipsHiddenFiles), (Names{"far.txt", "near.txt"}));
}

TEST_P(FileManagerContract, AWalkDoesNotFollowLinks) {
  platform->addFile(outside("folder/file").path());
  platform->addLink(inDrive("w/link").path(), outside("folder").path());
  platform->addLink(inDrive("w/up").path(), "..");
  EXPECT_EQ(walk(inDrive("w")), (Names{"link", "up"}));
}

TEST_P(FileManagerContract, AWalkLeavesOutWhatItIsToldTo) {
  platform->addFile(inDrive("w/.hidden/in").path());
  platform->addFile(inDrive("w/.dot").path());
  platform->addFile(inDrive("w/book.Bundle/page").path());
  EXPECT_EQ(walk(inDrive("w")), (Names{".dot", ".hidden", ".hidden/in", "book.Bundle", "book.Bundle/page"}));
  EXPECT_EQ(walk(inDrive("w"), SkipsHiddenFiles), (Names{"book.Bundle", "book.Bundle/page"}));
  EXPECT_EQ(walk(inDrive("w"), SkipsHiddenFiles | SkipsPackageDescendants), (Names{"book.Bundle"}));
}

TEST_P(FileManagerContract, AWalkTellsFoldersApart) {
  platform->addFile(inDrive("w/folder/x").path());
  platform->addFile(inDrive("w/file").path());
  platform->files().enumerate(
      inDrive("w"), {}, SkipsSubdirectoryDescendants,
      [](const URL& entry) {
        EXPECT_EQ(entry.hasDirectoryPath(), entry.lastPathComponent() == "folder") << entry.path();
        return true;
      },
      [](const URL&, const Error&) { return true; });
}

TEST_P(FileManagerContract, AWalkOfNothingIsOneError) {
  EXPECT_EQ(walk(inDrive("gone")), Names{"error 260 gone"});
  platform->addFile(inDrive("file").path());
  const Names ofAFile = walk(inDrive("file"));
  ASSERT_EQ(ofAFile.size(), 1u);
  EXPECT_EQ(ofAFile.front().substr(0, 5), "error");
}

TEST_P(FileManagerContract, ATildeIsTheHomeFolder) {
  const std::string home = files().expandingTilde("~");
  EXPECT_EQ(home.front(), '/');
  EXPECT_EQ(files().expandingTilde("~/Documents"), home + "/Documents");
  for (const char* other : {"/a/~", "~somebody/x", "a"}) EXPECT_EQ(files().expandingTilde(other), other);
}

TEST_P(FileManagerContract, ThereIsADocumentsDirectory) {
  const std::vector<std::string> folders = files().userDocumentsDirectories();
  ASSERT_FALSE(folders.empty());
  EXPECT_EQ(files().expandingTilde(folders.front()).front(), '/');
}

TEST_P(FileManagerContract, NamesAreBytes) {
  const URL url = inDrive("not\xffutf8");
  EXPECT_EQ(code(files().createDirectoryAtURL(url)), 0);
  EXPECT_TRUE(exists(url));
  // Twins in case and in Unicode normalisation are two items.
  platform->addFile(inDrive("w/a").path());
  platform->addFile(inDrive("w/A").path());
  platform->addFile(inDrive("w/\xC3\xA9").path());
  platform->addFile(inDrive("w/e\xCC\x81").path());
  EXPECT_EQ(walk(inDrive("w")).size(), 4u);
}

}  // namespace
}  // namespace vaelo::contract
