// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/account.h"

#include <gio/gio.h>

#include <mutex>

#include "host/support/glib_ptr.h"

namespace vaelo {

/// Shared with the blocks that are under way to the main queue, which may outlive the account.
class Account::Watched : public std::enable_shared_from_this<Watched> {
 public:
  Watched(DriveLayout& layout, LogSink& log, Queues& queues, NotificationCenter& notifications)
      : layout_(layout), log_(log), queues_(queues), notifications_(notifications) {
    reload();
  }

  void watch() {
    const GRef<GFile> file(g_file_new_for_path(layout_.accountFile().c_str()));
    GError* failure = nullptr;
    monitor_ = g_file_monitor_file(file.get(), G_FILE_MONITOR_NONE, nullptr, &failure);
    if (!monitor_) {
      const GErrorPtr owned(failure);
      log_.write(LogType::Error, std::string("drive: can't watch the account: ") + owned->message);
      return;
    }
    g_signal_connect(monitor_, "changed", G_CALLBACK(changed), this);
    tellOf(reload());  // it may have changed before the watch began
  }

  void stop() {
    if (!monitor_) return;
    g_signal_handlers_disconnect_by_data(monitor_, this);
    g_file_monitor_cancel(monitor_);
    g_clear_object(&monitor_);
  }

  AccountRecord record() const {
    const std::lock_guard lock(mutex_);
    return record_;
  }

  std::optional<UbiquityIdentityToken> token() const { return tokenOf(record()); }

 private:
  enum class Change { None, Details, Identity };

  static std::optional<UbiquityIdentityToken> tokenOf(const AccountRecord& record) {
    if (!record.signedIn || record.token.empty()) return std::nullopt;
    return UbiquityIdentityToken{record.token};
  }

  static void changed(GFileMonitor*, GFile*, GFile*, GFileMonitorEvent, gpointer held) {
    auto* self = static_cast<Watched*>(held);
    self->tellOf(self->reload());
  }

  Change reload() {
    Result<AccountRecord> read = readAccountFile(layout_.accountFile(), log_);
    if (read.error && read.error->code != FileErrorCode::ReadNoSuchFile) {
      log_.write(LogType::Error, "drive: can't read the account: " + read.error->description());
      return Change::None;
    }
    AccountRecord now = read.value.value_or(AccountRecord());
    const std::lock_guard lock(mutex_);
    if (now == record_) return Change::None;
    // Without an account the documents of the last one stay where they are.
    if (!now.mirror.empty() && now.mirror != record_.mirror) layout_.setMirror(now.mirror);
    const bool isAnother = tokenOf(now) != tokenOf(record_);
    record_ = std::move(now);
    return isAnother ? Change::Identity : Change::Details;
  }

  void tellOf(Change change) {
    if (change == Change::None) return;
    queues_.main().async([weak = weak_from_this(), change] {
      const auto self = weak.lock();
      if (!self) return;
      if (change == Change::Identity) self->notifications_.post({IdentityDidChangeNotification, {}});
      self->notifications_.post({AccountDidChangeNotification, {}});
    });
  }

  DriveLayout& layout_;
  LogSink& log_;
  Queues& queues_;
  NotificationCenter& notifications_;
  GFileMonitor* monitor_ = nullptr;  // main thread
  mutable std::mutex mutex_;
  AccountRecord record_;  // guarded by mutex_
};

Account::Account(DriveLayout& layout, LogSink& log, Queues& queues, NotificationCenter& notifications)
    : watched_(std::make_shared<Watched>(layout, log, queues, notifications)) {
  watched_->watch();
}

Account::~Account() { watched_->stop(); }

std::optional<UbiquityIdentityToken> Account::token() const { return watched_->token(); }

AccountRecord Account::record() const { return watched_->record(); }

}  // namespace vaelo
