// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/decoder/decoder.h"

namespace vaelo {

class PictureDecoder : public Decoder {
 public:
  explicit PictureDecoder(UniqueFd document);
  DecoderMessage answer(const std::string& request) override;

 private:
  UniqueFd document_;
};

}  // namespace vaelo
