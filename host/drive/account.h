// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "host/drive/drive_layout.h"
#include "platform/cloud_documents.h"
#include "platform/logging.h"
#include "platform/notifications.h"
#include "platform/queues.h"

namespace vaelo {

/// What the account file says.
struct AccountRecord {
  std::string name;
  std::string token;  ///< empty when there is none
  bool signedIn = false;
  std::optional<std::int64_t> allowance;  ///< bytes that the account may use; absent: as many as the disk holds
};

/// The record; nobody is signed in when the file is absent or damaged, and the log tells of the latter. Any thread.
AccountRecord readAccount(const DriveLayout& layout, LogSink& log);

/// On the first start, which an absent account file tells, makes the local account: an empty drive with a welcome document,
/// then the file, so that a crash on the way is made good by the next start. Never touches what is there. Two processes may
/// start at once: one account wins. Blocks; any thread.
std::optional<Error> makeLocalAccountIfAbsent(const DriveLayout& layout);

/// The signed-in account, as the account file says, which is watched: when another process changes it,
/// IdentityDidChangeNotification is posted on the main queue. Made and destroyed on the main thread.
class Account {
 public:
  Account(const DriveLayout& layout, LogSink& log, Queues& queues, NotificationCenter& notifications);
  ~Account();
  Account(const Account&) = delete;
  Account& operator=(const Account&) = delete;

  /// Any thread; does not touch the disk.
  std::optional<UbiquityIdentityToken> token() const;
  std::optional<std::int64_t> allowance() const;

 private:
  class Watched;
  std::shared_ptr<Watched> watched_;
};

}  // namespace vaelo
