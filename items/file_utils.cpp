// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/file_utils.h"

#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

enum class ItemKind { None, File, Directory };

ItemKind kindOf(const URL& url) {
  bool isDirectory = false;
  if (!Platform::current().fileManager.fileExistsAtPath(url.path(), &isDirectory)) return ItemKind::None;
  return isDirectory ? ItemKind::Directory : ItemKind::File;
}

Error baseError(int code) { return Error{FileErrorDomain, code, {}, {}, {}}; }

std::unique_ptr<FileCoordinator> freshCoordinator() { return Platform::current().fileCoordination.makeCoordinator(); }

// What is done inside the coordinated writes: functions of their own, since log lines tell the name of the function.

std::optional<Error> createDirectory(const URL& url) {
  const std::optional<Error> failure = Platform::current().fileManager.createDirectoryAtURL(url);
  if (failure) {
    VLO_ERROR("failed to create directory:'%@': %@", url, *failure);
  } else {
    VLO_INFO("Created directory: '%@'", url);
  }
  return failure;
}

std::optional<Error> removeUnlessChanged(const URL& url, const Value& dateBefore) {
  const Value dateNow = FileUtils::getResourceValueForURL(ResourceKey::ContentModificationDate, url);
  // Two absent dates are no equal ones.
  if (!dateBefore.isPresent() || !(dateBefore == dateNow)) {
    VLO_INFO("Date changed during delete (user chose Keep?) -- preserving document: '%@'", url);
    return baseError(FileErrorCode::UserCancelled);
  }
  const std::optional<Error> failure = Platform::current().fileManager.removeItemAtURL(url);
  if (failure) {
    VLO_ERROR("failed to delete item:'%@': %@", url, *failure);
  } else {
    VLO_INFO("Deleted item: '%@'", url);
  }
  return failure;
}

std::optional<Error> moveWithNotices(FileCoordinator& coordinator, const URL& source, const URL& destination) {
  coordinator.itemWillMove(source, destination);
  VLO_DEBUG("Moving src2:  '%@'", source);
  VLO_DEBUG("Moving dest2: '%@'", destination);
  const std::optional<Error> failure = Platform::current().fileManager.moveItemAtURL(source, destination);
  if (failure) {
    VLO_WARNING("KX Move failed: %@", *failure);
  } else {
    VLO_INFO("Move successful");
    coordinator.itemDidMove(source, destination);
  }
  return failure;
}

}  // namespace

bool FileUtils::exists(const URL& url) { return Platform::current().fileManager.fileExistsAtPath(url.path()); }

bool FileUtils::isFile(const URL& url) { return kindOf(url) == ItemKind::File; }

bool FileUtils::isDir(const URL& url) { return kindOf(url) == ItemKind::Directory; }

std::optional<Error> FileUtils::mkdir(const URL& url) {
  VLO_DEBUG("Creating directory: '%@'", url);
  std::optional<Error> failure;
  std::optional<Error> error = freshCoordinator()->coordinateWriting(
      url, WritingDefault, [&](const URL& newURL) { failure = createDirectory(newURL); });
  if (!error) error = failure;
  VLO_DEBUG("Coordinated Write returned %@", error);
  return error;
}

std::optional<Error> FileUtils::remove(const URL& url) {
  VLO_DEBUG("Removing item: '%@'", url);
  const Value dateBefore = getResourceValueForURL(ResourceKey::ContentModificationDate, url);
  std::optional<Error> failure;
  std::optional<Error> error = freshCoordinator()->coordinateWriting(
      url, WritingForDeleting, [&](const URL& newURL) { failure = removeUnlessChanged(newURL, dateBefore); });
  if (!error) error = failure;
  VLO_INFO("Coordinated Write returned %@", error);
  return error;
}

std::optional<Error> FileUtils::moveTo(const URL& source, const URL& destination) {
  VLO_DEBUG("Moving src1:  '%@'", source);
  VLO_DEBUG("Moving dest1: '%@'", destination);
  if (source.path() == destination.path()) {
    VLO_DEBUG("Move: src and dest are the same");
    return std::nullopt;
  }
  const ItemKind kind = kindOf(source);
  if (kind == ItemKind::None) VLO_INFO("Move: source filename does not exist, must be a fault.");
  const ItemKind kindThere = kindOf(destination);
  if (kind == ItemKind::File && kindThere == ItemKind::Directory) {
    VLO_ERROR("Move: must move a file to a file (dest is a dir)");
    return baseError(FileErrorCode::FeatureUnsupported);
  }
  if (kind == ItemKind::Directory && kindThere == ItemKind::File) {
    VLO_ERROR("Move: must move a dir to a dir (dest is a file)");
    return baseError(FileErrorCode::FeatureUnsupported);
  }
  const std::unique_ptr<FileCoordinator> coordinator = freshCoordinator();
  std::optional<Error> failure;
  std::optional<Error> error = coordinator->coordinateWriting(
      source, WritingForMoving, destination, WritingForReplacing, [&](const URL& newSource, const URL& newDestination) {
        failure = moveWithNotices(*coordinator, newSource, newDestination);
      });
  if (!error) error = failure;
  if (error) VLO_WARNING("Move failed: %@", *error);
  return error;
}

std::optional<URL> FileUtils::docDir() {
  FileManager& files = Platform::current().fileManager;
  const std::vector<std::string> found = files.userDocumentsDirectories();
  if (found.empty()) return std::nullopt;
  return URL(files.expandingTilde(found.front()), true);
}

bool FileUtils::evictDocument(const URL& url) {
  const std::optional<Error> error = Platform::current().cloudDocuments.evict(url);
  if (error) VLO_WARNING("Evict error: %@", *error);
  return !error;
}

Value FileUtils::getResourceValueForURL(ResourceKey key, const std::optional<URL>& url) {
  if (!url) return {};
  ResourceValues& resources = Platform::current().resourceValues;
  for (const bool promised : {true, false}) {
    const Result<ResourceMap> values =
        promised ? resources.promisedItemResourceValues(*url, {key}) : resources.resourceValues(*url, {key});
    if (!values.value) continue;
    const auto found = values.value->find(key);
    if (found != values.value->end() && found->second.isPresent()) return found->second;
  }
  return {};
}

void FileUtils::dumpURLResourceValues(const URL&) {}

void FileUtils::logFileAttributes(const std::string& path) {
  const Result<FileAttributes> attributes = Platform::current().fileManager.attributesOfItemAtPath(path);
  if (!attributes.value) {
    VLO_ERROR("Cannot get attributes of %@: %@", path, attributes.error);
    return;
  }
  const Date now = Platform::current().queues.now();
  const auto age = [&](const std::optional<Date>& date) {
    using Seconds = std::chrono::duration<double>;  // what lies between two dates may be longer than the clock counts
    return date ? (Seconds(now.time_since_epoch()) - Seconds(date->time_since_epoch())).count() : 0.0;
  };
  VLO_DEBUG("Date Created: %@ (%lf seconds ago)", attributes.value->creationDate, age(attributes.value->creationDate));
  VLO_DEBUG("Date Modified: %@ (%lf seconds ago)", attributes.value->modificationDate,
            age(attributes.value->modificationDate));
  VLO_DEBUG("Size: %@ bytes", attributes.value->size);
}

}  // namespace vaelo
