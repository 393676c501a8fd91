// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/picture_decoder.h"

#include "host/support/decoder_error.h"

namespace vaelo {

PictureDecoder::PictureDecoder(UniqueFd document) : document_(std::move(document)) {}

DecoderMessage PictureDecoder::answer(const std::string&) {
  return {std::string("error ") + DecoderError::Unsupported, UniqueFd()};
}

}  // namespace vaelo
