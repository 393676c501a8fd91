// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/thumbnails/late_picture.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "host/gtk/cairo_texture.h"

namespace vaelo {

namespace {

/// Pixels for each point of the finest screen.
int finestScale() {
  int finest = 1;
  GListModel* monitors = gdk_display_get_monitors(gdk_display_get_default());
  for (guint i = 0; i < g_list_model_get_n_items(monitors); ++i) {
    const GRef<GdkMonitor> monitor(GDK_MONITOR(g_list_model_get_item(monitors, i)));
    finest = std::max(finest, gdk_monitor_get_scale_factor(monitor.get()));
  }
  return finest;
}

cairo_surface_t* surfaceOf(GdkTexture* texture) {
  cairo_surface_t* surface =
      cairo_image_surface_create(CAIRO_FORMAT_ARGB32, gdk_texture_get_width(texture), gdk_texture_get_height(texture));
  gdk_texture_download(texture, cairo_image_surface_get_data(surface),
                       static_cast<gsize>(cairo_image_surface_get_stride(surface)));
  cairo_surface_mark_dirty(surface);
  return surface;
}

/// The same at half its size or more, so that each pixel is made of all that it stands for. The first is gone then.
cairo_surface_t* takeScaled(cairo_surface_t* from, int width, int height) {
  cairo_surface_t* scaled = cairo_image_surface_create(CAIRO_FORMAT_ARGB32, width, height);
  cairo_t* cairo = cairo_create(scaled);
  cairo_scale(cairo, double(width) / cairo_image_surface_get_width(from),
              double(height) / cairo_image_surface_get_height(from));
  cairo_set_source_surface(cairo, from, 0, 0);
  cairo_pattern_set_filter(cairo_get_source(cairo), CAIRO_FILTER_BILINEAR);
  cairo_set_operator(cairo, CAIRO_OPERATOR_SOURCE);
  cairo_paint(cairo);
  cairo_destroy(cairo);
  cairo_surface_destroy(from);
  return scaled;
}

struct LatePictureState {
  int width;
  int height;
  std::future<GRef<GdkTexture>> coming;
  GRef<GdkTexture> texture;
  GRef<GdkTexture> smaller;

  /// Waits where need be. Comes in the size in which it is drawn, where that is smaller than its own: renderers would look
  /// at each of its pixels several times, in each frame, or else leave pixels out.
  GdkTexture* textureFor(double widthInPoints, double heightInPoints) {
    if (coming.valid()) texture = coming.get();
    if (!texture) return nullptr;
    const int wide = static_cast<int>(std::ceil(widthInPoints * finestScale()));
    const int high = static_cast<int>(std::ceil(heightInPoints * finestScale()));
    if (wide >= width || high >= height || wide <= 0 || high <= 0) return texture.get();
    if (!smaller || gdk_texture_get_width(smaller.get()) != wide || gdk_texture_get_height(smaller.get()) != high) {
      cairo_surface_t* surface = surfaceOf(texture.get());
      int halfWidth = width / 2;
      int halfHeight = height / 2;
      for (; halfWidth > wide && halfHeight > high; halfWidth /= 2, halfHeight /= 2) {
        surface = takeScaled(surface, halfWidth, halfHeight);
      }
      smaller.reset(takeCairoTexture(takeScaled(surface, wide, high)));
    }
    return smaller.get();
  }
};

struct LatePicture {
  GObject parent;
  LatePictureState* state;
};

struct LatePictureClass {
  GObjectClass parent;
};

LatePictureState& stateOf(gpointer object) { return *static_cast<LatePicture*>(object)->state; }

void snapshotLate(GdkPaintable* paintable, GdkSnapshot* snapshot, double width, double height) {
  if (GdkTexture* texture = stateOf(paintable).textureFor(width, height)) {
    gdk_paintable_snapshot(GDK_PAINTABLE(texture), snapshot, width, height);
  }
}

void implementPaintable(gpointer interface, gpointer) {
  auto* paintable = static_cast<GdkPaintableInterface*>(interface);
  paintable->snapshot = snapshotLate;
  paintable->get_flags = [](GdkPaintable*) {
    return static_cast<GdkPaintableFlags>(GDK_PAINTABLE_STATIC_SIZE | GDK_PAINTABLE_STATIC_CONTENTS);
  };
  paintable->get_intrinsic_width = [](GdkPaintable* self) { return stateOf(self).width; };
  paintable->get_intrinsic_height = [](GdkPaintable* self) { return stateOf(self).height; };
}

void initLatePictureClass(gpointer type, gpointer) {
  G_OBJECT_CLASS(type)->finalize = [](GObject* object) {
    delete &stateOf(object);
    G_OBJECT_CLASS(g_type_class_peek(G_TYPE_OBJECT))->finalize(object);
  };
}

GType latePictureType() {
  static const GType type = [] {
    const GType made = g_type_register_static_simple(G_TYPE_OBJECT, "VaeloLatePicture", sizeof(LatePictureClass),
                                                     initLatePictureClass, sizeof(LatePicture), nullptr, G_TYPE_FLAG_NONE);
    const GInterfaceInfo paintable{implementPaintable, nullptr, nullptr};
    g_type_add_interface_static(made, GDK_TYPE_PAINTABLE, &paintable);
    return made;
  }();
  return type;
}

}  // namespace

GRef<GdkPaintable> makeLatePicture(int width, int height, std::future<GRef<GdkTexture>> coming) {
  gpointer made = g_object_new(latePictureType(), nullptr);
  static_cast<LatePicture*>(made)->state = new LatePictureState{width, height, std::move(coming), {}, {}};
  return GRef<GdkPaintable>(GDK_PAINTABLE(made));
}

}  // namespace vaelo
