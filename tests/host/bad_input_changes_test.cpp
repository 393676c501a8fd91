// SPDX-License-Identifier: GPL-3.0-or-later
// Changes that meet what nobody wished for: each ends with every byte accounted for.
#include <fcntl.h>
#include <sys/mount.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <functional>
#include <thread>

#include "app/nav_controller.h"
#include "fileops/ui_utils.h"
#include "items/file_utils.h"
#include "tests/host/platform_fixture.h"

namespace vaelo::drive_test {

namespace {

using Content = std::map<std::string, std::string>;

class BadInputChangesTest : public PlatformTest {
 protected:
  BadInputChangesTest() {
    write(drive + "/Report.txt", "report");
    write(drive + "/Plans/Inside.txt", "inside");
  }
  ~BadInputChangesTest() override {
    for (const std::string& place : mounted_) ::umount2(place.c_str(), MNT_DETACH);
  }
  /// What a person reads in the prompt; empty when it went well.
  std::string rename(const std::string& from, const std::string& to) {
    return UIUtils::bestMessage(UIUtils::renameItemAtURLToName(URL(drive + "/" + from), to));
  }
  std::vector<Error> moveInto(const std::string& folder, const std::vector<std::string>& names) {
    std::vector<URL> items;
    for (const std::string& name : names) items.emplace_back(drive + "/" + name);
    return std::make_shared<NavController>()->moveItemsToDirectoryToDirectory(items, URL(drive + "/" + folder, true));
  }
  Content drives() const { return content(drive); }
  bool mount(const std::string& place, const char* kind, const char* options) {
    makeFolder(place);
    if (::mount(kind ? "none" : place.c_str(), place.c_str(), kind, kind ? 0 : MS_BIND, options) != 0) return false;
    mounted_.push_back(place);
    return true;
  }
  bool makeReadOnly(const std::string& place) {
    return mount(place, nullptr, nullptr) &&
           ::mount(nullptr, place.c_str(), nullptr, MS_BIND | MS_REMOUNT | MS_RDONLY, nullptr) == 0;
  }
  static void fill(const std::string& disk) {
    const int file = ::open((disk + "/filler").c_str(), O_WRONLY | O_CREAT | O_APPEND, 0600);
    const std::string page(4096, 'x');
    while (::write(file, page.data(), page.size()) > 0) {
    }
    EXPECT_EQ(errno, ENOSPC);
    ::close(file);
  }

