// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gio/gio.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/xattr.h>

#include <deque>
#include <filesystem>
#include <fstream>
#include <mutex>
#include <string>
#include <vector>

#include "platform/logging.h"
#include "platform/queues.h"

namespace vaelo::drive_test {

class RecordingLog : public LogSink {
 public:
  void write(LogType, const std::string& line) override {
    const std::lock_guard lock(mutex_);
    lines_.push_back(line);
  }
  int count(const std::string& part) {
    const std::lock_guard lock(mutex_);
    int found = 0;
    for (const std::string& line : lines_) found += line.find(part) != std::string::npos;
    return found;
  }

 private:
  std::mutex mutex_;
  std::vector<std::string> lines_;  // guarded by mutex_
};

class ManualQueue : public DispatchQueue {
 public:
  void async(Block block) override {
    const std::lock_guard lock(mutex_);
    blocks_.push_back(std::move(block));
  }
  void after(std::chrono::nanoseconds, Block block) override { async(std::move(block)); }
  std::string label() const override { return "main"; }
  void drain() {
    for (;;) {
      Block block;
      {
        const std::lock_guard lock(mutex_);
        if (blocks_.empty()) return;
        block = std::move(blocks_.front());
        blocks_.pop_front();
      }
      block();
    }
  }

 private:
  std::mutex mutex_;
  std::deque<Block> blocks_;  // guarded by mutex_
};

class InlineOperations : public OperationQueue {
 public:
  void addOperation(Block operation) override { operation(); }
  std::string name() const override { return "inline"; }
  QualityOfService qualityOfService() const override { return QualityOfService::Default; }
};

/// The main queue runs when the test says so; operations run at once.
class TestQueues : public Queues {
 public:
  ManualQueue& main() override { return main_; }
  std::shared_ptr<DispatchQueue> makeSerialQueue(const std::string&) override { return std::make_shared<ManualQueue>(); }
  std::shared_ptr<OperationQueue> makeOperationQueue(const std::string&, QualityOfService) override {
    return std::make_shared<InlineOperations>();
  }
  std::unique_ptr<TimerSource> makeTimer(std::shared_ptr<DispatchQueue>, std::chrono::nanoseconds, std::chrono::nanoseconds,
                                         Block) override {
    return nullptr;
  }
  Date now() override { return Date(); }

 private:
  ManualQueue main_;
};

/// A temporary folder with the data folder of a drive in it, and short ways to put things there.
class DriveTest : public testing::Test {
 protected:
  DriveTest() {
    std::string pattern = testing::TempDir() + "vaelo-drive-XXXXXX";
    root = std::filesystem::canonical(::mkdtemp(pattern.data())).string();
    data = root + "/data";
    mirror = data + "/mirror";
    drive = mirror + "/com~marrow~Kestrel";
  }
  ~DriveTest() override { std::filesystem::remove_all(root); }

  static void makeFolder(const std::string& path) { std::filesystem::create_directories(path); }
  static void write(const std::string& path, const std::string& bytes = "content") {
    makeFolder(path.substr(0, path.rfind('/')));
    std::ofstream(path, std::ios::binary) << bytes;
  }
  static std::string read(const std::string& path) {
    std::ifstream stream(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
  }
  static void link(const std::string& target, const std::string& path) { std::filesystem::create_symlink(target, path); }
  static void rename(const std::string& from, const std::string& to) {
    makeFolder(to.substr(0, to.rfind('/')));
    std::filesystem::rename(from, to);
  }
  static bool exists(const std::string& path) { return std::filesystem::exists(std::filesystem::symlink_status(path)); }
  static void setAttribute(const std::string& path, const char* name, const std::string& value) {
    ASSERT_EQ(::lsetxattr(path.c_str(), name, value.data(), value.size(), 0), 0) << path;
  }
  static std::string attribute(const std::string& path, const char* name) {
    char value[256];
    const ssize_t length = ::lgetxattr(path.c_str(), name, value, sizeof value);
    return length < 0 ? "" : std::string(value, static_cast<std::size_t>(length));
  }
  static void removeAttribute(const std::string& path, const char* name) { ::lremovexattr(path.c_str(), name); }
  /// What a user does with `cp -a`: attributes come along.
  static void copyWithAttributes(const std::string& from, const std::string& to) {
    std::string program = "cp", option = "-a", source = from, target = to;
    char* arguments[] = {program.data(), option.data(), source.data(), target.data(), nullptr};
    int status = -1;
    ASSERT_TRUE(g_spawn_sync(nullptr, arguments, nullptr, G_SPAWN_SEARCH_PATH, nullptr, nullptr, nullptr, nullptr, &status,
                             nullptr));
    ASSERT_EQ(status, 0);
  }

  std::string root, data, mirror, drive;
  RecordingLog log;
};

}  // namespace vaelo::drive_test
