// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/marked_file.h"

#include <fcntl.h>
#include <glib.h>
#include <sys/sendfile.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <vector>

#include "host/drive/small_file.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

MarkedFile::Result failure(int number) {
  MarkedFile::Result result;
  result.reason = g_strerror(number);
  return result;
}

// Where an open file is by now; empty when it has no name any more.
std::string pathOf(int file) {
  std::array<char, 4096> path = {};
  const std::string link = "/proc/self/fd/" + std::to_string(file);
  const ssize_t length = ::readlink(link.c_str(), path.data(), path.size() - 1);
  if (length <= 0 || path[0] != '/') return "";
  const std::string found(path.data(), static_cast<std::size_t>(length));
  const auto there = versionOf(found);
  const auto open = versionOf(file);
  return there && open && there->isSameFile(*open) ? found : "";
}

int copyContent(int from, int to) {
  off_t place = 0;
  for (;;) {
    constexpr std::size_t most = 0x7ffff000;  // what one call transfers on Linux
    const ssize_t step = ::sendfile(to, from, &place, most);
    if (step == 0) return 0;
    if (step < 0 && errno != EINTR) return errno;
  }
}

// Marks are appended to a document. What doesn't begin with it would take something away from it.
bool beginsWith(int file, int beginning) {
  constexpr std::size_t piece = 64 * 1024;
  std::vector<char> read(piece);
  std::vector<char> expected(piece);
  for (off_t place = 0;;) {
    const ssize_t length = ::pread(beginning, expected.data(), piece, place);
    if (length <= 0) return length == 0;
    const auto bytes = static_cast<std::size_t>(length);
    if (::pread(file, read.data(), bytes, place) != length || std::memcmp(read.data(), expected.data(), bytes) != 0) {
      return false;
    }
    place += length;
  }
}

void flushFolder(const std::string& folder) {
  const UniqueFd open(::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (open) ::fsync(open.get());
}

}  // namespace

std::string markedCopyName(const std::string& name, int number) {
  constexpr std::size_t longest = 255;
  const std::size_t dot = name.rfind('.');
  const bool hasExtension = dot != std::string::npos && dot > 0;
  std::string stem = name.substr(0, hasExtension ? dot : name.size());
  const std::string end = (number > 1 ? filled(_(" (marked %s)"), {std::to_string(number)}) : _(" (marked)")) +
                          (hasExtension ? name.substr(dot) : "");
  // Whole letters go.
  const auto isInLetter = [&] { return !stem.empty() && (static_cast<unsigned char>(stem.back()) & 0xC0) == 0x80; };
  while (!stem.empty() && stem.size() + end.size() > longest) {
    while (isInLetter()) stem.pop_back();
    if (!stem.empty()) stem.pop_back();
  }
  return stem + end;
}

MarkedFile::Result MarkedFile::save(int marked) {
  std::string path = pathOf(current_);
  if (path.empty()) path = path_;
  if (!coordination_) return put(marked, path);
  Result result;
  const auto error = coordination_->makeCoordinator()->coordinateWriting(
      URL(path), WritingForReplacing, [&](const URL& url) { result = put(marked, url.path()); });
  if (error) result.reason = error->localizedFailureReason.value_or("");
  return result;
}

MarkedFile::Result MarkedFile::put(int marked, const std::string& path) {
  if (!beginsWith(marked, original_)) return Result();
  const std::string folder = path.substr(0, path.rfind('/') + 1);
  const std::string growing = folder + ".vaelo-marked-" + takeString(g_uuid_string_random());
  Result result;
  result.file = UniqueFd(::open(growing.c_str(), O_RDWR | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600));
  if (!result.file) return failure(errno);
  const bool replacing = isStillThere(path);
  int problem = replacing && ::access(path.c_str(), W_OK) != 0 ? errno : copyContent(marked, result.file.get());
  if (problem == 0) {
    copyAttributes(result.file.get(), replacing);
    if (::fsync(result.file.get()) != 0) problem = errno;
  }
  if (problem == 0 && replacing && isStillThere(path)) {
    if (::rename(growing.c_str(), path.c_str()) != 0) problem = errno;
    result.outcome = Outcome::Replaced;
    result.path = path;
  } else if (problem == 0) {
    // The document that others know keeps its identity.
    for (const char* name : {"user.vaelo.docid", "user.vaelo.share", "user.vaelo.sharelink"}) {
      ::fremovexattr(result.file.get(), name);
    }
    constexpr int most = 1000;
    const std::string name = path.substr(folder.size());
    problem = EEXIST;
    for (int number = 1; problem == EEXIST && number <= most; ++number) {
      result.path = folder + markedCopyName(name, number);
      problem = renameWithoutReplacing(growing, result.path);
    }
    result.outcome = Outcome::Beside;
  }
  if (problem != 0) {
    ::unlink(growing.c_str());
    return failure(problem);
  }
  flushFolder(folder);
  result.version = versionOf(result.file.get()).value_or(FileVersion());
  return result;
}

bool MarkedFile::isStillThere(const std::string& path) const { return versionOf(path) == expected_; }

// What can't be kept where the document is can't have been there.
void MarkedFile::copyAttributes(int to, bool withOwner) const {
  struct stat status = {};
  if (::fstat(current_, &status) == 0) {
    if (withOwner && ::fchown(to, status.st_uid, status.st_gid) != 0) status.st_mode &= ~(S_ISUID | S_ISGID);
    ::fchmod(to, status.st_mode & 07777);
  }
  std::vector<char> names(static_cast<std::size_t>(std::max<ssize_t>(::flistxattr(current_, nullptr, 0), 0)));
  const ssize_t length = names.empty() ? 0 : ::flistxattr(current_, names.data(), names.size());
  for (ssize_t at = 0; at < length;) {
    const char* name = names.data() + at;
    at += static_cast<ssize_t>(std::char_traits<char>::length(name)) + 1;
    std::vector<char> value(static_cast<std::size_t>(std::max<ssize_t>(::fgetxattr(current_, name, nullptr, 0), 0)));
    if (::fgetxattr(current_, name, value.data(), value.size()) == static_cast<ssize_t>(value.size())) {
      ::fsetxattr(to, name, value.data(), value.size(), 0);
    }
  }
}

}  // namespace vaelo
