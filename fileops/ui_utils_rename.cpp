// SPDX-License-Identifier: GPL-3.0-or-later
#include "fileops/ui_utils.h"
#include "items/file_utils.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

Error invalidName() { return {FileErrorDomain, FileErrorCode::WriteInvalidFileName, {}, {}, {}}; }

}  // namespace

std::optional<Error> UIUtils::renameItemAtURLToName(const URL& url, const std::string& name) {
  if (name.empty()) {
    VLO_DEBUG("Rename: empty, reverting");
    return invalidName();
  }
  if (!FileUtils::isValidFilename(name)) {
    VLO_DEBUG("Name is invalid: %@", name);
    return invalidName();
  }
  VLO_DEBUG("Name is valid: %@", name);
  // A bookmark whose document is gone is renamed itself.
  const URL resolved = vlo_URLByResolvingBookmark(url).value_or(url);
  if (Platform::current().cloudDocuments.isExternalDocumentReference(url)) {
    VLO_DEBUG("Renaming bookmark %@ (%@)", url, resolved);
  }
  const URL newURL = computeNewURLNewBasename(resolved, name);
  if (newURL == resolved) {
    VLO_DEBUG("Rename: Old and new URLs are the same: %@ - %@", resolved, newURL);
    return std::nullopt;
  }
  return FileUtils::moveTo(resolved, newURL);
}

URL UIUtils::computeNewURLNewBasename(const URL& url, const std::string& name) {
  const std::string extension = url.pathExtension();
  const std::string typed = URL("/" + name).pathExtension();
  const bool keeps =
      extension.empty() || Platform::current().characterClasses.localizedCaseInsensitiveEquals(extension, typed);
  return url.deletingLastPathComponent().appendingPathComponent(keeps ? name : name + "." + extension,
                                                                url.hasDirectoryPath());
}

}  // namespace vaelo
