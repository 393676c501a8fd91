// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <set>

#include "tests/support/call_record.h"
#include "tests/support/memory_disk.h"
#include "tests/support/memory_types.h"

namespace vaelo {

/// The metadata of a disk in memory.
class MemoryResourceValues : public ResourceValues {
 public:
  MemoryResourceValues(MemoryDisk& disk, TypeIdentifiers& types, CallRecord& record)
      : disk_(disk), types_(types), record_(record) {}

  // What a test chooses, by path: answers instead of the disk's.
  std::map<std::string, Result<ResourceMap>> promisedAnswers;
  std::map<std::string, Result<ResourceMap>> plainAnswers;
  std::map<std::string, URL> linkTargets;
  std::map<std::string, Result<URL>> aliasTargets;
  std::set<std::string> unreachable;
  // For every path.
  std::optional<Error> promisedReadError;
  std::optional<Error> plainReadError;
  bool securityScoped = false;  ///< items are behind a security scope
  int openScopes = 0;

  Result<ResourceMap> promisedItemResourceValues(const URL& url, const std::vector<ResourceKey>& keys) override;
  Result<ResourceMap> resourceValues(const URL& url, const std::vector<ResourceKey>& keys) override;
  bool promisedItemIsReachable(const URL& url) override;
  URL resolvingSymlinks(const URL& url) override;
  Result<URL> resolveAliasFile(const URL& url) override;
  bool startAccessingSecurityScopedResource(const URL& url) override;
  void stopAccessingSecurityScopedResource(const URL& url) override;

 private:
  Value valueOf(MemoryItem& item, const URL& url, ResourceKey key, bool asPromise);
  std::string typeOf(const MemoryItem& item, const URL& url);
  ResourceMap valuesOf(MemoryItem& item, const URL& url, const std::vector<ResourceKey>& keys, bool asPromise);

  MemoryDisk& disk_;
  TypeIdentifiers& types_;
  CallRecord& record_;
};

}  // namespace vaelo