 private:
  std::vector<std::string> mounted_;
};

TEST_F(BadInputChangesTest, NamesAreCountedInBytesAndToldInCharacters) {
  const Content before = drives();
  std::string name;
  for (int i = 0; i < 84; ++i) name += "\u65E5";  // three bytes each, and ".txt" comes behind
  EXPECT_EQ(rename("Report.txt", name), "The name is too long by 1 character.");
  EXPECT_EQ(rename("Report.txt", name + name), "The name is too long by 87 characters.");
  EXPECT_EQ(rename("Plans", std::string(300, 'x')), "The name is too long by 45 characters.");
  EXPECT_EQ(UIUtils::bestMessage(FileUtils::mkdir(URL(drive + "/" + std::string(256, 'x')))),
            "The name is too long by 1 character.");
  EXPECT_EQ(drives(), before);
  EXPECT_EQ(rename("Report.txt", name.substr(3)), "");
  EXPECT_EQ(read(drive + "/" + name.substr(3) + ".txt"), "report");
  EXPECT_EQ(rename("Plans", name + "xyz"), "");
  EXPECT_EQ(read(drive + "/" + name + "xyz/Inside.txt"), "inside") << "255 bytes are allowed";
}

TEST_F(BadInputChangesTest, UnusualNamesStandOnTheDiskAsTheyWereTyped) {
  for (const std::string name :
       {"\u202Etxt.report", "\u05D0\u200F.txt", "e\u0301.txt", "\u00E9.txt", "blank .txt ", " .. a..", "dots...",
        "\U0001F468\u200D\U0001F469\u200D\U0001F467", "a\\b|c?.*", "-rf", "%s%n%@"}) {
    write(drive + "/plain", "bytes of " + name);
    EXPECT_EQ(rename("plain", name), "") << name;
    EXPECT_EQ(read(drive + "/" + name), "bytes of " + name) << name;
    EXPECT_FALSE(exists(drive + "/plain"));
  }
}

TEST_F(BadInputChangesTest, NamesThatNobodyCouldReadAreRefused) {
  const Content before = drives();
  for (const std::string name : {"", ".", "..", ".hidden", "a/b", "../up", "a:b", "line\nbreak", "tab\tbed", "bell\a",
                                 "del\x7F", "\xFF\xFE", "par\u2029", "non\uFFFE"}) {
    EXPECT_EQ(rename("Report.txt", name), "Character not allowed in filename") << name;
  }
  EXPECT_EQ(drives(), before);
}

TEST_F(BadInputChangesTest, AFolderThatCanOnlyBeReadKeepsAll) {
  write(drive + "/Locked/a.txt", "a");
  write(drive + "/Locked/.far.txt.vlopromise", "[Promise]\nName=far.txt\nSize=9\n");
  const Content before = drives();
  if (!makeReadOnly(drive + "/Locked")) GTEST_SKIP() << std::strerror(errno);
  const std::string words = "“a.txt” is on a disk that can only be read.";
  EXPECT_EQ(rename("Locked/a.txt", "b.txt"), words);
  EXPECT_EQ(rename("Locked/far.txt", "b.txt"), "“far.txt” is on a disk that can only be read.");
  EXPECT_EQ(UIUtils::bestMessage(FileUtils::remove(URL(drive + "/Locked/a.txt"))), words);
  EXPECT_EQ(UIUtils::bestMessage(FileUtils::mkdir(URL(drive + "/Locked/New"))), "“New” is on a disk that can only be read.");
  std::vector<Error> errors = moveInto("Plans", {"Locked/a.txt"});
  ASSERT_EQ(errors.size(), 1u);
  EXPECT_EQ(UIUtils::bestMessage(errors[0]), words);
  errors = moveInto("Locked", {"Report.txt", "Plans"});
  ASSERT_EQ(errors.size(), 2u);
  for (const Error& error : errors) {
    EXPECT_EQ(UIUtils::bestMessage(error), "“Locked” is on a disk that can only be read.") << "the folder, not the item";
  }
  EXPECT_EQ(drives(), before);
}

TEST_F(BadInputChangesTest, AFullDiskKeepsAllAndMovesWithinItself) {
  const std::string disk = drive + "/Disk";
  if (!mount(disk, "tmpfs", "size=64k,nr_inodes=20")) GTEST_SKIP() << std::strerror(errno);
  write(disk + "/here.txt", "here");
  makeFolder(disk + "/Folder");
  write(drive + "/large", std::string(70000, 'x'));
  const Content before = drives();
  std::vector<Error> errors = moveInto("Disk", {"large"});
  ASSERT_EQ(errors.size(), 1u);
  EXPECT_EQ(errors[0].code, FileErrorCode::WriteOutOfSpace) << "told before it is copied";
  EXPECT_EQ(drives(), before);
  fill(disk);
  const Content full = drives();
  EXPECT_EQ(moveInto("Disk", {"Report.txt", "Plans"}).size(), 2u);
  EXPECT_EQ(drives(), full);
  EXPECT_TRUE(moveInto("Disk/Folder", {"Disk/here.txt"}).empty());
  EXPECT_EQ(read(disk + "/Folder/here.txt"), "here");
}

TEST_F(BadInputChangesTest, MoreItemsThanADiskTakesStayWhereTheyAre) {
  const std::string disk = drive + "/Disk";
  if (!mount(disk, "tmpfs", "size=1m,nr_inodes=10")) GTEST_SKIP() << std::strerror(errno);
  for (int i = 0; i < 20; ++i) write(drive + "/Many/" + std::to_string(i), std::to_string(i));
  const Content before = drives();
  EXPECT_EQ(moveInto("Disk", {"Many"}).size(), 1u);
  EXPECT_EQ(drives(), before);
}

TEST_F(BadInputChangesTest, AnItemThatIsGoneCostsNothingElse) {
  write(drive + "/gone", "x");
  const std::vector<std::string> chosen{"Report.txt", "gone"};
  std::filesystem::remove(drive + "/gone");
  const std::vector<Error> errors = moveInto("Plans", chosen);
  ASSERT_EQ(errors.size(), 1u);
  EXPECT_EQ(UIUtils::bestMessage(errors[0]), "The file “gone” doesn’t exist any more.");
  EXPECT_EQ(read(drive + "/Plans/Report.txt"), "report");
  EXPECT_EQ(FileUtils::remove(URL(drive + "/gone"))->code, FileErrorCode::UserCancelled);
  EXPECT_NE(rename("gone", "back"), "");
  EXPECT_FALSE(exists(drive + "/back"));
}

/// Lets a test act in the moment between the question and the deed: before an item is deleted its presenters are asked.
class Interloper : public FilePresenter {
 public:
  Interloper(const std::string& path, std::function<void()> act) : url_(path), act_(std::move(act)) {
    Platform::current().fileCoordination.addFilePresenter(*this);
  }
  ~Interloper() override { Platform::current().fileCoordination.removeFilePresenter(*this); }
  std::optional<URL> presentedItemURL() override { return url_; }
  std::shared_ptr<OperationQueue> presentedItemOperationQueue() override { return queue_; }
  void accommodatePresentedItemDeletionWithCompletionHandler(Completion completion) override {
    act_();
    completion(std::nullopt);
  }
  void accommodatePresentedSubitemDeletionAtURLCompletionHandler(const URL&, Completion completion) override {
    completion(std::nullopt);
  }
  void presentedItemDidChange() override {}
  void presentedItemDidMoveToURL(const URL&) override {}

