// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/document_decoder.h"

#include <algorithm>
#include <chrono>
#include <cstring>

#include "host/decoder/document_text.h"
#include "host/decoder/document_words.h"
#include "host/decoder/page_painting.h"
#include "host/decoder/pixel_file.h"
#include "host/support/decoder_error.h"

namespace vaelo {

namespace {

using Clock = std::chrono::steady_clock;

constexpr int MostPages = 200'000;
constexpr double SmallestSide = 1;  // points; what is less can't be looked at
constexpr double LargestSide = 20'000;
constexpr double LargestScale = 64;
constexpr int MostPixelsOnASide = 8192;
constexpr int MostPixels = 16 * 1024 * 1024;
constexpr int MostSizesInAnAnswer = 500;
constexpr std::chrono::milliseconds SizesTake(10);
constexpr std::chrono::milliseconds FindingTakes(60);
constexpr std::size_t LongestAnswer = 60'000;  // bytes, within DecoderMessage::MaximumText
constexpr int MostMatchesOnAPage = 500;

DecoderMessage ok() { return {"ok", UniqueFd()}; }
DecoderMessage damaged() { return errorAnswer(DecoderError::Damaged); }

double side(double points) { return std::isfinite(points) ? std::clamp(points, SmallestSide, LargestSide) : SmallestSide; }

}  // namespace

DocumentDecoder::DocumentDecoder(UniqueFd document) : original_(std::move(document)) {}

DecoderMessage DocumentDecoder::answer(const std::string& request) {
  std::string_view words = request;
  const std::string_view command = nextWord(words);
  if (command == "open") return open(std::string(words));
  if (!document_) return damaged();
  if (command == "sizes") return sizes(words);
  if (command == "render") return render(words);
  if (command == "text") return text(words);
  if (command == "find") return find(words);
  if (command == "areas") return areas(words);
  if (command == "touched") return touched(words);
  if (command == "mark") return marks_.add(words, pages_) ? ok() : errorAnswer(DecoderError::Unsupported);
  if (command == "unmark") {
    marks_.clear();
    return ok();
  }
  if (command == "save") return save();
  return errorAnswer(DecoderError::Unsupported);
}

DecoderMessage DocumentDecoder::open(const std::string& password) {
  const char* problem = nullptr;
  stored_.clear();
  document_ = openPortableDocument(original_, password, problem);
  if (!document_) return errorAnswer(problem);
  password_ = password;
  pages_ = std::min(poppler_document_get_n_pages(document_.get()), MostPages);
  if (pages_ <= 0) return damaged();
  const bool mayMark = poppler_document_get_permissions(document_.get()) & POPPLER_PERMISSIONS_OK_TO_ADD_NOTES;
  return {"ok " + std::to_string(pages_) + (mayMark ? " 1" : " 0") + sizesFrom(0), UniqueFd()};
}

DecoderMessage DocumentDecoder::sizes(std::string_view words) {
  int from = 0;
  if (!nextNumber(words, from) || from < 0 || from >= pages_) return errorAnswer(DecoderError::Unsupported);
  return {"ok" + sizesFrom(from), UniqueFd()};
}

// A page that can't be read gets a usual size and says so when it is rendered.
std::string DocumentDecoder::sizesFrom(int from) const {
  std::string found;
  const Clock::time_point end = Clock::now() + SizesTake;
  for (int i = from; i < pages_ && i < from + MostSizesInAnAnswer && (i == from || Clock::now() < end); ++i) {
    double width = 595;
    double height = 842;
    if (const GRef<PopplerPage> read = page(i)) poppler_page_get_size(read.get(), &width, &height);
    appendNumber(found, side(width));
    appendNumber(found, side(height));
  }
  return found;
}

GRef<PopplerPage> DocumentDecoder::page(int index) const {
  if (index < 0 || index >= pages_) return {};
  return GRef<PopplerPage>(poppler_document_get_page(document_.get(), index));
}

DecoderMessage DocumentDecoder::render(std::string_view words) {
  int index = 0;
  PageTile tile;
  if (!nextNumber(words, index) || !nextNumber(words, tile.scale) || !nextNumber(words, tile.x) ||
      !nextNumber(words, tile.y) || !nextNumber(words, tile.width) || !nextNumber(words, tile.height) || tile.scale <= 0 ||
      tile.scale > LargestScale || tile.x < 0 || tile.y < 0 || tile.width <= 0 || tile.height <= 0 ||
      tile.width > MostPixelsOnASide || tile.height > MostPixelsOnASide || tile.width > MostPixels / tile.height) {
    return errorAnswer(DecoderError::Unsupported);
  }
  std::vector<int> hidden;
  while (!words.empty()) {
    if (!nextNumber(words, hidden.emplace_back())) return errorAnswer(DecoderError::Unsupported);
  }
  const GRef<PopplerPage> shown = page(index);
  if (!shown) return damaged();
  PixelFile pixels(static_cast<std::size_t>(tile.width) * 4 * static_cast<std::size_t>(tile.height));
  if (!pixels.data()) return errorAnswer(DecoderError::TooBig);
  stored_.hide(shown.get(), hidden);
  return paintPage(shown.get(), tile, pixels.data()) ? DecoderMessage{"ok", pixels.take()} : damaged();
}

DecoderMessage DocumentDecoder::text(std::string_view words) {
  int index = 0;
  const GRef<PopplerPage> read = nextNumber(words, index) ? page(index) : nullptr;
  if (!read) return damaged();
  const PageText found = textOf(read.get());
  if (found.boxes.empty()) return {"ok 0", UniqueFd()};
  const std::size_t boxBytes = found.boxes.size() * sizeof found.boxes.front();
  PixelFile file(boxBytes + found.text.size());
  if (!file.data()) return errorAnswer(DecoderError::TooBig);
  std::memcpy(file.data(), found.boxes.data(), boxBytes);
  std::memcpy(file.data() + boxBytes, found.text.data(), found.text.size());
  return {"ok " + std::to_string(found.boxes.size()), file.take()};
}

DecoderMessage DocumentDecoder::find(std::string_view words) {
  int from = 0;
  if (!nextNumber(words, from) || from < 0 || from >= pages_ || words.empty()) return errorAnswer(DecoderError::Unsupported);
  const std::string wanted(words);
  const Clock::time_point end = Clock::now() + FindingTakes;
  int next = from;
  std::vector<PageBox> matches;
  do {
    if (const GRef<PopplerPage> searched = page(next)) matches = findText(searched.get(), wanted, MostMatchesOnAPage);
    ++next;
  } while (matches.empty() && next < pages_ && Clock::now() < end);
  std::string found = "ok " + std::to_string(next);
  for (const PageBox& match : matches) {
    for (const float edge : match) appendNumber(found, static_cast<double>(edge));
  }
  return {std::move(found), UniqueFd()};
}

DecoderMessage DocumentDecoder::areas(std::string_view words) {
  int index = 0;
  const GRef<PopplerPage> read = nextNumber(words, index) ? page(index) : nullptr;
  if (!read) return damaged();
  std::string found = "ok ";
  for (const std::string& line : areasOf(document_.get(), read.get())) {
    if (found.size() + line.size() < LongestAnswer) found += line + '\n';
  }
  return {std::move(found), UniqueFd()};
}

DecoderMessage DocumentDecoder::touched(std::string_view words) {
  int index = 0;
  double x = 0;
  double y = 0;
  double reach = 0;
  const bool isPlace = nextNumber(words, index) && nextNumber(words, x) && nextNumber(words, y) && nextNumber(words, reach);
  const GRef<PopplerPage> read = isPlace ? page(index) : nullptr;
  if (!read) return damaged();
  const std::string found = stored_.touched(read.get(), x, y, reach);
  return {found.empty() ? "ok" : "ok " + found, UniqueFd()};
}

// What was saved is read back and must be as long as the original: it is going to take the original's place.
DecoderMessage DocumentDecoder::save() {
  const char* problem = nullptr;
  UniqueFd marked = marks_.apply(original_, password_, problem);
  if (!marked) return errorAnswer(problem);
  const GRef<PopplerDocument> readBack = openPortableDocument(marked, password_, problem);
  if (!readBack || std::min(poppler_document_get_n_pages(readBack.get()), MostPages) != pages_ ||
      !marks_.areIn(readBack.get(), document_.get())) {
    return errorAnswer(DecoderError::Unsupported);
  }
  return {"ok", std::move(marked)};
}

}  // namespace vaelo
