// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/drive_file_progress.h"

namespace vaelo {

std::shared_ptr<void> DriveFileProgress::subscribe(const URL&, Published) { return nullptr; }

}  // namespace vaelo
