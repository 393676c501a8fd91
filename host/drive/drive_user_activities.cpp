// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/drive_user_activities.h"

#include <dirent.h>
#include <gio/gio.h>
#include <unistd.h>

#include <cerrno>
#include <map>
#include <utility>
#include <vector>

#include "host/drive/device_identity.h"
#include "host/drive/published_activity.h"
#include "host/drive/small_file.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr std::string_view activitySuffix = ".ini";
constexpr std::size_t mostFiles = 64;      // of as many devices; more are somebody's mistake or mischief
constexpr guint gatherMilliseconds = 100;  // a file is replaced in several steps

struct OtherActivity {
  std::string deviceID;
  ActivityRecord record;
  bool operator==(const OtherActivity&) const = default;
};

std::string activitiesFolder(const DriveLayout& layout) { return layout.mirrorRoot() + "/.vaelo/activities"; }

}  // namespace

/// Keeps this device's file as the current activity says, and reads those of the others. What touches the disk runs on one
/// queue, in the order in which it was asked for.
class DriveUserActivities::Publisher : public CurrentActivity {
 public:
  using Found = std::function<void(std::optional<OtherActivity>)>;

  Publisher(const DriveLayout& layout, LogSink& log, Queues& queues)
      : layout_(layout), log_(log), queues_(queues), queue_(queues.makeSerialQueue("com.marrow.VaeloDrive.activities")) {}

  void becomes(const void* activity, std::optional<ActivityRecord> offered) override {
    const std::lock_guard lock(mutex_);
    current_ = activity;
    offer(std::move(offered));
  }
  void changes(const void* activity, std::optional<ActivityRecord> offered) override {
    const std::lock_guard lock(mutex_);
    if (current_ == activity) offer(std::move(offered));
  }
  void resigns(const void* activity) override {
    const std::lock_guard lock(mutex_);
    if (current_ != activity) return;
    current_ = nullptr;
    offer(std::nullopt);
  }
  /// What was current was so for the account before.
  void forget() {
    const std::lock_guard lock(mutex_);
    current_ = nullptr;
    offer(std::nullopt);
  }
  /// Calls back on the queue, now and when this device's own activity has changed.
  void findOthers(Found found) {
    queue_->async([this, found = std::move(found)]() mutable {
      found_ = std::move(found);
      keep();
      found_(latest());
    });
  }
  void lookAgain() {
    queue_->async([this] { found_(latest()); });
  }
  std::string folder() const { return activitiesFolder(layout_); }
  LogSink& log() { return log_; }
  Queues& queues() { return queues_; }

 private:
  // Called under the lock, so that what is written last is what was said last.
  void offer(std::optional<ActivityRecord> offered) {
    offered_ = std::move(offered);
    if (offered_) offered_->since = std::chrono::floor<std::chrono::seconds>(queues_.now());
    queue_->async([this] { keep(); });
  }

  // All below: on the queue.

  void keep() {
    std::optional<ActivityRecord> offered;
    {
      const std::lock_guard lock(mutex_);
      offered = offered_;
    }
    if (offered) offered->deviceName = device().name;
    const std::string folder = this->folder();
    if (isKept_ && offered == kept_ && folder == keptIn_) return;
    const std::string name = "/" + device().id + std::string(activitySuffix);
    // What was told to the devices of another account is no longer so.
    if (isKept_ && kept_ && folder != keptIn_) ::unlink((keptIn_ + name).c_str());
    isKept_ = true;
    kept_ = offered;
    keptIn_ = folder;
    const std::string file = folder + name;
    std::optional<Error> error;
    if (!offered) {
      if (::unlink(file.c_str()) != 0 && errno != ENOENT && errno != ENOTDIR) {
        error = errorFromErrno(errno, file, FileAccess::Write);
      }
    } else if (g_mkdir_with_parents(folder.c_str(), 0700) != 0) {
      error = errorFromErrno(errno, folder, FileAccess::Write);
    } else {
      error = writeSmallFile(file, activityFileText(*offered));
    }
    if (error) log_.write(LogType::Error, "drive: can't tell other devices what is open: " + error->description());
    if (found_) found_(latest());
  }

  std::optional<OtherActivity> latest() {
    std::optional<OtherActivity> found;
    std::map<std::string, std::string> refusals;
    for (const std::string& name : activityFiles()) {
      std::string reason;
      if (auto other = readOther(name, reason)) {
        if (!found || found->record.since < other->record.since) found = std::move(other);
      } else if (!reason.empty()) {
        refusals[name] = reason;
        if (refusals_[name] != reason) log_.write(LogType::Error, "drive: activity " + name + " ignored: " + reason);
      }
    }
    refusals_ = std::move(refusals);
    return found;
  }

  std::vector<std::string> activityFiles() {
    std::vector<std::string> names;
    const std::unique_ptr<DIR, int (*)(DIR*)> stream(::opendir(folder().c_str()), ::closedir);
    if (!stream) return names;
    const std::string own = device().id + std::string(activitySuffix);
    while (const dirent* entry = ::readdir(stream.get())) {
      const std::string name = entry->d_name;
      if (name.front() == '.' || name == own) continue;  // temporary files begin so
      if (names.size() == mostFiles) {
        if (!std::exchange(toldOfMany_, true)) log_.write(LogType::Error, "drive: too many activities; the rest is ignored");
        break;
      }
      names.push_back(name);
    }
    return names;
  }

