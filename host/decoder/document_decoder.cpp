// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/document_decoder.h"

#include "host/support/decoder_error.h"

namespace vaelo {

DocumentDecoder::DocumentDecoder(UniqueFd document) : document_(std::move(document)) {}

DecoderMessage DocumentDecoder::answer(const std::string&) {
  return {std::string("error ") + DecoderError::Unsupported, UniqueFd()};
}

}  // namespace vaelo
