// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/cloud_documents.h"
#include "platform/document_store.h"
#include "platform/file_coordinator.h"
#include "platform/file_manager.h"
#include "platform/file_progress.h"
#include "platform/file_provider.h"
#include "platform/formatting.h"
#include "platform/launch_services.h"
#include "platform/notifications.h"
#include "platform/preferences.h"
#include "platform/type_identifiers.h"
#include "platform/user_activity.h"

namespace vaelo::contract {

/// What another program says of an item that is not downloaded.
struct PromiseFacts {
  std::uint64_t size = 0;
  std::optional<Date> modified;
  std::optional<Date> created;
  bool isPackage = false;
  std::optional<std::string> shareRole;
  std::vector<std::string> tags;
};

/// What a library's manifest says.
struct LibraryFacts {
  std::string name;
  std::optional<std::vector<std::string>> types;
  std::optional<std::string> folderLevels;
  std::vector<std::string> owners;
};

/// One implementation of the platform's services with an empty drive, somebody signed in, and ways to change it as other
/// programs do. Main thread.
class ContractPlatform {
 public:
  virtual ~ContractPlatform() = default;

  virtual FileManager& files() = 0;
  virtual ResourceValues& values() = 0;
  virtual FileCoordination& coordination() = 0;
  virtual CloudDocuments& cloud() = 0;
  virtual DocumentStore& documents() = 0;
  virtual FileProvider& provider() = 0;
  virtual Preferences& preferences() = 0;
  virtual Queues& queues() = 0;
  virtual NotificationCenter& notifications() = 0;
  virtual Formatting& formatting() = 0;
  virtual TypeIdentifiers& types() = 0;
  virtual CharacterClasses& characters() = 0;
  virtual UserActivities& activities() = 0;
  virtual FileProgress& progress() = 0;
  virtual LaunchServices& launch() = 0;

  virtual std::string mirror() const = 0;
  virtual std::string outside() const = 0;  ///< a folder that is not in the drive
  std::string drive() const { return mirror() + "/com~marrow~Kestrel"; }

  // Folders above are made as needed.
  virtual void addFolder(const std::string& path) = 0;
  virtual void addFile(const std::string& path, const std::string& bytes = "content") = 0;
  virtual void addLink(const std::string& path, const std::string& target) = 0;
  virtual void addPromise(const std::string& path, const PromiseFacts& facts = {}) = 0;
  virtual void addBookmark(const std::string& path, const URL& target) = 0;
  virtual void addAlias(const std::string& path, const URL& target) = 0;
  virtual void addLibrary(const std::string& identifier, const LibraryFacts& facts) = 0;
  virtual void setTags(const std::string& path, const std::vector<std::string>& tags) = 0;
  virtual void setShareRole(const std::string& path, const std::string& role) = 0;
  virtual void hideExtension(const std::string& path) = 0;
  virtual void setModified(const std::string& path, Date date) = 0;
  // What another program does without coordination. Folders above are made as needed.
  virtual void renameBehind(const std::string& from, const std::string& to) = 0;
  virtual void changeBehind(const std::string& path, const std::string& bytes) = 0;
  virtual void removeBehind(const std::string& path) = 0;
  virtual void setAccount(std::optional<std::string> token) = 0;
  /// Another program has so many bytes of an item that is not downloaded; the item is there with the last of them.
  virtual void transfer(const std::string& path, std::int64_t completed, std::int64_t total) = 0;
  /// Preferences as after a new start.
  virtual Preferences& preferencesAfterRestart() = 0;

  /// Runs the main queue, and lets the others run, until `done` says so; false when it never does.
  virtual bool until(const std::function<bool()>& done) = 0;
};

std::unique_ptr<ContractPlatform> makeMemoryPlatform();
std::unique_ptr<ContractPlatform> makeHostPlatform();

}  // namespace vaelo::contract
