// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <string_view>

#include "host/decoder/decoder.h"
#include "host/decoder/picture_source.h"

namespace vaelo {

/// Pictures. Sizes are pixels, of the picture as it is shown: turned as the camera was held. Requests, what follows "ok",
/// and the pixels (premultiplied BGRA) that come with it:
///   whole MAXW MAXH        WIDTH HEIGHT W H DELAY WORD…   all of the picture of WIDTH x HEIGHT, as W x H that fit
///   part X Y W H TOW TOH   TOW TOH                        a part of it, as TOW x TOH
///   next MAXW MAXH         W H DELAY                      the next picture of an animation
/// DELAY is in milliseconds, -1 where nothing follows. The words: transparent, scalable, partial (the end is missing).
class PictureDecoder : public Decoder {
 public:
  explicit PictureDecoder(UniqueFd document);
  ~PictureDecoder() override;
  DecoderMessage answer(const std::string& request) override;

 private:
  const char* open(PictureSize bounds);
  DecoderMessage whole(std::string_view words);
  DecoderMessage part(std::string_view words);
  DecoderMessage next(std::string_view words);
  DecoderMessage pixels(std::string text, const PicturePart& part, PictureSize to);

  UniqueFd document_;
  void* mapped_ = nullptr;
  std::size_t bytes_ = 0;
  std::unique_ptr<PictureSource> picture_;
};

}  // namespace vaelo
