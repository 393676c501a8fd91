// SPDX-License-Identifier: GPL-3.0-or-later
#include "fileops/new_folder_prompt.h"

#include "platform/platform.h"

namespace vaelo {

std::shared_ptr<NewFolderPrompt> NewFolderPrompt::newWithTitleDoneButtonTextCompletion(const OptionalText& title,
                                                                                       const OptionalText& doneButtonText,
                                                                                       ValidateNewFilename completion) {
  Formatting& formatting = Platform::current().formatting;
  const auto prompt = std::make_shared<NewFolderPrompt>();
  prompt->initWithTitleMessagePlaceholderFilenameDoneButtonTextCompletion(
      title, formatting.localizedString("Enter a name for this folder."), formatting.localizedString("Folder Name"),
      std::nullopt, doneButtonText, std::move(completion));
  return prompt;
}

}  // namespace vaelo
