// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/result.h"

namespace vaelo {

/// An installed (or known) application. Immutable; compared by bundle identifier.
struct ApplicationRecord {
  std::string bundleIdentifier;
  std::string itemName;
  std::string localizedName;
  std::string localizedShortName;
  std::string shortVersionString;
  std::string vendorName;
  std::string executableName;
  std::string bundleContainerURL;
  std::string itemID;
  bool isInstalled = false;
  bool supportsOpenInPlace = false;
  friend bool operator==(const ApplicationRecord& a, const ApplicationRecord& b) {
    return a.bundleIdentifier == b.bundleIdentifier;
  }
  std::string description() const { return bundleIdentifier; }
};

/// The rank of an application that owns a type.
inline constexpr const char* HandlerRankOwner = "Owner";

/// A document and who can open it.
class DocumentRecord {
 public:
  using Ranked = std::vector<std::pair<std::string, std::vector<ApplicationRecord>>>;
  virtual ~DocumentRecord() = default;
  virtual URL url() const = 0;
  /// Rank name and its applications, best first.
  virtual Result<Ranked> applicationsAvailableForOpeningByHandlerRank() = 0;
};

/// Installed applications. May read files; safe from any thread.
class LaunchServices {
 public:
  virtual ~LaunchServices() = default;
  virtual std::shared_ptr<DocumentRecord> documentRecord(const URL& url, bool sourceIsManaged) = 0;
  virtual std::optional<ApplicationRecord> applicationRecord(const std::string& bundleIdentifier) = 0;
  virtual std::string ownBundleIdentifier() = 0;
};

}  // namespace vaelo
