// SPDX-License-Identifier: GPL-3.0-or-later
#include <sys/wait.h>

#include "host/drive/drive_synced_store.h"
#include "host/drive/item_attributes.h"
#include "host/drive/promise_file.h"
#include "host/drive/tag_dictionary.h"
#include "tests/host/drive_service_fixture.h"

namespace vaelo::drive_test {

namespace {

using Names = std::vector<std::string>;

class ItemTagsTest : public DriveTest {
 protected:
  ItemTagsTest() { write(item); }
  const std::string item = drive + "/a.txt";
};

TEST_F(ItemTagsTest, ArePutOnAndTakenOffOneByOne) {
  ASSERT_FALSE(setTagAt(item, "Red", true));
  ASSERT_FALSE(setTagAt(item, "Büro 2", true));
  EXPECT_EQ(attribute(item, "user.xdg.tags"), "Red,Büro 2");
  EXPECT_EQ(tagNamesAt(item), (Names{"Red", "Büro 2"}));
  ASSERT_FALSE(setTagAt(item, "Red", true));
  EXPECT_EQ(attribute(item, "user.xdg.tags"), "Red,Büro 2");
  ASSERT_FALSE(setTagAt(item, "Red", false));
  EXPECT_EQ(attribute(item, "user.xdg.tags"), "Büro 2");
  ASSERT_FALSE(setTagAt(item, "Büro 2", false));
  EXPECT_EQ(::lgetxattr(item.c_str(), "user.xdg.tags", nullptr, 0), -1);
  ASSERT_FALSE(setTagAt(item, "Red", false));
}

TEST_F(ItemTagsTest, WhatAnotherProgramWroteStaysAsItIs) {
  setAttribute(item, "user.xdg.tags", " Red ,\xff\xfe,,a\nb");
  ASSERT_FALSE(setTagAt(item, "Blue", true));
  EXPECT_EQ(attribute(item, "user.xdg.tags"), " Red ,\xff\xfe,,a\nb,Blue");
  ASSERT_FALSE(setTagAt(item, "Red", false));
  EXPECT_EQ(attribute(item, "user.xdg.tags"), "\xff\xfe,,a\nb,Blue");
  ASSERT_FALSE(setTagAt(item, "a\nb", false));
  EXPECT_EQ(attribute(item, "user.xdg.tags"), "\xff\xfe,,Blue");
}

TEST_F(ItemTagsTest, NamesThatNoTagCanHaveAreRefused) {
  for (const char* name : {"", " ", "a,b", "a\nb", "\x1b[0m", "\xff", " a", "a "}) {
    EXPECT_EQ(setTagAt(item, name, true)->code, FileErrorCode::WriteInvalidFileName) << name;
  }
  EXPECT_TRUE(isTagName(std::string(100, 'a')));
  EXPECT_FALSE(isTagName(std::string(101, 'a')));
  EXPECT_EQ(tagNamesAt(item), Names());
}

TEST_F(ItemTagsTest, MoreThanTheFileSystemKeepsIsAnErrorAndLosesNothing) {
  ASSERT_FALSE(setTagAt(item, "Red", true));
  std::optional<Error> failed;
  for (int i = 0; i < 1000 && !failed; ++i) failed = setTagAt(item, std::string(90, 'x') + std::to_string(i), true);
  ASSERT_TRUE(failed);
  EXPECT_EQ(tagNamesAt(item).front(), "Red");
}

TEST_F(ItemTagsTest, AnItemThatIsNotThereHasNone) {
  EXPECT_TRUE(setTagAt(drive + "/gone", "Red", true));
  EXPECT_FALSE(exists(drive + "/gone"));
}

TEST_F(ItemTagsTest, AnItemThatIsNotDownloadedIsTaggedInItsPromise) {
  PromiseInfo info;
  info.name = "away.txt";
  info.size = 7;
  info.documentID = 12;
  ASSERT_FALSE(writePromise(drive, info));
  const std::string promise = promisePathFor(drive + "/away.txt");
  ASSERT_FALSE(setTagAt(promise, "Red", true));
  ASSERT_FALSE(setTagAt(promise, "a;b", true));
  EXPECT_EQ(tagNamesAt(promise), (Names{"Red", "a;b"}));
  ASSERT_FALSE(setTagAt(promise, "Red", false));
  const auto read = readPromise(promise);
  EXPECT_EQ(read.value->tags, (Names{"a;b"}));
  EXPECT_EQ(read.value->size, 7u);
  EXPECT_EQ(read.value->documentID, 12);
  ASSERT_FALSE(setTagAt(promise, "a;b", false));
  EXPECT_EQ(tagNamesAt(promise), Names());
}

class SyncedTagsTest : public DriveTest {
 protected:
  Names names() {
    Names found;
    DriveSyncedStore fresh(layout, log, notifications);
    const Value dictionary = fresh.objectForKey("RoverTagDict");
    if (!dictionary.dictionary()) return found;
    EXPECT_EQ(dictionary.dictionary()->at("RoverTagDictVersion").unsignedValue(), 2u);
    const Value tags = dictionary.dictionary()->at("RoverTags");
    for (const Value& tag : *tags.array()) {
      found.push_back(*tag.dictionary()->at("n").get<std::string>() + " " +
                      std::to_string(tag.dictionary()->at("l").unsignedValue()));
    }
    return found;
  }
  const std::string file = mirror + "/.vaelo/values";
  DriveLayout layout{data};
  NotificationCenter notifications;
  DriveSyncedStore store{layout, log, notifications};
};

TEST_F(SyncedTagsTest, ANewTagIsAddedOnceAtTheEnd) {
  ASSERT_FALSE(store.addTag("Red", 6));
  ASSERT_FALSE(store.addTag("It's \"new\"", 0));
  ASSERT_FALSE(store.addTag("Red", 1));
  EXPECT_EQ(names(), (Names{"Red 6", "It's \"new\" 0"}));
}

TEST_F(SyncedTagsTest, ANewTagIsKnownBeforeTheFilesWatchTellsOfIt) {
  store.accountChanged();
  EXPECT_FALSE(store.objectForKey("RoverTagDict").isPresent());
  ASSERT_FALSE(store.addTag("Red", 6));
  EXPECT_TRUE(store.objectForKey("RoverTagDict").isPresent());
}

TEST_F(SyncedTagsTest, WhatElseTheFileSaysStays) {
  write(file,
        "{'other': <[1, 2]>, 'RoverTagDict': <{'RoverTagDictVersion': <2>, 'x': <true>, "
        "'RoverTags': <[{'n': <'Red'>, 'l': <uint32 6>, 'more': <'kept'>}]>}>}");
  ASSERT_FALSE(store.addTag("Blue", 4));
  EXPECT_EQ(names(), (Names{"Red 6", "Blue 4"}));
  const std::string text = read(file);
  for (const char* part : {"'other'", "'x'", "'kept'"}) EXPECT_NE(text.find(part), std::string::npos) << part;
}

TEST_F(SyncedTagsTest, EntriesOfOtherKindsStayToo) {
  write(file,
        "{'RoverTagDict': <{'RoverTagDictVersion': <uint64 2>, 'RoverTags': <[<'text'>, <{'n': <5>}>, <{'n': <'Red'>, 'l': "
        "<uint64 6>}>]>}>}");
  ASSERT_FALSE(store.addTag("Red", 1));
  ASSERT_FALSE(store.addTag("Blue", 4));
  const std::string text = read(file);
  for (const char* part : {"'text'", "'n': <5>", "'Red'", "'Blue'"}) EXPECT_NE(text.find(part), std::string::npos) << part;
}

TEST_F(SyncedTagsTest, TagsOfOtherVersionsAndFormsAreNotTouched) {
  for (const char* text : {"{'RoverTagDict': <{'RoverTagDictVersion': <uint64 3>, 'RoverTags': <@aa{sv} []>}>}",
                           "{'RoverTagDict': <{'RoverTagDictVersion': <uint64 1>}>}", "{'RoverTagDict': <@a{sv} {}>}",
                           "{'RoverTagDict': <'text'>}", "{'RoverTagDict': <{'RoverTagDictVersion': <'2'>}>}",
                           "{'RoverTagDict': <{'RoverTagDictVersion': <uint64 2>, 'RoverTags': <'Red'>}>}"}) {
    write(file, text);
    EXPECT_EQ(store.addTag("Blue", 4)->code, FileErrorCode::FeatureUnsupported) << text;
    EXPECT_EQ(read(file), text);
  }
}

TEST_F(SyncedTagsTest, AFileThatIsDamagedIsSetAside) {
  write(file, "garbage {");
  ASSERT_FALSE(store.addTag("Blue", 4));
  EXPECT_EQ(read(file + ".damaged-1"), "garbage {");
  EXPECT_EQ(names(), (Names{"Blue 4"}));
}

TEST_F(SyncedTagsTest, TenThousandTagsAreReadAndAddedTo) {
  std::string text = "{'RoverTagDict': <{'RoverTagDictVersion': <uint64 2>, 'RoverTags': <[";
  for (int i = 0; i < 10000; ++i) {
    text += (i ? ", " : "") + std::string("{'n': <'tag number ") + std::to_string(i) + "'>, 'l': <uint64 1>}";
  }
  write(file, text + "]>}>}");
  EXPECT_EQ(names().size(), 10000u);
  ASSERT_FALSE(store.addTag("Blue", 4));
  const Names all = names();
  ASSERT_EQ(all.size(), 10001u);
  EXPECT_EQ(all.back(), "Blue 4");
}

TEST_F(SyncedTagsTest, AFileWithoutEndIsNotRead) {
  write(file, std::string(5 * 1024 * 1024, ' '));
  EXPECT_EQ(names(), Names());
  EXPECT_GE(log.count("can't be read"), 1);
  EXPECT_TRUE(store.addTag("Blue", 4));
}

TEST_F(SyncedTagsTest, NestingWithoutEndIsNoDictionary) {
  write(file, "{'RoverTagDict': " + std::string(5000, '<') + "1" + std::string(5000, '>') + "}");
  EXPECT_EQ(names(), Names());
}

TEST_F(SyncedTagsTest, ProcessesThatAddAtOnceLoseNone) {
  const pid_t child = ::fork();
  if (child == 0) {
    for (int i = 0; i < 25; ++i) store.addTag("theirs " + std::to_string(i), 1);
    ::_exit(0);
  }
  for (int i = 0; i < 25; ++i) EXPECT_FALSE(store.addTag("ours " + std::to_string(i), 2));
  int status = 0;
  ASSERT_EQ(::waitpid(child, &status, 0), child);
  EXPECT_EQ(names().size(), 50u);
}

class SyncedStoreFollowingTest : public DriveServiceTest {
 protected:
  SyncedStoreFollowingTest() {
    start();
    store = std::make_unique<DriveSyncedStore>(service->layout(), log, notifications);
    observation =
        notifications.addObserver(SyncedStoreDidChangeExternallyNotification, [this](const Notification&) { ++changes; });
    store->watch();
  }
  bool waitForText(const std::string& key, const std::string& text) {
    return waitFor([&] { return store->objectForKey(key) == Value(text); });
  }
  /// As another process does it: written under another name, and renamed.
  static void replace(const std::string& file, const std::string& text) {
    write(file + ".new", text);
    std::filesystem::rename(file + ".new", file);
  }

