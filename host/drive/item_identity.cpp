// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/item_identity.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <sys/xattr.h>

#include <cerrno>
#include <charconv>

#include "host/drive/extended_attribute.h"
#include "host/drive/promise_file.h"

namespace vaelo {

namespace {

constexpr const char* attributeName = "user.vaelo.docid";

bool isPromisePath(const std::string& path) { return isPromiseName(path.substr(path.rfind('/') + 1)); }

std::int64_t parsed(const std::optional<std::string>& text) {
  std::int64_t id = 0;
  if (!text) return 0;
  const auto [end, failure] = std::from_chars(text->data(), text->data() + text->size(), id);
  return failure == std::errc() && end == text->data() + text->size() && id > 0 ? id : 0;
}

std::int64_t promisedID(const std::string& path) {
  const Result<PromiseInfo> promise = readPromise(path);
  return promise && promise.value->documentID.value_or(0) > 0 ? *promise.value->documentID : 0;
}

std::optional<ItemIdentity> identity(int handle, const char* path, int flags) {
  struct statx status = {};
  if (::statx(handle, path, flags, STATX_INO | STATX_BTIME, &status) != 0) return std::nullopt;
  ItemIdentity found;
  found.device = makedev(status.stx_dev_major, status.stx_dev_minor);
  found.inode = status.stx_ino;
  if (status.stx_mask & STATX_BTIME) found.born = status.stx_btime.tv_sec * 1'000'000'000 + status.stx_btime.tv_nsec;
  return found;
}

}  // namespace

std::optional<ItemIdentity> identityOf(const std::string& path) {
  std::optional<ItemIdentity> found = identity(AT_FDCWD, path.c_str(), AT_SYMLINK_NOFOLLOW);
  if (!found) return found;
  found->carriedID = isPromisePath(path) ? promisedID(path) : parsed(extendedAttribute(path, attributeName));
  return found;
}

std::optional<ItemIdentity> identityOfOpenFile(int handle, const std::string& path) {
  std::optional<ItemIdentity> found = identity(handle, "", AT_EMPTY_PATH);
  if (!found) return found;
  found->carriedID = isPromisePath(path) ? promisedID(path) : parsed(extendedAttribute(handle, attributeName));
  return found;
}

Carrying carryID(const std::string& path, std::int64_t id, bool replacing) {
  if (isPromisePath(path)) return setPromiseDocumentID(path, id) ? Carrying::NotPossible : Carrying::Done;
  const std::string text = std::to_string(id);
  if (::lsetxattr(path.c_str(), attributeName, text.data(), text.size(), replacing ? 0 : XATTR_CREATE) == 0) {
    return Carrying::Done;
  }
  return errno == EEXIST ? Carrying::CarriesAnother : Carrying::NotPossible;
}

}  // namespace vaelo
