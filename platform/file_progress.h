// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "platform/url.h"

namespace vaelo {

inline constexpr const char* FileProgressKind = "file";

/// Progress of one transfer. Main thread.
class Progress {
 public:
  virtual ~Progress() = default;
  virtual std::string kind() const = 0;
  virtual std::int64_t completedUnits() const = 0;
  virtual std::int64_t totalUnits() const = 0;
  /// Calls `changed` with the key path ("fractionCompleted") on each change; ends when the token goes.
  virtual std::shared_ptr<void> observe(const std::string& keyPath, std::function<void(const std::string&)> changed) = 0;
  virtual std::string description() const = 0;
};

/// Progress published for files. Main thread.
class FileProgress {
 public:
  using Withdrawn = std::function<void()>;
  using Published = std::function<Withdrawn(std::shared_ptr<Progress>)>;
  virtual ~FileProgress() = default;
  /// The subscription ends when the token goes; `published` returns what to call when that progress is withdrawn.
  virtual std::shared_ptr<void> subscribe(const URL& url, Published published) = 0;
};

}  // namespace vaelo
