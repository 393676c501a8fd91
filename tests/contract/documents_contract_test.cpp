// SPDX-License-Identifier: GPL-3.0-or-later
#include <cerrno>

#include "tests/contract/contract_test.h"

namespace vaelo::contract {
namespace {

/// Document identifiers, and the strings that other devices read.
class DocumentsContract : public ContractTest {
 protected:
  DocumentStore& store() { return platform->documents(); }
  std::int64_t identifier(const URL& url) {
    const auto read = platform->values().promisedItemResourceValues(url, {ResourceKey::DocumentIdentifier});
    if (!read.value || !read.value->count(ResourceKey::DocumentIdentifier)) return 0;
    const std::int64_t* number = read.value->at(ResourceKey::DocumentIdentifier).get<std::int64_t>();
    return number ? *number : -1;
  }
  DocumentStore::Device device() { return store().deviceOf(URL(platform->drive(), true)).value(); }
  /// Where the store finds the document; "" and the error's number when it doesn't.
  std::string pathOf(std::int64_t id) {
    const auto failed = [](const SystemError& error) { return " " + std::to_string(error.number); };
    const auto file = store().resolveDocumentID(device(), static_cast<std::uint64_t>(id));
    if (!file.value) return failed(file.error);
    const auto handle = store().openByID(device(), *file.value);
    if (!handle.value) return failed(handle.error);
    EXPECT_GE(*handle.value, 0);
    const auto attributes = store().attributesOfOpenFile(*handle.value);
    store().close(*handle.value);
    if (!attributes.value) return failed(attributes.error);
    EXPECT_EQ(attributes.value->documentID, id);
    return attributes.value->path;
  }
  URL add(const std::string& name) {
    platform->addFile(inDrive(name).path());
    return inDrive(name);
  }
  Result<std::string> encoded(const URL& url) {
    return answerOf<Result<std::string>>(
               [&](auto done) { platform->provider().BookmarkableStringFromDocumentURL(url, std::move(done)); })
        .value_or(Error{"never answered", 0, {}, {}, {}});
  }
  Result<URL> decoded(const std::string& text) {
    return answerOf<Result<URL>>(
               [&](auto done) { platform->provider().DocumentURLFromBookmarkableString(text, std::move(done)); })
        .value_or(Error{"never answered", 0, {}, {}, {}});
  }
};

VAELO_CONTRACT_SUITE(DocumentsContract);

const std::string NotFound = " " + std::to_string(ENOENT);

TEST_P(DocumentsContract, EachDocumentHasAnIdentifierOfItsOwn) {
  const URL a = add("a"), b = add("b");
  const std::int64_t id = identifier(a);
  EXPECT_GT(id, 0);
  EXPECT_EQ(identifier(a), id) << "asked again";
  EXPECT_GT(identifier(b), 0);
  EXPECT_NE(identifier(b), id);
}

TEST_P(DocumentsContract, AnIdentifierLeadsToItsDocument) {
  EXPECT_EQ(pathOf(identifier(add("folder/a"))), inDrive("folder/a").path());
}

TEST_P(DocumentsContract, AnIdentifierSurvivesMoves) {
  const std::int64_t id = identifier(add("a"));
  platform->addFolder(inDrive("to").path());
  ASSERT_FALSE(platform->files().moveItemAtURL(inDrive("a"), inDrive("b")));
  EXPECT_EQ(identifier(inDrive("b")), id);
  EXPECT_EQ(pathOf(id), inDrive("b").path());
  ASSERT_FALSE(platform->files().moveItemAtURL(inDrive("b"), inDrive("to/c")));
  EXPECT_EQ(pathOf(id), inDrive("to/c").path());
  ASSERT_FALSE(platform->files().moveItemAtURL(inDrive("to"), inDrive("away")));
  EXPECT_EQ(pathOf(id), inDrive("away/c").path()) << "with the folder that it is in";
}

TEST_P(DocumentsContract, AnIdentifierSurvivesAnotherProgramsRename) {
  const std::int64_t id = identifier(add("a"));
  platform->renameBehind(inDrive("a").path(), inDrive("to/b").path());
  EXPECT_EQ(pathOf(id), inDrive("to/b").path());
  EXPECT_EQ(identifier(inDrive("to/b")), id);
}

TEST_P(DocumentsContract, AnIdentifierGoesToAnotherLibraryToo) {
  platform->addLibrary("org~example~Sketch", {"Sketchbook", {}, {}, {}});
  const std::int64_t id = identifier(add("a"));
  const URL there(platform->mirror() + "/org~example~Sketch/Documents/a");
  ASSERT_FALSE(platform->files().moveItemAtURL(inDrive("a"), there));
  EXPECT_EQ(pathOf(id), there.path());
}

TEST_P(DocumentsContract, AnItemThatIsNotDownloadedIsFoundUnderItsOwnName) {
  platform->addPromise(inDrive("far.txt").path());
  const std::int64_t id = identifier(inDrive("far.txt"));
  EXPECT_GT(id, 0);
  EXPECT_EQ(pathOf(id), inDrive("far.txt").path());
  ASSERT_FALSE(platform->files().moveItemAtURL(inDrive("far.txt"), inDrive("new.txt")));
  EXPECT_EQ(identifier(inDrive("new.txt")), id);
  EXPECT_EQ(pathOf(id), inDrive("new.txt").path());
}

TEST_P(DocumentsContract, ADocumentThatTakesAFormerPlaceIsAnother) {
  const std::int64_t id = identifier(add("a"));
  ASSERT_FALSE(platform->files().moveItemAtURL(inDrive("a"), inDrive("b")));
  EXPECT_NE(identifier(add("a")), id);
  EXPECT_EQ(pathOf(id), inDrive("b").path());
}

TEST_P(DocumentsContract, WhatIsUnknownOrGoneIsNotFound) {
  EXPECT_EQ(pathOf(4'711'000), NotFound);
  EXPECT_EQ(pathOf(0), NotFound);
  const std::int64_t id = identifier(add("a"));
  ASSERT_FALSE(platform->files().removeItemAtURL(inDrive("a")));
  EXPECT_EQ(pathOf(id), NotFound);
}

TEST_P(DocumentsContract, NumbersThatAreTooLargeAreOfNothing) {
  const auto file = store().resolveDocumentID(device(), UINT64_MAX);
  EXPECT_FALSE(file.value);
  EXPECT_EQ(file.error.number, ENOENT);
  EXPECT_FALSE(file.error.text.empty());
}

TEST_P(DocumentsContract, AnotherDeviceHasNoneOfThem) {
  const std::int64_t id = identifier(add("a"));
  EXPECT_FALSE(store().resolveDocumentID(device() + 1, static_cast<std::uint64_t>(id)).value);
  const auto file = store().resolveDocumentID(device(), static_cast<std::uint64_t>(id));
  ASSERT_TRUE(file.value);
  EXPECT_FALSE(store().openByID(device() + 1, *file.value).value);
}

TEST_P(DocumentsContract, AnOpenDocumentTellsWhereItHasGone) {
  const std::int64_t id = identifier(add("a"));
  const auto file = store().resolveDocumentID(device(), static_cast<std::uint64_t>(id));
  const auto first = store().openByID(device(), file.value.value());
  const auto second = store().openByID(device(), file.value.value());
  ASSERT_TRUE(first.value && second.value);
  EXPECT_NE(*first.value, *second.value);
  ASSERT_FALSE(platform->files().moveItemAtURL(inDrive("a"), inDrive("b")));
  EXPECT_EQ(store().attributesOfOpenFile(*first.value).value.value().path, inDrive("b").path());
  store().close(*first.value);
  EXPECT_EQ(store().attributesOfOpenFile(*first.value).error.number, EBADF);
  ASSERT_FALSE(platform->files().removeItemAtURL(inDrive("b")));
  EXPECT_EQ(store().attributesOfOpenFile(*second.value).error.number, ENOENT);
  store().close(*second.value);
}

TEST_P(DocumentsContract, ADeviceIsThatOfAFolder) {
  platform->addFolder(inDrive("folder").path());
  EXPECT_EQ(store().deviceOf(inDrive("folder", true)), device());
  EXPECT_FALSE(store().deviceOf(inDrive("gone", true)));
}

// Strings for other devices.

TEST_P(DocumentsContract, AStringLeadsBackToItsDocument) {
  for (const char* name : {"a.txt", "folder/with blank/ü.txt", "100%:?#&=", "line\nbreak"}) {
    const auto text = encoded(add(name));
    ASSERT_TRUE(text.value) << name;
    EXPECT_FALSE(platform->characters().containsControlCharacter(*text.value));
    const auto url = decoded(*text.value);
    EXPECT_EQ(url.value, inDrive(name));
    EXPECT_FALSE(url.error);
  }
}

TEST_P(DocumentsContract, AStringFollowsItsDocument) {
  const auto text = encoded(add("a"));
  ASSERT_TRUE(text.value);
  ASSERT_FALSE(platform->files().moveItemAtURL(inDrive("a"), inDrive("b")));
  EXPECT_EQ(decoded(*text.value).value, inDrive("b"));
}

TEST_P(DocumentsContract, AStringOfAnItemThatIsNotDownloadedNamesTheItem) {
  platform->addPromise(inDrive("far").path());
  const auto text = encoded(inDrive("far"));
  ASSERT_TRUE(text.value);
  EXPECT_EQ(decoded(*text.value).value, inDrive("far"));
}

TEST_P(DocumentsContract, WhatTakesAGoneDocumentsPlaceStandsIn) {
  const auto text = encoded(add("a"));
  ASSERT_TRUE(text.value);
  ASSERT_FALSE(platform->files().removeItemAtURL(inDrive("a")));
  const auto gone = decoded(*text.value);
  EXPECT_FALSE(gone.value);
  ASSERT_TRUE(gone.error);
  EXPECT_EQ(gone.error->code, FileErrorCode::NoSuchFile);
  add("a");
  EXPECT_EQ(decoded(*text.value).value, inDrive("a")) << "as on a device that has a copy with another identifier";
}

TEST_P(DocumentsContract, WhatIsNotInTheDriveHasNoString) {
  platform->addFile(outside("a").path());
  for (const URL& url : {outside("a"), URL(platform->mirror())}) {
    const auto text = encoded(url);
    EXPECT_FALSE(text.value);
    ASSERT_TRUE(text.error);
    EXPECT_EQ(text.error->domain, CloudDocumentsErrorDomain);
    EXPECT_EQ(text.error->code, 7);
  }
  const auto gone = encoded(inDrive("gone"));
  ASSERT_TRUE(gone.error);
  EXPECT_EQ(gone.error->domain, FileErrorDomain);
  EXPECT_EQ(gone.error->code, FileErrorCode::NoSuchFile);
}

TEST_P(DocumentsContract, TextThatNobodyMadeLeadsNowhere) {
  for (const char* text : {"", "anything", "vlo1:", "vlo1:x:y", "/etc/passwd", "memory:1"}) {
    const auto url = decoded(text);
    EXPECT_FALSE(url.value) << text;
    ASSERT_TRUE(url.error) << text;
    EXPECT_EQ(url.error->code, FileErrorCode::Formatting) << text;
  }
}

}  // namespace
}  // namespace vaelo::contract
