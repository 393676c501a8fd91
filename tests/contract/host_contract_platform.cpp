// SPDX-License-Identifier: GPL-3.0-or-later
#include <fcntl.h>
#include <gio/gio.h>
#include <sys/stat.h>
#include <sys/xattr.h>

#include <filesystem>
#include <fstream>
#include <stdexcept>

#include "host/desktop/gio_launch_services.h"
#include "host/drive/alias_file.h"
#include "host/drive/bookmark_file.h"
#include "host/drive/drive_file_progress.h"
#include "host/drive/drive_user_activities.h"
#include "host/drive/local_cloud_documents.h"
#include "host/drive/local_document_store.h"
#include "host/drive/local_file_provider.h"
#include "host/drive/promise_file.h"
#include "host/files/g_types.h"
#include "host/files/glib_queues.h"
#include "host/files/icu_character_classes.h"
#include "host/files/icu_formatting.h"
#include "host/files/ini_preferences.h"
#include "host/files/local_file_coordination.h"
#include "host/files/local_file_manager.h"
#include "host/files/local_resource_values.h"
#include "tests/contract/contract_platform.h"
#include "tests/support/recording_log.h"

namespace vaelo::contract {

namespace {

namespace fs = std::filesystem;

/// A folder below the system's temporary one that goes with everything in it.
class TemporaryFolder {
 public:
  TemporaryFolder() {
    std::string pattern = (fs::temp_directory_path() / "vaelo-contract-XXXXXX").string();
    if (!::mkdtemp(pattern.data())) throw std::runtime_error("no temporary folder");
    path_ = fs::canonical(pattern).string();
  }
  ~TemporaryFolder() {
    std::error_code ignored;
    fs::remove_all(path_, ignored);
  }
  TemporaryFolder(const TemporaryFolder&) = delete;
  TemporaryFolder& operator=(const TemporaryFolder&) = delete;
  const std::string& path() const { return path_; }

 private:
  std::string path_;
};

void makeFolderFor(const std::string& path) { fs::create_directories(fs::path(path).parent_path()); }

void write(const std::string& path, const std::string& bytes) {
  makeFolderFor(path);
  std::ofstream(path, std::ios::binary) << bytes;
}

/// The data folder as it is before the services look at it: an account, an empty drive.
std::string preparedData(const std::string& root) {
  write(root + "/data/account.ini", "[Account]\nName=Somebody\nToken=somebody\nSignedIn=true\n");
  fs::create_directories(root + "/data/mirror/com~marrow~Kestrel");
  fs::create_directories(root + "/outside");
  return root + "/data";
}

class HostContractPlatform : public ContractPlatform {
 public:
  FileManager& files() override { return files_; }
  ResourceValues& values() override { return values_; }
  FileCoordination& coordination() override { return coordination_; }
  CloudDocuments& cloud() override { return cloud_; }
  DocumentStore& documents() override { return documents_; }
  FileProvider& provider() override { return provider_; }
  Preferences& preferences() override { return *preferences_; }
  Preferences& preferencesAfterRestart() override {
    preferences_ = std::make_unique<IniPreferences>(preferencesFile(), log_);
    return *preferences_;
  }
  Queues& queues() override { return queues_; }
  NotificationCenter& notifications() override { return notifications_; }
  Formatting& formatting() override { return formatting_; }
  TypeIdentifiers& types() override { return types_; }
  CharacterClasses& characters() override { return characters_; }
  UserActivities& activities() override { return activities_; }
  FileProgress& progress() override { return progress_; }
  LaunchServices& launch() override { return launch_; }

  std::string mirror() const override { return data_ + "/mirror"; }
  std::string outside() const override { return root_.path() + "/outside"; }

