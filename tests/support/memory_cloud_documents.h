// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <set>

#include "platform/cloud_documents.h"
#include "platform/notifications.h"
#include "tests/support/call_record.h"
#include "tests/support/memory_container.h"
#include "tests/support/memory_disk.h"
#include "tests/support/memory_drive_places.h"
#include "tests/support/memory_error.h"

namespace vaelo {

/// The drive on a disk in memory, with somebody signed in. The mirror is /drive/mirror.
class MemoryCloudDocuments : public CloudDocuments {
 public:
  MemoryCloudDocuments(MemoryDisk& disk, Queues& queues, NotificationCenter& notifications, CallRecord& record);

  /// Adds a library with its documents folder.
  std::shared_ptr<MemoryContainer> addContainer(const std::string& identifier, const std::string& name);
  /// Signs somebody in or everybody out, and tells of it on the main queue when that is a change.
  void setAccount(std::optional<UbiquityIdentityToken> token);

  std::optional<UbiquityIdentityToken> account = UbiquityIdentityToken{"somebody"};
  std::shared_ptr<MemoryContainer> drive;
  std::vector<CloudContainerRef> containers;  ///< the drive's own first
  /// False: items move without a download only to containers in `movableTo` and between those in `movable`, by identifier.
  bool movesAreFree = true;
  std::set<std::string> movableTo;
  std::set<std::pair<std::string, std::string>> movable;
  Result<std::int64_t> quota{std::int64_t{4096}};
  int quotaFetches = 0;

  // What a test wants to go wrong, or otherwise than the disk says; by path.
  std::optional<Error> containerError;
  bool containerErrorComesWithValue = false;
  /// There is no other copy of what is in the drive.
  std::optional<Error> evictError = memoryError(FileErrorCode::FeatureUnsupported, "", "It is not kept elsewhere");
  bool containerLookupTellsNothing = false;  ///< neither a container nor an error
  CloudContainerRef containerOfEverything;   ///< instead of the one that holds the URL
  std::map<std::string, Result<URL>> bookmarks;
  std::map<std::string, URL> logicalOfPromise;
  std::map<std::string, URL> physicalOfLogical;
  std::map<std::string, Result<std::vector<std::string>>> tags;

  std::optional<UbiquityIdentityToken> ubiquityIdentityToken() override { return account; }
  std::string defaultContainerIdentifier() override { return DriveIdentifier; }
  std::vector<CloudContainerRef> allContainers() override;
  CloudContainerRef containerWithIdentifier(const std::string& identifier) override;
  Result<CloudContainerRef> containerForURL(const URL& url) override;
  std::optional<std::string> containerIdentifierForURL(const URL& url) override;
  bool isDocumentsContainer(const URL& url) override;
  std::optional<URL> defaultContainerURL() override { return account ? std::optional(Drive) : std::nullopt; }
  std::optional<std::string> pathRelativeToMirror(const URL& url) override;
  bool URLIsInDriveMirror(const URL& url) override { return realPathURL(url).isInside(Mirror); }
  bool URLIsInDriveTrash(const URL& url) override;
  URL realPathURL(const URL& url) override;
  bool isExternalDocumentReference(const URL& url) override;
  Result<URL> resolveExternalDocumentReference(const URL& url) override;
  bool isPromise(const URL& url) override;
  URL logicalURLOfPromise(const URL& url) override;
  URL physicalURL(const URL& url) override;
  Result<std::vector<std::string>> tagNames(const URL& url) override;
  bool canMoveWithoutDownloading(const CloudContainer& from, const CloudContainer& to) override;
  std::optional<Error> evict(const URL& url) override;
  void fetchQuota(std::function<void(Result<std::int64_t>)> done) override;

 private:
  MemoryDisk& disk_;
  Queues& queues_;
  NotificationCenter& notifications_;
  CallRecord& record_;
};

}  // namespace vaelo
