// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/files/long_work.h"
#include "host/files/name_rules.h"
#include "host/files/tree_removals.h"
#include "platform/file_manager.h"

namespace vaelo {

/// The file system of this machine. An item that is not downloaded is moved and removed with its promise.
class LocalFileManager : public FileManager {
 public:
  /// Folders that are removed go through `removals`, which outlives it; without, they are removed on the spot. What `rules`
  /// take for one name is taken. Moves and removals are `longWork`, where given, which outlives it too.
  explicit LocalFileManager(TreeRemovals* removals = nullptr, NameRules rules = {}, LongWork* longWork = nullptr)
      : removals_(removals), rules_(rules), longWork_(longWork) {}
  bool fileExistsAtPath(const std::string& path, bool* isDirectory = nullptr) override;
  Result<FileAttributes> attributesOfItemAtPath(const std::string& path) override;
  Result<std::string> destinationOfSymbolicLinkAtPath(const std::string& path) override;
  std::optional<Error> createDirectoryAtURL(const URL& url) override;
  std::optional<Error> removeItemAtURL(const URL& url) override;
  std::optional<Error> moveItemAtURL(const URL& source, const URL& destination) override;
  void enumerate(const URL& url, const std::vector<ResourceKey>& prefetch, unsigned options,
                 const std::function<bool(const URL&)>& visit,
                 const std::function<bool(const URL&, const Error&)>& onError) override;
  std::vector<std::string> userDocumentsDirectories() override;
  std::string expandingTilde(const std::string& path) override;

 private:
  TreeRemovals* removals_;
  const NameRules rules_;
  LongWork* longWork_;
};

}  // namespace vaelo
