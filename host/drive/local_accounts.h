// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "host/drive/account_record.h"
#include "host/drive/drive_layout.h"
#include "platform/logging.h"

namespace vaelo {

/// The accounts that a device knows, each with documents of its own. One of them is in the account file; the others, and a
/// copy of that one, are key files in the accounts folder. Whoever switches replaces the account file in one step, so a
/// crash leaves one account or the other, and every process hears of it through the file. Processes take turns by a lock
/// file. Blocking; any thread.
class LocalAccounts {
 public:
  struct Known {
    AccountRecord record;
    bool isCurrent = false;  ///< in the account file; signed in or not, its record tells
  };
  static constexpr std::size_t LongestName = 100;  ///< in characters

  /// Both outlive it.
  LocalAccounts(const DriveLayout& layout, LogSink& log) : layout_(layout), log_(log) {}

  /// By name. Files that are damaged are passed over, and the log tells.
  std::vector<Known> all() const;
  /// Makes an account with a drive of its own, and signs it in. Error 514 for a name that is empty, too long, no text or has
  /// control characters in it; 516 for one that is taken.
  std::optional<Error> add(const std::string& name);
  /// Signs in one of the known accounts, whoever was signed in before. Error 4 for an unknown token.
  std::optional<Error> signIn(const std::string& token);
  /// Nobody is signed in then; the account's documents stay on the device.
  std::optional<Error> signOut();

  /// For the start of the program. On the first start, which an absent account file tells, makes the local account: an empty
  /// drive with a welcome document, then the file, so that a crash on the way is made good by the next start. Never touches
  /// documents that are there. Two processes may start at once: one account wins.
  std::optional<Error> makeFirstIfAbsent();
  /// For the start of the program: moves an account file that is damaged to account.ini.damaged-N. True when it did.
  bool setDamagedFileAside();

 private:
  Result<KeyFile> currentFile() const;
  std::optional<Error> makeDrive(const std::string& mirror) const;
  std::optional<Error> keep(GKeyFile* account) const;
  std::optional<Error> makeCurrent(GKeyFile* account) const;
  std::string fileOf(const std::string& token) const;

  const DriveLayout& layout_;
  LogSink& log_;
};

}  // namespace vaelo
