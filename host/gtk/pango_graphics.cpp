// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/pango_graphics.h"

#include <cmath>
#include <numbers>

#include "host/gtk/cairo_texture.h"
#include "host/support/glib_ptr.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

namespace {

PangoContext* context() {
  static PangoContext* shared = pango_font_map_create_context(pango_cairo_font_map_get_default());
  return shared;
}

GRef<PangoLayout> layoutOf(const std::string& text, const Font& font) {
  GRef<PangoLayout> layout(pango_layout_new(context()));
  PangoFontDescription* description = pango_font_description_from_string(PangoGraphics::FontFamilies);
  pango_font_description_set_absolute_size(description, font.pointSize * textScale() * PANGO_SCALE);
  pango_layout_set_font_description(layout.get(), description);
  pango_font_description_free(description);
  pango_layout_set_text(layout.get(), text.c_str(), static_cast<int>(text.size()));
  return layout;
}

double points(int pangoUnits) { return static_cast<double>(pangoUnits) / PANGO_SCALE; }

/// As lists show it. Of a folder or package the name tells nothing.
GIcon* iconFor(const std::string& fileName, const std::optional<std::string>& typeIdentifier) {
  TypeIdentifiers& types = Platform::current().types;
  if (typeIdentifier && types.conformsTo(*typeIdentifier, "com.marrow.package")) {
    return g_themed_icon_new("package-x-generic");
  }
  const bool isFolder = typeIdentifier && types.conformsTo(*typeIdentifier, "public.directory");
  const std::string type =
      isFolder ? "inode/directory" : takeString(g_content_type_guess(fileName.c_str(), nullptr, 0, nullptr));
  return g_content_type_get_icon(type.c_str());
}

class CairoContext : public DrawingContext {
 public:
  explicit CairoContext(cairo_t* cairo) : cairo_(cairo) {}
  void setFillColor(const Color& color) override { fill_ = color; }
  void setStrokeColor(const Color& color) override { stroke_ = color; }
  void setLineWidth(double width) override { cairo_set_line_width(cairo_, width); }
  void fillRect(const Rect& rect) override {
    cairo_rectangle(cairo_, rect.x, rect.y, rect.width, rect.height);
    paintFill();
  }
  void fillEllipse(const Rect& rect) override {
    ellipse(rect);
    paintFill();
  }
  void strokeEllipse(const Rect& rect) override {
    ellipse(rect);
    use(stroke_);
    cairo_stroke(cairo_);
  }
  void fillWedge(const Point& center, double radius, double startAngle, double endAngle) override {
    cairo_move_to(cairo_, center.x, center.y);
    cairo_arc(cairo_, center.x, center.y, radius, startAngle, endAngle);
    cairo_close_path(cairo_);
    paintFill();
  }
  void drawImage(const ImageRef& image, const Rect& rect) override {
    const auto* held = dynamic_cast<const GtkImageData*>(image.get());
    if (!held || !GDK_IS_TEXTURE(held->paintable())) return;
    GdkTexture* texture = GDK_TEXTURE(held->paintable());
    cairo_surface_t* surface =
        cairo_image_surface_create(CAIRO_FORMAT_ARGB32, gdk_texture_get_width(texture), gdk_texture_get_height(texture));
    gdk_texture_download(texture, cairo_image_surface_get_data(surface),
                         static_cast<gsize>(cairo_image_surface_get_stride(surface)));
    cairo_surface_mark_dirty(surface);
    cairo_save(cairo_);
    cairo_translate(cairo_, rect.x, rect.y);
    cairo_scale(cairo_, rect.width / gdk_texture_get_width(texture), rect.height / gdk_texture_get_height(texture));
    cairo_set_source_surface(cairo_, surface, 0, 0);
    cairo_paint(cairo_);
    cairo_restore(cairo_);
    cairo_surface_destroy(surface);
  }

