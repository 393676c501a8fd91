// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/picture_vector.h"

#include <algorithm>
#include <cmath>
#include <memory>
#include <string_view>

#include "host/support/decoder_error.h"

namespace vaelo {

namespace {

constexpr double Longest = 8192;      // pixels that a side is said to have; it is drawn at any size anyway
constexpr double WithoutSize = 1024;  // of a picture that doesn't say

struct CairoDestroy {
  void operator()(cairo_t* cairo) const { cairo_destroy(cairo); }
  void operator()(cairo_surface_t* surface) const { cairo_surface_destroy(surface); }
};

bool isUsable(double length) { return std::isfinite(length) && length > 0; }

PictureSize sizeOf(RsvgHandle* handle) {
  double width = 0;
  double height = 0;
  if (!rsvg_handle_get_intrinsic_size_in_pixels(handle, &width, &height) || !isUsable(width) || !isUsable(height)) {
    gboolean hasBox = FALSE;
    RsvgRectangle box = {};
    rsvg_handle_get_intrinsic_dimensions(handle, nullptr, nullptr, nullptr, nullptr, &hasBox, &box);
    width = hasBox ? box.width : 0;
    height = hasBox ? box.height : 0;
  }
  if (!isUsable(width) || !isUsable(height)) width = height = WithoutSize;
  const double scale = std::min(1.0, Longest / std::max(width, height));
  return {std::max(1, static_cast<int>(std::lround(width * scale))),
          std::max(1, static_cast<int>(std::lround(height * scale)))};
}

}  // namespace

bool PictureVector::isOne(const unsigned char* file, std::size_t size) {
  constexpr std::size_t looked = 4096;
  // NOLINTNEXTLINE(cppcoreguidelines-pro-type-reinterpret-cast): text in a file of bytes
  const std::string_view begin(reinterpret_cast<const char*>(file), std::min(size, looked));
  if (begin.size() > 2 && begin.substr(0, 2) == "\x1F\x8B") return true;  // compressed
  const std::size_t text = begin.find_first_not_of("\xEF\xBB\xBF \t\r\n");
  return text != std::string_view::npos && begin[text] == '<';
}

const char* PictureVector::open(PictureSize) {
  const GRef<GInputStream> stream(g_memory_input_stream_new_from_data(file_, static_cast<gssize>(bytes_), nullptr));
  handle_.reset(rsvg_handle_new_from_stream_sync(stream.get(), nullptr, RSVG_HANDLE_FLAGS_NONE, nullptr, nullptr));
  if (!handle_) return DecoderError::Damaged;
  size_ = sizeOf(handle_.get());
  return nullptr;
}

PictureSource::Features PictureVector::features() const {
  Features features;
  features.transparent = true;
  features.scalable = true;
  return features;
}

const char* PictureVector::draw(const PicturePart& part, PictureSize to, std::uint32_t* pixels) {
  // NOLINTNEXTLINE(cppcoreguidelines-pro-type-reinterpret-cast): cairo counts bytes
  auto* bytes = reinterpret_cast<unsigned char*>(pixels);
  const std::unique_ptr<cairo_surface_t, CairoDestroy> surface(
      cairo_image_surface_create_for_data(bytes, CAIRO_FORMAT_ARGB32, to.width, to.height, to.width * 4));
  const std::unique_ptr<cairo_t, CairoDestroy> cairo(cairo_create(surface.get()));
  const double across = to.width / part.width;
  const double down = to.height / part.height;
  const RsvgRectangle whole = {-part.x * across, -part.y * down, size_.width * across, size_.height * down};
  const bool drawn = rsvg_handle_render_document(handle_.get(), cairo.get(), &whole, nullptr);
  cairo_surface_flush(surface.get());
  return drawn ? nullptr : DecoderError::Damaged;
}

}  // namespace vaelo
