// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirror/mirrored_drawing.h"

#include "host/gtk/pango_graphics.h"

namespace vaelo {

MirroredDrawing::MirroredDrawing(View& view) : area_(GTK_WIDGET(g_object_ref_sink(gtk_drawing_area_new()))) {
  gtk_drawing_area_set_draw_func(
      GTK_DRAWING_AREA(area_),
      [](GtkDrawingArea*, cairo_t* cairo, int width, int height, gpointer drawn) {
        drawWithCairo(cairo, [&](DrawingContext& context) {
          static_cast<View*>(drawn)->drawRect(context, {0, 0, static_cast<double>(width), static_cast<double>(height)});
        });
      },
      &view, nullptr);
}

MirroredDrawing::~MirroredDrawing() {
  gtk_drawing_area_set_draw_func(GTK_DRAWING_AREA(area_), nullptr, nullptr, nullptr);
  g_object_unref(area_);
}

void MirroredDrawing::update() { gtk_widget_queue_draw(area_); }

}  // namespace vaelo
