// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "platform/queues.h"
#include "platform/result.h"

namespace vaelo {

/// Values of CloudContainer::supportedFolderLevels.
inline constexpr const char* FolderLevelsNone = "None";
inline constexpr const char* FolderLevelsOne = "One";
inline constexpr const char* FolderLevelsAny = "Any";

/// Home-screen shortcut types and the keys of a recent-document item's user info.
inline constexpr const char* SearchShortcutType = "com.marrow.VaeloDrive.shortcut.search";
inline constexpr const char* RecentDocumentShortcutType = "com.marrow.VaeloDrive.shortcut.recent-document";
inline constexpr const char* RecentDocumentAliasURLKey = "alias-url";  ///< archived URL (data)
inline constexpr const char* RecentDocumentDocIDKey = "document-id";   ///< unsigned 64-bit
inline constexpr const char* RecentDocumentURLKey = "url";             ///< archived URL (data)

/// A document type that an application declares for its library.
struct DeclaredDocumentType {
  Value contentTypes;  ///< normally an array of type identifiers; not checked
};

/// An application's library in the drive. A snapshot; safe from any thread.
class CloudContainer {
 public:
  virtual ~CloudContainer() = default;
  virtual std::string identifier() const = 0;
  virtual std::string localizedName() const = 0;
  /// What the user sees as the library's top folder; absent when the library has none.
  virtual std::optional<URL> documentsFolderURL() const = 0;
  /// Absent: no types declared, everything is welcome.
  virtual std::optional<std::vector<DeclaredDocumentType>> documentTypes() const = 0;
  /// Absent, or one of the FolderLevels constants, or what a newer version wrote.
  virtual std::optional<std::string> supportedFolderLevels() const = 0;
  /// Identifiers of the applications that own the library, the main one first.
  virtual std::vector<std::string> ownerBundleIdentifiers() const = 0;
  /// Empties the library on the device and the server. Blocks.
  virtual std::optional<Error> deleteAllContents() = 0;
};

using CloudContainerRef = std::shared_ptr<CloudContainer>;

/// The signed-in account, as an opaque token: equal tokens are the same account.
struct UbiquityIdentityToken {
  std::string opaque;
  friend bool operator==(const UbiquityIdentityToken&, const UbiquityIdentityToken&) = default;
};

/// The local mirror of the drive and what the account knows of its items. Calls may touch the disk, never the network,
/// unless said; safe from any thread. Location tests look at the real place of an item: "..", links and look-alike prefixes
/// don't fool them.
class CloudDocuments {
 public:
  virtual ~CloudDocuments() = default;

  /// The signed-in account's token; nothing when none is. IdentityDidChangeNotification is posted on the main queue when it
  /// changes.
  virtual std::optional<UbiquityIdentityToken> ubiquityIdentityToken() = 0;

  virtual std::string defaultContainerIdentifier() = 0;
  /// Every container with a documents folder, the default one first, the others in the order of their localized names.
  virtual std::vector<CloudContainerRef> allContainers() = 0;
  /// The container with that identifier; null when there is none.
  virtual CloudContainerRef containerWithIdentifier(const std::string& identifier) = 0;
  /// The container that holds the item. No container: an error, and no value.
  virtual Result<CloudContainerRef> containerForURL(const URL& url) = 0;
  virtual std::optional<std::string> containerIdentifierForURL(const URL& url) = 0;
  /// True when `url` is a container's documents folder itself.
  virtual bool isDocumentsContainer(const URL& url) = 0;
  /// The documents folder of the default container; nothing when no account is signed in.
  virtual std::optional<URL> defaultContainerURL() = 0;
  /// The path below the mirror's root, without a leading slash; nothing outside the mirror.
  virtual std::optional<std::string> pathRelativeToMirror(const URL& url) = 0;

  virtual bool URLIsInDriveMirror(const URL& url) = 0;
  virtual bool URLIsInDriveTrash(const URL& url) = 0;
  /// The form of `url` with links followed; what does not exist keeps its last components.
  virtual URL realPathURL(const URL& url) = 0;

  /// True when `url` is a bookmark: a reference to a document outside the drive.
  virtual bool isExternalDocumentReference(const URL& url) = 0;
  virtual Result<URL> resolveExternalDocumentReference(const URL& url) = 0;
  /// True for the physical URL of a promise: the placeholder of an item that is not downloaded.
  virtual bool isPromise(const URL& url) = 0;
  /// The logical URL of the item that a promise stands for; `url` itself when it is none.
  virtual URL logicalURLOfPromise(const URL& url) = 0;
  /// The physical URL behind a logical one: the promise's when the item is not downloaded, else the same URL object.
  virtual URL physicalURL(const URL& url) = 0;

  /// Tag names in the order in which they are kept.
  virtual Result<std::vector<std::string>> tagNames(const URL& url) = 0;
  virtual bool canMoveWithoutDownloading(const CloudContainer& from, const CloudContainer& to) = 0;
  /// Gives up the local copy of an item that the cloud has.
  virtual std::optional<Error> evict(const URL& url) = 0;

  /// Asks for the free bytes of the account; may use the network. `done` comes once, on any thread.
  virtual void fetchQuota(std::function<void(Result<std::int64_t>)> done) = 0;
};

}  // namespace vaelo
