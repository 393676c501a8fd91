// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "host/drive/small_file.h"
#include "platform/logging.h"

namespace vaelo {

/// How an account's provider sells more storage.
struct UpgradeTerms {
  std::string page;           ///< an http or https address
  std::vector<double> below;  ///< percents of free space, falling: below the first there is an offer of level 1, and so on
  bool asksFirst = false;     ///< the application shows the offer before the page
  friend bool operator==(const UpgradeTerms&, const UpgradeTerms&) = default;
};

/// What an account's key file says.
struct AccountRecord {
  std::string name;   ///< fit to be shown
  std::string token;  ///< empty when there is none
  bool signedIn = false;
  std::string mirror;                     ///< below the data folder
  std::optional<std::int64_t> allowance;  ///< bytes that the account may use; absent: as many as the disk holds
  std::optional<UpgradeTerms> upgrade;    ///< absent: the provider sells nothing
  friend bool operator==(const AccountRecord&, const AccountRecord&) = default;
};

inline constexpr const char* AccountGroup = "Account";

/// Reads a key file with an account in it. Error 260 when there is no file; others when it can't be read, is damaged, has no
/// token, or names a mirror that is no place for one. Allowance and terms that make no sense are left out, and the log
/// tells. Any thread.
Result<AccountRecord> readAccountFile(const std::string& path, LogSink& log);
/// The account that a parsed file tells of.
Result<AccountRecord> accountIn(GKeyFile* keys, const std::string& path, LogSink& log);

}  // namespace vaelo
