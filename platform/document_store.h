// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <string>

#include "platform/result.h"

namespace vaelo {

/// A failed step of the store: the system's error number and its text (strerror).
struct SystemError {
  int number = 0;
  std::string text;
};

template <typename T>
struct SystemResult {
  std::optional<T> value;
  SystemError error;
};

/// The versioned document store: finds a document by the identifier that it keeps across renames and moves.
/// Blocking; safe from any thread.
class DocumentStore {
 public:
  using Device = std::uint64_t;
  using FileID = std::uint64_t;
  /// What an open file says of itself.
  struct OpenFileAttributes {
    std::int64_t documentID = 0;
    std::string path;
  };
  virtual ~DocumentStore() = default;
  /// The device number of the file system that holds `folder` (POSIX stat).
  virtual std::optional<Device> deviceOf(const URL& folder) = 0;
  virtual SystemResult<FileID> resolveDocumentID(Device device, std::uint64_t documentID) = 0;
  /// Opens read-only, without following a final link; the handle is 0 or more.
  virtual SystemResult<int> openByID(Device device, FileID file) = 0;
  virtual SystemResult<OpenFileAttributes> attributesOfOpenFile(int handle) = 0;
  virtual void close(int handle) = 0;
};

}  // namespace vaelo
