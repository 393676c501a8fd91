// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtest/gtest.h>

#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "tests/support/memory_platform.h"

namespace vaelo {

inline const URL Library("/drive/mirror/org~example~Sketchbook", true);
inline const URL LibraryDocuments("/drive/mirror/org~example~Sketchbook/Documents", true);
inline constexpr const char* LibraryIdentifier = "org~example~Sketchbook";

using TestContainer = MemoryContainer;
using WorldItem = MemoryItem;

inline Error fileError(int code) { return {FileErrorDomain, code, {}, {}, {}}; }

/// The platform in memory for tests of items, with a library besides the drive. Items have the metadata that a test says
/// and no other, and types are those that it says; the short names are for what most of these tests touch.
class ItemsWorld : public MemoryPlatform {
 public:
  ItemsWorld();

  MemoryItem& addFile(const URL& url, ResourceMap said = {});
  MemoryItem& addFolder(const URL& url, ResourceMap said = {});
  int indexOf(const std::string& call) const { return record.indexOf(call); }
  bool called(const std::string& call) const { return record.has(call); }

  // What was asked.
  std::vector<std::string>& calls = record.calls;
  RecordingLog& recordedLog = log;
  std::vector<std::string>& userActions = tracing.userActions;
  std::vector<ResourceKey>& lastKeys = record.lastKeys;
  unsigned& lastOptions = record.lastOptions;

  // The file system.
  std::map<std::string, MemoryItem>& items = disk.items;
  std::set<std::string>& unreachable = values.unreachable;
  std::map<std::string, Result<ResourceMap>>& promisedAnswers = values.promisedAnswers;
  std::map<std::string, Result<ResourceMap>>& plainAnswers = values.plainAnswers;
  std::optional<Error>& createError = files.createError;
  std::optional<Error>& removeError = files.removeError;
  std::optional<Error>& moveError = files.moveError;
  std::optional<Error>& enumerationError = files.enumerationError;
  std::map<std::string, URL>& linkTargets = values.linkTargets;
  std::map<std::string, Result<URL>>& aliasTargets = values.aliasTargets;
  bool& securityScoped = values.securityScoped;
  std::vector<std::string>& documentsDirectories = files.documentsDirectories;
  Date& now_ = clock->origin;

  // Coordination.
  std::optional<Error>& coordinatorError = coordination.coordinatorError;
  bool& errorAfterAccessor = coordination.errorAfterAccessor;
  std::map<std::string, URL>& redirected = coordination.redirected;
  std::function<void()>& beforeAccessor = coordination.beforeAccessor;

  // The cloud.
  std::shared_ptr<MemoryContainer> drive = cloud.drive;
  std::shared_ptr<MemoryContainer> appLibrary = cloud.addContainer(LibraryIdentifier, "Sketchbook");
  std::vector<CloudContainerRef>& containers = cloud.containers;
  std::optional<Error>& containerError = cloud.containerError;
  bool& containerErrorComesWithValue = cloud.containerErrorComesWithValue;
  bool& containerLookupTellsNothing = cloud.containerLookupTellsNothing;
  CloudContainerRef& containerOfEverything = cloud.containerOfEverything;
  std::map<std::string, Result<URL>>& bookmarks = cloud.bookmarks;
  std::map<std::string, URL>& logicalOfPromise = cloud.logicalOfPromise;
  std::map<std::string, URL>& physicalOfLogical = cloud.physicalOfLogical;
  std::map<std::string, Result<std::vector<std::string>>>& tags = cloud.tags;
  std::set<std::string>& movableTo = cloud.movableTo;
  std::optional<Error>& evictError = cloud.evictError;

  // The document store.
  SystemResult<DocumentStore::FileID>& resolvedFile = documents.resolvedFile.emplace();
  SystemResult<int>& openedHandle = documents.openedHandle.emplace();
  SystemResult<DocumentStore::OpenFileAttributes>& openAttributes = documents.openAttributes.emplace();
  std::optional<DocumentStore::Device>& device_ = documents.device;
  std::set<DocumentStore::Device>& devices = documents.devices;

  // Applications and types.
  std::map<std::string, std::string>& typeOfExtension = types.typeOfExtension;
  std::map<std::string, std::set<std::string>>& conformances = types.conformances;
  std::map<std::string, std::string>& descriptions = types.descriptions;
  Result<DocumentRecord::Ranked>& ranked = launch.ranked;
  std::map<std::string, ApplicationRecord>& applications = launch.applications;
  std::set<std::string>& unpreviewable = screens.unpreviewable;
  bool& holdsOpening = screens.holdsOpening;
  bool& opensInPlace = screens.opensInPlace;
  std::function<void()>& heldOpening = screens.heldOpening;
  ViewControllerRef& openingPresenter = screens.openingPresenter;
  bool& rightToLeft = application.rightToLeft;

 private:
  MemoryItem& add(const URL& url, FileType type, ResourceMap said);
};

inline const Date Noon{std::chrono::hours(12)};

/// The base of all tests of items.
class ItemsTest : public ::testing::Test {
 protected:
  bool logged(const std::string& level, const std::string& message) { return world.log.has(level, message); }
  std::vector<std::string> messages() { return world.log.messages(); }

  ItemsWorld world;
};

}  // namespace vaelo
