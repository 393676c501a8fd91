// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <vector>

#include "platform/result.h"

namespace vaelo {

/// What can be asked about a file. The comment names the type of the Value; an absent value means "not known".
enum class ResourceKey {
  Name,                      ///< string, the last path component
  LocalizedName,             ///< string, what a person should read
  TypeIdentifier,            ///< string, a uniform type identifier such as "public.jpeg"
  LocalizedTypeDescription,  ///< string; "Alias" for an alias file
  FileSize,                  ///< unsigned, bytes; absent for folders and packages
  TotalFileSize,             ///< unsigned, bytes including metadata
  CreationDate,              ///< Date
  ContentModificationDate,   ///< Date
  IsDirectory,               ///< bool, true for packages too
  IsPackage,                 ///< bool
  IsRegularFile,             ///< bool
  HasHiddenExtension,        ///< bool
  ParentDirectoryURL,        ///< URL
  IsShared,                  ///< bool: the cloud item is shared
  SharedItemRole,            ///< string: SharedItemRoleOwner or SharedItemRoleParticipant
  DownloadingStatus,         ///< string, one of the DownloadingStatus constants; absent outside the drive
  DocumentIdentifier,        ///< signed 64-bit
  ThumbnailDictionary,       ///< dictionary of images by size key
};

inline constexpr const char* SharedItemRoleOwner = "owner";
inline constexpr const char* SharedItemRoleParticipant = "participant";
inline constexpr const char* DownloadingStatusNotDownloaded = "not-downloaded";
inline constexpr const char* DownloadingStatusDownloaded = "downloaded";
inline constexpr const char* DownloadingStatusCurrent = "current";
/// The key of the 1024x1024 image in the thumbnail dictionary.
inline constexpr const char* Thumbnail1024SizeKey = "Thumbnail1024x1024";

using ResourceMap = std::map<ResourceKey, Value>;

/// Reads metadata of files, never their content. Every call may touch the disk; safe from any thread.
///
/// The promised-item forms answer for the logical URL of an item whether or not it is downloaded; the plain forms know only
/// what stands on the disk. Keys without a value are left out of the map.
class ResourceValues {
 public:
  virtual ~ResourceValues() = default;

  /// Errors: FileErrorCode::NoSuchFile when neither item nor promise exists; ReadNoPermission; ReadUnknown.
  virtual Result<ResourceMap> promisedItemResourceValues(const URL& url, const std::vector<ResourceKey>& keys) = 0;
  virtual Result<ResourceMap> resourceValues(const URL& url, const std::vector<ResourceKey>& keys) = 0;
  /// True when the item exists, downloaded or promised.
  virtual bool promisedItemIsReachable(const URL& url) = 0;

  /// `url` with every symbolic link in its path followed; unchanged when the links run in a circle or end nowhere.
  virtual URL resolvingSymlinks(const URL& url) = 0;
  /// The target of an alias file, without asking the user anything and without mounting a volume.
  virtual Result<URL> resolveAliasFile(const URL& url) = 0;

  /// Opens the door to an item outside the application's reach; true when a matching stop is owed.
  virtual bool startAccessingSecurityScopedResource(const URL& url) = 0;
  virtual void stopAccessingSecurityScopedResource(const URL& url) = 0;
};

}  // namespace vaelo
