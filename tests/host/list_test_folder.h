// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <glib.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <string>

namespace vaelo::list_test {

/// A folder that is gone with its test.
class TestFolder {
 public:
  TestFolder() : path_(std::filesystem::temp_directory_path() / "vaelo-list-XXXXXX") {
    if (!mkdtemp(path_.data())) ADD_FAILURE() << "no temporary folder";
  }
  ~TestFolder() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
  }
  TestFolder(const TestFolder&) = delete;
  TestFolder& operator=(const TestFolder&) = delete;

  const std::string& path() const { return path_; }
  void write(const std::string& name, const std::string& content = "x") const {
    std::ofstream(path_ + "/" + name) << content;
  }
  void makeFolder(const std::string& name) const { std::filesystem::create_directory(path_ + "/" + name); }
  void remove(const std::string& name) const { std::filesystem::remove_all(path_ + "/" + name); }

 private:
  std::string path_;
};

/// Runs the main loop until `happened`; false after ten seconds without.
inline bool waitUntil(const std::function<bool()>& happened) {
  bool late = false;
  const guint timer = g_timeout_add_seconds(
      10,
      [](gpointer flag) -> gboolean {
        *static_cast<bool*>(flag) = true;
        return G_SOURCE_CONTINUE;
      },
      &late);
  while (!late && !happened()) g_main_context_iteration(nullptr, TRUE);
  g_source_remove(timer);
  return happened();
}

}  // namespace vaelo::list_test
