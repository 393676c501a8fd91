// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "platform/ui/graphics.h"

namespace vaelo {

/// Text by Pango, drawing by Cairo, icons of the icon theme.
class PangoGraphics : public Graphics {
 public:
  static constexpr const char* FontFamilies = "Cantarell, sans";
  FontMetrics fontMetrics(const Font& font) override;
  Size measure(const std::string& text, const Font& font, double maxWidth, int maxLines) override;
  ImageRef renderImage(const Size& size, const std::function<void(DrawingContext&)>& draw) override;
  ImageRef documentIcon(const std::string& fileName, const std::optional<std::string>& typeIdentifier,
                        IconFormat format) override;
};

/// Calls `draw` with what draws on `cairo`.
void drawWithCairo(cairo_t* cairo, const std::function<void(DrawingContext&)>& draw);

/// How much larger than usual the user wants text.
double textScale();

/// An image as the toolkit holds it.
class GtkImageData : public Image {
 public:
  GtkImageData(GdkPaintable* paintable, double width, double height)
      : paintable_(paintable), width_(width), height_(height) {}
  ~GtkImageData() override { g_object_unref(paintable_); }
  double width() const override { return width_; }
  double height() const override { return height_; }
  GdkPaintable* paintable() const { return paintable_; }

 private:
  GdkPaintable* paintable_;
  double width_;
  double height_;
};

}  // namespace vaelo
