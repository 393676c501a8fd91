// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/contract/contract_test.h"

namespace vaelo::contract {
namespace {

using Names = std::vector<std::string>;

constexpr int NotInDrive = 7;

/// Containers, the account, tags, quota.
class CloudContainersContract : public ContractTest {
 protected:
  CloudDocuments& cloud() { return platform->cloud(); }
  URL inLibrary(const std::string& id, const std::string& path) const {
    return URL(platform->mirror() + "/" + id + "/Documents" + (path.empty() ? "" : "/" + path), path.empty());
  }
  Names identifiers() {
    Names found;
    for (const CloudContainerRef& container : cloud().allContainers()) found.push_back(container->identifier());
    return found;
  }
  std::optional<Result<std::int64_t>> quota() {
    return answerOf<Result<std::int64_t>>([&](auto done) { cloud().fetchQuota(std::move(done)); });
  }
};

VAELO_CONTRACT_SUITE(CloudContainersContract);

TEST_P(CloudContainersContract, AnEmptyDriveHasItsOwnContainer) {
  EXPECT_EQ(cloud().defaultContainerIdentifier(), "com~marrow~Kestrel");
  EXPECT_EQ(identifiers(), Names{"com~marrow~Kestrel"});
  const CloudContainerRef drive = cloud().containerWithIdentifier("com~marrow~Kestrel");
  ASSERT_TRUE(drive);
  EXPECT_EQ(drive->localizedName(), "Vaelo Drive");
  EXPECT_EQ(drive->documentsFolderURL(), URL(platform->drive()));
  EXPECT_FALSE(drive->documentTypes());
  EXPECT_FALSE(drive->supportedFolderLevels());
  EXPECT_TRUE(drive->ownerBundleIdentifiers().empty());
  EXPECT_EQ(cloud().defaultContainerURL(), URL(platform->drive()));
}

TEST_P(CloudContainersContract, ALibraryIsWhatItsManifestSays) {
  platform->addLibrary(
      "org~example~Sketch",
      {"Sketchbook", Names{"public.image", "com.adobe.pdf"}, FolderLevelsOne, {"org.example.A", "org.example.B"}});
  const CloudContainerRef library = cloud().containerWithIdentifier("org~example~Sketch");
  ASSERT_TRUE(library);
  EXPECT_EQ(library->identifier(), "org~example~Sketch");
  EXPECT_EQ(library->localizedName(), "Sketchbook");
  EXPECT_EQ(library->documentsFolderURL(), inLibrary("org~example~Sketch", ""));
  EXPECT_EQ(library->supportedFolderLevels(), FolderLevelsOne);
  EXPECT_EQ(library->ownerBundleIdentifiers(), (Names{"org.example.A", "org.example.B"}));
  ASSERT_TRUE(library->documentTypes());
  ASSERT_EQ(library->documentTypes()->size(), 1u);
  EXPECT_EQ(library->documentTypes()->front().contentTypes, Value(Array{"public.image", "com.adobe.pdf"}));
}

TEST_P(CloudContainersContract, WhatAManifestLeavesOutIsAbsent) {
  platform->addLibrary("org~example~Plain", {"Plain", {}, {}, {}});
  const CloudContainerRef library = cloud().containerWithIdentifier("org~example~Plain");
  ASSERT_TRUE(library);
  EXPECT_FALSE(library->documentTypes());
  EXPECT_FALSE(library->supportedFolderLevels());
  EXPECT_TRUE(library->ownerBundleIdentifiers().empty());
}

TEST_P(CloudContainersContract, TheDriveComesFirstAndTheOthersByName) {
  platform->addLibrary("org~example~One", {"Zebra", {}, {}, {}});
  platform->addLibrary("org~example~Two", {"Apples", {}, {}, {}});
  platform->addLibrary("org~example~Three", {"Middle", {}, {}, {}});
  EXPECT_EQ(identifiers(), (Names{"com~marrow~Kestrel", "org~example~Two", "org~example~Three", "org~example~One"}));
}

TEST_P(CloudContainersContract, ALibraryWithoutDocumentsFolderIsKnownButNotListed) {
  platform->addLibrary("org~example~Sketch", {"Sketchbook", {}, {}, {}});
  ASSERT_FALSE(platform->files().removeItemAtURL(inLibrary("org~example~Sketch", "")));
  EXPECT_EQ(identifiers(), Names{"com~marrow~Kestrel"});
  const CloudContainerRef library = cloud().containerWithIdentifier("org~example~Sketch");
  ASSERT_TRUE(library);
  EXPECT_FALSE(library->documentsFolderURL());
  EXPECT_FALSE(cloud().isDocumentsContainer(inLibrary("org~example~Sketch", "")));
}

TEST_P(CloudContainersContract, UnknownIdentifiersAreOfNoContainer) {
  for (const char* identifier : {"org~example~None", "", ".Trash", "..", "com~marrow~Kestrel/x"}) {
    EXPECT_FALSE(cloud().containerWithIdentifier(identifier)) << identifier;
  }
}

TEST_P(CloudContainersContract, AnItemIsInTheContainerThatItsPathNames) {
  platform->addLibrary("org~example~Sketch", {"Sketchbook", {}, {}, {}});
  const auto container = [&](const URL& url) { return cloud().containerIdentifierForURL(url); };
  EXPECT_EQ(container(inDrive("a/b")), "com~marrow~Kestrel");
  EXPECT_EQ(container(inDrive("")), "com~marrow~Kestrel");
  EXPECT_EQ(container(inLibrary("org~example~Sketch", "a")), "org~example~Sketch");
  EXPECT_EQ(container(URL(platform->mirror() + "/org~example~Sketch")), "org~example~Sketch");
  const auto found = cloud().containerForURL(inLibrary("org~example~Sketch", "a"));
  ASSERT_TRUE(found.value);
  EXPECT_EQ((*found.value)->localizedName(), "Sketchbook");
  EXPECT_FALSE(found.error);
}

TEST_P(CloudContainersContract, WhatIsInNoContainerIsAnError) {
  platform->addFile(platform->mirror() + "/.Trash/a");
  for (const URL& url : {outside("a"), URL(platform->mirror()), URL(platform->mirror() + "/.Trash/a"),
                         URL(platform->mirror() + "/org~example~None/Documents/a")}) {
    const auto found = cloud().containerForURL(url);
    EXPECT_FALSE(found.value) << url.path();
    ASSERT_TRUE(found.error) << url.path();
    EXPECT_EQ(found.error->domain, CloudDocumentsErrorDomain);
    EXPECT_EQ(found.error->code, NotInDrive);
    EXPECT_FALSE(cloud().containerIdentifierForURL(url)) << url.path();
  }
}

TEST_P(CloudContainersContract, OnlyDocumentsFoldersThemselvesAreDocumentsContainers) {
  platform->addLibrary("org~example~Sketch", {"Sketchbook", {}, {}, {}});
  platform->addFolder(inDrive("Documents").path());
  platform->addFolder(inLibrary("org~example~Sketch", "Documents").path());
  EXPECT_TRUE(cloud().isDocumentsContainer(inDrive("", true)));
  EXPECT_TRUE(cloud().isDocumentsContainer(inLibrary("org~example~Sketch", "")));
  EXPECT_TRUE(cloud().isDocumentsContainer(URL(platform->drive() + "/Documents/..")));
  for (const URL& url : {inDrive("Documents"), URL(platform->mirror()), URL(platform->mirror() + "/org~example~Sketch"),
                         inLibrary("org~example~Sketch", "Documents"), outside("Documents"), inDrive("a")}) {
    EXPECT_FALSE(cloud().isDocumentsContainer(url)) << url.path();
  }
}

TEST_P(CloudContainersContract, EmptyingALibraryLeavesTheLibrary) {
  platform->addLibrary("org~example~Sketch", {"Sketchbook", {}, {}, {}});
  platform->addFile(inLibrary("org~example~Sketch", "in/a").path());
  platform->addPromise(inLibrary("org~example~Sketch", "far").path());
  platform->addFile(platform->mirror() + "/org~example~Sketch/Data/b");
  platform->addFile(inDrive("kept").path());
  EXPECT_FALSE(cloud().containerWithIdentifier("org~example~Sketch")->deleteAllContents());
  EXPECT_FALSE(isThere(inLibrary("org~example~Sketch", "in")));
  EXPECT_FALSE(isThere(inLibrary("org~example~Sketch", "far")));
  EXPECT_FALSE(isThere(URL(platform->mirror() + "/org~example~Sketch/Data")));
  EXPECT_TRUE(isThere(inDrive("kept")));
  EXPECT_EQ(identifiers(), (Names{"com~marrow~Kestrel", "org~example~Sketch"}));
  EXPECT_EQ(cloud().containerWithIdentifier("org~example~Sketch")->localizedName(), "Sketchbook");
}

TEST_P(CloudContainersContract, ItemsMoveBetweenContainersWithoutADownload) {
  platform->addLibrary("org~example~Sketch", {"Sketchbook", {}, {}, {}});
  const auto drive = cloud().containerWithIdentifier("com~marrow~Kestrel");
  const auto library = cloud().containerWithIdentifier("org~example~Sketch");
  EXPECT_TRUE(cloud().canMoveWithoutDownloading(*drive, *library));
  EXPECT_TRUE(cloud().canMoveWithoutDownloading(*library, *drive));
  EXPECT_FALSE(cloud().canMoveWithoutDownloading(*drive, *drive)) << "that is no move between containers";
}

TEST_P(CloudContainersContract, WhatHasNoOtherCopyIsNotGivenUp) {
  platform->addFile(inDrive("a").path());
  const auto error = cloud().evict(inDrive("a"));
  ASSERT_TRUE(error);
  EXPECT_EQ(error->domain, FileErrorDomain);
  EXPECT_EQ(error->code, FileErrorCode::FeatureUnsupported);
  EXPECT_TRUE(platform->files().fileExistsAtPath(inDrive("a").path()));
}

// The account.

TEST_P(CloudContainersContract, SigningOutClosesTheDriveAndTellsOfIt) {
  int told = 0;
  const auto token =
      platform->notifications().addObserver(IdentityDidChangeNotification, [&](const Notification&) { ++told; });
  ASSERT_TRUE(cloud().ubiquityIdentityToken());
  platform->setAccount(std::nullopt);
  EXPECT_TRUE(platform->until([&] { return told == 1; }));
  EXPECT_FALSE(cloud().ubiquityIdentityToken());
  EXPECT_FALSE(cloud().defaultContainerURL());
  EXPECT_TRUE(cloud().allContainers().empty());
  EXPECT_TRUE(cloud().containerWithIdentifier("com~marrow~Kestrel")) << "what is on the device stays known";
  EXPECT_EQ(cloud().containerIdentifierForURL(inDrive("a")), "com~marrow~Kestrel");
}

TEST_P(CloudContainersContract, AnotherAccountIsAnotherToken) {
  int told = 0;
  const auto token =
      platform->notifications().addObserver(IdentityDidChangeNotification, [&](const Notification&) { ++told; });
  const auto first = cloud().ubiquityIdentityToken();
  EXPECT_EQ(cloud().ubiquityIdentityToken(), first) << "asked again";
  platform->setAccount("somebody else");
  EXPECT_TRUE(platform->until([&] { return told == 1; }));
  EXPECT_NE(cloud().ubiquityIdentityToken(), first);
  platform->setAccount("somebody");
  EXPECT_TRUE(platform->until([&] { return told == 2; }));
  EXPECT_EQ(cloud().ubiquityIdentityToken(), first);
  EXPECT_EQ(cloud().defaultContainerURL(), URL(platform->drive()));
}

TEST_P(CloudContainersContract, FreeBytesAreToldToWhoIsSignedIn) {
  const auto free = quota();
  ASSERT_TRUE(free && free->value);
  EXPECT_GE(*free->value, 0);
  platform->setAccount(std::nullopt);
  ASSERT_TRUE(platform->until([&] { return !cloud().ubiquityIdentityToken(); }));
  const auto none = quota();
  ASSERT_TRUE(none && none->error);
  EXPECT_FALSE(none->value);
  EXPECT_EQ(none->error->domain, CloudDocumentsErrorDomain);
}

// Tags.

TEST_P(CloudContainersContract, TagsKeepTheirOrder) {
  platform->addFile(inDrive("a").path());
  EXPECT_EQ(cloud().tagNames(inDrive("a")).value, Names{});
  platform->setTags(inDrive("a").path(), {"Red", "Blue sky", "Ärger"});
  EXPECT_EQ(cloud().tagNames(inDrive("a")).value, (Names{"Red", "Blue sky", "Ärger"}));
}

TEST_P(CloudContainersContract, TagsOfAnItemThatIsNotDownloaded) {
  PromiseFacts facts;
  facts.tags = {"Red", "Green"};
  platform->addPromise(inDrive("far").path(), facts);
  EXPECT_EQ(cloud().tagNames(inDrive("far")).value, (Names{"Red", "Green"}));
  EXPECT_EQ(cloud().tagNames(cloud().physicalURL(inDrive("far"))).value, (Names{"Red", "Green"}));
}

TEST_P(CloudContainersContract, TagsStayWithAnItemThatMoves) {
  platform->addFile(inDrive("a").path());
  platform->setTags(inDrive("a").path(), {"Red"});
  ASSERT_FALSE(platform->files().moveItemAtURL(inDrive("a"), inDrive("b")));
  EXPECT_EQ(cloud().tagNames(inDrive("b")).value, Names{"Red"});
}

TEST_P(CloudContainersContract, WhatIsNotThereHasNoTags) {
  const auto tags = cloud().tagNames(inDrive("gone"));
  EXPECT_FALSE(tags.value);
  ASSERT_TRUE(tags.error);
  EXPECT_EQ(tags.error->code, FileErrorCode::NoSuchFile);
}

}  // namespace
}  // namespace vaelo::contract
