// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "fileops/filename_prompt.h"

namespace vaelo {

/// Asks for the name of a folder that is to be made.
class NewFolderPrompt : public FilenamePrompt {
 public:
  static std::shared_ptr<NewFolderPrompt> newWithTitleDoneButtonTextCompletion(const OptionalText& title,
                                                                               const OptionalText& doneButtonText,
                                                                               ValidateNewFilename completion);
};

}  // namespace vaelo
