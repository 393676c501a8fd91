// SPDX-License-Identifier: GPL-3.0-or-later
#include <sys/inotify.h>
#include <sys/resource.h>
#include <unistd.h>

#include <csignal>
#include <set>
#include <thread>

#include "host/drive/document_index.h"
#include "host/drive/promise_file.h"
#include "host/support/unique_fd.h"
#include "tests/host/drive_test_support.h"

namespace vaelo::drive_test {

constexpr const char* idAttribute = "user.vaelo.docid";

/// Whether anybody has read a folder since the last question.
class FolderReads {
 public:
  explicit FolderReads(const std::string& folder) {
    inotify_add_watch(events_.get(), folder.c_str(), IN_OPEN | IN_ACCESS | IN_ONLYDIR);
  }
  bool any() const {
    char events[4096];
    return ::read(events_.get(), events, sizeof events) > 0;
  }

 private:
  UniqueFd events_{inotify_init1(IN_NONBLOCK | IN_CLOEXEC)};
};

class DriveIndexTest : public DriveTest {
 protected:
  DriveIndexTest() { write(drive + "/a.txt"); }
  std::int64_t idOf(const std::string& path) {
    const Result<std::int64_t> id = index->documentIDFor(path, true);
    EXPECT_TRUE(id) << (id.error ? id.error->description() : "");
    EXPECT_GT(id.value.value_or(0), 0);
    return id.value.value_or(0);
  }
  std::string placeOf(std::int64_t id) {
    const Result<IndexedDocument> found = index->resolve(id);
    return found ? found.value->path : "nowhere";
  }
  void reopen() { index = std::make_unique<DocumentIndex>(layout, log); }
  void damage(const std::string& bytes) {
    index.reset();
    std::filesystem::remove(data + "/index.sqlite-wal");
    write(data + "/index.sqlite", bytes);
    reopen();
  }