 private:
  void use(const Color& color) { cairo_set_source_rgba(cairo_, color.red, color.green, color.blue, color.alpha); }
  void paintFill() {
    use(fill_);
    cairo_fill(cairo_);
  }
  void ellipse(const Rect& rect) {
    cairo_save(cairo_);
    cairo_translate(cairo_, rect.x + rect.width / 2, rect.y + rect.height / 2);
    cairo_scale(cairo_, rect.width / 2, rect.height / 2);
    cairo_new_sub_path(cairo_);
    cairo_arc(cairo_, 0, 0, 1, 0, 2 * std::numbers::pi);
    cairo_restore(cairo_);
  }
  cairo_t* cairo_;
  Color fill_;
  Color stroke_;
};

}  // namespace

void drawWithCairo(cairo_t* cairo, const std::function<void(DrawingContext&)>& draw) {
  CairoContext drawing(cairo);
  draw(drawing);
}

double textScale() {
  constexpr double usual = 96 * 1024;
  GtkSettings* settings = gtk_settings_get_default();
  int resolution = -1;
  if (settings) g_object_get(settings, "gtk-xft-dpi", &resolution, nullptr);
  return resolution > 0 ? resolution / usual : 1;
}

FontMetrics PangoGraphics::fontMetrics(const Font& font) {
  const GRef<PangoLayout> layout = layoutOf("X", font);
  PangoRectangle ink;
  PangoRectangle logical;
  pango_layout_get_extents(layout.get(), &ink, &logical);
  const int baseline = pango_layout_get_baseline(layout.get());
  FontMetrics metrics;
  metrics.ascender = points(baseline);
  metrics.descender = -points(logical.height - baseline);
  metrics.capHeight = points(ink.height);
  metrics.lineHeight = points(logical.height);
  return metrics;
}

Size PangoGraphics::measure(const std::string& text, const Font& font, double maxWidth, int maxLines) {
  const GRef<PangoLayout> layout = layoutOf(text, font);
  if (maxWidth > 0) {
    pango_layout_set_width(layout.get(), static_cast<int>(std::ceil(maxWidth * PANGO_SCALE)));
    pango_layout_set_wrap(layout.get(), PANGO_WRAP_WORD_CHAR);
    pango_layout_set_ellipsize(layout.get(), maxLines == 0 ? PANGO_ELLIPSIZE_NONE : PANGO_ELLIPSIZE_END);
    if (maxLines > 0) pango_layout_set_height(layout.get(), -maxLines);
  }
  PangoRectangle logical;
  pango_layout_get_extents(layout.get(), nullptr, &logical);
  return {std::ceil(points(logical.width)), std::ceil(points(logical.height))};
}

ImageRef PangoGraphics::renderImage(const Size& size, const std::function<void(DrawingContext&)>& draw) {
  const int scale = std::max(1, static_cast<int>(std::ceil(Platform::current().screens.device().mainScreen().scale)));
  const int width = std::max(1, static_cast<int>(std::ceil(size.width)));
  const int height = std::max(1, static_cast<int>(std::ceil(size.height)));
  cairo_surface_t* surface = cairo_image_surface_create(CAIRO_FORMAT_ARGB32, width * scale, height * scale);
  cairo_t* cairo = cairo_create(surface);
  cairo_scale(cairo, scale, scale);
  drawWithCairo(cairo, draw);
  cairo_destroy(cairo);
  return std::make_shared<GtkImageData>(GDK_PAINTABLE(takeCairoTexture(surface)), size.width, size.height);
}

ImageRef PangoGraphics::documentIcon(const std::string& fileName, const std::optional<std::string>& typeIdentifier,
                                     IconFormat format) {
  const int size = format == IconFormat::Large ? 128 : 32;
  const int scale = format == IconFormat::Large ? 2 : 1;  // large ones are shown at twice their size
  const GRef<GIcon> icon(iconFor(fileName, typeIdentifier));
  GtkIconTheme* theme = gtk_icon_theme_get_for_display(gdk_display_get_default());
  GtkIconPaintable* paintable =
      gtk_icon_theme_lookup_by_gicon(theme, icon.get(), size, scale, GTK_TEXT_DIR_NONE, static_cast<GtkIconLookupFlags>(0));
  return std::make_shared<GtkImageData>(GDK_PAINTABLE(paintable), size, size);
}

}  // namespace vaelo