  std::unique_ptr<DriveSyncedStore> store;
  int changes = 0;
  NotificationCenter::Token observation;
};

TEST_F(SyncedStoreFollowingTest, WhatAnotherProcessWritesIsReadAndTold) {
  makeFolder(mirror + "/.vaelo");
  store->accountChanged();
  const int before = changes;
  replace(mirror + "/.vaelo/values", "{'a': <'one'>}");
  ASSERT_TRUE(waitForText("a", "one"));
  ASSERT_TRUE(waitFor([&] { return changes > before; }));
  replace(mirror + "/.vaelo/values", "{'a': <'two'>}");
  ASSERT_TRUE(waitForText("a", "two"));
  std::filesystem::remove(mirror + "/.vaelo/values");
  ASSERT_TRUE(waitFor([&] { return !store->objectForKey("a").isPresent(); }));
}

TEST_F(SyncedStoreFollowingTest, AnotherAccountHasValuesOfItsOwn) {
  write(mirror + "/.vaelo/values", "{'a': <'first'>}");
  store->accountChanged();
  ASSERT_TRUE(waitForText("a", "first"));
  const std::string other = data + "/accounts/0b";
  write(other + "/.vaelo/values", "{'a': <'second'>}");
  writeAccount("Token=0b\nSignedIn=true\nMirror=accounts/0b\n");
  ASSERT_TRUE(waitFor([&] { return service->layout().mirrorRoot() == other; }));
  const int before = changes;
  store->accountChanged();
  EXPECT_EQ(changes, before + 1);
  EXPECT_EQ(store->objectForKey("a"), Value("second"));
  replace(other + "/.vaelo/values", "{'a': <'third'>}");
  ASSERT_TRUE(waitForText("a", "third"));
}

}  // namespace

}  // namespace vaelo::drive_test
