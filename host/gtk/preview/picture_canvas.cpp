// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/picture_canvas.h"

#include <adwaita.h>

namespace vaelo {

namespace {

struct CanvasWidget {
  GtkWidget parent;
  PictureCanvas* canvas;  // null when it is gone
};

struct CanvasWidgetClass {
  GtkWidgetClass parent;
};

CanvasWidget* canvasOf(gpointer widget) { return static_cast<CanvasWidget*>(widget); }

void initClass(gpointer klass, gpointer) {
  auto* widgetClass = static_cast<GtkWidgetClass*>(klass);
  widgetClass->snapshot = [](GtkWidget* widget, GtkSnapshot* snapshot) {
    if (const PictureCanvas* canvas = canvasOf(widget)->canvas) canvas->snapshot(snapshot);
  };
  widgetClass->size_allocate = [](GtkWidget* widget, int width, int height, int) {
    if (PictureCanvas* canvas = canvasOf(widget)->canvas) canvas->resized(width, height);
  };
  gtk_widget_class_set_accessible_role(widgetClass, GTK_ACCESSIBLE_ROLE_IMG);
  gtk_widget_class_set_css_name(widgetClass, "picture");
}

GType widgetType() {
  static const GType type = g_type_register_static_simple(GTK_TYPE_WIDGET, "VaeloPictureCanvas", sizeof(CanvasWidgetClass),
                                                          initClass, sizeof(CanvasWidget), nullptr, G_TYPE_FLAG_FINAL);
  return type;
}

graphene_rect_t rectangle(const PictureViewport::Area& area) {
  return GRAPHENE_RECT_INIT(static_cast<float>(area.x), static_cast<float>(area.y), static_cast<float>(area.width),
                            static_cast<float>(area.height));
}

PictureViewport::Area intersection(const PictureViewport::Area& a, const PictureViewport::Area& b) {
  const double left = std::max(a.x, b.x);
  const double top = std::max(a.y, b.y);
  return {left, top, std::max(0.0, std::min(a.x + a.width, b.x + b.width) - left),
          std::max(0.0, std::min(a.y + a.height, b.y + b.height) - top)};
}

// Of middle greys, so that black drawings and white ones are both seen on it.
void drawCheckerboard(GtkSnapshot* snapshot, const graphene_rect_t& area) {
  constexpr float square = 8;
  const bool isDark = adw_style_manager_get_dark(adw_style_manager_get_default());
  const float light = isDark ? 0.44F : 0.96F;
  const float shade = isDark ? 0.38F : 0.87F;
  const GdkRGBA ground = {light, light, light, 1};
  const GdkRGBA squares = {shade, shade, shade, 1};
  gtk_snapshot_append_color(snapshot, &ground, &area);
  const graphene_rect_t tile = GRAPHENE_RECT_INIT(area.origin.x, area.origin.y, 2 * square, 2 * square);
  gtk_snapshot_push_repeat(snapshot, &area, &tile);
  const graphene_rect_t first = GRAPHENE_RECT_INIT(area.origin.x, area.origin.y, square, square);
  const graphene_rect_t second = GRAPHENE_RECT_INIT(area.origin.x + square, area.origin.y + square, square, square);
  gtk_snapshot_append_color(snapshot, &squares, &first);
  gtk_snapshot_append_color(snapshot, &squares, &second);
  gtk_snapshot_pop(snapshot);
}

}  // namespace

PictureCanvas::PictureCanvas() : widget_(GTK_WIDGET(g_object_ref_sink(g_object_new(widgetType(), nullptr)))) {
  canvasOf(widget_)->canvas = this;
  gtk_widget_set_overflow(widget_, GTK_OVERFLOW_HIDDEN);
  gtk_widget_set_focusable(widget_, TRUE);
  gtk_widget_set_hexpand(widget_, TRUE);
  gtk_widget_set_vexpand(widget_, TRUE);
  g_signal_connect_object(adw_style_manager_get_default(), "notify::dark", G_CALLBACK(gtk_widget_queue_draw), widget_,
                          G_CONNECT_SWAPPED);
}

PictureCanvas::~PictureCanvas() {
  canvasOf(widget_)->canvas = nullptr;
  g_object_unref(widget_);
}

void PictureCanvas::change(const std::function<void(PictureViewport&)>& change) {
  change(viewport_);
  gtk_widget_queue_draw(widget_);
  if (changed_) changed_();
}

void PictureCanvas::setWhole(GRef<GdkTexture> texture, bool isTransparent) {
  whole_ = std::move(texture);
  isTransparent_ = isTransparent;
  gtk_widget_queue_draw(widget_);
}

void PictureCanvas::setDetail(GRef<GdkTexture> texture, const PictureViewport::Area& part) {
  if (!detail_ && !texture) return;
  detail_ = std::move(texture);
  detailPart_ = part;
  gtk_widget_queue_draw(widget_);
}

void PictureCanvas::resized(int width, int height) {
  viewport_.setWindow({static_cast<double>(width), static_cast<double>(height)});
  if (changed_) changed_();
}

void PictureCanvas::snapshot(GtkSnapshot* snapshot) const {
  if (!whole_) return;
  const PictureViewport::Area picture = viewport_.pictureArea();
  if (isTransparent_) {
    const PictureViewport::Size window = viewport_.window();
    drawCheckerboard(snapshot, rectangle(intersection(picture, {0, 0, window.width, window.height})));
  }
  const bool isHidden = detail_ && detailPart_.covers(viewport_.visiblePart());
  // What is transparent would show both.
  const bool isClipped = detail_ && !isHidden && isTransparent_;
  const graphene_rect_t all = rectangle(picture);
  if (!isHidden && !isClipped) gtk_snapshot_append_texture(snapshot, whole_.get(), &all);
  if (!detail_) return;
  const double scale = viewport_.scale();
  const PictureViewport::Area part = {picture.x + detailPart_.x * scale, picture.y + detailPart_.y * scale,
                                      detailPart_.width * scale, detailPart_.height * scale};
  if (isClipped) {
    const PictureViewport::Area around[] = {
        {picture.x, picture.y, picture.width, part.y - picture.y},
        {picture.x, part.y + part.height, picture.width, picture.y + picture.height - part.y - part.height},
        {picture.x, part.y, part.x - picture.x, part.height},
        {part.x + part.width, part.y, picture.x + picture.width - part.x - part.width, part.height}};
    for (const PictureViewport::Area& area : around) {
      const graphene_rect_t clip = rectangle(area);
      if (clip.size.width <= 0 || clip.size.height <= 0) continue;
      gtk_snapshot_push_clip(snapshot, &clip);
      gtk_snapshot_append_texture(snapshot, whole_.get(), &all);
      gtk_snapshot_pop(snapshot);
    }
  }
  const graphene_rect_t place = rectangle(part);
  gtk_snapshot_append_texture(snapshot, detail_.get(), &place);
}

}  // namespace vaelo
