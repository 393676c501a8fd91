// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/drive_file_progress.h"

#include <gio/gio.h>
#include <sys/stat.h>

#include <algorithm>
#include <utility>
#include <vector>

#include "host/drive/promise_file.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr int ReportEvery = 50;  // milliseconds

class FileTransfer : public Progress {
 public:
  std::string kind() const override { return FileProgressKind; }
  std::int64_t completedUnits() const override { return completed_; }
  std::int64_t totalUnits() const override { return total_; }
  std::string description() const override {
    return std::to_string(completed_) + " of " + std::to_string(total_) + " bytes";
  }
  std::shared_ptr<void> observe(const std::string& keyPath, std::function<void(const std::string&)> changed) override {
    auto observer = std::make_shared<Observer>(Observer{keyPath, std::move(changed)});
    std::erase_if(observers_, [](const auto& each) { return each.expired(); });
    observers_.push_back(observer);
    return observer;
  }
  /// A total of 0 is not known.
  void set(std::int64_t completed, std::int64_t total) {
    if (completed == completed_ && total == total_) return;
    completed_ = completed;
    total_ = total;
    // A copy, since an observer may begin or end another one.
    for (const std::weak_ptr<Observer>& weak : std::vector(observers_)) {
      if (const auto observer = weak.lock(); observer && observer->keyPath == "fractionCompleted") {
        observer->changed("fractionCompleted");
      }
    }
  }

 private:
  struct Observer {
    std::string keyPath;
    std::function<void(const std::string&)> changed;
  };
  std::int64_t completed_ = 0;
  std::int64_t total_ = 0;
  std::vector<std::weak_ptr<Observer>> observers_;
};

class Subscription : public std::enable_shared_from_this<Subscription> {
 public:
  Subscription(const URL& url, FileProgress::Published published)
      : path_(logicalNameOf(url.path()).value_or(url.path())),
        promise_(promisePathFor(path_)),
        partial_(DriveFileProgress::partialPathFor(path_)),
        published_(std::move(published)),
        arrived_(isThere()) {
    const GRef<GFile> folder(g_file_new_for_path(path_.substr(0, path_.rfind('/') + 1).c_str()));
    monitor_.reset(g_file_monitor_directory(folder.get(), G_FILE_MONITOR_WATCH_MOVES, nullptr, nullptr));
    if (!monitor_) return;  // where folders can't be watched nothing is published
    g_file_monitor_set_rate_limit(monitor_.get(), ReportEvery);
    g_signal_connect(monitor_.get(), "changed",
                     G_CALLBACK(+[](GFileMonitor*, GFile* file, GFile* other, GFileMonitorEvent, Subscription* self) {
                       if (self->concerns(file) || self->concerns(other)) self->lookSoon();
                     }),
                     this);
    lookSoon();
  }
  ~Subscription() {
    g_clear_handle_id(&timer_, g_source_remove);
    if (!monitor_) return;
    g_signal_handlers_disconnect_by_data(monitor_.get(), this);
    g_file_monitor_cancel(monitor_.get());
  }
  Subscription(const Subscription&) = delete;
  Subscription& operator=(const Subscription&) = delete;

 private:
  bool isThere() const {
    struct stat status = {};
    return ::lstat(path_.c_str(), &status) == 0;
  }
  bool concerns(GFile* file) const {
    const char* path = file ? g_file_peek_path(file) : nullptr;
    return path && (path_ == path || partial_ == path || promise_ == path);
  }
  void lookSoon() {
    if (timer_) return;
    const gint64 passed = (g_get_monotonic_time() - lastLook_) / 1000;
    timer_ = g_timeout_add(
        static_cast<guint>(lastLook_ ? std::clamp<gint64>(ReportEvery - passed, 0, ReportEvery) : 0),
        +[](gpointer data) -> gboolean {
          // A subscriber may end its subscription while it is told.
          const auto self = static_cast<Subscription*>(data)->shared_from_this();
          self->timer_ = 0;
          self->look();
          self->lastLook_ = g_get_monotonic_time();
          return G_SOURCE_REMOVE;
        },
        this);
  }
  void look() {
    const bool wasThere = std::exchange(arrived_, isThere());
    if (arrived_) {
      if (wasThere) return;
      const std::int64_t total = std::max<std::int64_t>(total_, 1);
      tell(total, total);
      return withdraw();
    }
    struct stat status = {};
    if (::lstat(partial_.c_str(), &status) != 0 || !S_ISREG(status.st_mode)) return withdraw();
    if (!progress_) {
      const Result<PromiseInfo> promise = readPromise(promise_);
      total_ = promise ? static_cast<std::int64_t>(std::min<std::uint64_t>(promise.value->size, INT64_MAX)) : 0;
    }
    tell(total_ > 0 ? std::min<std::int64_t>(status.st_size, total_) : status.st_size, total_);
  }
  void tell(std::int64_t completed, std::int64_t total) {
    if (progress_) return progress_->set(completed, total);
    progress_ = std::make_shared<FileTransfer>();
    progress_->set(completed, total);
    withdrawn_ = published_(progress_);
  }
  void withdraw() {
    if (!std::exchange(progress_, nullptr)) return;
    if (const FileProgress::Withdrawn withdrawn = std::exchange(withdrawn_, nullptr)) withdrawn();
  }

  const std::string path_;
  const std::string promise_;
  const std::string partial_;
  const FileProgress::Published published_;
  bool arrived_;
  std::int64_t total_ = 0;
  GRef<GFileMonitor> monitor_;
  guint timer_ = 0;
  gint64 lastLook_ = 0;
  std::shared_ptr<FileTransfer> progress_;
  FileProgress::Withdrawn withdrawn_;
};

}  // namespace

std::shared_ptr<void> DriveFileProgress::subscribe(const URL& url, Published published) {
  return std::make_shared<Subscription>(url, std::move(published));
}

std::string DriveFileProgress::partialPathFor(const std::string& logicalPath) {
  constexpr std::string_view suffix = ".vlopromise";
  std::string path = promisePathFor(logicalPath);
  return path.replace(path.rfind(suffix), suffix.size(), ".vlopartial");
}

}  // namespace vaelo
