// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/attributed_string.h"

#include <utility>

namespace vaelo {

void AttributedString::append(std::string text, const TextAttributes& attributes) {
  if (!text.empty()) runs_.push_back({std::move(text), nullptr, attributes});
}

void AttributedString::appendImage(ImageRef image, const TextAttributes& attributes) {
  if (image) runs_.push_back({"", std::move(image), attributes});
}

std::string AttributedString::plainText() const {
  std::string text;
  for (const Run& run : runs_) text += run.text;
  return text;
}

}  // namespace vaelo
