// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_lines.h"

#include <algorithm>
#include <utility>

namespace vaelo {

namespace {
constexpr std::string_view ParagraphSeparator = "\xe2\x80\xa9";
}  // namespace

void TextLines::endLine(std::string& arranged) {
  arranged += '\n';
  longest_ = std::max(longest_, characters_);
  characters_ = 0;
  ++lines_;
}

std::string TextLines::arrange(std::string_view text) {
  std::string arranged;
  arranged.reserve(text.size() + text.size() / mostCharacters_ + 1);
  for (std::size_t at = 0; at < text.size() && !isFull(); ++at) {
    const char byte = text[at];
    const bool afterReturn = std::exchange(afterReturn_, byte == '\r');
    if (byte == '\n' || byte == '\r') {
      if (byte == '\r' || !afterReturn) endLine(arranged);
      continue;
    }
    if (byte == ParagraphSeparator.front() && text.substr(at).starts_with(ParagraphSeparator)) {
      at += ParagraphSeparator.size() - 1;
      endLine(arranged);
      continue;
    }
    const bool begins = (static_cast<unsigned char>(byte) & 0xc0) != 0x80;
    if (begins && characters_++ == mostCharacters_) {
      brokeLines_ = true;
      --characters_;
      endLine(arranged);
      characters_ = 1;
    }
    arranged += byte;
  }
  longest_ = std::max(longest_, characters_);
  return arranged;
}

}  // namespace vaelo
