// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gio/gio.h>

#include <atomic>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "host/drive/local_cloud_documents.h"
#include "host/gtk/list/worker.h"

namespace vaelo {

/// Answers the searches of the desktop's shell (org.gnome.Shell.SearchProvider2): items of the drive by name, known to the
/// shell by their document identifiers.
///
/// A search runs on a worker, reads names alone, ends after a part of a second with what it has, and is cut short by the
/// next one. Calls come and answers go on the main thread.
class SearchProvider {
 public:
  struct Events {
    /// The user chose a result. The identifier is what the shell sent: anything.
    std::function<void(const std::string& documentID, std::uint32_t timestamp)> chosen;
    /// The user wants the search to go on in the application.
    std::function<void(const std::string& query, std::uint32_t timestamp)> continued;
  };
  /// `drive` outlives it.
  SearchProvider(LocalCloudDocuments& drive, Events events);
  ~SearchProvider();
  SearchProvider(const SearchProvider&) = delete;
  SearchProvider& operator=(const SearchProvider&) = delete;

  /// False with `error` set when the bus doesn't take the object.
  bool exportOn(GDBusConnection* bus, const std::string& objectPath, GError** error);
  void unexport();

 private:
  void called(const std::string& method, GVariant* arguments, GDBusMethodInvocation* call);
  void choose(const std::string& id, std::uint32_t timestamp);
  void search(const std::vector<std::string>& terms, GDBusMethodInvocation* call);
  void describe(const std::vector<std::string>& ids, GDBusMethodInvocation* call);

  /// Keeps the drive from going while the worker is in it.
  struct Gate {
    std::mutex mutex;
    bool closed = false;  // guarded by mutex
  };

  LocalCloudDocuments& drive_;
  Events events_;
  std::shared_ptr<Gate> gate_ = std::make_shared<Gate>();
  Worker worker_;
  std::shared_ptr<std::atomic<bool>> searching_;  // set to true: the search stops
  GDBusConnection* bus_ = nullptr;                // strong reference
  unsigned registration_ = 0;
};

}  // namespace vaelo
