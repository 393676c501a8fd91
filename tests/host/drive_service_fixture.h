// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <sys/statvfs.h>

#include "host/drive/alias_file.h"
#include "host/drive/bookmark_file.h"
#include "host/drive/local_cloud_documents.h"
#include "host/drive/local_document_store.h"
#include "host/drive/local_file_provider.h"
#include "host/drive/promise_file.h"
#include "tests/host/drive_test_support.h"

namespace vaelo::drive_test {

class DriveServiceTest : public DriveTest {
 protected:
  void start() {
    service.reset();
    service = std::make_unique<LocalCloudDocuments>(data, log, queues, notifications);
  }
  void addLibrary(const std::string& identifier, const std::string& manifest) {
    makeFolder(mirror + "/" + identifier + "/Documents");
    write(mirror + "/" + identifier + "/.vaelo-container", manifest);
  }
  std::vector<std::string> containerNames() {
    std::vector<std::string> names;
    for (const CloudContainerRef& container : service->allContainers()) names.push_back(container->localizedName());
    return names;
  }
  void writeAccount(const std::string& text) {
    // As another process does it: the file is replaced in one step.
    write(root + "/account.new", "[Account]\nName=Me\n" + text);
    std::filesystem::rename(root + "/account.new", data + "/account.ini");
  }
  /// Runs the main loop until `done`; fails after ten seconds.
  template <typename Condition>
  bool waitFor(Condition done) {
    bool late = false;
    const guint timer = g_timeout_add_seconds(
        10, [](gpointer flag) -> gboolean { return *static_cast<bool*>(flag) = true; }, &late);
    while (!done() && !late) {
      g_main_context_iteration(nullptr, TRUE);
      queues.main().drain();
    }
    g_source_remove(timer);
    return !late;
  }

  TestQueues queues;
  NotificationCenter notifications;
  std::unique_ptr<LocalCloudDocuments> service;
};

}  // namespace vaelo::drive_test
