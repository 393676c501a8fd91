// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/picture_scaler.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <vector>

namespace vaelo {

namespace {

using Colour __attribute__((vector_size(16))) = float;
using Bytes __attribute__((vector_size(4))) = std::uint8_t;
using Words __attribute__((vector_size(16))) = std::int32_t;

constexpr double SharpFrom = 2;

Colour unpack(std::uint32_t pixel) {
  Bytes bytes;
  std::memcpy(&bytes, &pixel, sizeof bytes);
  return __builtin_convertvector(bytes, Colour);
}

std::uint32_t pack(Colour colour) {
  const Words words = __builtin_convertvector(colour + 0.5F, Words);
  const Bytes bytes = __builtin_convertvector(words, Bytes);
  std::uint32_t pixel = 0;
  std::memcpy(&pixel, &bytes, sizeof pixel);
  return pixel;
}

/// Which source pixels make each pixel along one axis. The weights of one add up to 1.
struct Axis {
  struct Taps {
    int first;
    int count;
    std::size_t weights;
  };
  std::vector<Taps> taps;
  std::vector<float> weights;
  int begin = 0;
  int end = 0;
};

Axis makeAxis(double start, double length, int to, int limit) {
  Axis axis;
  const double step = length / to;
  axis.taps.reserve(static_cast<std::size_t>(to));
  for (int i = 0; i < to; ++i) {
    double left = start + i * step;
    double right = left + step;
    if (step < 1) {  // a point, or two pixels around it
      const double middle = (left + right) / 2;
      const double reach = 1 / step >= SharpFrom ? 0 : 0.5;
      left = middle - reach;
      right = middle + reach;
    }
    const int first = std::clamp(static_cast<int>(std::floor(left)), 0, limit - 1);
    const int last = std::clamp(static_cast<int>(std::ceil(right)) - 1, first, limit - 1);
    axis.taps.push_back({first, last - first + 1, axis.weights.size()});
    double sum = 0;
    for (int k = first; k <= last; ++k) sum += std::max(std::min(right, k + 1.0) - std::max(left, double(k)), 1e-6);
    for (int k = first; k <= last; ++k) {
      const double covered = std::max(std::min(right, k + 1.0) - std::max(left, double(k)), 1e-6);
      axis.weights.push_back(static_cast<float>(covered / sum));
    }
  }
  axis.begin = axis.taps.front().first;
  axis.end = axis.taps.back().first + axis.taps.back().count;
  return axis;
}

/// Source rows brought to the width, the last two of which are kept since neighbours share them.
class WideRows {
 public:
  WideRows(const PictureRows& rows, const Axis& axis)
      : rows_(rows), axis_(axis), pixels_(static_cast<std::size_t>(axis.end - axis.begin)) {
    for (Row& row : kept_) row.colours.resize(axis.taps.size());
  }

  const std::vector<Colour>& at(int y) {
    if (kept_[0].y == y) return kept_[0].colours;
    if (kept_[1].y == y) return kept_[1].colours;
    std::swap(kept_[0], kept_[1]);
    kept_[0].y = y;
    rows_.read(axis_.begin, y, axis_.end - axis_.begin, pixels_.data());
    Colour* to = kept_[0].colours.data();
    for (const Axis::Taps& taps : axis_.taps) {
      const float* weight = &axis_.weights[taps.weights];
      const std::uint32_t* pixel = &pixels_[static_cast<std::size_t>(taps.first - axis_.begin)];
      Colour sum = {};
      for (int k = 0; k < taps.count; ++k) sum += unpack(pixel[k]) * weight[k];
      *to++ = sum;
    }
    return kept_[0].colours;
  }

 private:
  struct Row {
    int y = -1;
    std::vector<Colour> colours;
  };
  const PictureRows& rows_;
  const Axis& axis_;
  std::vector<std::uint32_t> pixels_;
  Row kept_[2];
};

bool isWhole(double value) { return std::abs(value - std::round(value)) < 1e-6; }

}  // namespace

void scalePicture(const PictureRows& rows, const PicturePart& part, PictureSize to, std::uint32_t* pixels) {
  const auto width = static_cast<std::size_t>(to.width);
  if (isWhole(part.x) && isWhole(part.y) && part.width == to.width && part.height == to.height) {
    const int x = static_cast<int>(std::round(part.x));
    const int y = static_cast<int>(std::round(part.y));
    for (int i = 0; i < to.height; ++i, pixels += width) rows.read(x, y + i, to.width, pixels);
    return;
  }
  const Axis across = makeAxis(part.x, part.width, to.width, rows.size().width);
  const Axis down = makeAxis(part.y, part.height, to.height, rows.size().height);
  WideRows wide(rows, across);
  std::vector<Colour> sum(width);
  for (const Axis::Taps& taps : down.taps) {
    for (int k = 0; k < taps.count; ++k) {
      const Colour* row = wide.at(taps.first + k).data();
      const float weight = down.weights[taps.weights + static_cast<std::size_t>(k)];
      for (std::size_t i = 0; i < width; ++i) sum[i] = k == 0 ? row[i] * weight : sum[i] + row[i] * weight;
    }
    for (std::size_t i = 0; i < width; ++i) pixels[i] = pack(sum[i]);
    pixels += width;
  }
}

}  // namespace vaelo
