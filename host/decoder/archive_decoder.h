// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/decoder/decoder.h"

namespace vaelo {

class ArchiveDecoder : public Decoder {
 public:
  explicit ArchiveDecoder(UniqueFd document);
  DecoderMessage answer(const std::string& request) override;

 private:
  UniqueFd document_;
};

}  // namespace vaelo
