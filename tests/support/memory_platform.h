// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gmock/gmock.h>

#include <memory>

#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "tests/support/memory_drive.h"
#include "tests/support/memory_file_progress.h"
#include "tests/support/memory_user_activities.h"
#include "tests/support/recording_log.h"

namespace vaelo {

/// Types as a small table: the ones that tests name, each extension its own type otherwise.
class MemoryTypes : public TypeIdentifiers {
 public:
  std::optional<std::string> preferredIdentifierForExtension(const std::string& extension) override;
  bool conformsTo(const std::string& type, const std::string& other) override;
  std::optional<std::string> description(const std::string& type) override;
};

/// Character classes of ASCII.
class MemoryCharacters : public CharacterClasses {
 public:
  bool containsIllegalCharacter(const std::string& text) override { return text.find('\x7f') != std::string::npos; }
  bool containsControlCharacter(const std::string& text) override;
  bool containsNewline(const std::string& text) override { return text.find('\n') != std::string::npos; }
  std::string trimmingWhitespaceAndNewlines(const std::string& text) override { return text; }
  bool localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) override;
};

/// Plain English.
class MemoryFormatting : public Formatting {
 public:
  std::string byteCount(std::uint64_t bytes, ByteCountStyle style, bool withUnit = true) override;
  std::string localizedDate(Date date, DateStyle dateStyle, DateStyle timeStyle) override;
  std::string localizedString(const std::string& key) override { return key; }
  std::string localizedCount(const std::string& key, std::int64_t count) override { return key + std::to_string(count); }
  std::string localizedAmount(const std::string& key, double, const std::string& text) override { return key + text; }
  std::string filled(const std::string& format, const std::vector<std::string>& arguments) override;
};

class MockApplication : public Application {
 public:
  MOCK_METHOD(int, run, (int, char**, std::function<std::shared_ptr<ApplicationDelegate>()>), (override));
  MOCK_METHOD(bool, isRightToLeft, (), (override));
  MOCK_METHOD(std::string, description, (), (override));
};

class MockTracing : public ActivityTracing {
 public:
  MOCK_METHOD(void, recordUserAction, (const std::string&), (override));
};

class MockDocumentStore : public DocumentStore {
 public:
  MOCK_METHOD(std::optional<Device>, deviceOf, (const URL&), (override));
  MOCK_METHOD(SystemResult<FileID>, resolveDocumentID, (Device, std::uint64_t), (override));
  MOCK_METHOD(SystemResult<int>, openByID, (Device, FileID), (override));
  MOCK_METHOD(SystemResult<OpenFileAttributes>, attributesOfOpenFile, (int), (override));
  MOCK_METHOD(void, close, (int), (override));
};

class MockFileProvider : public FileProvider {
 public:
  MOCK_METHOD(void, BookmarkableStringFromDocumentURL, (const URL&, std::function<void(Result<std::string>)>), (override));
  MOCK_METHOD(void, DocumentURLFromBookmarkableString, (const std::string&, std::function<void(Result<URL>)>), (override));
};

class MockLaunchServices : public LaunchServices {
 public:
  MOCK_METHOD(std::shared_ptr<DocumentRecord>, documentRecord, (const URL&, bool), (override));
  MOCK_METHOD(std::optional<ApplicationRecord>, applicationRecord, (const std::string&), (override));
  std::string ownBundleIdentifier() override { return "own.browser"; }
};

class MockOffers : public OfferManager {
 public:
  MOCK_METHOD(bool, fetchOfferIfNeeded, (), (override));
  MOCK_METHOD(StorageOfferRef, currentOffer, (), (override));
};

class MockPreferences : public Preferences {
 public:
  MOCK_METHOD(std::optional<Data>, dataForKey, (const std::string&), (override));
  MOCK_METHOD(void, setDataForKey, (const std::string&, const Data&), (override));
  MOCK_METHOD(void, removeKey, (const std::string&), (override));
};

class MockQueues : public Queues {
 public:
  DispatchQueue& main() override { throw std::logic_error("no main queue here"); }
  MOCK_METHOD(std::shared_ptr<DispatchQueue>, makeSerialQueue, (const std::string&), (override));
  MOCK_METHOD(std::shared_ptr<OperationQueue>, makeOperationQueue, (const std::string&, QualityOfService), (override));
  MOCK_METHOD(std::unique_ptr<TimerSource>, makeTimer,
              (std::shared_ptr<DispatchQueue>, std::chrono::nanoseconds, std::chrono::nanoseconds, Block), (override));
  Date now() override { return Date(std::chrono::seconds(5000)); }
};

class MockScreens : public ScreenFactory {
 public:
  Graphics& graphics() override { throw std::logic_error("no graphics here"); }
  Device& device() override { throw std::logic_error("no device here"); }
  MOCK_METHOD(WindowRef, makeWindow, (const Rect&), (override));
  MOCK_METHOD(DocumentListControllerRef, makeRootList, (), (override));
  MOCK_METHOD(DocumentListControllerRef, makeList, (const URL&), (override));
  MOCK_METHOD(std::optional<std::vector<DocumentListControllerRef>>, hierarchyTo, (const URL&), (override));
  MOCK_METHOD(ViewControllerRef, makeDriveUnavailable, (), (override));
  MOCK_METHOD(bool, canPreviewItem, (const URL&), (override));
  MOCK_METHOD(std::shared_ptr<DocumentInteractionController>, makeDocumentInteraction, (const URL&), (override));
  MOCK_METHOD(std::shared_ptr<UpgradeFlowManager>, makeUpgradeFlow, (StorageOfferRef), (override));
  MOCK_METHOD(void, runPreOpenAlert, (const URL&, const ViewControllerRef&, std::function<void()>), (override));
};

/// A platform for tests of items: a drive in memory, a log that keeps its lines, and mocks for what a test rarely needs.
/// Installed while it lives.
class MemoryPlatform {
 public:
  MemoryPlatform();
  ~MemoryPlatform() { Platform::install(nullptr); }

  MemoryDrive drive;
  RecordingLog log;
  MemoryTypes types;
  MemoryCharacters characters;
  MemoryFormatting formatting;
  NotificationCenter notifications;
  ::testing::NiceMock<MockApplication> application;
  ::testing::NiceMock<MockTracing> tracing;
  ::testing::NiceMock<MockDocumentStore> documentStore;
  MemoryFileProgress fileProgress;
  MemoryUserActivities userActivities;
  ::testing::NiceMock<MockFileProvider> fileProvider;
  ::testing::NiceMock<MockLaunchServices> launchServices;
  ::testing::NiceMock<MockOffers> offers;
  ::testing::NiceMock<MockPreferences> preferences;
  ::testing::NiceMock<MockQueues> queues;
  ::testing::NiceMock<MockScreens> screens;

 private:
  Platform platform_;
};

}  // namespace vaelo
