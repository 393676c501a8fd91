// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>

#include "items/file_utils.h"
#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

Error formattingError() { return Error{FileErrorDomain, FileErrorCode::Formatting, {}, {}, {}}; }

/// The number of components of the path from the mirror's root; nothing outside the mirror.
std::optional<std::size_t> depthInMirror(const URL& url) {
  const std::optional<std::string> path = Platform::current().cloudDocuments.pathRelativeToMirror(url);
  return path ? std::optional(URL("/" + *path).pathComponents().size()) : std::nullopt;
}

/// "\u2068name\u2069": a name of either direction keeps to itself within the line.
std::string isolated(const std::string& name) { return "\u2068" + name + "\u2069"; }

}  // namespace

std::string FileUtils::pathBarArrowCharacter(bool rightToLeft) { return rightToLeft ? " ◂ " : " ▸ "; }

std::optional<Error> FileUtils::containerAndRelativePathforURLContainerRelativePathComponents(
    const URL& url, CloudContainerRef* container, std::vector<std::string>* components) {
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  const Result<CloudContainerRef> lookup = cloud.containerForURL(url);
  CloudContainerRef found = lookup.value.value_or(nullptr);
  if (!found || lookup.error) {
    const std::optional<std::string> identifier = cloud.containerIdentifierForURL(url);
    found = identifier ? cloud.containerWithIdentifier(*identifier) : nullptr;
    if (!found) {
      VLO_WARNING("Split URL: %@", lookup.error);
      return lookup.error;
    }
  }
  if (container) *container = found;
  if (!components) return lookup.error;

  const std::optional<URL> documents = found->documentsFolderURL();
  if (!documents) return formattingError();
  const auto top = depthInMirror(*documents);
  const auto own = depthInMirror(url);
  if (!top || !own || *own < *top) return formattingError();
  if (*own == *top) return lookup.error;

  std::optional<Error> walkError;
  std::vector<std::string> names;
  URL at = url;
  for (std::size_t left = *own - *top; left > 0; --left, at = at.deletingLastPathComponent()) {
    const Result<ResourceMap> values =
        Platform::current().resourceValues.promisedItemResourceValues(at, {ResourceKey::LocalizedName});
    const auto value = values.value ? values.value->find(ResourceKey::LocalizedName) : ResourceMap::const_iterator();
    const std::string* name = values.value && value != values.value->end() ? value->second.get<std::string>() : nullptr;
    if (name) {
      names.push_back(*name);
      continue;
    }
    VLO_DEBUG("Can't get localizedName for URL %@: err %@", at, values.error);
    const std::string last = at.lastPathComponent();
    if (last.empty()) {
      walkError = formattingError();
      break;
    }
    names.push_back(last);
  }
  std::reverse(names.begin(), names.end());
  *components = std::move(names);
  return lookup.error ? lookup.error : walkError;
}

std::optional<std::string> FileUtils::displayableLocationForURL(const URL& url) {
  CloudContainerRef container;
  std::vector<std::string> names;
  if (containerAndRelativePathforURLContainerRelativePathComponents(url, &container, &names) || !container) {
    return std::nullopt;
  }
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  const bool rightToLeft = Platform::current().application.isRightToLeft();
  const std::string separator = pathBarArrowCharacter(rightToLeft);
  std::string line = rightToLeft ? "\u200F" : "";
  const CloudContainerRef drive = cloud.containerWithIdentifier(cloud.defaultContainerIdentifier());
  if (drive) line += isolated(drive->localizedName());
  if (container->identifier() != cloud.defaultContainerIdentifier()) {
    line += separator + isolated(container->localizedName());
  }
  for (std::size_t i = 0; i + 1 < names.size(); ++i) line += separator + isolated(names[i]);
  return line;
}

}  // namespace vaelo
