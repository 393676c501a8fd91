// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/picture_decoder.h"

#include <sys/mman.h>
#include <sys/stat.h>

#include <algorithm>
#include <cmath>

#include "host/decoder/document_words.h"
#include "host/decoder/picture_raster.h"
#include "host/decoder/picture_vector.h"
#include "host/decoder/pixel_file.h"
#include "host/support/decoder_error.h"

namespace vaelo {

namespace {

constexpr int LongestSide = 16384;                      // of what is drawn at once
constexpr double MostPicturePixels = 64 * 1024 * 1024;  // of it

bool isDrawable(PictureSize size) {
  return size.width > 0 && size.height > 0 && size.width <= LongestSide && size.height <= LongestSide &&
         static_cast<double>(size.width) * size.height <= MostPicturePixels;
}

bool readSize(std::string_view& words, PictureSize& size) {
  return nextNumber(words, size.width) && nextNumber(words, size.height) && isDrawable(size);
}

std::string text(PictureSize size) { return std::to_string(size.width) + " " + std::to_string(size.height); }

}  // namespace

PictureSize fitPicture(PictureSize picture, PictureSize bounds, bool grows) {
  double scale =
      std::min(static_cast<double>(bounds.width) / picture.width, static_cast<double>(bounds.height) / picture.height);
  if (!grows) scale = std::min(scale, 1.0);
  const auto side = [&](int length, int most) { return std::clamp(static_cast<int>(std::lround(length * scale)), 1, most); };
  return {side(picture.width, bounds.width), side(picture.height, bounds.height)};
}

PictureDecoder::PictureDecoder(UniqueFd document) : document_(std::move(document)) {
  struct stat status = {};
  if (::fstat(document_.get(), &status) != 0 || status.st_size <= 0) return;
  bytes_ = static_cast<std::size_t>(status.st_size);
  // Not copied. Who cuts the file short meanwhile ends this process, and nothing else.
  void* mapped = ::mmap(nullptr, bytes_, PROT_READ, MAP_PRIVATE, document_.get(), 0);
  if (mapped != MAP_FAILED) mapped_ = mapped;
}

PictureDecoder::~PictureDecoder() {
  picture_.reset();
  if (mapped_) ::munmap(mapped_, bytes_);
}

DecoderMessage PictureDecoder::answer(const std::string& request) {
  std::string_view words = request;
  const std::string_view verb = nextWord(words);
  if (verb == "whole") return whole(words);
  if (!picture_) return errorAnswer(DecoderError::Damaged);
  if (verb == "part") return part(words);
  if (verb == "next") return next(words);
  return errorAnswer(DecoderError::Unsupported);
}

const char* PictureDecoder::open(PictureSize bounds) {
  if (picture_) return nullptr;
  if (!mapped_) return bytes_ == 0 ? DecoderError::Damaged : DecoderError::TooBig;
  const auto* file = static_cast<const unsigned char*>(mapped_);
  std::unique_ptr<PictureSource> picture;
  if (PictureVector::isOne(file, bytes_)) {
    picture = std::make_unique<PictureVector>(file, bytes_);
  } else {
    picture = std::make_unique<PictureRaster>(file, bytes_);
  }
  if (const char* problem = picture->open(bounds)) return problem;
  picture_ = std::move(picture);
  return nullptr;
}

DecoderMessage PictureDecoder::whole(std::string_view words) {
  PictureSize bounds;
  if (!readSize(words, bounds)) return errorAnswer(DecoderError::Damaged);
  if (const char* problem = open(bounds)) return errorAnswer(problem);
  const PictureSize size = picture_->size();
  const PictureSource::Features features = picture_->features();
  const PictureSize to = fitPicture(size, bounds, features.scalable);
  std::string answer = "ok " + text(size) + " " + text(to) + " " + std::to_string(features.delay);
  if (features.transparent) answer += " transparent";
  if (features.scalable) answer += " scalable";
  if (features.partial) answer += " partial";
  return pixels(answer, {0, 0, double(size.width), double(size.height)}, to);
}

DecoderMessage PictureDecoder::part(std::string_view words) {
  PicturePart part;
  PictureSize to;
  const bool isRead = nextNumber(words, part.x) && nextNumber(words, part.y) && nextNumber(words, part.width) &&
                      nextNumber(words, part.height) && readSize(words, to);
  const PictureSize size = picture_->size();
  const bool isInside = part.x >= 0 && part.y >= 0 && part.width > 0 && part.height > 0 &&
                        part.x + part.width <= size.width + 0.01 && part.y + part.height <= size.height + 0.01;
  if (!isRead || !isInside) return errorAnswer(DecoderError::Damaged);
  return pixels("ok " + text(to), part, to);
}

DecoderMessage PictureDecoder::next(std::string_view words) {
  PictureSize bounds;
  if (!readSize(words, bounds)) return errorAnswer(DecoderError::Damaged);
  picture_->advance();
  const PictureSize size = picture_->size();
  const PictureSource::Features features = picture_->features();
  const PictureSize to = fitPicture(size, bounds, features.scalable);
  return pixels("ok " + text(to) + " " + std::to_string(features.delay), {0, 0, double(size.width), double(size.height)},
                to);
}

DecoderMessage PictureDecoder::pixels(std::string text, const PicturePart& part, PictureSize to) {
  PixelFile file(static_cast<std::size_t>(to.width) * static_cast<std::size_t>(to.height) * 4);
  if (!file.data()) return errorAnswer(DecoderError::TooBig);
  // NOLINTNEXTLINE(cppcoreguidelines-pro-type-reinterpret-cast): memory of a page of its own
  if (const char* problem = picture_->draw(part, to, reinterpret_cast<std::uint32_t*>(file.data())))
    return errorAnswer(problem);
  return {std::move(text), file.take()};
}

}  // namespace vaelo
