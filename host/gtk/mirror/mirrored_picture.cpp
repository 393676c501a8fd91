// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirror/mirrored_picture.h"

#include <cairo.h>

#include <algorithm>
#include <cmath>

#include "host/gtk/cairo_texture.h"
#include "host/gtk/pango_graphics.h"
#include "host/gtk/style.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr const char* BorderClass = "vaelo-bordered";
constexpr const char* BorderStyle =
    "picture.vaelo-bordered { outline: 1px solid alpha(currentColor, .16); outline-offset: -1px; }";

/// The picture with each pixel as a square of `times` by `times`: the toolkit itself would blur small ones.
GdkPaintable* magnified(GdkTexture* texture, int times) {
  const int width = gdk_texture_get_width(texture);
  const int height = gdk_texture_get_height(texture);
  cairo_surface_t* small = cairo_image_surface_create(CAIRO_FORMAT_ARGB32, width, height);
  gdk_texture_download(texture, cairo_image_surface_get_data(small),
                       static_cast<gsize>(cairo_image_surface_get_stride(small)));
  cairo_surface_mark_dirty(small);
  cairo_surface_t* large = cairo_image_surface_create(CAIRO_FORMAT_ARGB32, width * times, height * times);
  cairo_t* cairo = cairo_create(large);
  cairo_scale(cairo, times, times);
  cairo_set_source_surface(cairo, small, 0, 0);
  cairo_pattern_set_filter(cairo_get_source(cairo), CAIRO_FILTER_NEAREST);
  cairo_paint(cairo);
  cairo_destroy(cairo);
  cairo_surface_destroy(small);
  return GDK_PAINTABLE(takeCairoTexture(large));
}

/// How many times larger than its pixels the picture is shown, rounded up; 1 where it is not to be shown crisp.
int magnification(const ImageView& view, GdkPaintable* picture) {
  if (view.magnificationFilter() != MagnificationFilter::Nearest || !GDK_IS_TEXTURE(picture)) return 1;
  const double times = view.frame().width / gdk_texture_get_width(GDK_TEXTURE(picture));
  constexpr int most = 8;
  return std::clamp(static_cast<int>(std::ceil(times)), 1, most);
}

}  // namespace

MirroredPicture::MirroredPicture(ImageView& view) : view_(view), area_(GTK_WIDGET(g_object_ref_sink(gtk_picture_new()))) {
  addStyle(BorderStyle);
  gtk_picture_set_content_fit(GTK_PICTURE(area_), GTK_CONTENT_FIT_FILL);
  update();
}

MirroredPicture::~MirroredPicture() { g_object_unref(area_); }

void MirroredPicture::update() {
  const auto* image = dynamic_cast<const GtkImageData*>(view_.image().get());
  GdkPaintable* picture = image ? image->paintable() : nullptr;
  const int times = picture ? magnification(view_, picture) : 1;
  if (shown_ != view_.image() || times_ != times) {
    shown_ = view_.image();
    times_ = times;
    const GRef<GdkPaintable> large(times > 1 ? magnified(GDK_TEXTURE(picture), times) : nullptr);
    gtk_picture_set_paintable(GTK_PICTURE(area_), large ? large.get() : picture);
  }
  gtk_accessible_update_property(GTK_ACCESSIBLE(area_), GTK_ACCESSIBLE_PROPERTY_LABEL, view_.accessibilityLabel().c_str(),
                                 -1);
  if (view_.borderWidth() > 0) {
    gtk_widget_add_css_class(area_, BorderClass);
  } else {
    gtk_widget_remove_css_class(area_, BorderClass);
  }
}

}  // namespace vaelo
