// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "fileops/filename_prompt.h"

namespace vaelo {

/// Asks for another name of an item.
class RenamePrompt : public FilenamePrompt {
 public:
  static std::shared_ptr<RenamePrompt> newWithFilenameCompletion(const OptionalText& filename,
                                                                 ValidateNewFilename completion);
};

}  // namespace vaelo
