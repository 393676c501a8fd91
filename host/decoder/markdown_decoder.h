// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/decoder/decoder.h"

namespace vaelo {

/// Makes text with forms of Markdown. One request:
///   render    "BYTES CHARACTERS", and a file: so many bytes of UTF-8, and then a line for each form of it:
///             FORM FIRST END WORD, tabs between, counted in characters, in the order of FIRST. The forms are those of
///             MarkdownText.
/// A document that is too long for it, or has a paragraph that is, is DecoderError::TooBig.
class MarkdownDecoder : public Decoder {
 public:
  explicit MarkdownDecoder(UniqueFd document) : document_(std::move(document)) {}
  DecoderMessage answer(const std::string& request) override;

 private:
  UniqueFd document_;
};

}  // namespace vaelo
