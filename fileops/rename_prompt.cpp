// SPDX-License-Identifier: GPL-3.0-or-later
#include "fileops/rename_prompt.h"

#include "platform/platform.h"

namespace vaelo {

std::shared_ptr<RenamePrompt> RenamePrompt::newWithFilenameCompletion(const OptionalText& filename,
                                                                      ValidateNewFilename completion) {
  Formatting& formatting = Platform::current().formatting;
  const auto prompt = std::make_shared<RenamePrompt>();
  prompt->initWithTitleMessagePlaceholderFilenameDoneButtonTextCompletion(
      formatting.localizedString("Rename Item"), formatting.localizedString("Enter a new name for this item."), std::nullopt,
      filename, formatting.localizedString("Done"), std::move(completion));
  return prompt;
}

}  // namespace vaelo
