// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/item_attributes.h"
#include "host/drive/packages.h"
#include "host/drive/promise_file.h"
#include "tests/host/drive_test_support.h"

namespace vaelo::drive_test {

using namespace std::chrono_literals;

class DrivePromiseTest : public DriveTest {
 protected:
  DrivePromiseTest() { makeFolder(drive); }
  PromiseInfo named(const std::string& name) {
    PromiseInfo info;
    info.name = name;
    info.size = 12345;
    return info;
  }
};

TEST_F(DrivePromiseTest, NamesGoBothWays) {
  for (const std::string name :
       {"a", "Report.pdf", ".hidden", "two words", "\xff\xfe", "\xf0\x9f\x90\xa6.txt", "a.vlopromise"}) {
    const std::string promise = promiseNameFor(name);
    EXPECT_EQ(promise, "." + name + ".vlopromise");
    EXPECT_TRUE(isPromiseName(promise));
    EXPECT_EQ(logicalNameOf("/d/" + promise), "/d/" + name);
  }
}

TEST_F(DrivePromiseTest, OtherNamesAreNoPromises) {
  for (const char* name : {"", ".", "a", "a.vlopromise", ".vlopromise", "..vlopromise", "...vlopromise", "....vlopromise",
                           ".0123456789abcdeg.vlopromise-long", ".0123.vlopromise-long", ".a.vlopromise "}) {
    EXPECT_FALSE(isPromiseName(name)) << name;
  }
  // These would stand for the folder itself, its parent, and nothing.
  EXPECT_EQ(logicalNameOf("/d/...vlopromise"), std::nullopt);
  EXPECT_EQ(logicalNameOf("/d/....vlopromise"), std::nullopt);
  EXPECT_EQ(logicalNameOf("/d/..vlopromise"), std::nullopt);
}

TEST_F(DrivePromiseTest, WhatIsWrittenIsRead) {
  PromiseInfo info = named("Report = [1];\\ .pdf");
  info.modified = Date(1234567890s + 250000us);
  info.created = Date(-5s);
  info.package = true;
  info.share = "participant";
  info.tags = {"Red", "semi;colon", "back\\slash"};
  info.documentID = 77;
  ASSERT_FALSE(writePromise(drive, info));
  const Result<PromiseInfo> back = readPromise(promisePathFor(drive + "/" + info.name));
  ASSERT_TRUE(back) << back.error->description();
  EXPECT_EQ(back.value->name, info.name);
  EXPECT_EQ(back.value->size, 12345u);
  EXPECT_EQ(back.value->modified, info.modified);
  EXPECT_EQ(back.value->created, info.created);
  EXPECT_TRUE(back.value->package);
  EXPECT_EQ(back.value->share, info.share);
  EXPECT_EQ(back.value->tags, info.tags);
  EXPECT_EQ(back.value->documentID, 77);
}

TEST_F(DrivePromiseTest, LongAndStrangeNamesSurvive) {
  for (const std::string& name : {std::string(255, 'x'), std::string(243, 'y'), std::string(244, 'z'),
                                  std::string(255, '\xe9'), std::string("\xff\xfe"), " " + std::string(250, '\n') + ";\\"}) {
    ASSERT_FALSE(writePromise(drive, named(name)));
    const std::string physical = promisePathFor(drive + "/" + name);
    EXPECT_LE(physical.size() - drive.size() - 1, 255u);
    EXPECT_EQ(logicalNameOf(physical), drive + "/" + name);
    EXPECT_EQ(physicalPathOf(drive + "/" + name), physical);
    EXPECT_EQ(readPromise(physical).value->size, 12345u);
  }
}

TEST_F(DrivePromiseTest, ALongPromiseMustNameItsOwnItem) {
  const std::string name(255, 'x');
  const std::string path = promisePathFor(drive + "/" + name);
  for (const char* liar : {"../../escape", "..", "other", "", "a/b"}) {
    write(path, std::string("[Promise]\nName=") + liar + "\nSize=1\n");
    EXPECT_FALSE(readPromise(path)) << liar;
    EXPECT_EQ(logicalNameOf(path), std::nullopt) << liar;
  }
}

TEST_F(DrivePromiseTest, TheFileNameOfAShortPromiseDecides) {
  write(drive + "/.real.vlopromise", "[Promise]\nName=../../etc\nSize=3\n");
  EXPECT_EQ(readPromise(drive + "/.real.vlopromise").value->name, "real");
}

TEST_F(DrivePromiseTest, DamagedPromisesAreErrorsOrGaps) {
  const std::string path = drive + "/.a.vlopromise";
  EXPECT_EQ(readPromise(path).error->code, FileErrorCode::ReadNoSuchFile);
  write(path, "no key file at all");
  EXPECT_EQ(readPromise(path).error->code, FileErrorCode::ReadUnknown);
  write(path, std::string(70 * 1024, '#'));
  EXPECT_EQ(readPromise(path).error->code, FileErrorCode::ReadUnknown);
  std::filesystem::remove(path);
  write(root + "/elsewhere", "[Promise]\nSize=1\n");
  link(root + "/elsewhere", path);
  EXPECT_FALSE(readPromise(path));
  std::filesystem::remove(path);
  ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
  EXPECT_FALSE(readPromise(path));
  std::filesystem::remove(path);
  write(path, "[Promise]\nSize=-1\nModified=nan\nCreated=1e300\nShare=everybody\nDocumentID=12x\nPackage=maybe\n");
  const Result<PromiseInfo> info = readPromise(path);
  ASSERT_TRUE(info);
  EXPECT_EQ(info.value->size, 0u);
  EXPECT_FALSE(info.value->modified || info.value->created || info.value->share || info.value->documentID);
  EXPECT_FALSE(info.value->package);
}

TEST_F(DrivePromiseTest, ANameThatIsNoneIsNotWritten) {
  for (const char* name : {"", ".", "..", "a/b"}) {
    EXPECT_EQ(writePromise(drive, named(name))->code, FileErrorCode::WriteInvalidFileName) << name;
  }
  EXPECT_TRUE(std::filesystem::is_empty(drive));
}

TEST_F(DrivePromiseTest, WritingLeavesNothingElseBehind) {
  ASSERT_FALSE(writePromise(drive, named("a")));
  ASSERT_FALSE(writePromise(drive, named("a")));
  EXPECT_TRUE(writePromise(root + "/missing", named("a")));
  int count = 0;
  for ([[maybe_unused]] const auto& entry : std::filesystem::directory_iterator(drive)) ++count;
  EXPECT_EQ(count, 1);
}

TEST_F(DrivePromiseTest, TheIdentifierIsAddedToWhatIsThere) {
  write(drive + "/.a.vlopromise", "[Promise]\nName=a\nSize=9\nFuture=kept\n");
  ASSERT_FALSE(setPromiseDocumentID(drive + "/.a.vlopromise", 42));
  EXPECT_EQ(readPromise(drive + "/.a.vlopromise").value->documentID, 42);
  EXPECT_NE(read(drive + "/.a.vlopromise").find("Future=kept"), std::string::npos);
}

TEST_F(DrivePromiseTest, ARealFileGoesBeforeItsPromise) {
  ASSERT_FALSE(writePromise(drive, named("a")));
  EXPECT_EQ(physicalPathOf(drive + "/a"), drive + "/.a.vlopromise");
  EXPECT_EQ(physicalPathOf(drive + "/.a.vlopromise"), drive + "/.a.vlopromise");
  write(drive + "/a");
  EXPECT_EQ(physicalPathOf(drive + "/a"), drive + "/a");
  EXPECT_EQ(physicalPathOf(drive + "/b"), std::nullopt);
}

TEST_F(DrivePromiseTest, TagsAndSharesAreReadFromItemAndPromise) {
  write(drive + "/file");
  EXPECT_TRUE(tagNamesAt(drive + "/file").empty());
  EXPECT_EQ(sharedItemRoleAt(drive + "/file"), std::nullopt);
  setAttribute(drive + "/file", "user.xdg.tags", "Red, Work ,,Red,\xff,Blue");
  setAttribute(drive + "/file", "user.vaelo.share", "owner");
  EXPECT_EQ(tagNamesAt(drive + "/file"), (std::vector<std::string>{"Red", "Work", "Blue"}));
  EXPECT_EQ(sharedItemRoleAt(drive + "/file"), "owner");
  setAttribute(drive + "/file", "user.vaelo.share", "boss");
  EXPECT_EQ(sharedItemRoleAt(drive + "/file"), std::nullopt);
  PromiseInfo info = named("away");
  info.tags = {"Green"};
  info.share = "participant";
  ASSERT_FALSE(writePromise(drive, info));
  EXPECT_EQ(tagNamesAt(promisePathFor(drive + "/away")), (std::vector<std::string>{"Green"}));
  EXPECT_EQ(sharedItemRoleAt(promisePathFor(drive + "/away")), "participant");
}

TEST_F(DrivePromiseTest, LongTagListsAreReadWhole) {
  write(drive + "/file");
  setAttribute(drive + "/file", "user.xdg.tags", std::string(600, 'a') + "," + std::string(600, 'b'));
  EXPECT_EQ(tagNamesAt(drive + "/file").size(), 2u);
}

TEST_F(DrivePromiseTest, PackagesAreKnownByTheirExtension) {
  for (const char* name : {"a.bundle", "a.RTFD", "a b.TextBundle", "x.sketchbundle", "y.y.vlopackage"}) {
    EXPECT_TRUE(isPackageName(name)) << name;
  }
  for (const char* name : {"bundle", ".bundle", "a.bundles", "a.bundle.txt", "a.", ""})
    EXPECT_FALSE(isPackageName(name)) << name;
}

}  // namespace vaelo::drive_test
