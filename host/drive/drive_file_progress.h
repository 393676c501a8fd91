// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/drive/drive_layout.h"
#include "platform/file_progress.h"

namespace vaelo {

class DriveFileProgress : public FileProgress {
 public:
  explicit DriveFileProgress(const DriveLayout& layout) : layout_(layout) {}
  std::shared_ptr<void> subscribe(const URL& url, Published published) override;

 private:
  const DriveLayout& layout_;
};

}  // namespace vaelo
