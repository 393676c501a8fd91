// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/host/drive_service_fixture.h"

namespace vaelo::drive_test {

class DriveStoreTest : public DriveServiceTest {
 protected:
  DriveStoreTest() {
    start();
    write(drive + "/doc.txt", "hello");
    id = static_cast<std::uint64_t>(*service->index().documentIDFor(drive + "/doc.txt", true).value);
    store = std::make_unique<LocalDocumentStore>(service->index());
    provider = std::make_unique<LocalFileProvider>(service->layout(), service->index(), queues);
    device = *store->deviceOf(URL(drive));
  }
  ~DriveStoreTest() override {
    provider.reset();
    store.reset();
  }
  std::string pathThrough(std::uint64_t wanted) {
    const auto file = store->resolveDocumentID(device, wanted);
    if (!file.value) return "resolve: " + std::to_string(file.error.number);
    const auto handle = store->openByID(device, *file.value);
    if (!handle.value) return "open: " + std::to_string(handle.error.number);
    const auto attributes = store->attributesOfOpenFile(*handle.value);
    store->close(*handle.value);
    if (!attributes.value) return "attributes: " + std::to_string(attributes.error.number);
    EXPECT_EQ(static_cast<std::uint64_t>(attributes.value->documentID), wanted);
    return attributes.value->path;
  }
  Result<std::string> encoded(const std::string& path) {
    Result<std::string> answer;
    provider->BookmarkableStringFromDocumentURL(URL(path), [&](Result<std::string> result) { answer = std::move(result); });
    return answer;
  }
  Result<URL> decoded(const std::string& text) {
    Result<URL> answer;
    provider->DocumentURLFromBookmarkableString(text, [&](Result<URL> result) { answer = std::move(result); });
    return answer;
  }

