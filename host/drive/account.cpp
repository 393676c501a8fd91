// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/account.h"

#include <gio/gio.h>

#include <cerrno>
#include <charconv>
#include <mutex>

#include "host/drive/cloud_container.h"
#include "host/drive/small_file.h"

namespace vaelo {

namespace {

constexpr const char* group = "Account";
constexpr const char* welcomeName = "Welcome to Vaelo Drive.md";
constexpr const char* welcomeText =
    "# Welcome to Vaelo Drive\n\n"
    "This is your drive. Put documents and folders here, and find them on every device of yours.\n\n"
    "- Touch a document to look at it.\n"
    "- Hold a finger on an item to see what can be done with it.\n"
    "- Pull the list down to refresh it.\n\n"
    "You may delete this document whenever you like.\n";

std::string randomToken() {
  gchar* text = g_uuid_string_random();
  std::string token;
  for (const char* c = text; *c; ++c) {
    if (*c != '-') token.push_back(*c);
  }
  g_free(text);
  return token;
}

bool isEmptyFolder(const std::string& path) {
  GDir* folder = g_dir_open(path.c_str(), 0, nullptr);
  if (!folder) return false;
  const bool empty = g_dir_read_name(folder) == nullptr;
  g_dir_close(folder);
  return empty;
}

}  // namespace

AccountRecord readAccount(const DriveLayout& layout, LogSink& log) {
  AccountRecord record;
  const Result<KeyFile> file = readKeyFile(layout.accountFile());
  if (!file) {
    if (file.error->code != FileErrorCode::ReadNoSuchFile) {
      log.write(LogType::Error, "drive: can't read the account: " + file.error->description());
    }
    return record;
  }
  GKeyFile* keys = file.value->get();
  record.name = keyFileBytes(keys, group, "Name").value_or("");
  record.token = keyFileBytes(keys, group, "Token").value_or("");
  record.signedIn = keyFileBool(keys, group, "SignedIn", false);
  if (const std::optional<std::string> text = keyFileBytes(keys, group, "Allowance")) {
    std::int64_t bytes = 0;
    const auto [end, failure] = std::from_chars(text->data(), text->data() + text->size(), bytes);
    if (failure == std::errc() && end == text->data() + text->size() && bytes >= 0) record.allowance = bytes;
  }
  if (record.token.empty()) log.write(LogType::Error, "drive: the account file has no account in it");
  return record;
}

std::optional<Error> makeLocalAccountIfAbsent(const DriveLayout& layout) {
  if (g_file_test(layout.accountFile().c_str(), G_FILE_TEST_EXISTS)) return std::nullopt;
  const std::string drive = layout.defaultContainerFolder();
  for (const std::string& folder : {drive, layout.trashFolder()}) {
    if (g_mkdir_with_parents(folder.c_str(), 0700) != 0) return errorFromErrno(errno, folder, FileAccess::Write);
  }
  const auto alreadyThere = [](const std::optional<Error>& error) {
    return error && error->code == FileErrorCode::WriteFileExists;
  };
  // A drive that outlived its account file is the user's; nothing is put into it.
  if (isEmptyFolder(drive)) {
    auto failed = writeSmallFile(drive + "/" + welcomeName, welcomeText, false);
    if (failed && !alreadyThere(failed)) return failed;
    failed = writeSmallFile(drive + "/" + ContainerManifestName, "[Container]\nName=Vaelo Drive\n", false);
    if (failed && !alreadyThere(failed)) return failed;
  }
  const KeyFile file(g_key_file_new());
  g_key_file_set_string(file.get(), group, "Name", g_get_real_name());
  g_key_file_set_string(file.get(), group, "Token", randomToken().c_str());
  g_key_file_set_boolean(file.get(), group, "SignedIn", TRUE);
  auto failed = writeSmallFile(layout.accountFile(), keyFileText(file.get()), false);
  if (failed && !alreadyThere(failed)) return failed;
  return std::nullopt;
}

/// Shared with the blocks that are under way to the main queue, which may outlive the account.
class Account::Watched : public std::enable_shared_from_this<Watched> {
 public:
  Watched(const DriveLayout& layout, LogSink& log, Queues& queues, NotificationCenter& notifications)
      : layout_(layout), log_(log), queues_(queues), notifications_(notifications), record_(readAccount(layout, log)) {}

  void watch() {
    GFile* file = g_file_new_for_path(layout_.accountFile().c_str());
    GError* failure = nullptr;
    monitor_ = g_file_monitor_file(file, G_FILE_MONITOR_NONE, nullptr, &failure);
    g_object_unref(file);
    if (!monitor_) {
      log_.write(LogType::Error, std::string("drive: can't watch the account: ") + failure->message);
      g_error_free(failure);
      return;
    }
    g_signal_connect(monitor_, "changed", G_CALLBACK(changed), this);
    reload();  // it may have changed before the watch began
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
  static std::optional<UbiquityIdentityToken> tokenOf(const AccountRecord& record) {
    if (!record.signedIn || record.token.empty()) return std::nullopt;
    return UbiquityIdentityToken{record.token};
  }

  static void changed(GFileMonitor*, GFile*, GFile*, GFileMonitorEvent, gpointer self) {
    static_cast<Watched*>(self)->reload();
  }

  void reload() {
    AccountRecord now = readAccount(layout_, log_);
    bool isAnother = false;
    {
      const std::lock_guard lock(mutex_);
      isAnother = tokenOf(now) != tokenOf(record_);
      record_ = std::move(now);
    }
    if (!isAnother) return;
    queues_.main().async([weak = weak_from_this()] {
      if (const auto self = weak.lock()) self->notifications_.post({IdentityDidChangeNotification, {}});
    });
  }

  const DriveLayout& layout_;
  LogSink& log_;
  Queues& queues_;
  NotificationCenter& notifications_;
  GFileMonitor* monitor_ = nullptr;  // main thread
  mutable std::mutex mutex_;
  AccountRecord record_;  // guarded by mutex_
};

Account::Account(const DriveLayout& layout, LogSink& log, Queues& queues, NotificationCenter& notifications)
    : watched_(std::make_shared<Watched>(layout, log, queues, notifications)) {
  watched_->watch();
}

Account::~Account() { watched_->stop(); }

std::optional<UbiquityIdentityToken> Account::token() const { return watched_->token(); }

std::optional<std::int64_t> Account::allowance() const { return watched_->record().allowance; }

}  // namespace vaelo
