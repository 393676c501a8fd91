// SPDX-License-Identifier: GPL-3.0-or-later
#include <fcntl.h>
#include <sys/xattr.h>

#include <cerrno>
#include <map>

#include "host/drive/promise_file.h"
#include "host/gtk/list/details_reader.h"
#include "host/gtk/list/folder_reader.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

using list_test::TestFolder;

std::map<std::string, EntryKind> kindsIn(const std::string& path) {
  std::map<std::string, EntryKind> kinds;
  const FolderReading reading = readFolder(path);
  for (std::size_t i = 0; reading.snapshot && i < reading.snapshot->size(); ++i) {
    kinds[std::string(reading.snapshot->name(i))] = reading.snapshot->kind(i);
  }
  return kinds;
}

TEST(FolderReader, TellsKindsApart) {
  const TestFolder folder;
  folder.write("document.txt");
  folder.makeFolder("folder");
  folder.makeFolder("notes.rtfd");
  folder.write(".hidden");
  folder.makeFolder(".hiddenFolder");
  folder.write("Ref.vaelobookmark");
  folder.write("Link.desktop");
  folder.write("bad\xff\xfe");
  std::filesystem::create_symlink("folder", folder.path() + "/to folder");
  std::filesystem::create_symlink("document.txt", folder.path() + "/to document");
  std::filesystem::create_symlink("nowhere", folder.path() + "/broken");
  std::filesystem::create_symlink("circle", folder.path() + "/circle");
  const std::map<std::string, EntryKind> expected = {
      {"document.txt", EntryKind::Document}, {"folder", EntryKind::Folder},
      {"notes.rtfd", EntryKind::Package},    {"Ref.vaelobookmark", EntryKind::Bookmark},
      {"Link.desktop", EntryKind::Alias},    {"bad\xff\xfe", EntryKind::Document},
      {"to folder", EntryKind::FolderLink},  {"to document", EntryKind::Symlink},
      {"broken", EntryKind::Symlink},        {"circle", EntryKind::Symlink}};
  EXPECT_EQ(kindsIn(folder.path()), expected);
}

TEST(FolderReader, NamesAreShownWithoutHiddenExtensions) {
  const TestFolder folder;
  const auto shown = [&folder](const char* name, EntryKind kind) {
    folder.write(name);
    return readDetails(folder.path() + "/" + name, kind, 40)->displayName;
  };
  EXPECT_EQ(shown("Far.pdf.vaelobookmark", EntryKind::Bookmark), "Far.pdf");
  EXPECT_EQ(shown("Link.desktop", EntryKind::Alias), "Link");
  EXPECT_EQ(shown("letter.txt", EntryKind::Document), "");
  if (lsetxattr((folder.path() + "/letter.txt").c_str(), "user.vaelo.hidden-extension", "true", 4, 0) == 0) {
    EXPECT_EQ(shown("letter.txt", EntryKind::Document), "letter");
  }
  PromiseInfo info;
  info.name = "Plan.pdf";
  info.extensionHidden = true;
  ASSERT_FALSE(writePromise(folder.path(), info));
  EXPECT_EQ(readDetails(folder.path() + "/Plan.pdf", EntryKind::Promise, 40)->displayName, "Plan");
  EXPECT_TRUE(readPromise(promisePathFor(folder.path() + "/Plan.pdf")).value->extensionHidden);
}

TEST(FolderReader, PromisesStandUnderTheirItemsName) {
  const TestFolder folder;
  const std::string longName = std::string(250, 'n') + ".pdf";
  for (const std::string& name : {std::string("Plan.pdf"), std::string("Book.rtfd"), longName}) {
    PromiseInfo info;
    info.name = name;
    info.size = 1000;
    ASSERT_FALSE(writePromise(folder.path(), info));
  }
  const std::map<std::string, EntryKind> expected = {
      {"Plan.pdf", EntryKind::Promise}, {"Book.rtfd", EntryKind::PromisedPackage}, {longName, EntryKind::Promise}};
  EXPECT_EQ(kindsIn(folder.path()), expected);
  const auto details = readDetails(folder.path() + "/Plan.pdf", EntryKind::Promise, 40);
  EXPECT_EQ(details->secondLine.rfind("Not downloaded", 0), 0U) << details->secondLine;
  EXPECT_NE(details->secondLine.find("1 KB"), std::string::npos) << details->secondLine;
  EXPECT_EQ(details->shortLine, "Not downloaded");

  folder.write("Plan.pdf");
  EXPECT_EQ(kindsIn(folder.path()).at("Plan.pdf"), EntryKind::Document);
  EXPECT_EQ(countEntries(AT_FDCWD, folder.path().c_str()), 4);
}

