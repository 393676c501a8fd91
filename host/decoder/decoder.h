// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "host/support/decoder_message.h"

namespace vaelo {

/// Answers requests about one document in a process of its own, which may crash, hang or run out of memory without harm to
/// anybody. The first word of an answer is "ok" or "error"; after "error" comes one of the words of decoder_error.h.
class Decoder {
 public:
  virtual ~Decoder() = default;
  virtual DecoderMessage answer(const std::string& request) = 0;
};

/// An answer that says why there is none: a word of decoder_error.h.
inline DecoderMessage errorAnswer(const char* reason) { return {std::string("error ") + reason, UniqueFd()}; }

/// The decoder of a kind of documents, for the open file; null for an unknown kind.
std::unique_ptr<Decoder> makeDecoder(const std::string& kind, UniqueFd document);

}  // namespace vaelo
