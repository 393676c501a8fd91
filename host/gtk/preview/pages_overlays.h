// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <array>
#include <vector>

#include "host/gtk/preview/page_mark.h"
#include "host/gtk/preview/pages_layout.h"

namespace vaelo {

/// What is drawn over a page that stands at an area of the canvas, at so many pixels a point.
class PageOverlay {
 public:
  PageOverlay(GtkSnapshot* snapshot, const PageArea& area, double zoom) : snapshot_(snapshot), area_(area), zoom_(zoom) {}
  /// Translucent, so that what is written there can still be read.
  void fill(const std::vector<PageRect>& rects, const GdkRGBA& colour) const;
  /// As the mark will look in the document. `width` and `height` are those of the canvas.
  void draw(const PageMark& mark, double width, double height) const;

 private:
  graphene_rect_t placed(const PageRect& rect) const;
  void drawInk(const PageMark& mark, double width, double height) const;
  void drawNote(const PageMark& mark) const;

  GtkSnapshot* snapshot_;
  const PageArea& area_;
  double zoom_;
};

}  // namespace vaelo
