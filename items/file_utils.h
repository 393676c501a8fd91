// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "platform/cloud_documents.h"
#include "platform/resource_values.h"

namespace vaelo {

/// Probes and changes the file system, each change inside a coordinated write, and judges names, types and places.
/// Stateless; any thread; blocks until the file system has answered. Failures are returned, never thrown.
class FileUtils {
 public:
  /// Something is at the URL's path; it is a file (not a folder); it is a folder.
  static bool exists(const URL& url);
  static bool isFile(const URL& url);
  static bool isDir(const URL& url);
  /// Makes the folder and the missing ones above it.
  static std::optional<Error> mkdir(const URL& url);
  /// Deletes the item, unless it changed between this call and the moment of its turn: then UserCancelled.
  static std::optional<Error> remove(const URL& url);
  /// Moves `source` to be `destination` (not into it). The same path is success; a file onto a folder, or a folder onto
  /// a file, is FeatureUnsupported.
  static std::optional<Error> moveTo(const URL& source, const URL& destination);
  /// The user's documents directory.
  static std::optional<URL> docDir();
  /// Gives up the local copy of an item; true when that worked.
  static bool evictDocument(const URL& url);
  /// One value: that of the promised item, else that of the file on the disk. Absent when neither has one.
  static Value getResourceValueForURL(ResourceKey key, const std::optional<URL>& url);
  /// Diagnostics, without effect.
  static void dumpURLResourceValues(const URL& url);
  static void logFileAttributes(const std::string& path);

  /// May an item be given this name?
  static bool isValidFilename(const std::string& name);
  /// The type that the URL's extension names.
  static std::optional<std::string> fileUTI(const URL& url);
  /// A picture, film, sound or portable document, by its extension.
  static bool isAudioVideoImageFile(const URL& url);
  /// May a document of this extension live in the container that the URL lies in?
  static bool isValidExtensionForContainer(const URL& url);
  static std::string pathBarArrowCharacter(bool rightToLeft);
  /// Splits an item's URL into its container and the display names below the container's top folder, outermost first. The
  /// out arguments may be null and are written as far as the answer is known.
  static std::optional<Error> containerAndRelativePathforURLContainerRelativePathComponents(
      const URL& url, CloudContainerRef* container, std::vector<std::string>* components);
  /// "drive ▸ library ▸ folder" for an item, without the item itself.
  static std::optional<std::string> displayableLocationForURL(const URL& url);
};

}  // namespace vaelo
