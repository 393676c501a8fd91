// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/archive_decoder.h"

#include "host/support/decoder_error.h"

namespace vaelo {

ArchiveDecoder::ArchiveDecoder(UniqueFd document) : document_(std::move(document)) {}

DecoderMessage ArchiveDecoder::answer(const std::string&) {
  return {std::string("error ") + DecoderError::Unsupported, UniqueFd()};
}

}  // namespace vaelo
