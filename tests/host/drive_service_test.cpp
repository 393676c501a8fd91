// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/host/drive_service_fixture.h"

namespace vaelo::drive_test {

TEST_F(DriveServiceTest, TheFirstStartMakesADriveWithAWelcome) {
  start();
  ASSERT_TRUE(service->ubiquityIdentityToken());
  EXPECT_GE(service->ubiquityIdentityToken()->opaque.size(), 32u);
  EXPECT_EQ(service->defaultContainerURL(), URL(drive));
  EXPECT_GT(read(drive + "/Welcome to Vaelo Drive.md").size(), 50u);
  EXPECT_EQ(containerNames(), std::vector<std::string>{"Vaelo Drive"});
  int visible = 0;
  for (const auto& entry : std::filesystem::directory_iterator(drive)) visible += entry.path().filename().string()[0] != '.';
  EXPECT_EQ(visible, 1);
}

TEST_F(DriveServiceTest, LaterStartsKeepAccountAndDrive) {
  start();
  const auto token = service->ubiquityIdentityToken();
  std::filesystem::remove(drive + "/Welcome to Vaelo Drive.md");
  start();
  EXPECT_EQ(service->ubiquityIdentityToken(), token);
  EXPECT_FALSE(exists(drive + "/Welcome to Vaelo Drive.md"));
}

TEST_F(DriveServiceTest, ADriveThatOutlivedItsAccountFileIsLeftAlone) {
  write(drive + "/mine.txt");
  start();
  EXPECT_TRUE(service->ubiquityIdentityToken());
  EXPECT_FALSE(exists(drive + "/Welcome to Vaelo Drive.md"));
  EXPECT_TRUE(exists(drive + "/mine.txt"));
}

TEST_F(DriveServiceTest, ADamagedAccountFileIsSetAsideAndTheDriveOpens) {
  write(drive + "/mine.txt");
  write(data + "/account.ini", "garbage");
  start();
  EXPECT_TRUE(service->ubiquityIdentityToken());
  EXPECT_TRUE(service->accountWasDamaged());
  EXPECT_EQ(read(data + "/account.ini.damaged-1"), "garbage");
  EXPECT_EQ(log.count("can't read the account"), 1);
  EXPECT_EQ(service->defaultContainerURL(), URL(drive));
  EXPECT_FALSE(exists(drive + "/Welcome to Vaelo Drive.md"));
  const auto token = service->ubiquityIdentityToken();
  start();
  EXPECT_FALSE(service->accountWasDamaged());
  EXPECT_EQ(service->ubiquityIdentityToken(), token);
  write(data + "/account.ini", "[Account]\nName=no token\nSignedIn=true\n");
  start();
  EXPECT_TRUE(exists(data + "/account.ini.damaged-2"));
}

TEST_F(DriveServiceTest, AnAccountFileThatIsDamagedMeanwhileChangesNothing) {
  start();
  const auto token = service->ubiquityIdentityToken();
  int posted = 0;
  const auto observation = notifications.addObserver(AccountDidChangeNotification, [&](const Notification&) { ++posted; });
  write(root + "/half", "[Account]\nNam");
  std::filesystem::rename(root + "/half", data + "/account.ini");
  ASSERT_TRUE(waitFor([&] { return log.count("can't read the account") >= 1; }));
  EXPECT_EQ(service->ubiquityIdentityToken(), token);
  EXPECT_EQ(posted, 0);
  EXPECT_EQ(read(data + "/account.ini"), "[Account]\nNam");
}

TEST_F(DriveServiceTest, ADataFolderThatCannotBeMadeIsLogged) {
  write(root + "/file");
  LocalCloudDocuments broken(root + "/file/data", log, queues, notifications);
  EXPECT_FALSE(broken.ubiquityIdentityToken());
  EXPECT_TRUE(broken.allContainers().empty());
  EXPECT_EQ(log.count("can't make the local account"), 1);
}

TEST_F(DriveServiceTest, AnotherProcessSigningOutIsNoticed) {
  start();
  int posted = 0;
  const auto observation = notifications.addObserver(IdentityDidChangeNotification, [&](const Notification&) { ++posted; });
  writeAccount("Token=abc\nSignedIn=true\n");
  ASSERT_TRUE(waitFor([&] { return posted == 1; }));
  EXPECT_EQ(service->ubiquityIdentityToken(), UbiquityIdentityToken{"abc"});
  writeAccount("Token=abc\nSignedIn=false\n");
  ASSERT_TRUE(waitFor([&] { return posted == 2; }));
  EXPECT_FALSE(service->ubiquityIdentityToken());
}

TEST_F(DriveServiceTest, AnAccountThatStaysTheSameIsNoNews) {
  start();
  writeAccount("Token=abc\nSignedIn=true\n");
  ASSERT_TRUE(waitFor([&] { return service->ubiquityIdentityToken() == UbiquityIdentityToken{"abc"}; }));
  queues.main().drain();
  int posted = 0;
  const auto observation = notifications.addObserver(IdentityDidChangeNotification, [&](const Notification&) { ++posted; });
  writeAccount("Token=abc\nSignedIn=true\nAllowance=5\n");
  writeAccount("Token=xyz\nSignedIn=true\n");
  ASSERT_TRUE(waitFor([&] { return service->ubiquityIdentityToken() == UbiquityIdentityToken{"xyz"}; }));
  queues.main().drain();
  EXPECT_EQ(posted, 1);
}

TEST_F(DriveServiceTest, AServiceThatIsGonePostsNothing) {
  start();
  int posted = 0;
  const auto observation = notifications.addObserver(IdentityDidChangeNotification, [&](const Notification&) { ++posted; });
  writeAccount("Token=abc\nSignedIn=true\n");
  while (service->ubiquityIdentityToken() != UbiquityIdentityToken{"abc"}) g_main_context_iteration(nullptr, TRUE);
  service.reset();
  queues.main().drain();
  EXPECT_EQ(posted, 0);
}

TEST_F(DriveServiceTest, ContainersSayWhatTheirManifestsSay) {
  start();
  addLibrary("org~example~Sketch",
             "[Container]\nName=Sketchbook\nDocumentTypes=public.image;com.adobe.pdf;\n"
             "FolderLevels=One\nOwners=org.example.Sketch;org.example.SketchLite;\n");
  const CloudContainerRef sketch = service->containerWithIdentifier("org~example~Sketch");
  ASSERT_TRUE(sketch);
  EXPECT_EQ(sketch->identifier(), "org~example~Sketch");
  EXPECT_EQ(sketch->localizedName(), "Sketchbook");
  EXPECT_EQ(sketch->documentsFolderURL(), URL(mirror + "/org~example~Sketch/Documents"));
  EXPECT_EQ(sketch->supportedFolderLevels(), FolderLevelsOne);
  EXPECT_EQ(sketch->ownerBundleIdentifiers(), (std::vector<std::string>{"org.example.Sketch", "org.example.SketchLite"}));
  ASSERT_TRUE(sketch->documentTypes());
  ASSERT_EQ(sketch->documentTypes()->size(), 1u);
  EXPECT_EQ(*sketch->documentTypes()->front().contentTypes.array(), (Array{Value("public.image"), Value("com.adobe.pdf")}));
  const CloudContainerRef own = service->containerWithIdentifier(service->defaultContainerIdentifier());
  EXPECT_FALSE(own->documentTypes() || own->supportedFolderLevels());
}

TEST_F(DriveServiceTest, NamesAreInTheUsersLanguage) {
  start();
  const char* before = g_getenv("LANGUAGE");
  const std::string kept = before ? before : "";
  g_setenv("LANGUAGE", "de", TRUE);
  g_setenv("LC_ALL", "de_DE.UTF-8", TRUE);
  addLibrary("org~example~Sketch", "[Container]\nName=Sketchbook\nName[de]=Skizzenbuch\n");
  EXPECT_EQ(service->containerWithIdentifier("org~example~Sketch")->localizedName(), "Skizzenbuch");
  g_unsetenv("LC_ALL");
  before ? g_setenv("LANGUAGE", kept.c_str(), TRUE) : (g_unsetenv("LANGUAGE"), TRUE);
}

TEST_F(DriveServiceTest, ContainersAreListedInOrderAndFollowTheDisk) {
  start();
  addLibrary("z", "[Container]\nName=Book 10\n");
  addLibrary("y", "[Container]\nName=Book 2\n");
  makeFolder(mirror + "/without~documents");
  makeFolder(mirror + "/.hidden/Documents");
  write(mirror + "/stray file");
  makeFolder(root + "/elsewhere/Documents");
  link(root + "/elsewhere", mirror + "/a~link");
  makeFolder(mirror + "/link~inside");
  link(root + "/elsewhere", mirror + "/link~inside/Documents");
  EXPECT_EQ(containerNames(), (std::vector<std::string>{"Vaelo Drive", "Book 2", "Book 10"}));
  EXPECT_FALSE(service->containerWithIdentifier("without~documents")->documentsFolderURL());
  EXPECT_FALSE(service->containerWithIdentifier("a~link"));
  for (const char* name : {"", ".", "..", ".hidden", "../mirror", "z/Documents", "stray file", "none"}) {
    EXPECT_FALSE(service->containerWithIdentifier(name)) << name;
  }
  write(mirror + "/z/.vaelo-container", "[Container]\nName=A first\n");
  std::filesystem::remove_all(mirror + "/y");
  EXPECT_EQ(containerNames(), (std::vector<std::string>{"Vaelo Drive", "A first"}));
}

TEST_F(DriveServiceTest, ABrokenManifestCostsTheNameAlone) {
  start();
  for (const std::string& text : {std::string("garbage"), std::string("[Other]\nName=x\n"), std::string(70000, '#'),
                                  std::string("[Container]\nName=\xff\xfe\nbroken")}) {
    addLibrary("org~example~Broken", text);
    const int before = log.count("is broken");
    const CloudContainerRef container = service->containerWithIdentifier("org~example~Broken");
    ASSERT_TRUE(container);
    EXPECT_EQ(container->localizedName(), "org~example~Broken");
    EXPECT_TRUE(container->documentsFolderURL());
    EXPECT_EQ(log.count("is broken"), before + 1);
  }
  EXPECT_EQ(service->allContainers().size(), 2u);
}

TEST_F(DriveServiceTest, ItemsBelongToTheContainerThatHoldsThem) {
  start();
  addLibrary("lib", "[Container]\nName=Lib\n");
  EXPECT_EQ(service->containerIdentifierForURL(URL(drive + "/a/b")), "com~marrow~Kestrel");
  EXPECT_EQ(service->containerIdentifierForURL(URL(drive + "/../lib/Documents")), "lib");
  for (const std::string& path : {mirror, root, mirror + "/.Trash/a", mirror + "/none/a", drive + "/../../.."}) {
    const Result<CloudContainerRef> none = service->containerForURL(URL(path));
    EXPECT_FALSE(none);
    EXPECT_EQ(none.error->code, CloudDocumentsErrorCode::NotInDrive) << path;
  }
  EXPECT_TRUE(service->isDocumentsContainer(URL(drive)));
  EXPECT_TRUE(service->isDocumentsContainer(URL(mirror + "/lib/Documents")));
  EXPECT_FALSE(service->isDocumentsContainer(URL(mirror + "/lib")));
  EXPECT_FALSE(service->isDocumentsContainer(URL(drive + "/Documents")));
  EXPECT_EQ(service->pathRelativeToMirror(URL(drive + "/Desktop")), "com~marrow~Kestrel/Desktop");
}

TEST_F(DriveServiceTest, EmptyingALibraryKeepsItsShellAndWhatLinksLeadTo) {
  start();
  addLibrary("lib", "[Container]\nName=Lib\n");
  write(mirror + "/lib/Documents/a/b/c.txt");
  write(mirror + "/lib/Documents/.x.vlopromise");
  write(mirror + "/lib/private/data");
  write(root + "/outside/keep.txt");
  link(root + "/outside", mirror + "/lib/Documents/link");
  const auto error = service->containerWithIdentifier("lib")->deleteAllContents();
  EXPECT_FALSE(error) << error->description();
  EXPECT_TRUE(std::filesystem::is_empty(mirror + "/lib/Documents"));
  EXPECT_FALSE(exists(mirror + "/lib/private"));
  EXPECT_TRUE(exists(root + "/outside/keep.txt"));
  EXPECT_EQ(service->containerWithIdentifier("lib")->localizedName(), "Lib");
  EXPECT_FALSE(service->containerWithIdentifier("com~marrow~Kestrel")->deleteAllContents());
  EXPECT_EQ(service->allContainers().size(), 2u);
}

TEST_F(DriveServiceTest, BookmarksLeadOutOfTheDrive) {
  start();
  write(root + "/out side/doc.txt");
  const URL bookmark(drive + "/doc.txt.vaelobookmark");
  ASSERT_FALSE(writeBookmarkFile(bookmark.path(), URL(root + "/out side/doc.txt")));
  EXPECT_TRUE(service->isExternalDocumentReference(bookmark));
  EXPECT_EQ(service->resolveExternalDocumentReference(bookmark).value, URL(root + "/out side/doc.txt"));
  std::filesystem::remove(root + "/out side/doc.txt");
  EXPECT_EQ(service->resolveExternalDocumentReference(bookmark).error->code, FileErrorCode::NoSuchFile);
  EXPECT_FALSE(service->isExternalDocumentReference(URL(drive + "/none.vaelobookmark")));
  makeFolder(drive + "/folder.vaelobookmark");
  EXPECT_FALSE(service->isExternalDocumentReference(URL(drive + "/folder.vaelobookmark")));
  link(bookmark.path(), drive + "/link.vaelobookmark");
  EXPECT_FALSE(service->isExternalDocumentReference(URL(drive + "/link.vaelobookmark")));
  EXPECT_FALSE(service->resolveExternalDocumentReference(URL(drive + "/Welcome to Vaelo Drive.md")));
}

TEST_F(DriveServiceTest, BookmarksAndAliasesThatNameNoFileAreRefused) {
  const std::string bookmark = drive + "/b.vaelobookmark", alias = drive + "/a.desktop";
  for (const std::string& url :
       {std::string("http://example.org/a"), std::string("file://host/etc/passwd"), std::string("file:relative"),
        std::string("/etc/passwd"), std::string("../up"), std::string("file:///a%00b"), std::string("file:///a%zz"),
        std::string("file:///a%4"), std::string(""), std::string("file://")}) {
    write(bookmark, "[Bookmark]\nURL=" + url + "\n");
    EXPECT_EQ(readBookmarkFile(bookmark).error.value_or(Error()).code, FileErrorCode::ReadUnknown) << url;
    write(alias, "[Desktop Entry]\nType=Link\nURL=" + url + "\n");
    EXPECT_EQ(readAliasFile(alias).error.value_or(Error()).code, FileErrorCode::ReadUnknown) << url;
  }
  for (const std::string& text :
       {std::string("garbage"), std::string("[Other]\nURL=file:///etc\n"), std::string(70000, '\n')}) {
    write(bookmark, text);
    write(alias, text);
    EXPECT_FALSE(readBookmarkFile(bookmark));
    EXPECT_FALSE(readAliasFile(alias));
  }
  EXPECT_EQ(readBookmarkFile(drive + "/none.vaelobookmark").error->code, FileErrorCode::ReadNoSuchFile);
}

TEST_F(DriveServiceTest, AnAliasIsALinkEntryAlone) {
  const std::string alias = drive + "/a.desktop";
  write(alias, "[Desktop Entry]\nType=Link\nName=x\nURL=file:///tmp/a%20b\n");
  EXPECT_TRUE(isAliasName("a.desktop"));
  EXPECT_FALSE(isAliasName(".desktop"));
  EXPECT_EQ(readAliasFile(alias).value, URL("/tmp/a b"));
  write(alias, "[Desktop Entry]\nType=Application\nExec=true\nURL=file:///tmp/a\n");
  EXPECT_FALSE(readAliasFile(alias));
}

TEST_F(DriveServiceTest, PromisesGoBothWays) {
  start();
  PromiseInfo info;
  info.name = "away.pdf";
  info.tags = {"Red"};
  ASSERT_FALSE(writePromise(drive, info));
  const URL logical(drive + "/away.pdf"), physical(drive + "/.away.pdf.vlopromise"),
      plain(drive + "/Welcome to Vaelo Drive.md");
  EXPECT_TRUE(service->isPromise(physical));
  EXPECT_FALSE(service->isPromise(logical));
  EXPECT_EQ(service->logicalURLOfPromise(physical), logical);
  EXPECT_TRUE(service->logicalURLOfPromise(plain).sameObject(plain));
  EXPECT_EQ(service->physicalURL(logical), physical);
  EXPECT_TRUE(service->physicalURL(plain).sameObject(plain));
  EXPECT_TRUE(service->physicalURL(physical).sameObject(physical));
  EXPECT_EQ(service->tagNames(logical).value, std::vector<std::string>{"Red"});
  EXPECT_EQ(service->tagNames(plain).value, std::vector<std::string>{});
  EXPECT_EQ(service->tagNames(URL(drive + "/none")).error->code, FileErrorCode::NoSuchFile);
}

TEST_F(DriveServiceTest, TheOnlyCopyIsNotGivenUp) {
  start();
  const auto error = service->evict(URL(drive + "/Welcome to Vaelo Drive.md"));
  ASSERT_TRUE(error);
  EXPECT_EQ(error->code, FileErrorCode::FeatureUnsupported);
  EXPECT_TRUE(exists(drive + "/Welcome to Vaelo Drive.md"));
}

TEST_F(DriveServiceTest, ItemsMoveBetweenAnyTwoContainers) {
  start();
  addLibrary("lib", "[Container]\nFolderLevels=None\n");
  const CloudContainerRef own = service->containerWithIdentifier("com~marrow~Kestrel");
  const CloudContainerRef lib = service->containerWithIdentifier("lib");
  EXPECT_TRUE(service->canMoveWithoutDownloading(*own, *lib));
  EXPECT_TRUE(service->canMoveWithoutDownloading(*lib, *own));
  EXPECT_FALSE(service->canMoveWithoutDownloading(*own, *own));
}

TEST_F(DriveServiceTest, TheQuotaIsTheSmallerOfAllowanceAndDisk) {
  const auto free = [this] {
    Result<std::int64_t> answer;
    int answers = 0;
    service->fetchQuota([&](Result<std::int64_t> result) {
      answer = std::move(result);
      ++answers;
    });
    EXPECT_EQ(answers, 1);
    return answer;
  };
  start();
  struct statvfs disk = {};
  ASSERT_EQ(::statvfs(mirror.c_str(), &disk), 0);
  EXPECT_NEAR(static_cast<double>(*free().value), static_cast<double>(disk.f_bavail * disk.f_frsize), 5e9);
  std::filesystem::remove_all(drive);
  write(drive + "/a", std::string(1000, 'x'));
  PromiseInfo info;
  info.name = "away";
  info.size = 3000;
  ASSERT_FALSE(writePromise(drive, info));
  writeAccount("Token=t\nSignedIn=true\nAllowance=10000\n");
  start();
  EXPECT_EQ(free().value, 6000);
  writeAccount("Token=t\nSignedIn=true\nAllowance=100\n");
  start();
  EXPECT_EQ(free().value, 0);
  info.name = "vast";
  for (const std::uint64_t size : {std::uint64_t{1} << 63, ~std::uint64_t{0}}) {
    info.size = size;
    ASSERT_FALSE(writePromise(drive, info));
    writeAccount("Token=t\nSignedIn=true\nAllowance=10000\n");
    start();
    EXPECT_EQ(free().value, 0) << size;
  }
  std::filesystem::remove(promisePathFor(drive + "/vast"));
  writeAccount("Token=t\nSignedIn=true\nAllowance=9223372036854775807\n");
  start();
  EXPECT_LT(*free().value, 9223372036854775807 / 2);
  writeAccount("Token=t\nSignedIn=false\n");
  start();
  EXPECT_TRUE(free().error);
}

TEST_F(DriveServiceTest, ADiskThatDoesNotTellItsSizeHasNoQuota) {
  makeFolder(data);
  writeAccount("Token=t\nSignedIn=true\nAllowance=100\n");
  link("/proc", mirror);
  start();
  Result<std::int64_t> answer;
  int measured = 0;
  service->observeStorage([&](const StorageFigures&) { ++measured; });
  service->fetchQuota([&](Result<std::int64_t> result) { answer = std::move(result); });
  ASSERT_TRUE(answer.error);
  EXPECT_EQ(answer.error->localizedFailureReason, "the disk doesn't tell how large it is");
  EXPECT_EQ(measured, 0);
}

TEST_F(DriveServiceTest, WhatAFetchMeasuresIsToldBesides) {
  makeFolder(data);
  writeAccount("Token=t\nSignedIn=true\nAllowance=1000\n");
  write(drive + "/a", std::string(400, 'x'));
  start();
  std::optional<StorageFigures> measured;
  service->observeStorage([&](const StorageFigures& figures) { measured = figures; });
  service->fetchQuota([](const Result<std::int64_t>&) {});
  EXPECT_EQ(measured, (StorageFigures{600, 1000}));
  for (const char* less : {"400", "399", "0"}) {
    writeAccount(std::string("Token=t\nSignedIn=true\nAllowance=") + less + "\n");
    start();
    service->observeStorage([&](const StorageFigures& figures) { measured = figures; });
    service->fetchQuota([](const Result<std::int64_t>&) {});
    EXPECT_EQ(measured, (StorageFigures{0, std::stoll(less)}));
  }
}

TEST_F(DriveServiceTest, AnAllowanceBeyondTheDiskIsWhatTheDiskHasRoomFor) {
  makeFolder(data);
  writeAccount("Token=t\nSignedIn=true\nAllowance=9223372036854775807\n");
  write(drive + "/a", std::string(400, 'x'));
  start();
  std::optional<StorageFigures> measured;
  service->observeStorage([&](const StorageFigures& figures) { measured = figures; });
  service->fetchQuota([](const Result<std::int64_t>&) {});
  ASSERT_TRUE(measured);
  EXPECT_GT(measured->free, 0);
  EXPECT_EQ(measured->total, measured->free + 400);
}

TEST_F(DriveServiceTest, ARebuiltIndexIsAnnounced) {
  write(data + "/index.sqlite", std::string(5000, 'x'));
  int posted = 0;
  const auto observation =
      notifications.addObserver(DocumentIndexRebuiltNotification, [&](const Notification&) { ++posted; });
  start();
  EXPECT_EQ(posted, 0);
  queues.main().drain();
  EXPECT_EQ(posted, 1);
  EXPECT_TRUE(service->index().wasRebuilt());
}

}  // namespace vaelo::drive_test
