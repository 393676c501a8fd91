// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/shared_item.h"

#include <glib.h>
#include <sys/stat.h>

#include "host/desktop/content_type.h"
#include "host/desktop/drive_link.h"
#include "host/drive/extended_attribute.h"
#include "host/drive/promise_file.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr const char* ShareLinkAttribute = "user.vaelo.sharelink";

std::optional<std::string> shareLinkAt(const std::string& physical) {
  const std::optional<std::string> text = extendedAttribute(physical, ShareLinkAttribute);
  const bool isWebLink = text && (text->starts_with("https://") || text->starts_with("http://"));
  return isWebLink && g_str_is_ascii(text->c_str()) ? text : std::nullopt;
}

}  // namespace

SharedItem describeSharedItem(const URL& url, CloudDocuments& drive) {
  SharedItem item{url, takeString(g_filename_display_basename(url.path().c_str())), false, false, false, {}, 0, {}, {}};
  const std::optional<std::string> physical = physicalPathOf(url.path());
  struct stat info {};
  item.downloaded = stat(url.path().c_str(), &info) == 0;
  item.exists = physical.has_value();
  item.contentType = contentTypeOf(url.path());
  if (item.downloaded) {
    item.folder = S_ISDIR(info.st_mode);
    if (!item.folder) item.size = static_cast<std::uint64_t>(info.st_size);
  } else if (item.exists) {
    const Result<PromiseInfo> promise = readPromise(*physical);
    if (promise.value) {
      item.size = promise.value->size;
      item.folder = promise.value->package;
    }
  }
  item.link = drive.URLIsInDriveMirror(url) ? driveLinkTo(url) : std::optional(url.absoluteString());
  if (physical) item.shareLink = shareLinkAt(*physical);
  return item;
}

}  // namespace vaelo
