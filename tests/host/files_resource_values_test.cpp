// SPDX-License-Identifier: GPL-3.0-or-later
#include <fcntl.h>
#include <sys/stat.h>

#include "host/drive/promise_file.h"
#include "host/files/g_types.h"
#include "host/files/local_file_manager.h"
#include "host/files/local_resource_values.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {

namespace {

class FilesResourceValuesTest : public drive_test::DriveTest {
 protected:
  FilesResourceValuesTest() { makeFolder(drive); }

  static const std::vector<ResourceKey>& allKeys() {
    static const std::vector<ResourceKey> keys{ResourceKey::Name,
                                               ResourceKey::LocalizedName,
                                               ResourceKey::TypeIdentifier,
                                               ResourceKey::LocalizedTypeDescription,
                                               ResourceKey::FileSize,
                                               ResourceKey::TotalFileSize,
                                               ResourceKey::CreationDate,
                                               ResourceKey::ContentModificationDate,
                                               ResourceKey::IsDirectory,
                                               ResourceKey::IsPackage,
                                               ResourceKey::IsRegularFile,
                                               ResourceKey::HasHiddenExtension,
                                               ResourceKey::ParentDirectoryURL,
                                               ResourceKey::IsShared,
                                               ResourceKey::SharedItemRole,
                                               ResourceKey::DownloadingStatus,
                                               ResourceKey::ThumbnailDictionary};
    return keys;
  }
  /// The promised form of all keys but the identifier.
  ResourceMap valuesOf(const std::string& path) {
    Result<ResourceMap> values = resources.promisedItemResourceValues(URL(path), allKeys());
    if (!values) ADD_FAILURE() << values.error->description();
    return values.value.value_or(ResourceMap());
  }
  static std::string text(const ResourceMap& values, ResourceKey key) {
    const auto at = values.find(key);
    return at == values.end() ? "(absent)" : at->second.description();
  }
  std::string type(const std::string& path) { return text(valuesOf(path), ResourceKey::TypeIdentifier); }