  DriveLayout layout{data};
  std::unique_ptr<DocumentIndex> index = std::make_unique<DocumentIndex>(layout, log);
};

TEST_F(DriveIndexTest, AnIdentifierIsMadeOnceAndOnlyOnRequest) {
  EXPECT_EQ(index->documentIDFor(drive + "/a.txt", false).value, 0);
  EXPECT_EQ(attribute(drive + "/a.txt", idAttribute), "");
  const std::int64_t id = idOf(drive + "/a.txt");
  EXPECT_EQ(idOf(drive + "/a.txt"), id);
  EXPECT_EQ(index->documentIDFor(drive + "/../com~marrow~Kestrel/a.txt", false).value, id);
  EXPECT_EQ(attribute(drive + "/a.txt", idAttribute), std::to_string(id));
  EXPECT_EQ(placeOf(id), drive + "/a.txt");
  reopen();
  EXPECT_EQ(placeOf(id), drive + "/a.txt");
}

TEST_F(DriveIndexTest, WhatIsNotThereHasNone) {
  EXPECT_EQ(index->documentIDFor(drive + "/none", true).error->code, FileErrorCode::NoSuchFile);
  EXPECT_EQ(index->documentIDFor("relative", true).error->code, FileErrorCode::NoSuchFile);
  EXPECT_EQ(index->documentIDFor("", true).error->code, FileErrorCode::NoSuchFile);
  EXPECT_EQ(index->resolve(0).error->code, FileErrorCode::NoSuchFile);
  EXPECT_EQ(index->resolve(-5).error->code, FileErrorCode::NoSuchFile);
  EXPECT_EQ(index->resolve(4711).error->code, FileErrorCode::NoSuchFile);
}

TEST_F(DriveIndexTest, WhatWasJustSoughtInVainIsNotWalkedForAgain) {
  FolderReads reads(drive);
  EXPECT_EQ(placeOf(4711), "nowhere");
  EXPECT_TRUE(reads.any());
  EXPECT_EQ(placeOf(4711), "nowhere");
  EXPECT_FALSE(reads.any());
  EXPECT_EQ(placeOf(4712), "nowhere");
  EXPECT_TRUE(reads.any()) << "another identifier";
  index = std::make_unique<DocumentIndex>(layout, log, nullptr, std::chrono::milliseconds(0));
  EXPECT_EQ(placeOf(4711), "nowhere");
  EXPECT_TRUE(reads.any());
  EXPECT_EQ(placeOf(4711), "nowhere");
  EXPECT_TRUE(reads.any()) << "after its time";
}

TEST_F(DriveIndexTest, ItSurvivesWhatOtherProgramsDo) {
  const std::int64_t id = idOf(drive + "/a.txt");
  rename(drive + "/a.txt", drive + "/b.txt");
  EXPECT_EQ(placeOf(id), drive + "/b.txt");
  rename(drive + "/b.txt", mirror + "/org~example~Other/Documents/deep/er/c.txt");
  EXPECT_EQ(placeOf(id), mirror + "/org~example~Other/Documents/deep/er/c.txt");
  rename(mirror + "/org~example~Other", mirror + "/org~example~Else");
  EXPECT_EQ(idOf(mirror + "/org~example~Else/Documents/deep/er/c.txt"), id);
  EXPECT_EQ(placeOf(id), mirror + "/org~example~Else/Documents/deep/er/c.txt");
}

TEST_F(DriveIndexTest, FoldersHaveThemToo) {
  makeFolder(drive + "/Folder/inner");
  const std::int64_t id = idOf(drive + "/Folder");
  rename(drive + "/Folder", drive + "/Renamed");
  EXPECT_EQ(placeOf(id), drive + "/Renamed");
}

TEST_F(DriveIndexTest, ACopyWithAttributesGetsItsOwn) {
  const std::int64_t id = idOf(drive + "/a.txt");
  copyWithAttributes(drive + "/a.txt", drive + "/copy.txt");
  ASSERT_EQ(attribute(drive + "/copy.txt", idAttribute), std::to_string(id));
  EXPECT_EQ(index->documentIDFor(drive + "/copy.txt", false).value, 0);
  const std::int64_t other = idOf(drive + "/copy.txt");
  EXPECT_NE(other, id);
  EXPECT_EQ(attribute(drive + "/copy.txt", idAttribute), std::to_string(other));
  EXPECT_EQ(placeOf(id), drive + "/a.txt");
  EXPECT_EQ(placeOf(other), drive + "/copy.txt");
}

TEST_F(DriveIndexTest, ACopyInTheOldPlaceOfAMovedDocumentIsStillACopy) {
  const std::int64_t id = idOf(drive + "/a.txt");
  rename(drive + "/a.txt", drive + "/moved.txt");
  copyWithAttributes(drive + "/moved.txt", drive + "/a.txt");
  for (int i = 0; i < 10; ++i) copyWithAttributes(drive + "/moved.txt", drive + "/copy" + std::to_string(i));
  EXPECT_EQ(placeOf(id), drive + "/moved.txt");
  EXPECT_NE(idOf(drive + "/a.txt"), id);
  EXPECT_EQ(idOf(drive + "/moved.txt"), id);
}

TEST_F(DriveIndexTest, TheCopyInheritsWhenTheOriginalIsGone) {
  const std::int64_t id = idOf(drive + "/a.txt");
  copyWithAttributes(drive + "/a.txt", drive + "/copy.txt");
  std::filesystem::remove(drive + "/a.txt");
  EXPECT_EQ(placeOf(id), drive + "/copy.txt");
  EXPECT_EQ(idOf(drive + "/copy.txt"), id);
}

TEST_F(DriveIndexTest, ADeletedDocumentIsNotFoundInItsSuccessor) {
  const std::int64_t id = idOf(drive + "/a.txt");
  std::filesystem::remove(drive + "/a.txt");
  write(drive + "/a.txt");
  EXPECT_EQ(placeOf(id), "nowhere");
  EXPECT_NE(idOf(drive + "/a.txt"), id);
}

TEST_F(DriveIndexTest, AStrippedAttributeIsPutBack) {
  const std::int64_t id = idOf(drive + "/a.txt");
  removeAttribute(drive + "/a.txt", idAttribute);
  EXPECT_EQ(idOf(drive + "/a.txt"), id);
  EXPECT_EQ(attribute(drive + "/a.txt", idAttribute), std::to_string(id));
}

TEST_F(DriveIndexTest, WhatCanCarryNoneIsKnownByItsInode) {
  link("a.txt", drive + "/link");  // links have no attributes
  const std::int64_t id = idOf(drive + "/link");
  EXPECT_NE(id, idOf(drive + "/a.txt"));
  rename(drive + "/link", drive + "/sub/renamed");
  EXPECT_EQ(placeOf(id), drive + "/sub/renamed");
  EXPECT_EQ(idOf(drive + "/sub/renamed"), id);
  // The next link may get the same inode and is another item all the same.
  std::filesystem::remove(drive + "/sub/renamed");
  link("a.txt", drive + "/new");
  EXPECT_NE(idOf(drive + "/new"), id);
  EXPECT_EQ(placeOf(id), "nowhere");
}

TEST_F(DriveIndexTest, AnItemWithoutRoomForAttributesIsKnownByItsInode) {
  write(drive + "/full");
  for (int i = 0; i < 400; ++i) {
    const std::string name = "user.filler" + std::to_string(i);
    if (::setxattr((drive + "/full").c_str(), name.c_str(), "0123456789", 10, 0) != 0) break;
  }
  const std::int64_t id = idOf(drive + "/full");
  rename(drive + "/full", drive + "/fuller");
  EXPECT_EQ(placeOf(id), drive + "/fuller");
}

TEST_F(DriveIndexTest, PromisesCarryTheirs) {
  PromiseInfo info;
  info.name = "away.pdf";
  info.size = 5;
  ASSERT_FALSE(writePromise(drive, info));
  EXPECT_EQ(index->documentIDFor(drive + "/away.pdf", false).value, 0);
  const std::int64_t id = idOf(drive + "/away.pdf");
  EXPECT_EQ(readPromise(drive + "/.away.pdf.vlopromise").value->documentID, id);
  EXPECT_EQ(idOf(drive + "/.away.pdf.vlopromise"), id);
  rename(drive + "/.away.pdf.vlopromise", drive + "/sub/.moved.pdf.vlopromise");
  EXPECT_EQ(placeOf(id), drive + "/sub/.moved.pdf.vlopromise");
  EXPECT_EQ(idOf(drive + "/sub/moved.pdf"), id);
}

TEST_F(DriveIndexTest, AFileWithAForeignIdentifierKeepsIt) {
  setAttribute(drive + "/a.txt", idAttribute, "987654321");
  EXPECT_EQ(placeOf(987654321), drive + "/a.txt");
  EXPECT_EQ(idOf(drive + "/a.txt"), 987654321);
}

TEST_F(DriveIndexTest, NonsenseInTheAttributeIsNoIdentifier) {
  for (const char* text : {"", "-3", "0", "12 ", "99999999999999999999", "abc"}) {
    write(drive + "/n");
    setAttribute(drive + "/n", idAttribute, text);
    EXPECT_EQ(index->documentIDFor(drive + "/n", false).value, 0) << text;
    const std::int64_t id = idOf(drive + "/n");
    EXPECT_EQ(idOf(drive + "/n"), id) << text;
    std::filesystem::remove(drive + "/n");
  }
}

TEST_F(DriveIndexTest, ADamagedDatabaseIsMovedAsideAndRebuilt) {
  const std::int64_t id = idOf(drive + "/a.txt");
  copyWithAttributes(drive + "/a.txt", drive + "/0 copy.txt");
  for (int round = 1; round <= 2; ++round) {
    damage("this is no database, but it is long enough to be looked at as one; " + std::string(5000, 'x'));
    EXPECT_FALSE(index->wasRebuilt());
    EXPECT_EQ(placeOf(id), drive + "/a.txt");
    EXPECT_TRUE(index->wasRebuilt());
    EXPECT_TRUE(exists(data + "/index.sqlite.damaged-" + std::to_string(round)));
    EXPECT_EQ(log.count("is damaged"), round);
  }
  EXPECT_NE(idOf(drive + "/0 copy.txt"), id);
  EXPECT_EQ(idOf(drive + "/a.txt"), id);
}

TEST_F(DriveIndexTest, ADatabaseDamagedInTheMiddleIsRebuilt) {
  for (int i = 0; i < 300; ++i) {
    write(drive + "/f" + std::to_string(i));
    idOf(drive + "/f" + std::to_string(i));
  }
  const std::int64_t id = idOf(drive + "/f7");
  index.reset();  // writes everything back into the one file
  std::string bytes = read(data + "/index.sqlite");
  ASSERT_GT(bytes.size(), 3 * 4096u);
  for (std::size_t i = 4096; i < bytes.size(); ++i) bytes[i] = static_cast<char>(i * 31);
  damage(bytes);
  EXPECT_EQ(placeOf(id), drive + "/f7");
  EXPECT_TRUE(index->wasRebuilt());
}

TEST_F(DriveIndexTest, WhatACrashLeftInTheLogIsKept) {
  link("a.txt", drive + "/link");  // only the database knows a link's identifier
  const std::int64_t id = idOf(drive + "/link");
  const std::string database = read(data + "/index.sqlite");
  const std::string writeAheadLog = read(data + "/index.sqlite-wal");
  index.reset();
  write(data + "/index.sqlite", database);
  write(data + "/index.sqlite-wal", writeAheadLog);
  reopen();
  EXPECT_TRUE(placeOf(id) == drive + "/link");
  EXPECT_FALSE(index->wasRebuilt());
}

TEST_F(DriveIndexTest, AnEmptyOrLostDatabaseCostsNoIdentifier) {
  const std::int64_t id = idOf(drive + "/a.txt");
  damage("");
  EXPECT_EQ(placeOf(id), drive + "/a.txt");
  index.reset();
  std::filesystem::remove(data + "/index.sqlite");
  reopen();
  EXPECT_EQ(placeOf(id), drive + "/a.txt");
  EXPECT_FALSE(index->wasRebuilt());
}

TEST_F(DriveIndexTest, ADatabaseThatCannotBeOpenedIsAnError) {
  index.reset();
  makeFolder(data + "/index.sqlite");
  reopen();
  const Result<std::int64_t> id = index->documentIDFor(drive + "/a.txt", true);
  ASSERT_TRUE(id.error);
  EXPECT_EQ(id.error->domain, FileErrorDomain);
  EXPECT_TRUE(id.error->localizedFailureReason);
  EXPECT_TRUE(exists(drive + "/a.txt"));
  std::filesystem::remove(data + "/index.sqlite");
  EXPECT_TRUE(index->documentIDFor(drive + "/a.txt", true));
}

TEST_F(DriveIndexTest, AFullDiskIsAnErrorAndPasses) {
  idOf(drive + "/a.txt");
  write(drive + "/b.txt");
  // No file may grow, which is as near to a full disk as a test comes without a disk of its own.
  const auto before = std::signal(SIGXFSZ, SIG_IGN);
  rlimit limit = {};
  ASSERT_EQ(::getrlimit(RLIMIT_FSIZE, &limit), 0);
  const rlimit none = {0, limit.rlim_max};
  ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &none), 0);
  const Result<std::int64_t> id = index->documentIDFor(drive + "/b.txt", true);
  ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &limit), 0);
  std::signal(SIGXFSZ, before);
  EXPECT_TRUE(id.error);
  EXPECT_EQ(attribute(drive + "/b.txt", idAttribute), "");
  idOf(drive + "/b.txt");
  EXPECT_FALSE(index->wasRebuilt());
}

