// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "tests/support/call_record.h"
#include "tests/support/memory_disk.h"

namespace vaelo {

/// The file manager of a disk in memory.
class MemoryFileManager : public FileManager {
 public:
  MemoryFileManager(MemoryDisk& disk, CallRecord& record) : disk_(disk), record_(record) {}

  // What a test wants to go wrong: nothing is done then.
  std::optional<Error> createError, removeError, moveError;
  std::optional<Error> enumerationError;  ///< of an entry that comes before all others
  std::vector<std::string> documentsDirectories{"~/Documents"};

  bool fileExistsAtPath(const std::string& path, bool* isDirectory = nullptr) override;
  Result<FileAttributes> attributesOfItemAtPath(const std::string& path) override;
  Result<std::string> destinationOfSymbolicLinkAtPath(const std::string& path) override;
  std::optional<Error> createDirectoryAtURL(const URL& url) override;
  std::optional<Error> removeItemAtURL(const URL& url) override;
  std::optional<Error> moveItemAtURL(const URL& source, const URL& destination) override;
  void enumerate(const URL& url, const std::vector<ResourceKey>& prefetch, unsigned options,
                 const std::function<bool(const URL&)>& visit,
                 const std::function<bool(const URL&, const Error&)>& onError) override;
  std::vector<std::string> userDocumentsDirectories() override { return documentsDirectories; }
  std::string expandingTilde(const std::string& path) override;

 private:
  bool isThere(const std::string& path) { return disk_.logicalItem(path) || disk_.physicalItem(path); }
  bool enumerateBelow(const URL& url, unsigned options, const std::function<bool(const URL&)>& visit,
                      const std::function<bool(const URL&, const Error&)>& onError);

  MemoryDisk& disk_;
  CallRecord& record_;
};

}  // namespace vaelo