  // Nothing, without a reason, for what is no fault: the same document is open here.
  std::optional<OtherActivity> readOther(const std::string& name, std::string& reason) {
    const std::string id = name.ends_with(activitySuffix) ? name.substr(0, name.size() - activitySuffix.size()) : "";
    if (!isDeviceID(id)) {
      reason = "not the name of a device's file";  // not for people
      return std::nullopt;
    }
    Result<ActivityRecord> record = readActivityFile(folder() + "/" + name, queues_.now());
    if (!record) {
      if (record.error->code != FileErrorCode::ReadNoSuchFile) {
        reason = record.error->localizedFailureReason.value_or("it can't be read");  // not for people
      }
      return std::nullopt;
    }
    if (kept_ && kept_->type == record.value->type && kept_->userInfo == record.value->userInfo) return std::nullopt;
    return OtherActivity{id, std::move(*record.value)};
  }

  const DeviceIdentity& device() {
    if (device_.id.empty()) device_ = deviceIdentity(layout_, log_);
    return device_;
  }

  const DriveLayout& layout_;
  LogSink& log_;
  Queues& queues_;
  std::mutex mutex_;  // guards the two below
  const void* current_ = nullptr;
  std::optional<ActivityRecord> offered_;
  // On the queue:
  bool isKept_ = false;  // the file is as kept_ says
  std::optional<ActivityRecord> kept_;
  std::string keptIn_;  // the folder
  DeviceIdentity device_;
  std::map<std::string, std::string> refusals_;  // which the log has told, by file
  bool toldOfMany_ = false;
  Found found_;
  std::shared_ptr<DispatchQueue> queue_;  // last, so that it ends before what its blocks use
};

/// The folder's monitor, and the hop to the main thread.
class DriveUserActivities::Watch : public std::enable_shared_from_this<Watch> {
 public:
  Watch(std::shared_ptr<Publisher> publisher, OfferChanged changed)
      : publisher_(std::move(publisher)), changed_(std::move(changed)) {}
  ~Watch() { stop(); }
  Watch(const Watch&) = delete;
  Watch& operator=(const Watch&) = delete;

  void start() {
    const std::string folder = publisher_->folder();
    g_mkdir_with_parents(folder.c_str(), 0700);
    const GRef<GFile> file(g_file_new_for_path(folder.c_str()));
    GError* failure = nullptr;
    monitor_.reset(g_file_monitor_directory(file.get(), G_FILE_MONITOR_NONE, nullptr, &failure));
    if (const GErrorPtr owned(failure); owned) {
      publisher_->log().write(LogType::Error, std::string("drive: can't watch what other devices do: ") + owned->message);
    } else {
      g_signal_connect_swapped(monitor_.get(), "changed", G_CALLBACK(+[](Watch* self) { self->lookSoon(); }), this);
    }
    publisher_->findOthers(
        [weak = weak_from_this(), &main = publisher_->queues().main()](std::optional<OtherActivity> found) {
          main.async([weak, found = std::move(found)] {
            if (const auto self = weak.lock()) self->found(found);
          });
        });
  }
  void restart() {
    stop();
    start();
  }
  void stop() {
    g_clear_handle_id(&timer_, g_source_remove);
    if (!monitor_) return;
    g_signal_handlers_disconnect_by_data(monitor_.get(), this);
    g_file_monitor_cancel(monitor_.get());
    monitor_.reset();
  }

 private:
  void lookSoon() {
    if (timer_) return;
    timer_ = g_timeout_add(
        gatherMilliseconds,
        +[](gpointer data) -> gboolean {
          auto* self = static_cast<Watch*>(data);
          self->timer_ = 0;
          self->publisher_->lookAgain();
          return G_SOURCE_REMOVE;
        },
        this);
  }
  void found(const std::optional<OtherActivity>& other) {
    if (!monitor_ || other == told_) return;
    told_ = other;
    if (!other) return changed_(std::nullopt);
    Dictionary userInfo;
    for (const auto& [key, value] : other->record.userInfo) userInfo[key] = value;
    auto activity = std::make_shared<PublishedActivity>(other->record.type, std::weak_ptr<CurrentActivity>());
    activity->setUserInfo(std::move(userInfo));
    changed_(OfferedActivity{other->deviceID, other->record.deviceName, std::move(activity)});
  }

  const std::shared_ptr<Publisher> publisher_;
  const OfferChanged changed_;
  GRef<GFileMonitor> monitor_;
  guint timer_ = 0;
  std::optional<OtherActivity> told_;
};

DriveUserActivities::DriveUserActivities(const DriveLayout& layout, LogSink& log, Queues& queues)
    : publisher_(std::make_shared<Publisher>(layout, log, queues)) {}

DriveUserActivities::~DriveUserActivities() {
  if (watch_) watch_->stop();
}

std::shared_ptr<UserActivity> DriveUserActivities::makeActivity(const std::string& type) {
  return std::make_shared<PublishedActivity>(type, publisher_);
}

void DriveUserActivities::accountChanged() {
  publisher_->forget();
  if (watch_) watch_->restart();
}

void DriveUserActivities::watchOthers(OfferChanged changed) {
  watch_ = std::make_shared<Watch>(publisher_, std::move(changed));
  watch_->start();
}

}  // namespace vaelo
