// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/picture_raster.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <vector>

#include "host/decoder/picture_orientation.h"
#include "host/decoder/picture_scaler.h"
#include "host/support/decoder_error.h"

namespace vaelo {

namespace {

constexpr gint64 MaximumPixels = 128 * 1024 * 1024;       // half a gibibyte
constexpr gint64 MaximumPhotograph = 1024 * 1024 * 1024;  // which are decoded smaller, but not in no time
constexpr std::size_t Chunk = 64 * 1024;
constexpr int ShortestDelay = 20;  // milliseconds; a picture that is due sooner is a mistake of its maker
constexpr int MissingDelay = 100;
constexpr guint32 MissingColour = 0x80808000;  // of what the file has no pixels for; transparent where it can be

int reduced(int length, int denominator) { return (length + denominator - 1) / denominator; }

class PixbufRows : public PictureRows {
 public:
  explicit PixbufRows(const GdkPixbuf* pixbuf)
      : data_(gdk_pixbuf_read_pixels(pixbuf)),
        size_{gdk_pixbuf_get_width(pixbuf), gdk_pixbuf_get_height(pixbuf)},
        stride_(static_cast<std::size_t>(gdk_pixbuf_get_rowstride(pixbuf))),
        hasAlpha_(gdk_pixbuf_get_has_alpha(pixbuf)) {}

  PictureSize size() const override { return size_; }

  void read(int x, int y, int count, std::uint32_t* pixels) const override {
    const std::size_t channels = hasAlpha_ ? 4 : 3;
    const guchar* from = data_ + static_cast<std::size_t>(y) * stride_ + static_cast<std::size_t>(x) * channels;
    if (!hasAlpha_) {
      for (int i = 0; i < count; ++i, from += 3) pixels[i] = 0xFF000000U | rgb(from[0], from[1], from[2]);
      return;
    }
    for (int i = 0; i < count; ++i, from += 4) {
      const std::uint32_t alpha = from[3];
      const auto times = [&](std::uint32_t value) { return (value * alpha + 127) / 255; };
      pixels[i] = alpha == 255 ? 0xFF000000U | rgb(from[0], from[1], from[2])
                  : alpha == 0 ? 0
                               : alpha << 24 | rgb(times(from[0]), times(from[1]), times(from[2]));
    }
  }

 private:
  static std::uint32_t rgb(std::uint32_t red, std::uint32_t green, std::uint32_t blue) {
    return red << 16 | green << 8 | blue;
  }
  const guchar* data_;
  PictureSize size_;
  std::size_t stride_;
  bool hasAlpha_;
};

}  // namespace

/// What happens while a loader is fed.
struct PictureRaster::Loading {
  PictureSize wanted;
  bool isPhotograph;
  PictureSize stored = {};
  bool tooBig = false;
  int rows = 0;  // that have come

  static void sizePrepared(GdkPixbufLoader* loader, int width, int height, Loading* self) {
    self->stored = {width, height};
    int denominator = 1;
    const auto fits = [&](int by) {
      return reduced(width, by) >= self->wanted.width && reduced(height, by) >= self->wanted.height;
    };
    const auto pixels = [&](int by) { return static_cast<gint64>(reduced(width, by)) * reduced(height, by); };
    if (self->isPhotograph) {
      while (denominator < 8 && (fits(denominator * 2) || pixels(denominator) > MaximumPixels)) denominator *= 2;
    }
    self->tooBig = pixels(denominator) > MaximumPixels || pixels(1) > MaximumPhotograph;
    if (self->tooBig) {
      gdk_pixbuf_loader_set_size(loader, 0, 0);  // so that it gives up before it takes memory
    } else if (denominator > 1) {
      gdk_pixbuf_loader_set_size(loader, reduced(width, denominator), reduced(height, denominator));
    }
  }

  // What never comes must not show what was in that memory before.
  static void areaPrepared(GdkPixbufLoader* loader, Loading*) {
    if (GdkPixbuf* pixbuf = gdk_pixbuf_loader_get_pixbuf(loader)) gdk_pixbuf_fill(pixbuf, MissingColour);
  }

