// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/system_error.h"

#include <cerrno>
#include <climits>

#include "host/drive/promise_file.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

/// Each has one "%s", the item's name.
const char* wordsFor(int number) {
  switch (number) {
    case ENOENT:
    case ENOTDIR:
      return _("The file “%s” doesn’t exist any more.");
    case EACCES:
    case EPERM:
      return _("You don’t have permission to use “%s”.");
    case EEXIST:
    case ENOTEMPTY:
      return _("An item named “%s” already exists.");
    case ENAMETOOLONG:
      return _("“%s” lies too deep in its folders.");
    case EILSEQ:
      return _("The disk can’t keep the name “%s”.");
    case ENOSPC:
    case EDQUOT:
      return _("There is not enough space for “%s”. Delete something and try again.");
    case EROFS:
      return _("“%s” is on a disk that can only be read.");
    case ELOOP:
      return _("The links of “%s” run in a circle.");
    case EBUSY:
      return _("“%s” is being changed by another program. Try again later.");
    case ECANCELED:
      return _("“%s” stays where it is.");
    default:
      return _("“%s” can’t be used.");
  }
}

/// For a name of more bytes than a disk keeps; people count characters.
std::string wordsForLongName(const std::string& name) {
  std::size_t excess = 0;
  for (std::size_t length = name.size(); length > NAME_MAX; ++excess) {
    do --length;
    while (length > 0 && (static_cast<unsigned char>(name[length]) & 0xC0) == 0x80);
  }
  return filled(ngettext("The name is too long by %s character.", "The name is too long by %s characters.", excess),
                {numberText(static_cast<std::int64_t>(excess))});
}

}  // namespace

Error describedError(int number, const std::string& path, FileAccess access) {
  Error error = errorFromErrno(number, path, access);
  if (number == ECANCELED) error.code = FileErrorCode::UserCancelled;
  if (number == ENOTEMPTY) error.code = FileErrorCode::WriteFileExists;
  if (number == EILSEQ && access == FileAccess::Write) error.code = FileErrorCode::WriteInvalidFileName;
  if (number == ENAMETOOLONG && access == FileAccess::Write) {
    // No character of it is wrong, as the words for the other code would have it.
    error.code = FileErrorCode::WriteUnknown;
    const std::string bytes = path.substr(path.rfind('/') + 1);
    if (bytes.size() > NAME_MAX) {
      error.localizedDescription = wordsForLongName(bytes);
      return error;
    }
  }
  // Nobody knows the file that stands for what is not downloaded.
  const std::string known = logicalNameOf(path).value_or(path);
  error.localizedDescription = filled(wordsFor(number), {takeString(g_filename_display_basename(known.c_str()))});
  return error;
}

}  // namespace vaelo
