// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_overlays.h"

#include <algorithm>

namespace vaelo {

namespace {

GdkRGBA colourOf(const PageMark& mark, float alpha) {
  return {static_cast<float>(mark.colour[0]), static_cast<float>(mark.colour[1]), static_cast<float>(mark.colour[2]), alpha};
}

}  // namespace

graphene_rect_t PageOverlay::placed(const PageRect& rect) const {
  return GRAPHENE_RECT_INIT(static_cast<float>(area_.x + rect.left * zoom_), static_cast<float>(area_.y + rect.top * zoom_),
                            static_cast<float>((rect.right - rect.left) * zoom_),
                            static_cast<float>((rect.bottom - rect.top) * zoom_));
}

void PageOverlay::fill(const std::vector<PageRect>& rects, const GdkRGBA& colour) const {
  for (const PageRect& rect : rects) {
    const graphene_rect_t place = placed(rect);
    gtk_snapshot_append_color(snapshot_, &colour, &place);
  }
}

void PageOverlay::draw(const PageMark& mark, double width, double height) const {
  switch (mark.kind) {
    case PageMark::Kind::Highlight:
      return fill(mark.lines, colourOf(mark, 0.4F));
    case PageMark::Kind::Ink:
      return drawInk(mark, width, height);
    case PageMark::Kind::Note:
      return drawNote(mark);
  }
}

// Only what shows: a page that is looked at closely is larger than any picture can be.
void PageOverlay::drawInk(const PageMark& mark, double width, double height) const {
  const double left = std::max(area_.x, 0.0);
  const double top = std::max(area_.y, 0.0);
  const double right = std::min(area_.x + area_.width, width);
  const double bottom = std::min(area_.y + area_.height, height);
  if (right <= left || bottom <= top || mark.points.empty()) return;
  const graphene_rect_t shown = GRAPHENE_RECT_INIT(static_cast<float>(left), static_cast<float>(top),
                                                   static_cast<float>(right - left), static_cast<float>(bottom - top));
  cairo_t* context = gtk_snapshot_append_cairo(snapshot_, &shown);
  cairo_translate(context, area_.x, area_.y);
  cairo_scale(context, zoom_, zoom_);
  cairo_set_source_rgb(context, mark.colour[0], mark.colour[1], mark.colour[2]);
  cairo_set_line_width(context, mark.width);
  cairo_set_line_cap(context, CAIRO_LINE_CAP_ROUND);
  cairo_set_line_join(context, CAIRO_LINE_JOIN_ROUND);
  for (const auto& point : mark.points) cairo_line_to(context, point[0], point[1]);
  // A line of one point would show nothing.
  if (mark.points.size() == 1) cairo_line_to(context, mark.points[0][0], mark.points[0][1]);
  cairo_stroke(context);
  cairo_destroy(context);
}

void PageOverlay::drawNote(const PageMark& mark) const {
  constexpr double side = PageMark::NoteSide;
  const double x = mark.points.front()[0];
  const double y = mark.points.front()[1];
  const graphene_rect_t paper = placed({x, y, x + side, y + side});
  GskRoundedRect outline;
  gsk_rounded_rect_init_from_rect(&outline, &paper, static_cast<float>(4 * zoom_));
  const GdkRGBA colour = colourOf(mark, 1);
  const GdkRGBA ink = {0.3F, 0.25F, 0, 0.8F};
  gtk_snapshot_push_rounded_clip(snapshot_, &outline);
  gtk_snapshot_append_color(snapshot_, &colour, &paper);
  gtk_snapshot_pop(snapshot_);
  const float line = 1;
  const float widths[] = {line, line, line, line};
  const GdkRGBA colours[] = {ink, ink, ink, ink};
  gtk_snapshot_append_border(snapshot_, &outline, widths, colours);
  for (const double part : {0.3, 0.5, 0.7}) {
    const double lineTop = y + side * part - 0.75;
    fill({{x + side * 0.2, lineTop, x + side * (part > 0.6 ? 0.6 : 0.8), lineTop + 1.5}}, ink);
  }
}

}  // namespace vaelo