TEST_F(DriveIndexTest, ThreadsAndProcessesAgree) {
  for (int i = 0; i < 50; ++i) write(drive + "/f" + std::to_string(i));
  DocumentIndex second(layout, log);  // as another process would have it
  std::vector<std::vector<std::int64_t>> seen(4);
  std::vector<std::thread> threads;
  for (std::size_t t = 0; t < seen.size(); ++t) {
    threads.emplace_back([&, t] {
      DocumentIndex& mine = t % 2 ? second : *index;
      for (int i = 0; i < 50; ++i) {
        seen[t].push_back(mine.documentIDFor(drive + "/f" + std::to_string(i), true).value.value_or(-1));
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  for (const auto& ids : seen) EXPECT_EQ(ids, seen.front());
  EXPECT_EQ(std::set<std::int64_t>(seen.front().begin(), seen.front().end()).size(), 50u);
  EXPECT_EQ(std::count(seen.front().begin(), seen.front().end(), -1), 0);
}

TEST_F(DriveIndexTest, NamesThatAreNotUtf8AreBytesLikeOthers) {
  write(drive + "/\xff\xfe.txt");
  const std::int64_t id = idOf(drive + "/\xff\xfe.txt");
  reopen();
  EXPECT_EQ(placeOf(id), drive + "/\xff\xfe.txt");
}

}  // namespace vaelo::drive_test