  std::unique_ptr<LocalDocumentStore> store;
  std::unique_ptr<LocalFileProvider> provider;
  std::uint64_t id = 0;
  DocumentStore::Device device = 0;
};

TEST_F(DriveStoreTest, ADocumentIsFoundByItsIdentifier) {
  EXPECT_EQ(pathThrough(id), drive + "/doc.txt");
  rename(drive + "/doc.txt", drive + "/sub/moved.txt");
  EXPECT_EQ(pathThrough(id), drive + "/sub/moved.txt");
  EXPECT_FALSE(store->deviceOf(URL(drive + "/none")));
}

TEST_F(DriveStoreTest, FailuresAreTheSystems) {
  EXPECT_EQ(pathThrough(0), "resolve: " + std::to_string(ENOENT));
  EXPECT_EQ(pathThrough(UINT64_MAX), "resolve: " + std::to_string(ENOENT));
  EXPECT_EQ(store->resolveDocumentID(device + 1, id).error.number, ESTALE);
  EXPECT_FALSE(store->resolveDocumentID(device + 1, id).error.text.empty());
  EXPECT_EQ(store->openByID(device, 1).error.number, ENOENT);
  EXPECT_EQ(store->attributesOfOpenFile(-1).error.number, EBADF);
}

TEST_F(DriveStoreTest, AFinalLinkIsNotFollowed) {
  link("/etc/passwd", drive + "/link");
  const auto linkID = static_cast<std::uint64_t>(*service->index().documentIDFor(drive + "/link", true).value);
  EXPECT_EQ(pathThrough(linkID), "open: " + std::to_string(ELOOP));
}

TEST_F(DriveStoreTest, APipeDoesNotBlock) {
  ASSERT_EQ(::mkfifo((drive + "/pipe").c_str(), 0600), 0);
  const auto pipeID = static_cast<std::uint64_t>(*service->index().documentIDFor(drive + "/pipe", true).value);
  EXPECT_EQ(pathThrough(pipeID), drive + "/pipe");
}

TEST_F(DriveStoreTest, AFileDeletedWhileOpenHasNoPath) {
  const auto file = store->resolveDocumentID(device, id);
  const auto handle = store->openByID(device, *file.value);
  ASSERT_TRUE(handle.value);
  std::filesystem::remove(drive + "/doc.txt");
  EXPECT_EQ(store->attributesOfOpenFile(*handle.value).error.number, ENOENT);
  store->close(*handle.value);
}

TEST_F(DriveStoreTest, APromisedDocumentIsFoundUnderItsLogicalPath) {
  PromiseInfo info;
  info.name = std::string(255, 'n');
  ASSERT_FALSE(writePromise(drive, info));
  const auto promised = static_cast<std::uint64_t>(*service->index().documentIDFor(drive + "/" + info.name, true).value);
  EXPECT_EQ(pathThrough(promised), drive + "/" + info.name);
  EXPECT_EQ(decoded(*encoded(drive + "/" + info.name).value).value, URL(drive + "/" + info.name));
}

TEST_F(DriveStoreTest, BookmarkableStringsFollowTheDocument) {
  write(drive + "/a b:\xff.txt");
  const Result<std::string> text = encoded(drive + "/a b:\xff.txt");
  ASSERT_TRUE(text);
  EXPECT_EQ(text.value->substr(0, 5), "vlo1:");
  EXPECT_NE(text.value->find(":com~marrow~Kestrel/a%20b%3A%FF.txt"), std::string::npos) << *text.value;
  EXPECT_EQ(decoded(*text.value).value, URL(drive + "/a b:\xff.txt"));
  rename(drive + "/a b:\xff.txt", drive + "/sub/c.txt");
  EXPECT_EQ(decoded(*text.value).value, URL(drive + "/sub/c.txt"));
  std::filesystem::remove(drive + "/sub/c.txt");
  EXPECT_EQ(decoded(*text.value).error->code, FileErrorCode::NoSuchFile);
}

TEST_F(DriveStoreTest, AnUnknownIdentifierFallsBackToThePath) {
  EXPECT_EQ(decoded("vlo1:4711:com~marrow~Kestrel/doc.txt").value, URL(drive + "/doc.txt"));
  EXPECT_EQ(decoded("vlo1:0:com~marrow~Kestrel/doc.txt").value, URL(drive + "/doc.txt"));
}

TEST_F(DriveStoreTest, OnlyTheDriveIsBookmarkable) {
  write(root + "/outside.txt");
  link(root + "/outside.txt", drive + "/way out");
  for (const std::string& path : {root + "/outside.txt", drive + "/way out", drive + "/../../../outside.txt", mirror}) {
    const Result<std::string> text = encoded(path);
    ASSERT_TRUE(text.error) << path;
    EXPECT_EQ(text.error->domain, CloudDocumentsErrorDomain);
    EXPECT_EQ(text.error->code, 7);
  }
  EXPECT_EQ(encoded(drive + "/none").error->code, FileErrorCode::NoSuchFile);
}

TEST_F(DriveStoreTest, HostileStringsAreRefused) {
  write(root + "/data/secret");
  link(root + "/data", drive + "/out");
  for (const std::string& text : {std::string(),
                                  std::string("vlo1"),
                                  std::string("vlo1:"),
                                  std::string("vlo1:1"),
                                  std::string("vlo1:1:"),
                                  std::string("vlo2:1:a"),
                                  std::string("vlo1:-1:a"),
                                  std::string("vlo1:x:a"),
                                  std::string("vlo1: 1:a"),
                                  std::string("vlo1:99999999999999999999:com~marrow~Kestrel/doc.txt"),
                                  std::string("vlo1:0:/etc/passwd"),
                                  std::string("vlo1:0:../secret"),
                                  std::string("vlo1:0:%2e%2e/secret"),
                                  std::string("vlo1:0:com~marrow~Kestrel/../../secret"),
                                  std::string("vlo1:0:a%00b"),
                                  std::string("vlo1:0:a%zz"),
                                  std::string("vlo1:0:a//b"),
                                  std::string("vlo1:0:."),
                                  std::string("vlo1:0:a\0b", 10),
                                  std::string("http://example.org")}) {
    const Result<URL> url = decoded(text);
    ASSERT_TRUE(url.error) << text;
    EXPECT_EQ(url.error->code, FileErrorCode::Formatting) << text;
  }
  EXPECT_EQ(decoded("vlo1:0:com~marrow~Kestrel/out/secret").error->code, FileErrorCode::NoSuchFile);
  // A document outside the mirror that carries a known identifier.
  write(root + "/elsewhere.txt");
  const auto outside = *service->index().documentIDFor(root + "/elsewhere.txt", true).value;
  EXPECT_EQ(decoded("vlo1:" + std::to_string(outside) + ":nothing").error->code, FileErrorCode::NoSuchFile);
}

}  // namespace vaelo::drive_test
