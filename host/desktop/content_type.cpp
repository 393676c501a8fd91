// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/content_type.h"

#include <fcntl.h>
#include <gio/gio.h>
#include <sys/stat.h>
#include <unistd.h>

#include "host/drive/packages.h"
#include "host/support/glib_ptr.h"
#include "host/support/unique_fd.h"

namespace vaelo {

std::string contentTypeOf(const std::string& path) {
  const std::string name = path.substr(path.rfind('/') + 1);
  struct stat info {};
  const bool there = stat(path.c_str(), &info) == 0;
  if (there && S_ISDIR(info.st_mode) && !isPackageName(name)) return "inode/directory";
  gboolean uncertain = FALSE;
  const std::string byName = takeString(g_content_type_guess(name.c_str(), nullptr, 0, &uncertain));
  if (!uncertain || !there || !S_ISREG(info.st_mode)) return byName;
  const UniqueFd file(open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
  unsigned char start[4096];
  const ssize_t length = file ? read(file.get(), start, sizeof start) : -1;
  if (length <= 0) return byName;
  return takeString(g_content_type_guess(name.c_str(), start, static_cast<gsize>(length), nullptr));
}

}  // namespace vaelo
