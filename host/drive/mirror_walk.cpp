// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/mirror_walk.h"

#include <fts.h>

#include <memory>

#include "host/drive/drive_layout.h"

namespace vaelo {

void walkTree(const std::string& root,
              const std::function<bool(const std::string& path, const struct stat& status)>& visit) {
  std::string start = root;
  char* const roots[] = {start.data(), nullptr};
  const std::unique_ptr<FTS, int (*)(FTS*)> walk(::fts_open(roots, FTS_PHYSICAL | FTS_NOCHDIR, nullptr), ::fts_close);
  if (!walk) return;
  const std::string removing = root + DriveLayout::Removing;
  while (FTSENT* entry = ::fts_read(walk.get())) {
    if (entry->fts_level == FTS_ROOTLEVEL) continue;
    if (removing == entry->fts_path) {
      ::fts_set(walk.get(), entry, FTS_SKIP);
      continue;
    }
    switch (entry->fts_info) {
      case FTS_D:
      case FTS_F:
      case FTS_SL:
      case FTS_SLNONE:
      case FTS_DEFAULT:
        if (!visit(entry->fts_path, *entry->fts_statp)) return;
        break;
      default:  // the second visit of a folder, and what can't be read
        break;
    }
  }
}

}  // namespace vaelo
