// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "platform/cloud_documents.h"
#include "platform/file_coordinator.h"
#include "platform/file_manager.h"
#include "platform/resource_values.h"

namespace vaelo {

/// A container as a test describes it.
struct MemoryContainer : CloudContainer {
  std::string id;
  std::string name;
  std::optional<URL> folder;
  std::optional<std::vector<DeclaredDocumentType>> types;
  std::optional<std::string> levels;
  std::vector<std::string> owners;

  std::string identifier() const override { return id; }
  std::string localizedName() const override { return name; }
  std::optional<URL> documentsFolderURL() const override { return folder; }
  std::optional<std::vector<DeclaredDocumentType>> documentTypes() const override { return types; }
  std::optional<std::string> supportedFolderLevels() const override { return levels; }
  std::vector<std::string> ownerBundleIdentifiers() const override { return owners; }
  std::optional<Error> deleteAllContents() override { return std::nullopt; }
};

/// A drive in memory: items by path with their metadata, and what a test wants to go wrong. The mirror is /drive/mirror.
class MemoryDrive : public CloudDocuments, public ResourceValues, public FileManager, public FileCoordination {
 public:
  struct Item {
    ResourceMap values;
    FileAttributes attributes;
    std::string linkTarget;
    std::optional<URL> aliasTarget;
    std::optional<URL> bookmarkTarget;
    std::vector<std::string> tags;
    bool promised = false;  ///< logical only: nothing on the disk
  };

  MemoryDrive();

  /// Adds an item with its name, dates and kind as resource values; folders above are added too.
  Item& add(const std::string& path, FileType type = FileType::Regular);
  std::shared_ptr<MemoryContainer> addContainer(const std::string& id, const std::string& name);

  std::map<std::string, Item> items;
  std::vector<std::shared_ptr<MemoryContainer>> containers;
  std::set<std::pair<std::string, std::string>> movable;  ///< container identifiers, from and to
  std::string defaultID = "com~marrow~Kestrel";
  std::optional<Error> containerLookupError;
  std::optional<Error> promisedReadError;
  std::optional<Error> plainReadError;
  std::optional<Error> coordinationError;
  std::optional<Error> changeError;      ///< what create, remove and move answer
  std::function<void()> beforeAccessor;  ///< runs between a coordination's request and its accessor
  std::set<std::string> promises;        ///< physical URLs of promises
  std::vector<std::string> calls;        ///< what was asked, in order
  bool secured = false;                  ///< items are behind a security scope
  int openScopes = 0;

  // CloudDocuments
  std::optional<UbiquityIdentityToken> ubiquityIdentityToken() override { return UbiquityIdentityToken{"me"}; }
  std::string defaultContainerIdentifier() override { return defaultID; }
  std::vector<CloudContainerRef> allContainers() override { return {containers.begin(), containers.end()}; }
  CloudContainerRef containerWithIdentifier(const std::string& identifier) override;
  Result<CloudContainerRef> containerForURL(const URL& url) override;
  std::optional<std::string> containerIdentifierForURL(const URL& url) override;
  bool isDocumentsContainer(const URL& url) override;
  std::optional<URL> defaultContainerURL() override { return URL("/drive/mirror/" + defaultID, true); }
  std::optional<std::string> pathRelativeToMirror(const URL& url) override;
  bool URLIsInDriveMirror(const URL& url) override { return url.isInside(URL("/drive/mirror")); }
  bool URLIsInDriveTrash(const URL& url) override { return url.isInside(URL("/drive/mirror/.Trash")); }
  URL realPathURL(const URL& url) override { return url; }
  bool isExternalDocumentReference(const URL& url) override;
  Result<URL> resolveExternalDocumentReference(const URL& url) override;
  bool isPromise(const URL& url) override { return promises.contains(url.path()); }
  URL logicalURLOfPromise(const URL& url) override { return URL(url.path() + ".logical"); }
  URL physicalURL(const URL& url) override;
  Result<std::vector<std::string>> tagNames(const URL& url) override;
  bool canMoveWithoutDownloading(const CloudContainer& from, const CloudContainer& to) override;
  std::optional<Error> evict(const URL&) override { return changeError; }
  void fetchQuota(std::function<void(Result<std::int64_t>)> done) override { done(std::int64_t{1}); }

  // ResourceValues
  Result<ResourceMap> promisedItemResourceValues(const URL& url, const std::vector<ResourceKey>& keys) override;
  Result<ResourceMap> resourceValues(const URL& url, const std::vector<ResourceKey>& keys) override;
  bool promisedItemIsReachable(const URL& url) override { return items.contains(url.path()); }
  URL resolvingSymlinks(const URL& url) override;
  Result<URL> resolveAliasFile(const URL& url) override;
  bool startAccessingSecurityScopedResource(const URL&) override;
  void stopAccessingSecurityScopedResource(const URL&) override { --openScopes; }

  // FileManager
  bool fileExistsAtPath(const std::string& path, bool* isDirectory = nullptr) override;
  Result<FileAttributes> attributesOfItemAtPath(const std::string& path) override;
  Result<std::string> destinationOfSymbolicLinkAtPath(const std::string& path) override;
  std::optional<Error> createDirectoryAtURL(const URL& url) override;
  std::optional<Error> removeItemAtURL(const URL& url) override;
  std::optional<Error> moveItemAtURL(const URL& source, const URL& destination) override;
  void enumerate(const URL& url, const std::vector<ResourceKey>& prefetch, unsigned options,
                 const std::function<bool(const URL&)>& visit,
                 const std::function<bool(const URL&, const Error&)>& onError) override;
  std::vector<std::string> userDocumentsDirectories() override { return documentsDirectories; }
  std::string expandingTilde(const std::string& path) override { return "/home/me" + path.substr(1); }
  std::vector<std::string> documentsDirectories{"~/Documents"};

  // FileCoordination
  std::unique_ptr<FileCoordinator> makeCoordinator(FilePresenter* presenter = nullptr) override;
  void addFilePresenter(FilePresenter& presenter) override { presenters.insert(&presenter); }
  void removeFilePresenter(FilePresenter& presenter) override { presenters.erase(&presenter); }
  std::set<FilePresenter*> presenters;

 private:
  Item* itemAt(const std::string& path);
  static ResourceMap picked(const ResourceMap& values, const std::vector<ResourceKey>& keys);
};

}  // namespace vaelo
