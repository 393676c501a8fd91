// SPDX-License-Identifier: GPL-3.0-or-later
#include <chrono>

#include "tests/contract/contract_test.h"

namespace vaelo::contract {
namespace {

using K = ResourceKey;
using namespace std::chrono_literals;

class ResourceValuesContract : public ContractTest {
 protected:
  Value promised(const URL& url, K key) { return only(platform->values().promisedItemResourceValues(url, {key}), key); }
  Value plain(const URL& url, K key) { return only(platform->values().resourceValues(url, {key}), key); }
  URL resolved(const URL& url) { return platform->values().resolvingSymlinks(url); }
  URL add(const std::string& name, const std::string& bytes = "content") {
    platform->addFile(inDrive(name).path(), bytes);
    return inDrive(name);
  }

 private:
  static Value only(const Result<ResourceMap>& read, K key) {
    if (!read.value || read.value->empty()) return {};
    EXPECT_EQ(read.value->size(), 1u);
    return read.value->count(key) ? read.value->at(key) : Value("another key");
  }
};

VAELO_CONTRACT_SUITE(ResourceValuesContract);

TEST_P(ResourceValuesContract, AFileIsAFile) {
  const URL url = add("Plans/letter.txt", "12345");
  for (const bool isPlain : {false, true}) {
    const auto value = [&](K key) { return isPlain ? plain(url, key) : promised(url, key); };
    EXPECT_EQ(value(K::Name), Value("letter.txt"));
    EXPECT_EQ(value(K::LocalizedName), Value("letter.txt"));
    EXPECT_EQ(value(K::TypeIdentifier), Value("public.plain-text"));
    EXPECT_EQ(value(K::FileSize), Value(std::uint64_t{5}));
    EXPECT_EQ(value(K::IsDirectory), Value(false));
    EXPECT_EQ(value(K::IsPackage), Value(false));
    EXPECT_EQ(value(K::IsRegularFile), Value(true));
    EXPECT_EQ(value(K::HasHiddenExtension), Value(false));
    EXPECT_EQ(value(K::ParentDirectoryURL), Value(inDrive("Plans")));
    EXPECT_TRUE(value(K::CreationDate).get<Date>() || !value(K::CreationDate).isPresent());
  }
}

TEST_P(ResourceValuesContract, AHiddenExtensionIsNotShown) {
  for (const char* name : {"letter.tar.gz", "plain"}) platform->hideExtension(add(name).path());
  platform->addFolder(inDrive("Plans.old").path());
  platform->addFolder(inDrive("Draft.textbundle").path());
  for (const char* name : {"Plans.old", "Draft.textbundle"}) platform->hideExtension(inDrive(name).path());
  platform->addBookmark(inDrive("far.pdf.vaelobookmark").path(), outside("far.pdf"));
  platform->addAlias(inDrive("link.desktop").path(), outside("far.pdf"));
  const std::pair<const char*, const char*> shown[] = {{"letter.tar.gz", "letter.tar"},
                                                       {"Draft.textbundle", "Draft"},
                                                       {"far.pdf.vaelobookmark", "far.pdf"},
                                                       {"link.desktop", "link"},
                                                       {"plain", "plain"},
                                                       {"Plans.old", "Plans.old"}};
  for (const auto& [name, expected] : shown) {
    const URL url = inDrive(name);
    EXPECT_EQ(promised(url, K::Name), Value(name));
    EXPECT_EQ(promised(url, K::LocalizedName), Value(expected));
    EXPECT_EQ(promised(url, K::HasHiddenExtension), Value(std::string(name) != expected)) << name;
  }
  EXPECT_TRUE(platform->files().attributesOfItemAtPath(inDrive("letter.tar.gz").path()).value->extensionHidden);
}

TEST_P(ResourceValuesContract, AFolderHasNoSize) {
  platform->addFolder(inDrive("Plans").path());
  const URL url = inDrive("Plans", true);
  EXPECT_EQ(promised(url, K::TypeIdentifier), Value("public.folder"));
  EXPECT_EQ(promised(url, K::IsDirectory), Value(true));
  EXPECT_EQ(promised(url, K::IsPackage), Value(false));
  EXPECT_EQ(promised(url, K::IsRegularFile), Value(false));
  EXPECT_FALSE(promised(url, K::FileSize).isPresent());
  EXPECT_FALSE(promised(url, K::TotalFileSize).isPresent());
  EXPECT_TRUE(promised(url, K::LocalizedTypeDescription).get<std::string>());
}

TEST_P(ResourceValuesContract, PackagesAreFoldersOfCertainNames) {
  for (const char* name : {"a.bundle", "a.rtfd", "a.textbundle", "a.sketchbundle", "a.vlopackage", "a.BUNDLE"}) {
    platform->addFolder(inDrive(name).path());
    EXPECT_EQ(promised(inDrive(name), K::IsPackage), Value(true)) << name;
    EXPECT_EQ(promised(inDrive(name), K::IsDirectory), Value(true)) << name;
    const Value type = promised(inDrive(name), K::TypeIdentifier);
    ASSERT_TRUE(type.get<std::string>());
    EXPECT_TRUE(platform->types().conformsTo(*type.get<std::string>(), "com.marrow.package")) << name;
    EXPECT_FALSE(promised(inDrive(name), K::FileSize).isPresent());
  }
  EXPECT_EQ(promised(add("file.bundle"), K::IsPackage), Value(false));
  platform->addFolder(inDrive("bundle").path());
  EXPECT_EQ(promised(inDrive("bundle"), K::IsPackage), Value(false));
}

TEST_P(ResourceValuesContract, ALinkIsAskedOfItself) {
  add("five", "12345");
  platform->addLink(inDrive("link").path(), "five");
  platform->addLink(inDrive("dangling").path(), "nowhere");
  for (const char* name : {"link", "dangling"}) {
    EXPECT_EQ(promised(inDrive(name), K::TypeIdentifier), Value("public.symlink"));
    EXPECT_EQ(promised(inDrive(name), K::IsRegularFile), Value(false));
    EXPECT_EQ(promised(inDrive(name), K::IsDirectory), Value(false));
    EXPECT_EQ(promised(inDrive(name), K::Name), Value(name));
    EXPECT_TRUE(isThere(inDrive(name)));
  }
}

TEST_P(ResourceValuesContract, AnItemInALinkedFolderIsReadThroughTheLink) {
  add("real/letter.txt", "12345");
  platform->addPromise(inDrive("real/far.txt").path(), PromiseFacts{42, {}, {}, false, {}, {}});
  platform->addLink(inDrive("link").path(), "real");
  EXPECT_EQ(promised(inDrive("link/letter.txt"), K::FileSize), Value(std::uint64_t{5}));
  EXPECT_EQ(promised(inDrive("link/far.txt"), K::FileSize), Value(std::uint64_t{42}));
  EXPECT_EQ(promised(inDrive("link/letter.txt"), K::ParentDirectoryURL), Value(inDrive("link")));
}

TEST_P(ResourceValuesContract, ModificationDatesAreExact) {
  const URL url = add("a");
  for (const Date date : {Date(0s), Date(1'700'000'000s + 123'456'789ns), Date(-86'400s * 365 * 20), Date(5'000'000'000s)}) {
    platform->setModified(url.path(), date);
    EXPECT_EQ(promised(url, K::ContentModificationDate), Value(date));
    EXPECT_EQ(plain(url, K::ContentModificationDate), Value(date));
  }
}

TEST_P(ResourceValuesContract, OnlyWhatIsAskedForIsAnswered) {
  const URL url = add("a");
  const auto none = platform->values().promisedItemResourceValues(url, {});
  ASSERT_TRUE(none.value);
  EXPECT_TRUE(none.value->empty());
  const auto two = platform->values().resourceValues(url, {K::FileSize, K::Name, K::SharedItemRole, K::ThumbnailDictionary});
  ASSERT_TRUE(two.value);
  EXPECT_EQ(two.value->size(), 2u);
}

TEST_P(ResourceValuesContract, WhatIsNotThereIsError4) {
  for (const URL& url : {inDrive("gone"), inDrive("gone/below"), outside("gone")}) {
    for (const auto& read : {platform->values().promisedItemResourceValues(url, {K::Name}),
                             platform->values().resourceValues(url, {K::Name})}) {
      EXPECT_FALSE(read.value);
      ASSERT_TRUE(read.error);
      EXPECT_EQ(read.error->domain, FileErrorDomain);
      EXPECT_EQ(read.error->code, FileErrorCode::NoSuchFile);
      EXPECT_TRUE(read.error->localizedDescription);
    }
    EXPECT_FALSE(isThere(url));
  }
  add("file");
  EXPECT_EQ(platform->values().resourceValues(inDrive("file/below"), {K::Name}).error->code, FileErrorCode::NoSuchFile);
  EXPECT_FALSE(isThere(inDrive("file/below")));
}

TEST_P(ResourceValuesContract, AnItemThatIsNotDownloadedAnswersAsPromisedAlone) {
  PromiseFacts facts;
  facts.size = 1'234'567'890'123;
  facts.modified = Date(1'700'000'000s);
  facts.created = Date(1'600'000'000s);
  const URL url = inDrive("far.pdf");
  platform->addPromise(url.path(), facts);
  EXPECT_EQ(promised(url, K::Name), Value("far.pdf"));
  EXPECT_EQ(promised(url, K::TypeIdentifier), Value("com.adobe.pdf"));
  EXPECT_EQ(promised(url, K::FileSize), Value(facts.size));
  EXPECT_EQ(promised(url, K::ContentModificationDate), Value(*facts.modified));
  EXPECT_EQ(promised(url, K::CreationDate), Value(*facts.created));
  EXPECT_EQ(promised(url, K::IsRegularFile), Value(true));
  EXPECT_EQ(promised(url, K::IsDirectory), Value(false));
  EXPECT_EQ(promised(url, K::DownloadingStatus), Value(DownloadingStatusNotDownloaded));
  EXPECT_EQ(promised(url, K::IsShared), Value(false));
  EXPECT_TRUE(isThere(url));
  const auto read = platform->values().resourceValues(url, {K::Name});
  ASSERT_TRUE(read.error);
  EXPECT_EQ(read.error->code, FileErrorCode::NoSuchFile);
}

TEST_P(ResourceValuesContract, WhatAPromiseDoesNotSayIsNotKnown) {
  platform->addPromise(inDrive("far").path());
  EXPECT_FALSE(promised(inDrive("far"), K::ContentModificationDate).isPresent());
  EXPECT_FALSE(promised(inDrive("far"), K::CreationDate).isPresent());
  EXPECT_FALSE(promised(inDrive("far"), K::SharedItemRole).isPresent());
}

TEST_P(ResourceValuesContract, APackageMayBePromisedToo) {
  PromiseFacts facts;
  facts.isPackage = true;
  facts.size = 99;
  platform->addPromise(inDrive("far.sketchbundle").path(), facts);
  const URL url = inDrive("far.sketchbundle");
  EXPECT_EQ(promised(url, K::IsDirectory), Value(true));
  EXPECT_EQ(promised(url, K::IsPackage), Value(true));
  EXPECT_EQ(promised(url, K::IsRegularFile), Value(false));
  EXPECT_EQ(promised(url, K::FileSize), Value(std::uint64_t{99}));
}

TEST_P(ResourceValuesContract, APromisesOwnURLAnswersForItsItem) {
  platform->addPromise(inDrive("far.txt").path(), PromiseFacts{42, {}, {}, false, {}, {}});
  const URL physical = platform->cloud().physicalURL(inDrive("far.txt"));
  EXPECT_EQ(promised(physical, K::Name), Value("far.txt"));
  EXPECT_EQ(promised(physical, K::FileSize), Value(std::uint64_t{42}));
  EXPECT_EQ(promised(physical, K::DownloadingStatus), Value(DownloadingStatusNotDownloaded));
  EXPECT_TRUE(isThere(physical));
  EXPECT_EQ(plain(physical, K::Name), Value(physical.lastPathComponent())) << "plainly it is a file like another";
  EXPECT_EQ(plain(physical, K::IsRegularFile), Value(true));
}

TEST_P(ResourceValuesContract, WhatIsDownloadedInTheDriveIsCurrent) {
  EXPECT_EQ(promised(add("a"), K::DownloadingStatus), Value(DownloadingStatusCurrent));
  platform->addFile(outside("b").path());
  EXPECT_FALSE(promised(outside("b"), K::DownloadingStatus).isPresent());
}

TEST_P(ResourceValuesContract, SharingIsToldWithItsRole) {
  const URL alone = add("alone"), mine = add("mine"), theirs = add("theirs");
  platform->setShareRole(mine.path(), SharedItemRoleOwner);
  platform->setShareRole(theirs.path(), SharedItemRoleParticipant);
  PromiseFacts facts;
  facts.shareRole = SharedItemRoleParticipant;
  platform->addPromise(inDrive("far").path(), facts);
  EXPECT_EQ(promised(alone, K::IsShared), Value(false));
  EXPECT_FALSE(promised(alone, K::SharedItemRole).isPresent());
  for (const auto& [url, role] : {std::pair{mine, SharedItemRoleOwner}, std::pair{theirs, SharedItemRoleParticipant},
                                  std::pair{inDrive("far"), SharedItemRoleParticipant}}) {
    EXPECT_EQ(promised(url, K::IsShared), Value(true)) << url.path();
    EXPECT_EQ(promised(url, K::SharedItemRole), Value(role)) << url.path();
  }
}

TEST_P(ResourceValuesContract, TheShareStaysWithAnItemThatMoves) {
  platform->setShareRole(add("a").path(), SharedItemRoleOwner);
  ASSERT_FALSE(platform->files().moveItemAtURL(inDrive("a"), inDrive("b")));
  EXPECT_EQ(promised(inDrive("b"), K::SharedItemRole), Value(SharedItemRoleOwner));
}

TEST_P(ResourceValuesContract, ThereAreNoThumbnailsByThemselves) {
  EXPECT_FALSE(promised(add("a.png"), K::ThumbnailDictionary).isPresent());
}

TEST_P(ResourceValuesContract, TheLocalizedNameIsText) {
  const std::string name = "not\xffutf8.txt";
  const URL url = add(name);
  EXPECT_EQ(promised(url, K::Name), Value(name));
  const Value shown = promised(url, K::LocalizedName);
  ASSERT_TRUE(shown.get<std::string>());
  EXPECT_FALSE(platform->characters().containsIllegalCharacter(*shown.get<std::string>()));
}

// Links and aliases.

TEST_P(ResourceValuesContract, LinksAreFollowedWhereverTheyStand) {
  add("real/in/letter.txt");
  platform->addLink(inDrive("link").path(), "real");
  platform->addLink(inDrive("onward").path(), inDrive("link/in").path());
  platform->addLink(inDrive("last").path(), "onward/letter.txt");
  for (const char* name : {"link/in/letter.txt", "onward/letter.txt", "last", "link/../real/./in/letter.txt"}) {
    EXPECT_EQ(resolved(inDrive(name)), inDrive("real/in/letter.txt")) << name;
  }
  EXPECT_EQ(resolved(inDrive("link", true)), inDrive("real"));
}

TEST_P(ResourceValuesContract, AURLWithoutLinksStaysTheSameObject) {
  const URL url = add("a");
  EXPECT_TRUE(resolved(url).sameObject(url));
}

TEST_P(ResourceValuesContract, LinksThatLeadNowhereOrInACircleLeaveTheURLAsItIs) {
  platform->addLink(inDrive("dangling").path(), "nowhere");
  platform->addLink(inDrive("circle").path(), "circle");
  platform->addLink(inDrive("a").path(), "b");
  platform->addLink(inDrive("b").path(), "a");
  for (const char* name : {"dangling", "circle", "a", "dangling/below", "circle/below", "gone"}) {
    EXPECT_EQ(resolved(inDrive(name)), inDrive(name)) << name;
  }
}

TEST_P(ResourceValuesContract, AnItemThatIsNotDownloadedIsReachedThroughLinksToo) {
  platform->addPromise(inDrive("real/far.txt").path());
  platform->addLink(inDrive("link").path(), "real");
  EXPECT_EQ(resolved(inDrive("link/far.txt")), inDrive("real/far.txt"));
  EXPECT_EQ(resolved(inDrive("real/far.txt")), inDrive("real/far.txt"));
}

TEST_P(ResourceValuesContract, AnAliasIsToldByItsDescriptionAndLeadsToItsTarget) {
  const URL target = add("target with blank.txt");
  const URL alias = inDrive("alias.desktop");
  platform->addAlias(alias.path(), target);
  EXPECT_EQ(promised(alias, K::LocalizedTypeDescription), Value("Alias"));
  EXPECT_EQ(promised(alias, K::TypeIdentifier), Value("com.marrow.alias"));
  EXPECT_FALSE(platform->types().description("com.marrow.alias"));
  EXPECT_EQ(platform->values().resolveAliasFile(alias).value, target);
}

TEST_P(ResourceValuesContract, AnAliasNeedNotLeadAnywhere) {
  platform->addAlias(inDrive("alias.desktop").path(), outside("gone"));
  EXPECT_EQ(platform->values().resolveAliasFile(inDrive("alias.desktop")).value, outside("gone"));
}

TEST_P(ResourceValuesContract, WhatIsNoAliasLeadsNowhere) {
  const auto ofAFile = platform->values().resolveAliasFile(add("plain.txt"));
  EXPECT_FALSE(ofAFile.value);
  ASSERT_TRUE(ofAFile.error);
  EXPECT_EQ(ofAFile.error->code, FileErrorCode::ReadUnknown);
  EXPECT_TRUE(ofAFile.error->localizedDescription);
  const auto ofNothing = platform->values().resolveAliasFile(inDrive("gone.desktop"));
  ASSERT_TRUE(ofNothing.error);
  EXPECT_EQ(ofNothing.error->code, FileErrorCode::ReadNoSuchFile);
}

TEST_P(ResourceValuesContract, NothingIsBehindASecurityScope) {
  EXPECT_FALSE(platform->values().startAccessingSecurityScopedResource(add("a")));
  EXPECT_FALSE(platform->values().startAccessingSecurityScopedResource(outside("b")));
}

}  // namespace
}  // namespace vaelo::contract
