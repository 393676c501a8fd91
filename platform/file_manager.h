// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "platform/resource_values.h"

namespace vaelo {

enum class FileType { Regular, Directory, SymbolicLink, Other };

/// Plain attributes of what stands at a path, links not followed. Absent fields are not known.
struct FileAttributes {
  std::optional<FileType> type;
  Value size;  ///< unsigned, bytes
  std::optional<Date> creationDate;
  std::optional<Date> modificationDate;
  bool extensionHidden = false;
};

enum EnumerationOptions : unsigned {
  EnumerateAll = 0,
  SkipsSubdirectoryDescendants = 1,
  SkipsPackageDescendants = 2,
  SkipsHiddenFiles = 4,
};

/// The file system, as it stands on the disk. Calls block and are safe from any thread.
///
/// Errors are in FileErrorDomain: 4 or 260 no such file, 513 no permission, 516 exists, 640 disk full, 642 read-only, 512
/// other.
class FileManager {
 public:
  virtual ~FileManager() = default;

  /// True when something stands at the path, links followed; `isDirectory`, where given, tells whether it is a folder.
  virtual bool fileExistsAtPath(const std::string& path, bool* isDirectory = nullptr) = 0;
  virtual Result<FileAttributes> attributesOfItemAtPath(const std::string& path) = 0;
  virtual Result<std::string> destinationOfSymbolicLinkAtPath(const std::string& path) = 0;
  /// Makes the folder and the missing ones above it. A folder that is there already is no error; anything else there is 516.
  virtual std::optional<Error> createDirectoryAtURL(const URL& url) = 0;
  /// Removes an item and all below it; of an item that is not downloaded its promise. Never follows a link.
  virtual std::optional<Error> removeItemAtURL(const URL& url) = 0;
  /// Renames or moves an item; one that is not downloaded moves with its promise. Never replaces: 516 when the destination
  /// exists, with DestinationFilePathErrorKey in the user information.
  virtual std::optional<Error> moveItemAtURL(const URL& source, const URL& destination) = 0;
  /// Walks the tree below `url`, parents before children; links are not followed. `visit` returns false to end the walk;
  /// `onError` (entry, error) returns true to go on. `prefetch` is a hint. Items not downloaded come under their logical
  /// URL.
  virtual void enumerate(const URL& url, const std::vector<ResourceKey>& prefetch, unsigned options,
                         const std::function<bool(const URL&)>& visit,
                         const std::function<bool(const URL&, const Error&)>& onError) = 0;
  /// Paths of the user's documents directories, possibly with a leading tilde; the first is the main one.
  virtual std::vector<std::string> userDocumentsDirectories() = 0;
  virtual std::string expandingTilde(const std::string& path) = 0;
};

}  // namespace vaelo
