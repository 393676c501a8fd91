// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/cairo_texture.h"

namespace vaelo {

GdkTexture* takeCairoTexture(cairo_surface_t* picture) {
  cairo_surface_flush(picture);
  const int width = cairo_image_surface_get_width(picture);
  const int height = cairo_image_surface_get_height(picture);
  const auto stride = static_cast<gsize>(cairo_image_surface_get_stride(picture));
  GBytes* bytes = g_bytes_new_with_free_func(
      cairo_image_surface_get_data(picture), stride * static_cast<gsize>(height),
      +[](gpointer data) { cairo_surface_destroy(static_cast<cairo_surface_t*>(data)); }, picture);
  GdkTexture* texture = gdk_memory_texture_new(width, height, GDK_MEMORY_DEFAULT, bytes, stride);
  g_bytes_unref(bytes);
  return texture;
}

}  // namespace vaelo
