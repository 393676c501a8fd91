// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

namespace vaelo {

/// `path` with every link followed and every "." and ".." gone. What does not exist keeps its last components; a link that
/// leads nowhere leads to where it says. A link in a circle stays as it is. A path that is not absolute or holds a NUL comes
/// back unchanged. One open for a path without links, otherwise one readlink a component; any thread.
std::string realLocation(const std::string& path);

/// Where the drive keeps what. Immutable, so safe from any thread.
class DriveLayout {
 public:
  static constexpr const char* DefaultContainer = "com~marrow~Kestrel";

  /// `dataFolder`: absolute; need not exist yet. Links in it are followed once, here.
  explicit DriveLayout(const std::string& dataFolder);

  const std::string& dataFolder() const { return dataFolder_; }
  const std::string& mirrorRoot() const { return mirrorRoot_; }
  const std::string& trashFolder() const { return trashFolder_; }
  std::string accountFile() const { return dataFolder_ + "/account.ini"; }
  std::string indexFile() const { return dataFolder_ + "/index.sqlite"; }
  /// The folder of a container; `identifier` is in its folder form, one component.
  std::string containerFolder(const std::string& identifier) const { return mirrorRoot_ + "/" + identifier; }
  std::string defaultContainerFolder() const { return containerFolder(DefaultContainer); }

  /// The location tests look at realLocation(path), so that "..", links and look-alike prefixes don't fool them. The mirror
  /// holds its own root and the trash.
  bool isInMirror(const std::string& path) const;
  bool isInTrash(const std::string& path) const;
  /// The path below the mirror's root without a leading slash, empty for the root; nothing outside the mirror.
  std::optional<std::string> relativeToMirror(const std::string& path) const;
  /// The folder name of the container that holds the item (or is it); nothing outside, at the root, and below hidden
  /// folders such as the trash. Whether the container exists is not asked.
  std::optional<std::string> containerOf(const std::string& path) const;

 private:
  std::string dataFolder_;
  std::string mirrorRoot_;
  std::string trashFolder_;
};

}  // namespace vaelo