TEST(FolderReader, SaysWhyAFolderCannotBeRead) {
  const TestFolder folder;
  folder.write("file");
  EXPECT_EQ(readFolder(folder.path() + "/nothing").errorNumber, ENOENT);
  EXPECT_EQ(readFolder(folder.path() + "/file").errorNumber, ENOTDIR);
  EXPECT_EQ(readFolder(folder.path() + "/file").snapshot, nullptr);
}

TEST(FolderReader, LooksNamesUp) {
  const TestFolder folder;
  folder.write("a");
  folder.makeFolder("b");
  PromiseInfo info;
  info.name = "c";
  ASSERT_FALSE(writePromise(folder.path(), info));
  const std::vector<EntryChange> changes = lookUpNames(folder.path(), {"a", "b", "c", "d"});
  ASSERT_EQ(changes.size(), 4U);
  EXPECT_EQ(changes[0].kind, EntryKind::Document);
  EXPECT_EQ(changes[1].kind, EntryKind::Folder);
  EXPECT_EQ(changes[2].kind, EntryKind::Promise);
  EXPECT_EQ(changes[3].kind, std::nullopt);
}

TEST(DetailsReader, CountsWhatAFolderLists) {
  const TestFolder folder;
  folder.makeFolder("many");
  folder.makeFolder("one");
  folder.write("many/a");
  folder.write("many/b");
  folder.write("many/.hidden");
  folder.write("one/a");
  folder.write("file", std::string(2500, 'x'));
  EXPECT_EQ(readDetails(folder.path() + "/many", EntryKind::Folder, 40)->secondLine, "2 items");
  EXPECT_EQ(readDetails(folder.path() + "/one", EntryKind::Folder, 40)->secondLine, "1 item");
  EXPECT_NE(readDetails(folder.path() + "/file", EntryKind::Document, 40)->secondLine.find("3 KB"), std::string::npos);
  EXPECT_EQ(readDetails(folder.path() + "/file", EntryKind::Document, 40)->shortLine, "3 KB");
  EXPECT_EQ(readDetails(folder.path() + "/many", EntryKind::Folder, 40)->shortLine, "2 items");
  EXPECT_EQ(readDetails(folder.path() + "/gone", EntryKind::Document, 40)->secondLine, "");
}

TEST(DetailsReader, ALinkThatLeadsNowhereSaysSo) {
  const TestFolder folder;
  folder.write("there");
  std::filesystem::create_symlink("there", folder.path() + "/link");
  std::filesystem::create_symlink("nowhere", folder.path() + "/broken");
  std::filesystem::create_symlink("circle", folder.path() + "/circle");
  EXPECT_EQ(readDetails(folder.path() + "/broken", EntryKind::Symlink, 40)->secondLine, "Broken link");
  EXPECT_EQ(readDetails(folder.path() + "/broken", EntryKind::Symlink, 40)->shortLine, "Broken link");
  EXPECT_EQ(readDetails(folder.path() + "/circle", EntryKind::Symlink, 40)->secondLine, "Broken link");
  EXPECT_EQ(readDetails(folder.path() + "/link", EntryKind::Symlink, 40)->shortLine, "1 byte");
}

TEST(DetailsReader, APackageIsAsLargeAsItsFiles) {
  const TestFolder folder;
  folder.makeFolder("Trip.textbundle");
  folder.makeFolder("Trip.textbundle/assets");
  folder.write("Trip.textbundle/text.md", std::string(1500, 'x'));
  folder.write("Trip.textbundle/.hidden", std::string(500, 'x'));
  folder.write("Trip.textbundle/assets/map.png", std::string(1000, 'x'));
  PromiseInfo info;
  info.name = "film.mp4";
  info.size = 5000;
  ASSERT_FALSE(writePromise(folder.path() + "/Trip.textbundle/assets", info));
  EXPECT_EQ(readDetails(folder.path() + "/Trip.textbundle", EntryKind::Package, 40)->shortLine, "8 KB");
  folder.makeFolder("Empty.textbundle");
  EXPECT_EQ(readDetails(folder.path() + "/Empty.textbundle", EntryKind::Package, 40)->shortLine.find("byte"),
            std::string::npos);
}

TEST(DetailsReader, APackageOfVeryManyFilesKeepsNobodyWaiting) {
  const TestFolder folder;
  folder.makeFolder("Many.bundle");
  for (int i = 0; i < 1001; ++i) folder.write("Many.bundle/" + std::to_string(i));
  EXPECT_EQ(readDetails(folder.path() + "/Many.bundle", EntryKind::Package, 40)->shortLine.find("byte"), std::string::npos);
}

}  // namespace
}  // namespace vaelo