 private:
  const URL url_;
  const std::function<void()> act_;
  const std::shared_ptr<OperationQueue> queue_ =
      Platform::current().queues.makeOperationQueue("interloper", QualityOfService::Default);
};

TEST_F(BadInputChangesTest, WhatChangedWhileTheUserWasAskedIsKept) {
  const std::string path = drive + "/Report.txt";
  const Interloper writer(path, [&] {
    write(root + "/saved", "saved by another program");
    std::filesystem::rename(root + "/saved", path);
  });
  const auto error = FileUtils::remove(URL(path));
  ASSERT_TRUE(error);
  EXPECT_EQ(error->code, FileErrorCode::UserCancelled);
  EXPECT_EQ(read(path), "saved by another program");
}

TEST_F(BadInputChangesTest, WhatBecameAFolderIsKeptWithAllInIt) {
  const std::string path = drive + "/Report.txt";
  const Interloper swapper(path, [&] {
    std::filesystem::remove(path);
    write(path + "/new", "new");
  });
  EXPECT_EQ(FileUtils::remove(URL(path))->code, FileErrorCode::UserCancelled);
  EXPECT_EQ(read(path + "/new"), "new");
  EXPECT_TRUE(moveInto("Plans", {"Report.txt"}).empty());
  EXPECT_EQ(read(drive + "/Plans/Report.txt/new"), "new");
}

TEST_F(BadInputChangesTest, AFolderInTheWayIsNoTarget) {
  write(drive + "/Plans/Report.txt/kept", "kept");
  const Content before = drives();
  EXPECT_EQ(moveInto("Plans", {"Report.txt"}).size(), 1u);
  EXPECT_EQ(moveInto("Plans/Report.txt", {"Plans"}).size(), 1u) << "a folder into itself";
  EXPECT_EQ(moveInto("Report.txt", {"Plans"}).size(), 1u) << "a file is no folder";
  EXPECT_EQ(drives(), before);
}

// What the program wrote after the copy went to a file that was removed.
TEST_F(BadInputChangesTest, WhatAnotherProgramHoldsForWritingLosesNothing) {
  const std::string disk = drive + "/Disk";
  if (!mount(disk, "tmpfs", "size=1m")) GTEST_SKIP() << std::strerror(errno);
  write(drive + "/Folder/Deep.txt", "deep");
  for (const std::string item : {"Report.txt", "Folder/Deep.txt"}) {
    const std::string name = item.substr(0, item.find('/'));
    const std::string before = read(drive + "/" + item);
    const int held = ::open((drive + "/" + item).c_str(), O_WRONLY | O_APPEND);
    ASSERT_GE(held, 0);
    const std::vector<Error> errors = moveInto("Disk", {name});
    ASSERT_EQ(errors.size(), 1u);
    EXPECT_EQ(UIUtils::bestMessage(errors[0]), "“" + name + "” is being changed by another program. Try again later.");
    EXPECT_TRUE(std::filesystem::is_empty(disk));
    EXPECT_EQ(::write(held, ", more", 6), 6);
    // On its own disk it takes the program along.
    EXPECT_TRUE(moveInto("Plans", {name}).empty());
    EXPECT_EQ(::write(held, ", end", 5), 5);
    ::close(held);
    EXPECT_TRUE(moveInto("Disk", {"Plans/" + name}).empty());
    EXPECT_EQ(read(disk + "/" + item), before + ", more, end");
    std::filesystem::remove_all(disk + "/" + name);
  }
}

TEST_F(BadInputChangesTest, ItemsThatAnotherProgramRenamesMeanwhileAreAllSomewhere) {
  constexpr int count = 300;
  std::vector<std::string> names;
  for (int i = 0; i < count; ++i) {
    names.push_back(std::to_string(i));
    write(drive + "/" + names.back(), names.back());
  }
  makeFolder(drive + "/Elsewhere");
  std::thread other([&] {
    for (int i = count - 1; i >= 0; --i) {
      ::rename((drive + "/" + names[static_cast<std::size_t>(i)]).c_str(),
               (drive + "/Elsewhere/" + std::to_string(i)).c_str());
    }
  });
  const std::vector<Error> errors = moveInto("Plans", names);
  other.join();
  std::size_t moved = 0;
  for (const std::string& name : names) {
    const bool here = exists(drive + "/Plans/" + name);
    moved += here;
    EXPECT_EQ(read(drive + (here ? "/Plans/" : "/Elsewhere/") + name), name);
    EXPECT_NE(here, exists(drive + "/Elsewhere/" + name)) << "in one place";
    EXPECT_FALSE(exists(drive + "/" + name));
  }
  EXPECT_EQ(moved + errors.size(), static_cast<std::size_t>(count));
}

/// Moves as the application does, with the coordination of an instance of its own.
std::size_t moveAsInstance(const std::string& lock, const std::vector<std::string>& from, const std::string& folder) {
  LocalFileCoordination coordination(lock);
  LocalFileManager files;
  std::size_t moved = 0;
  for (const std::string& path : from) {
    const URL source(path);
    const URL target(folder + "/" + source.lastPathComponent());
    coordination.makeCoordinator()->coordinateWriting(
        source, WritingForMoving, target, WritingForReplacing,
        [&](const URL& a, const URL& b) { moved += !files.moveItemAtURL(a, b); });
  }
  return moved;
}

// On one disk and between two.
TEST_F(BadInputChangesTest, TwoInstancesThatMoveTheSameSelectionShareIt) {
  for (const bool otherDisk : {false, true}) {
    const std::string one = drive + "/One";
    const std::string two = drive + "/Two";
    if (otherDisk && !mount(two, "tmpfs", "size=10m")) GTEST_SKIP() << std::strerror(errno);
    makeFolder(one);
    makeFolder(two);
    std::vector<std::string> items;
    for (int i = 0; i < 200; ++i) {
      items.push_back(drive + "/item" + std::to_string(i));
      write(items.back(), items.back());
    }
    std::size_t movedByOther = 0;
    const std::string lock = data + "/coordination.lock";
    std::thread other([&] { movedByOther = moveAsInstance(lock, items, two); });
    const std::size_t moved = moveAsInstance(lock, items, one);
    other.join();
    EXPECT_EQ(moved + movedByOther, items.size());
    for (const std::string& item : items) {
      const std::string name = item.substr(item.rfind('/'));
      EXPECT_NE(exists(one + name), exists(two + name)) << name;
      EXPECT_EQ(read((exists(one + name) ? one : two) + name), item);
      EXPECT_FALSE(exists(item));
    }
    std::filesystem::remove_all(one);
    if (!otherDisk) std::filesystem::remove_all(two);
  }
}

}  // namespace

}  // namespace vaelo::drive_test
