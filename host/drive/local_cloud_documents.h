// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "host/drive/account.h"
#include "host/drive/container_catalog.h"
#include "host/drive/document_index.h"
#include "host/drive/drive_layout.h"
#include "host/drive/storage_figures.h"
#include "platform/cloud_documents.h"

namespace vaelo {

/// Posted on the main queue after a damaged document index was rebuilt, so that the user can be told.
inline constexpr const char* DocumentIndexRebuiltNotification = "DocumentIndexRebuiltNotification";

namespace CloudDocumentsErrorCode {
/// The item is not in the drive, or not in a container of it.
inline constexpr int NotInDrive = 7;
/// Nobody is signed in.
inline constexpr int NoAccount = 8;
}  // namespace CloudDocumentsErrorCode

/// An error of CloudDocumentsErrorDomain about the item at `path`.
Error cloudError(int code, const std::string& path, const std::string& reason);

/// The cloud-documents service on a local mirror alone. Nobody signed in: there are no containers to list and no default
/// one, while the location tests and the container of a given item still answer, since the mirror stays.
///
/// Made and destroyed on the main thread; calls come from any. Layout, account, catalog and index each guard what they keep;
/// the one lock of its own is for those who wait for the quota.
class LocalCloudDocuments : public CloudDocuments {
 public:
  /// `dataFolder`: absolute. On the first start the local account is made there (see LocalAccounts::makeFirstIfAbsent); when
  /// that fails the log tells why and nobody is signed in. A damaged account file is moved aside first. The index is opened
  /// by a worker. All references outlive the service.
  LocalCloudDocuments(const std::string& dataFolder, LogSink& log, Queues& queues, NotificationCenter& notifications);

  const DriveLayout& layout() const { return layout_; }
  /// Why the first start could not make the account, if so.
  const std::optional<Error>& setUpFailure() const { return setUpFailure_; }
  /// The account file was damaged when the program started, and another one made.
  bool accountWasDamaged() const { return accountWasDamaged_; }
  /// What the account file says.
  AccountRecord account() const { return account_.record(); }
  /// `observer` gets, on any thread, what each quota fetch measured. Before the first fetch.
  void observeStorage(std::function<void(const StorageFigures&)> observer) { storageObserver_ = std::move(observer); }
  DocumentIndex& index() { return index_; }
  TreeRemovals& removals() { return removals_; }

  std::optional<UbiquityIdentityToken> ubiquityIdentityToken() override;
  std::string defaultContainerIdentifier() override;
  std::vector<CloudContainerRef> allContainers() override;
  CloudContainerRef containerWithIdentifier(const std::string& identifier) override;
  Result<CloudContainerRef> containerForURL(const URL& url) override;
  std::optional<std::string> containerIdentifierForURL(const URL& url) override;
  bool isDocumentsContainer(const URL& url) override;
  std::optional<URL> defaultContainerURL() override;
  std::optional<std::string> pathRelativeToMirror(const URL& url) override;
  bool URLIsInDriveMirror(const URL& url) override;
  bool URLIsInDriveTrash(const URL& url) override;
  URL realPathURL(const URL& url) override;
  bool isExternalDocumentReference(const URL& url) override;
  Result<URL> resolveExternalDocumentReference(const URL& url) override;
  bool isPromise(const URL& url) override;
  URL logicalURLOfPromise(const URL& url) override;
  URL physicalURL(const URL& url) override;
  Result<std::vector<std::string>> tagNames(const URL& url) override;
  /// True between any two containers: both are folders of one mirror.
  bool canMoveWithoutDownloading(const CloudContainer& from, const CloudContainer& to) override;
  /// Always FeatureUnsupported: the mirror holds the only copy, which giving up would lose.
  std::optional<Error> evict(const URL& url) override;
  /// The free bytes of the disk, or what is left of the account's allowance when that is less. Counted by a worker.
  void fetchQuota(std::function<void(Result<std::int64_t>)> done) override;

 private:
  Result<StorageFigures> measureStorage() const;

  DriveLayout layout_;
  bool accountWasDamaged_ = false;
  std::optional<Error> setUpFailure_;
  Account account_;
  TreeRemovals removals_;
  ContainerCatalog containers_;
  DocumentIndex index_;
  std::function<void(const StorageFigures&)> storageObserver_;
  std::mutex quotaMutex_;
  std::vector<std::function<void(Result<std::int64_t>)>> quotaWaiting_;  // guarded by quotaMutex_
  std::shared_ptr<OperationQueue> workers_;  // last, so that it ends before what its operations use
};

}  // namespace vaelo