  void addFolder(const std::string& path) override { fs::create_directories(path); }
  void addFile(const std::string& path, const std::string& bytes) override { write(path, bytes); }
  void addLink(const std::string& path, const std::string& target) override {
    makeFolderFor(path);
    fs::create_symlink(target, path);
  }
  void addPromise(const std::string& path, const PromiseFacts& facts) override {
    makeFolderFor(path);
    PromiseInfo info;
    info.name = fs::path(path).filename().string();
    info.size = facts.size;
    info.modified = facts.modified;
    info.created = facts.created;
    info.package = facts.isPackage;
    info.share = facts.shareRole;
    info.tags = facts.tags;
    check(!writePromise(fs::path(path).parent_path().string(), info));
  }
  void addBookmark(const std::string& path, const URL& target) override {
    makeFolderFor(path);
    check(!writeBookmarkFile(path, target));
  }
  void addAlias(const std::string& path, const URL& target) override {
    write(path, "[Desktop Entry]\nType=Link\nName=Alias\nURL=" + target.absoluteString() + "\n");
  }
  void addLibrary(const std::string& identifier, const LibraryFacts& facts) override {
    const std::string folder = mirror() + "/" + identifier;
    fs::create_directories(folder + "/Documents");
    std::string manifest = "[Container]\nName=" + facts.name + "\n";
    const auto list = [](const std::vector<std::string>& items) {
      std::string text;
      for (const std::string& item : items) text += item + ";";
      return text;
    };
    if (facts.types) manifest += "DocumentTypes=" + list(*facts.types) + "\n";
    if (facts.folderLevels) manifest += "FolderLevels=" + *facts.folderLevels + "\n";
    if (!facts.owners.empty()) manifest += "Owners=" + list(facts.owners) + "\n";
    write(folder + "/.vaelo-container", manifest);
  }
  void setTags(const std::string& path, const std::vector<std::string>& tags) override {
    std::string text;
    for (const std::string& tag : tags) text += (text.empty() ? "" : ",") + tag;
    setAttribute(path, "user.xdg.tags", text);
  }
  void setShareRole(const std::string& path, const std::string& role) override {
    setAttribute(path, "user.vaelo.share", role);
  }
  void hideExtension(const std::string& path) override { setAttribute(path, "user.vaelo.hidden-extension", "true"); }
  void setModified(const std::string& path, Date date) override {
    using namespace std::chrono;
    const auto whole = floor<seconds>(date);
    timespec time{};
    time.tv_sec = whole.time_since_epoch().count();
    time.tv_nsec = duration_cast<nanoseconds>(date - whole).count();
    const timespec times[2] = {time, time};
    check(::utimensat(AT_FDCWD, path.c_str(), times, AT_SYMLINK_NOFOLLOW) == 0);
  }
  void renameBehind(const std::string& from, const std::string& to) override {
    makeFolderFor(to);
    fs::rename(from, to);
  }
  void changeBehind(const std::string& path, const std::string& bytes) override { write(path, bytes); }
  void removeBehind(const std::string& path) override { fs::remove_all(path); }
  void setAccount(std::optional<std::string> token) override {
    // As another process does it: the file is replaced in one step.
    write(root_.path() + "/account.new", "[Account]\nName=Somebody\nToken=" + token.value_or("somebody") +
                                             "\nSignedIn=" + (token ? "true" : "false") + "\n");
    fs::rename(root_.path() + "/account.new", data_ + "/account.ini");
  }
  void transfer(const std::string& path, std::int64_t completed, std::int64_t total) override {
    const std::string partial = DriveFileProgress::partialPathFor(path);
    write(partial, std::string(static_cast<std::size_t>(completed), 'x'));
    if (completed < total) return;
    fs::rename(partial, path);
    fs::remove(promisePathFor(path));
  }
  bool until(const std::function<bool()>& done) override {
    bool late = false;
    const guint deadline = g_timeout_add_seconds(
        10, [](gpointer flag) -> gboolean { return *static_cast<bool*>(flag) = true; }, &late);
    // What other threads do wakes no main loop.
    const guint tick = g_timeout_add(
        1, [](gpointer) -> gboolean { return G_SOURCE_CONTINUE; }, nullptr);
    while (!done() && !late) g_main_context_iteration(nullptr, TRUE);
    g_source_remove(tick);
    g_source_remove(deadline);
    return !late;
  }

 private:
  static void check(bool ok) {
    if (!ok) throw std::runtime_error("the test's folder can't be changed");
  }
  static void setAttribute(const std::string& path, const char* name, const std::string& value) {
    check(::lsetxattr(path.c_str(), name, value.data(), value.size(), 0) == 0);
  }
  std::string preferencesFile() const { return root_.path() + "/preferences.ini"; }

  TemporaryFolder root_;
  std::string data_ = preparedData(root_.path());
  RecordingLog log_;
  GLibQueues queues_;
  NotificationCenter notifications_;
  GTypes types_;
  IcuCharacterClasses characters_;
  IcuFormatting formatting_{"en_US", "en_US"};
  LocalFileManager files_;
  LocalCloudDocuments cloud_{data_, log_, queues_, notifications_};
  LocalDocumentStore documents_{cloud_.index()};
  LocalFileProvider provider_{cloud_.layout(), cloud_.index(), queues_};
  LocalResourceValues values_{cloud_.layout(), cloud_.index(), types_};
  LocalFileCoordination coordination_{data_ + "/coordination.lock"};
  DriveUserActivities activities_{cloud_.layout(), log_, queues_};
  DriveFileProgress progress_;
  GioLaunchServices launch_;
  std::unique_ptr<IniPreferences> preferences_ = std::make_unique<IniPreferences>(preferencesFile(), log_);
};

}  // namespace

std::unique_ptr<ContractPlatform> makeHostPlatform() { return std::make_unique<HostContractPlatform>(); }

}  // namespace vaelo::contract
