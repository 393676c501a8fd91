// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/thumbnail_cache.h"

#include <algorithm>
#include <cstdlib>

namespace vaelo {

GdkTexture* cachedThumbnail(const std::string& cacheFolder, const std::string& path, std::int64_t modified, int pixels) {
  char* uri = g_filename_to_uri(path.c_str(), nullptr, nullptr);
  if (!uri) return nullptr;
  char* hash = g_compute_checksum_for_string(G_CHECKSUM_MD5, uri, -1);
  const std::string folder = cacheFolder + "/thumbnails/";
  const std::string file = "/" + std::string(hash) + ".png";
  g_free(hash);
  g_free(uri);

  GdkPixbuf* picture = nullptr;
  for (const char* size : {"normal", "large", "x-large", "xx-large"}) {
    const std::string candidate = folder + size + file;
    if (!g_file_test(candidate.c_str(), G_FILE_TEST_IS_REGULAR)) continue;
    if ((picture = gdk_pixbuf_new_from_file(candidate.c_str(), nullptr))) break;
  }
  if (!picture) return nullptr;
  const char* version = gdk_pixbuf_get_option(picture, "tEXt::Thumb::MTime");
  GdkTexture* texture = nullptr;
  if (version && std::strtoll(version, nullptr, 10) == modified) {
    const int width = gdk_pixbuf_get_width(picture);
    const int height = gdk_pixbuf_get_height(picture);
    const double scale = std::min(1.0, static_cast<double>(pixels) / std::max(width, height));
    GdkPixbuf* scaled = gdk_pixbuf_scale_simple(picture, std::max(1, static_cast<int>(width * scale)),
                                                std::max(1, static_cast<int>(height * scale)), GDK_INTERP_BILINEAR);
    if (scaled) {
      texture = gdk_texture_new_for_pixbuf(scaled);
      g_object_unref(scaled);
    }
  }
  g_object_unref(picture);
  return texture;
}

}  // namespace vaelo