  static void areaUpdated(GdkPixbufLoader*, int, int y, int, int height, Loading* self) {
    self->rows = std::max(self->rows, y + height);
  }
};

PictureRaster::PictureRaster(const unsigned char* file, std::size_t size)
    : file_(file),
      bytes_(size),
      isPhotograph_(size > 3 && std::memcmp(file, "\xFF\xD8\xFF", 3) == 0),
      orientation_(pictureOrientation(file, size)) {}

const char* PictureRaster::open(PictureSize bounds) {
  // A photograph that lies on its side fits into bounds that do.
  if (turnsSideways(orientation_)) std::swap(bounds.width, bounds.height);
  return load(bounds);
}

const char* PictureRaster::load(PictureSize wanted) {
  Loading loading{wanted, isPhotograph_};
  const bool comesInRows = isPhotograph_ || (bytes_ > 4 && std::memcmp(file_, "\x89PNG", 4) == 0);
  const GRef<GdkPixbufLoader> loader(gdk_pixbuf_loader_new());
  g_signal_connect(loader.get(), "size-prepared", G_CALLBACK(Loading::sizePrepared), &loading);
  if (comesInRows) {
    g_signal_connect(loader.get(), "area-prepared", G_CALLBACK(Loading::areaPrepared), &loading);
    g_signal_connect(loader.get(), "area-updated", G_CALLBACK(Loading::areaUpdated), &loading);
  }
  bool fine = true;
  for (std::size_t at = 0; fine && at < bytes_; at += Chunk) {
    fine = gdk_pixbuf_loader_write(loader.get(), file_ + at, std::min(Chunk, bytes_ - at), nullptr);
  }
  fine = gdk_pixbuf_loader_close(loader.get(), nullptr) && fine;
  g_signal_handlers_disconnect_by_data(loader.get(), &loading);
  if (loading.tooBig) return DecoderError::TooBig;
  // There is a loader for what its name says that it is.
  if (!fine && (!gdk_pixbuf_loader_get_format(loader.get()) || loading.rows == 0)) return DecoderError::Damaged;
  if (const char* problem = take(loader.get())) return problem;
  stored_ = isPhotograph_ ? loading.stored : decoded();
  partial_ = comesInRows && loading.rows < decoded().height;
  // The loader ends a photograph in grey without a word.
  if (isPhotograph_) partial_ = partial_ || isCutJpeg(file_, bytes_);
  return nullptr;
}

const char* PictureRaster::take(GdkPixbufLoader* loader) {
  GdkPixbufAnimation* animation = gdk_pixbuf_loader_get_animation(loader);
  if (!animation) return DecoderError::Damaged;
  GdkPixbuf* pixbuf = nullptr;
  if (gdk_pixbuf_animation_is_static_image(animation)) {
    pixbuf = gdk_pixbuf_animation_get_static_image(animation);
  } else {
    G_GNUC_BEGIN_IGNORE_DEPRECATIONS
    const GTimeVal start = {0, 0};
    frames_.reset(gdk_pixbuf_animation_get_iter(animation, &start));
    G_GNUC_END_IGNORE_DEPRECATIONS
    pixbuf = frames_ ? gdk_pixbuf_animation_iter_get_pixbuf(frames_.get()) : nullptr;
  }
  if (!pixbuf || static_cast<gint64>(gdk_pixbuf_get_width(pixbuf)) * gdk_pixbuf_get_height(pixbuf) > MaximumPixels) {
    return DecoderError::Damaged;
  }
  if (gdk_pixbuf_get_bits_per_sample(pixbuf) != 8) return DecoderError::Unsupported;
  pixbuf_.reset(GDK_PIXBUF(g_object_ref(pixbuf)));
  if (const char* turned = gdk_pixbuf_get_option(pixbuf, "orientation"); turned && orientation_ == 1) {
    orientation_ = turned[0] >= '1' && turned[0] <= '8' && !turned[1] ? turned[0] - '0' : 1;
  }
  return nullptr;
}

PictureSize PictureRaster::decoded() const {
  return {gdk_pixbuf_get_width(pixbuf_.get()), gdk_pixbuf_get_height(pixbuf_.get())};
}

PictureSize PictureRaster::size() const {
  return turnsSideways(orientation_) ? PictureSize{stored_.height, stored_.width} : stored_;
}

PictureSource::Features PictureRaster::features() const {
  Features features;
  features.transparent = gdk_pixbuf_get_has_alpha(pixbuf_.get());
  features.partial = partial_;
  if (frames_) {
    const int delay = gdk_pixbuf_animation_iter_get_delay_time(frames_.get());
    features.delay = delay < 0 ? -1 : delay < ShortestDelay ? MissingDelay : delay;
  }
  return features;
}

const char* PictureRaster::draw(const PicturePart& part, PictureSize to, std::uint32_t* pixels) {
  PicturePart from = partBeforeTurn(orientation_, size(), part);
  if (turnsSideways(orientation_)) std::swap(to.width, to.height);
  const PictureSize wanted = {static_cast<int>(std::min(to.width / from.width, 1.0) * stored_.width),
                              static_cast<int>(std::min(to.height / from.height, 1.0) * stored_.height)};
  const auto isEnough = [&] { return decoded().width >= wanted.width && decoded().height >= wanted.height; };
  // What there is stays when there is no memory for more.
  if (isPhotograph_ && !isEnough()) load(wanted);
  const double across = static_cast<double>(decoded().width) / stored_.width;
  const double down = static_cast<double>(decoded().height) / stored_.height;
  from = {from.x * across, from.y * down, from.width * across, from.height * down};
  const PixbufRows rows(pixbuf_.get());
  if (orientation_ == 1) {
    scalePicture(rows, from, to, pixels);
    return nullptr;
  }
  std::vector<std::uint32_t> lying(static_cast<std::size_t>(to.width) * static_cast<std::size_t>(to.height));
  scalePicture(rows, from, to, lying.data());
  turnPicture(orientation_, lying.data(), to, pixels);
  return nullptr;
}

void PictureRaster::advance() {
  if (!frames_ || features().delay < 0) return;
  // The loaders tell the time to wait by their own count, which is followed to the millisecond.
  time_ += static_cast<gint64>(std::max(gdk_pixbuf_animation_iter_get_delay_time(frames_.get()), 1)) * 1000;
  G_GNUC_BEGIN_IGNORE_DEPRECATIONS
  const GTimeVal now = {static_cast<glong>(time_ / G_USEC_PER_SEC), static_cast<glong>(time_ % G_USEC_PER_SEC)};
  gdk_pixbuf_animation_iter_advance(frames_.get(), &now);
  G_GNUC_END_IGNORE_DEPRECATIONS
  GdkPixbuf* pixbuf = gdk_pixbuf_animation_iter_get_pixbuf(frames_.get());
  if (pixbuf && gdk_pixbuf_get_bits_per_sample(pixbuf) == 8) pixbuf_.reset(GDK_PIXBUF(g_object_ref(pixbuf)));
}

}  // namespace vaelo
