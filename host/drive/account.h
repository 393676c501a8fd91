// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "host/drive/account_record.h"
#include "host/drive/drive_layout.h"
#include "platform/cloud_documents.h"
#include "platform/logging.h"
#include "platform/notifications.h"
#include "platform/queues.h"

namespace vaelo {

/// Posted on the main queue when anything changed in what the account file says.
inline constexpr const char* AccountDidChangeNotification = "AccountDidChangeNotification";

/// The signed-in account, as the account file says, which is watched: when another process changes it,
/// IdentityDidChangeNotification is posted on the main queue if it is another account, and AccountDidChangeNotification in
/// any case. The layout's mirror is that of the account. A file that is damaged while the program runs changes nothing,
/// since whoever writes it may not be done; the log tells. Nobody is signed in when there is none. Made and destroyed on the
/// main thread.
class Account {
 public:
  Account(DriveLayout& layout, LogSink& log, Queues& queues, NotificationCenter& notifications);
  ~Account();
  Account(const Account&) = delete;
  Account& operator=(const Account&) = delete;

  /// Any thread; does not touch the disk.
  std::optional<UbiquityIdentityToken> token() const;
  AccountRecord record() const;

 private:
  class Watched;
  std::shared_ptr<Watched> watched_;
};

}  // namespace vaelo