  DriveLayout layout{data};
  DocumentIndex index{layout, log};
  GTypes types;
  LocalResourceValues resources{layout, index, types};
};

TEST_F(FilesResourceValuesTest, AFile) {
  write(drive + "/Report.PDF", "12345");
  const ResourceMap values = valuesOf(drive + "/Report.PDF");
  EXPECT_EQ(text(values, ResourceKey::Name), "Report.PDF");
  EXPECT_EQ(text(values, ResourceKey::LocalizedName), "Report.PDF");
  EXPECT_EQ(text(values, ResourceKey::TypeIdentifier), "com.adobe.pdf");
  EXPECT_EQ(values.at(ResourceKey::FileSize).unsignedValue(), 5u);
  EXPECT_TRUE(values.at(ResourceKey::FileSize).get<std::uint64_t>());
  EXPECT_TRUE(values.at(ResourceKey::ContentModificationDate).get<Date>());
  EXPECT_FALSE(values.at(ResourceKey::IsDirectory).boolValue());
  EXPECT_TRUE(values.at(ResourceKey::IsRegularFile).boolValue());
  EXPECT_FALSE(values.at(ResourceKey::HasHiddenExtension).boolValue());
  EXPECT_EQ(*values.at(ResourceKey::ParentDirectoryURL).get<URL>(), URL(drive));
  EXPECT_FALSE(values.at(ResourceKey::IsShared).boolValue());
  EXPECT_EQ(text(values, ResourceKey::SharedItemRole), "(absent)");
  EXPECT_EQ(text(values, ResourceKey::DownloadingStatus), DownloadingStatusCurrent);
  EXPECT_EQ(text(values, ResourceKey::ThumbnailDictionary), "(absent)");
}

TEST_F(FilesResourceValuesTest, FoldersPackagesAndLinks) {
  makeFolder(drive + "/folder.pdf");
  makeFolder(drive + "/doc.RTFD");
  write(drive + "/file.bundle");
  link("nowhere", drive + "/link");
  write(drive + "/plain");
  EXPECT_EQ(type(drive + "/folder.pdf"), "public.folder");
  EXPECT_EQ(text(valuesOf(drive + "/folder.pdf"), ResourceKey::FileSize), "(absent)");
  const ResourceMap package = valuesOf(drive + "/doc.RTFD");
  EXPECT_TRUE(package.at(ResourceKey::IsPackage).boolValue());
  EXPECT_TRUE(package.at(ResourceKey::IsDirectory).boolValue());
  EXPECT_EQ(text(package, ResourceKey::TypeIdentifier), "com.marrow.rtfd");
  EXPECT_FALSE(valuesOf(drive + "/file.bundle").at(ResourceKey::IsPackage).boolValue());
  EXPECT_EQ(type(drive + "/link"), "public.symlink");
  EXPECT_EQ(type(drive + "/plain"), "public.data");
}

TEST_F(FilesResourceValuesTest, AnAliasIsCalledOneAndNothingElseIs) {
  write(drive + "/alias.desktop", "[Desktop Entry]\nType=Link\nURL=file:///somewhere\n");
  write(drive + "/app.desktop", "[Desktop Entry]\nType=Application\nExec=true\n");
  EXPECT_EQ(text(valuesOf(drive + "/alias.desktop"), ResourceKey::LocalizedTypeDescription), "Alias");
  // A description of the type would be taken in place of the one above.
  EXPECT_EQ(types.description(type(drive + "/alias.desktop")), std::nullopt);
  EXPECT_NE(text(valuesOf(drive + "/app.desktop"), ResourceKey::LocalizedTypeDescription), "Alias");
  EXPECT_EQ(resources.resolveAliasFile(URL(drive + "/alias.desktop")).value, URL("/somewhere"));
  EXPECT_TRUE(resources.resolveAliasFile(URL(drive + "/app.desktop")).error->localizedDescription);
}

TEST_F(FilesResourceValuesTest, WhatIsNotDownloadedAnswersFromItsPromise) {
  PromiseInfo info;
  info.name = "far.desktop";
  info.size = 4711;
  info.modified = Date(std::chrono::seconds(1234567890));
  info.share = SharedItemRoleParticipant;
  ASSERT_FALSE(writePromise(drive, info));
  const ResourceMap values = valuesOf(drive + "/far.desktop");
  EXPECT_EQ(values, valuesOf(promisePathFor(drive + "/far.desktop")));
  EXPECT_EQ(text(values, ResourceKey::Name), "far.desktop");
  EXPECT_EQ(values.at(ResourceKey::FileSize).unsignedValue(), 4711u);
  EXPECT_EQ(*values.at(ResourceKey::ContentModificationDate).get<Date>(), *info.modified);
  EXPECT_EQ(text(values, ResourceKey::CreationDate), "(absent)");
  EXPECT_EQ(text(values, ResourceKey::SharedItemRole), SharedItemRoleParticipant);
  EXPECT_TRUE(values.at(ResourceKey::IsShared).boolValue());
  EXPECT_EQ(text(values, ResourceKey::DownloadingStatus), DownloadingStatusNotDownloaded);
  EXPECT_NE(text(values, ResourceKey::LocalizedTypeDescription), "Alias");
  EXPECT_TRUE(resources.promisedItemIsReachable(URL(drive + "/far.desktop")));
  EXPECT_EQ(resources.resourceValues(URL(drive + "/far.desktop"), allKeys()).error->code, FileErrorCode::NoSuchFile);
}

TEST_F(FilesResourceValuesTest, APromisedPackageIsOne) {
  PromiseInfo info;
  info.name = "far.sketchbundle";
  info.package = true;
  ASSERT_FALSE(writePromise(drive, info));
  const ResourceMap values = valuesOf(drive + "/far.sketchbundle");
  EXPECT_TRUE(values.at(ResourceKey::IsPackage).boolValue());
  EXPECT_TRUE(values.at(ResourceKey::IsDirectory).boolValue());
  EXPECT_FALSE(values.at(ResourceKey::IsRegularFile).boolValue());
}

TEST_F(FilesResourceValuesTest, DatesAreThoseThatTheClockCanTell) {
  const std::string path = drive + "/Old.txt";
  write(path);
  LocalFileManager files;
  const auto modifiedIn = [&](std::time_t seconds) {
    const timespec times[] = {{seconds, 500'000'000}, {seconds, 500'000'000}};
    EXPECT_EQ(::utimensat(AT_FDCWD, path.c_str(), times, 0), 0);
    const ResourceMap values = valuesOf(path);
    const auto found = values.find(ResourceKey::ContentModificationDate);
    const Date* date = found == values.end() ? nullptr : found->second.get<Date>();
    const std::optional<Date> told = date ? std::optional(*date) : std::nullopt;
    EXPECT_EQ(files.attributesOfItemAtPath(path).value->modificationDate, told);
    return told;
  };
  constexpr auto half = std::chrono::milliseconds(500);
  EXPECT_EQ(modifiedIn(-14'212'800), Date(std::chrono::seconds(-14'212'800) + half)) << "in 1969";
  EXPECT_EQ(modifiedIn(5'685'422'400), Date(std::chrono::seconds(5'685'422'400) + half)) << "in 2150";
  EXPECT_EQ(modifiedIn(10'413'792'000), std::nullopt) << "in 2300";
}

TEST_F(FilesResourceValuesTest, Failures) {
  write(drive + "/file");
  write(drive + "/.broken.vlopromise", "damaged");
  link("b", drive + "/a");
  link("a", drive + "/b");
  const auto code = [&](const std::string& path) {
    const auto values = resources.promisedItemResourceValues(URL(path), {ResourceKey::Name});
    return values.error ? values.error->code : 0;
  };
  EXPECT_EQ(code(drive + "/missing"), FileErrorCode::NoSuchFile);
  EXPECT_EQ(code(drive + "/file/below"), FileErrorCode::NoSuchFile);
  EXPECT_EQ(code(drive + "/.gone.vlopromise"), FileErrorCode::NoSuchFile);
  EXPECT_EQ(code(drive + "/broken"), FileErrorCode::ReadUnknown);
  EXPECT_EQ(code(drive + "/a/below"), FileErrorCode::ReadUnknown);
  EXPECT_EQ(code(drive + "/a"), 0);
  EXPECT_FALSE(resources.promisedItemIsReachable(URL(drive + "/missing")));
}

TEST_F(FilesResourceValuesTest, NamesThatAreNoTextCanBeRead) {
  const std::string name = "\xff\xfe.txt";
  write(drive + "/" + name);
  const ResourceMap values = valuesOf(drive + "/" + name);
  EXPECT_EQ(text(values, ResourceKey::Name), name);
  EXPECT_TRUE(g_utf8_validate(text(values, ResourceKey::LocalizedName).c_str(), -1, nullptr));
}

TEST_F(FilesResourceValuesTest, OutsideTheDriveNothingIsDownloaded) {
  write(root + "/outside");
  EXPECT_EQ(text(valuesOf(root + "/outside"), ResourceKey::DownloadingStatus), "(absent)");
}

TEST_F(FilesResourceValuesTest, TheIdentifierStays) {
  write(drive + "/a");
  const auto id = [&](const std::string& path) {
    return resources.promisedItemResourceValues(URL(path), {ResourceKey::DocumentIdentifier})
        .value->at(ResourceKey::DocumentIdentifier);
  };
  const Value before = id(drive + "/a");
  EXPECT_TRUE(before.get<std::int64_t>());
  rename(drive + "/a", drive + "/sub/b");
  EXPECT_EQ(id(drive + "/sub/b"), before);
}

TEST_F(FilesResourceValuesTest, LinksAreFollowedToWhatIsThere) {
  makeFolder(drive + "/real");
  write(drive + "/real/file");
  link("real", drive + "/link");
  link("nowhere", drive + "/lost");
  link("b", drive + "/a");
  link("a", drive + "/b");
  PromiseInfo info;
  info.name = "far";
  ASSERT_FALSE(writePromise(drive + "/real", info));
  EXPECT_EQ(resources.resolvingSymlinks(URL(drive + "/link/file")), URL(drive + "/real/file"));
  EXPECT_EQ(resources.resolvingSymlinks(URL(drive + "/link/far")), URL(drive + "/real/far"));
  EXPECT_EQ(resources.resolvingSymlinks(URL(drive + "/link/../link")), URL(drive + "/real"));
  for (const std::string name : {"/lost", "/a", "/real/file", "/missing"}) {
    const URL url(drive + name);
    EXPECT_TRUE(resources.resolvingSymlinks(url).sameObject(url)) << name;
  }
}

}  // namespace

}  // namespace vaelo
