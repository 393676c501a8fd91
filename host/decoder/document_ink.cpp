// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/document_ink.h"

#include <sys/mman.h>
#include <sys/stat.h>

#include <algorithm>
#include <array>
#include <optional>
#include <string>
#include <string_view>

#include "host/decoder/document_words.h"

namespace vaelo {

namespace {

constexpr std::size_t LongestNumber = 16;       // "-123456789.12 " and more
constexpr std::size_t LongestDictionary = 400;  // but for the points

using Point = std::array<double, 2>;

/// From points of the page as it is shown, counted from its upper left corner, to the coordinates of the file.
class Placing {
 public:
  /// `corners` as the file has them: upper left, upper right, lower left.
  Placing(Point upperLeft, Point upperRight, Point lowerLeft, double width, double height)
      : origin_(upperLeft),
        across_{(upperRight[0] - upperLeft[0]) / width, (upperRight[1] - upperLeft[1]) / width},
        down_{(lowerLeft[0] - upperLeft[0]) / height, (lowerLeft[1] - upperLeft[1]) / height} {}
  Point operator()(const Point& point) const {
    return {origin_[0] + across_[0] * point[0] + down_[0] * point[1],
            origin_[1] + across_[1] * point[0] + down_[1] * point[1]};
  }

 private:
  Point origin_;
  Point across_;
  Point down_;
};

// The eight numbers behind the name in the dictionary.
std::optional<std::array<double, 8>> eightNumbers(std::string_view dictionary, std::string_view name) {
  const std::size_t found = dictionary.find(name);
  if (found == std::string_view::npos) return std::nullopt;
  std::string_view words = dictionary.substr(found + name.size());
  std::array<double, 8> numbers = {};
  for (double& number : numbers) {
    if (!nextNumber(words, number)) return std::nullopt;
  }
  return numbers;
}

// "5 0 R " behind the name; empty when it isn't there.
std::string_view referenceOf(std::string_view dictionary, std::string_view name) {
  const std::size_t found = dictionary.find(name);
  if (found == std::string_view::npos) return {};
  const std::size_t begin = found + name.size();
  const std::size_t end = dictionary.find('R', begin);
  return end == std::string_view::npos || end - begin > 24 ? std::string_view() : dictionary.substr(begin, end + 1 - begin);
}

void appendPoint(std::string& words, const Point& point) {
  appendNumber(words, point[0]);
  appendNumber(words, point[1]);
}

std::string inkDictionary(const DocumentMark& mark, const Placing& placing, std::string_view page) {
  std::vector<Point> points;
  std::transform(mark.points.begin(), mark.points.end(), std::back_inserter(points), placing);
  Point low = points.front();
  Point high = points.front();
  std::string list;
  for (const Point& point : points) {
    for (std::size_t i = 0; i < 2; ++i) {
      low[i] = std::min(low[i], point[i] - mark.width);
      high[i] = std::max(high[i], point[i] + mark.width);
    }
    appendPoint(list, point);
  }
  std::string words = "<</Type /Annot /Subtype /Ink /F 4 /P ";
  words += page;
  words += " /Rect [";
  appendPoint(words, low);
  appendPoint(words, high);
  words += " ] /C [";
  for (const double part : mark.colour) appendNumber(words, part);
  words += " ] /BS <</W";
  appendNumber(words, mark.width);
  return words + " /S /S >> /InkList [[" + list + " ] ] >>";
}

// The size of the page that the mark was made for is where the highlight's corners lie apart.
std::optional<Placing> placingOf(std::string_view dictionary) {
  const auto corners = eightNumbers(dictionary, "/QuadPoints [");
  if (!corners) return std::nullopt;
  const auto& c = *corners;
  const double width = std::hypot(c[2] - c[0], c[3] - c[1]);
  const double height = std::hypot(c[4] - c[0], c[5] - c[1]);
  if (!(width > 0) || !(height > 0)) return std::nullopt;
  return Placing({c[0], c[1]}, {c[2], c[3]}, {c[4], c[5]}, width, height);
}

bool makeInk(char* begin, std::size_t length, const DocumentMark& mark) {
  const std::string_view dictionary(begin, length);
  const std::optional<Placing> placing = placingOf(dictionary);
  const std::string_view page = referenceOf(dictionary, "/P ");
  if (!placing || page.empty()) return false;
  const std::string words = inkDictionary(mark, *placing, page);
  if (words.size() > length) return false;
  std::fill(std::copy(words.begin(), words.end(), begin), begin + length, ' ');
  return true;
}

struct Span {
  std::size_t begin = 0;
  std::size_t end = 0;
};

// The dictionary of the next highlight that is an object. A page may be written anew with highlights in its own dictionary.
std::optional<Span> nextHighlight(std::string_view text, std::size_t& place) {
  constexpr std::string_view highlight = "/Subtype /Highlight ";
  while ((place = text.find(highlight, place)) != std::string_view::npos) {
    const std::size_t object = text.rfind(" obj", place);
    const std::size_t end = text.find("endobj", place);
    if (object == std::string_view::npos || end == std::string_view::npos) break;
    const std::size_t begin = text.find("<<", object);
    const std::size_t last = text.rfind(">>", end);
    const bool isMark = begin < place && last > place && text.substr(begin).starts_with("<</Type /Annot ");
    place = end;
    if (isMark) return Span{begin, last + 2};
  }
  place = text.size();
  return std::nullopt;
}

// One for each highlight and each ink, in the order of the marks.
bool makeAllInk(char* data, std::size_t size, const std::vector<DocumentMark>& marks) {
  const std::string_view text(data, size);
  std::size_t place = 0;
  for (const DocumentMark& mark : marks) {
    if (mark.kind != DocumentMark::Kind::Highlight && mark.kind != DocumentMark::Kind::Ink) continue;
    const std::optional<Span> found = nextHighlight(text, place);
    if (!found) return false;
    const bool isInk = mark.kind == DocumentMark::Kind::Ink;
    if (isInk && !makeInk(data + found->begin, found->end - found->begin, mark)) return false;
  }
  return !nextHighlight(text, place);
}

}  // namespace

std::size_t inkWordsLength(std::size_t points) { return LongestDictionary + points * 2 * LongestNumber; }

bool writeInk(const UniqueFd& file, off_t originalSize, const std::vector<DocumentMark>& marks) {
  if (std::none_of(marks.begin(), marks.end(), [](const auto& mark) { return mark.kind == DocumentMark::Kind::Ink; }))
    return true;
  struct stat status = {};
  if (::fstat(file.get(), &status) != 0 || status.st_size <= originalSize) return false;
  const auto size = static_cast<std::size_t>(status.st_size);
  void* mapped = ::mmap(nullptr, size, PROT_READ | PROT_WRITE, MAP_SHARED, file.get(), 0);
  if (mapped == MAP_FAILED) return false;
  const auto skipped = static_cast<std::size_t>(originalSize);
  const bool done = makeAllInk(static_cast<char*>(mapped) + skipped, size - skipped, marks);
  ::munmap(mapped, size);
  return done;
}

}  // namespace vaelo
