// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/copy_out.h"

#include <fcntl.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>

#include "host/drive/promise_file.h"
#include "host/support/texts.h"
#include "host/support/unique_fd.h"

namespace vaelo {

namespace {

constexpr GFileQueryInfoFlags AsItIs = G_FILE_QUERY_INFO_NOFOLLOW_SYMLINKS;

GFileType typeOf(GFile* file) { return g_file_query_file_type(file, AsItIs, nullptr); }

bool isPromise(GFile* file) {
  const std::string name = takeString(g_file_get_basename(file));
  return isPromiseName(name);
}

/// Calls `visit` for each entry until it says false; false with `error` set when the folder can't be read.
bool forEachEntry(GFile* folder, GCancellable* cancellable, GError** error, const std::function<bool(GFile*)>& visit) {
  const GRef<GFileEnumerator> entries(
      g_file_enumerate_children(folder, G_FILE_ATTRIBUTE_STANDARD_NAME, AsItIs, cancellable, error));
  if (!entries) return false;
  GFile* entry = nullptr;
  while (g_file_enumerator_iterate(entries.get(), nullptr, &entry, cancellable, error)) {
    if (!entry) return true;
    if (!visit(entry)) return false;
  }
  return false;
}

void removeTree(GFile* item) {
  if (typeOf(item) == G_FILE_TYPE_DIRECTORY) {
    forEachEntry(item, nullptr, nullptr, [](GFile* entry) {
      removeTree(entry);
      return true;
    });
  }
  g_file_delete(item, nullptr, nullptr);
}

void dropWhatTheAccountKnows(GFile* made) {
  const char* path = g_file_peek_path(made);
  if (!path) return;
  for (const char* name : {"user.vaelo.docid", "user.vaelo.share", "user.vaelo.sharelink"}) lremovexattr(path, name);
}

bool fail(GError** error, GIOErrorEnum code, const char* text) {
  g_set_error_literal(error, G_IO_ERROR, code, text);
  return false;
}

void flush(GFile* made) {
  const char* path = g_file_peek_path(made);
  const UniqueFd file(path ? open(path, O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC) : -1);
  if (file) fsync(file.get());
}

}  // namespace

CopyOut::CopyOut(GFile* source, GFile* destination, GCancellable* cancellable, Progress progress)
    : source_(G_FILE(g_object_ref(source))),
      destination_(G_FILE(g_object_ref(destination))),
      cancellable_(G_CANCELLABLE(g_object_ref(cancellable))),
      progress_(std::move(progress)) {}

CopyOutcome CopyOut::run() {
  GError* error = nullptr;
  const GRef<GFile> folder(g_file_get_parent(destination_.get()));
  bool copied = false;
  if (mayGoThere(&error) && folder) {
    const std::string name = ".vaelo-copy-" + takeString(g_uuid_string_random());
    const GRef<GFile> growing(g_file_get_child(folder.get(), name.c_str()));
    all_ = sizeOf(source_.get());
    copied = copy(source_.get(), growing.get(), &error) && putInPlace(growing.get(), &error);
    if (!copied) removeTree(growing.get());
  }
  if (copied) return {CopyOutcome::Kind::Copied, "", notCopied_};
  const GErrorPtr reason(error);
  if (g_error_matches(error, G_IO_ERROR, G_IO_ERROR_CANCELLED)) return {CopyOutcome::Kind::Cancelled, "", 0};
  return {CopyOutcome::Kind::Failed, reason ? reason->message : "", 0};
}

bool CopyOut::mayGoThere(GError** error) {
  const GRef<GFileInfo> from(
      g_file_query_info(source_.get(), G_FILE_ATTRIBUTE_ID_FILE, G_FILE_QUERY_INFO_NONE, cancellable_.get(), error));
  if (!from) return false;
  const GRef<GFileInfo> to(g_file_query_info(destination_.get(), G_FILE_ATTRIBUTE_ID_FILE "," G_FILE_ATTRIBUTE_STANDARD_TYPE,
                                             G_FILE_QUERY_INFO_NONE, cancellable_.get(), nullptr));
  const char* fromID = g_file_info_get_attribute_string(from.get(), G_FILE_ATTRIBUTE_ID_FILE);
  const char* toID = to ? g_file_info_get_attribute_string(to.get(), G_FILE_ATTRIBUTE_ID_FILE) : nullptr;
  if (g_file_equal(source_.get(), destination_.get()) || (fromID && g_strcmp0(fromID, toID) == 0)) {
    return fail(error, G_IO_ERROR_EXISTS, _("That is the item itself."));
  }
  if (g_file_has_prefix(destination_.get(), source_.get())) {
    return fail(error, G_IO_ERROR_WOULD_RECURSE, _("A folder can’t be copied into itself."));
  }
  if (to && g_file_info_get_file_type(to.get()) == G_FILE_TYPE_DIRECTORY) {
    return fail(error, G_IO_ERROR_EXISTS, _("There is a folder of that name, which is left as it is."));
  }
  replaces_ = to != nullptr;
  return true;
}

std::uint64_t CopyOut::sizeOf(GFile* item) {
  const GRef<GFileInfo> info(g_file_query_info(item, G_FILE_ATTRIBUTE_STANDARD_TYPE "," G_FILE_ATTRIBUTE_STANDARD_SIZE,
                                               AsItIs, cancellable_.get(), nullptr));
  if (!info) return 0;
  if (g_file_info_get_file_type(info.get()) != G_FILE_TYPE_DIRECTORY) {
    return static_cast<std::uint64_t>(g_file_info_get_size(info.get()));
  }
  std::uint64_t sum = 0;
  forEachEntry(item, cancellable_.get(), nullptr, [&](GFile* entry) {
    if (!isPromise(entry)) sum += sizeOf(entry);
    return true;
  });
  return sum;
}

bool CopyOut::copy(GFile* from, GFile* to, GError** error) {
  if (g_cancellable_set_error_if_cancelled(cancellable_.get(), error)) return false;
  if (typeOf(from) == G_FILE_TYPE_DIRECTORY) return copyFolder(from, to, error);
  // The item itself may be a link that stands for its document; those within a folder stay links.
  const GFileCopyFlags flags = from == source_.get() ? G_FILE_COPY_NONE : G_FILE_COPY_NOFOLLOW_SYMLINKS;
  struct Step {
    CopyOut& copy;
    std::uint64_t before;
  } step{*this, done_};
  const bool copied = g_file_copy(
      from, to, flags, cancellable_.get(),
      [](goffset now, goffset, gpointer held) {
        Step& at = *static_cast<Step*>(held);
        at.copy.done_ = at.before + static_cast<std::uint64_t>(now);
        at.copy.progress_(at.copy.done_, at.copy.all_);
      },
      &step, error);
  if (!copied) return false;
  dropWhatTheAccountKnows(to);
  flush(to);
  return true;
}

bool CopyOut::copyFolder(GFile* from, GFile* to, GError** error) {
  if (!g_file_make_directory(to, cancellable_.get(), error)) return false;
  return forEachEntry(from, cancellable_.get(), error, [&](GFile* entry) {
    if (isPromise(entry)) {
      ++notCopied_;
      return true;
    }
    const std::string name = takeString(g_file_get_basename(entry));
    const GRef<GFile> made(g_file_get_child(to, name.c_str()));
    return copy(entry, made.get(), error);
  });
}

bool CopyOut::putInPlace(GFile* made, GError** error) {
  const char* from = g_file_peek_path(made);
  const char* to = g_file_peek_path(destination_.get());
  if (!replaces_ && from && to) {
    // Says no, in one step, when something came there meanwhile.
    if (renameat2(AT_FDCWD, from, AT_FDCWD, to, RENAME_NOREPLACE) == 0) return true;
    if (errno == EEXIST) return fail(error, G_IO_ERROR_EXISTS, _("Something of that name has come there meanwhile."));
    // Some file systems know no such step; the call below looks first then.
  }
  const auto flags = static_cast<GFileCopyFlags>(G_FILE_COPY_NO_FALLBACK_FOR_MOVE | G_FILE_COPY_NOFOLLOW_SYMLINKS |
                                                 (replaces_ ? G_FILE_COPY_OVERWRITE : G_FILE_COPY_NONE));
  return g_file_move(made, destination_.get(), flags, nullptr, nullptr, nullptr, error);
}

}  // namespace vaelo
