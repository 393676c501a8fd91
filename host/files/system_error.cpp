// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/system_error.h"

#include <libintl.h>

#include <cerrno>
#include <climits>

#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

/// Each has one "%s", the item's name.
const char* wordsFor(int number) {
  switch (number) {
    case ENOENT:
    case ENOTDIR:
      return gettext("The file “%s” doesn’t exist any more.");
    case EACCES:
    case EPERM:
      return gettext("You don’t have permission to use “%s”.");
    case EEXIST:
    case ENOTEMPTY:
      return gettext("An item named “%s” already exists.");
    case ENAMETOOLONG:
      return gettext("“%s” lies too deep in its folders.");
    case EILSEQ:
      return gettext("The disk can’t keep the name “%s”.");
    case ENOSPC:
    case EDQUOT:
      return gettext("There is not enough space for “%s”. Delete something and try again.");
    case EROFS:
      return gettext("“%s” is on a disk that can only be read.");
    case ELOOP:
      return gettext("The links of “%s” run in a circle.");
    case EBUSY:
      return gettext("“%s” is being changed by another program. Try again later.");
    default:
      return gettext("“%s” can’t be used.");
  }
}

/// For a name of more bytes than a disk keeps; people count characters.
std::string wordsForLongName(const std::string& name) {
  std::size_t excess = 0;
  for (std::size_t length = name.size(); length > NAME_MAX; ++excess) {
    do --length;
    while (length > 0 && (static_cast<unsigned char>(name[length]) & 0xC0) == 0x80);
  }
  std::string words = ngettext("The name is too long by %s character.", "The name is too long by %s characters.", excess);
  if (const std::size_t at = words.find("%s"); at != std::string::npos) words.replace(at, 2, std::to_string(excess));
  return words;
}

}  // namespace

Error describedError(int number, const std::string& path, FileAccess access) {
  Error error = errorFromErrno(number, path, access);
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
  std::string words = wordsFor(number);
  const std::string name = takeString(g_filename_display_basename(path.c_str()));
  // Not printf: a translation must not be able to ask for more than the name.
  if (const std::size_t at = words.find("%s"); at != std::string::npos) words.replace(at, 2, name);
  error.localizedDescription = std::move(words);
  return error;
}

}  // namespace vaelo
