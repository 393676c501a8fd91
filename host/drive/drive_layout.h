// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <mutex>
#include <optional>
#include <shared_mutex>
#include <string>

namespace vaelo {

/// `path` with every link followed and every "." and ".." gone. What does not exist keeps its last components; a link that
/// leads nowhere leads to where it says. A link in a circle stays as it is. A path that is not absolute or holds a NUL comes
/// back unchanged. One open for a path without links, otherwise one readlink a component; any thread.
std::string realLocation(const std::string& path);

/// Where the drive keeps what. Each account of a device has a mirror of its own; the layout is that of the account whose
/// turn it is. Safe from any thread.
class DriveLayout {
 public:
  static constexpr const char* DefaultContainer = "com~marrow~Kestrel";
  /// Below the mirror's root: what is deleted already and not yet removed.
  static constexpr const char* Removing = "/.vaelo/removing";
  /// The mirror of a device's first account.
  static constexpr const char* FirstMirror = "mirror";

  /// `dataFolder`: absolute; need not exist yet. Links in it are followed once, here.
  explicit DriveLayout(const std::string& dataFolder);

  const std::string& dataFolder() const { return dataFolder_; }
  /// The account's mirror is `folder`, below the data folder, from now on.
  void setMirror(const std::string& folder);
  std::string mirrorRoot() const;
  std::string trashFolder() const { return mirrorRoot() + "/.Trash"; }
  std::string accountFile() const { return dataFolder_ + "/account.ini"; }
  /// What is known of the accounts whose turn it is not, and their mirrors.
  std::string accountsFolder() const { return dataFolder_ + "/accounts"; }
  std::string indexFile() const { return dataFolder_ + "/index.sqlite"; }
  /// The folder of a container; `identifier` is in its folder form, one component.
  std::string containerFolder(const std::string& identifier) const { return mirrorRoot() + "/" + identifier; }
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
  const std::string dataFolder_;
  mutable std::shared_mutex mutex_;
  std::string mirrorRoot_;  // guarded by mutex_
};

}  // namespace vaelo
