// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/page_painting.h"

namespace vaelo {

bool paintPage(PopplerPage* page, const PageTile& tile, unsigned char* pixels) {
  cairo_surface_t* surface =
      cairo_image_surface_create_for_data(pixels, CAIRO_FORMAT_ARGB32, tile.width, tile.height, tile.width * 4);
  cairo_t* context = cairo_create(surface);
  cairo_set_source_rgb(context, 1, 1, 1);
  cairo_paint(context);
  cairo_translate(context, -tile.x, -tile.y);
  cairo_scale(context, tile.scale, tile.scale);
  poppler_page_render(page, context);
  const bool drawn = cairo_status(context) == CAIRO_STATUS_SUCCESS;
  cairo_destroy(context);
  cairo_surface_finish(surface);
  cairo_surface_destroy(surface);
  return drawn;
}

}  // namespace vaelo
