// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_canvas.h"

#include <algorithm>
#include <cmath>

namespace vaelo {

namespace {

constexpr double LeastScroll = 0.5;  // pixels

struct PagesArea {
  GtkWidget parent;
  PagesCanvas* canvas;  // null when it is gone
};
struct PagesAreaClass {
  GtkWidgetClass parent;
};

enum Property { HAdjustment = 1, VAdjustment, HScrollPolicy, VScrollPolicy };

PagesCanvas* canvasOf(gpointer object) { return static_cast<PagesArea*>(object)->canvas; }

void getProperty(GObject* object, guint id, GValue* value, GParamSpec*) {
  const PagesCanvas* canvas = canvasOf(object);
  if (id == HAdjustment || id == VAdjustment) {
    g_value_set_object(value, canvas ? canvas->adjustment(id == HAdjustment) : nullptr);
  } else {
    g_value_set_enum(value, GTK_SCROLL_MINIMUM);
  }
}

void setProperty(GObject* object, guint id, const GValue* value, GParamSpec*) {
  PagesCanvas* canvas = canvasOf(object);
  if (canvas && (id == HAdjustment || id == VAdjustment)) {
    canvas->setAdjustment(id == HAdjustment, static_cast<GtkAdjustment*>(g_value_get_object(value)));
  }
}

void sizeAllocate(GtkWidget* widget, int width, int height, int) {
  if (PagesCanvas* canvas = canvasOf(widget)) canvas->allocated(width, height);
}

void snapshotArea(GtkWidget* widget, GtkSnapshot* snapshot) {
  if (PagesCanvas* canvas = canvasOf(widget)) canvas->snapshot(snapshot);
}

void measure(GtkWidget*, GtkOrientation, int, int* minimum, int* natural, int*, int*) { *minimum = *natural = 1; }

void initClass(gpointer type, gpointer) {
  GObjectClass* object = G_OBJECT_CLASS(type);
  object->get_property = getProperty;
  object->set_property = setProperty;
  g_object_class_override_property(object, HAdjustment, "hadjustment");
  g_object_class_override_property(object, VAdjustment, "vadjustment");
  g_object_class_override_property(object, HScrollPolicy, "hscroll-policy");
  g_object_class_override_property(object, VScrollPolicy, "vscroll-policy");
  GtkWidgetClass* widget = GTK_WIDGET_CLASS(type);
  widget->size_allocate = sizeAllocate;
  widget->snapshot = snapshotArea;
  widget->measure = measure;
  gtk_widget_class_set_css_name(widget, "pages");
  gtk_widget_class_set_accessible_role(widget, GTK_ACCESSIBLE_ROLE_DOCUMENT);
}

GType areaType() {
  static const GType type = [] {
    const GType made = g_type_register_static_simple(
        GTK_TYPE_WIDGET, "VaeloPagesArea", sizeof(PagesAreaClass), initClass, sizeof(PagesArea),
        +[](GTypeInstance*, gpointer) {}, static_cast<GTypeFlags>(0));
    const GInterfaceInfo scrollable = {nullptr, nullptr, nullptr};
    g_type_add_interface_static(made, GTK_TYPE_SCROLLABLE, &scrollable);
    return made;
  }();
  return type;
}

void drawPaper(GtkSnapshot* snapshot, const PageArea& area) {
  graphene_rect_t paper;
  graphene_rect_init(&paper, static_cast<float>(area.x), static_cast<float>(area.y), static_cast<float>(area.width),
                     static_cast<float>(area.height));
  GskRoundedRect outline;
  gsk_rounded_rect_init_from_rect(&outline, &paper, 0);
  const GdkRGBA shade = {0, 0, 0, 0.3F};
  gtk_snapshot_append_outset_shadow(snapshot, &outline, &shade, 0, 1, 0, 4);
  const GdkRGBA white = {1, 1, 1, 1};
  gtk_snapshot_append_color(snapshot, &white, &paper);
}

}  // namespace

PagesCanvas::PagesCanvas(Events events)
    : events_(std::move(events)),
      area_(GTK_WIDGET(g_object_ref_sink(g_object_new(areaType(), nullptr)))),
      parts_(area_.get()) {
  reinterpret_cast<PagesArea*>(area_.get())->canvas = this;
  gtk_widget_set_focusable(area_.get(), TRUE);
  gtk_widget_set_overflow(area_.get(), GTK_OVERFLOW_HIDDEN);
}

PagesCanvas::~PagesCanvas() {
  setAdjustment(true, nullptr);
  setAdjustment(false, nullptr);
  reinterpret_cast<PagesArea*>(area_.get())->canvas = nullptr;
}

void PagesCanvas::setAdjustment(bool horizontal, GtkAdjustment* adjustment) {
  GtkAdjustment*& kept = adjustments_[horizontal ? 0 : 1];
  if (kept) {
    g_signal_handlers_disconnect_by_data(kept, this);
    g_object_unref(kept);
  }
  kept = adjustment;
  if (!kept) return;
  g_object_ref_sink(kept);
  g_signal_connect_swapped(kept, "value-changed", G_CALLBACK(+[](PagesCanvas* self) { self->changed(); }), this);
  configure(scrolled(true), scrolled(false));
}

double PagesCanvas::scrolled(bool horizontal) const {
  GtkAdjustment* kept = adjustment(horizontal);
  return kept ? gtk_adjustment_get_value(kept) : 0;
}

void PagesCanvas::changed() {
  if (configuring_) return;
  gtk_widget_queue_draw(area_.get());
  const auto [first, last] = visiblePages();
  parts_.show(first, last, layout_.count());
  if (!allocating_) gtk_widget_queue_allocate(area_.get());
  events_.moved();
}

// Both at once, so that nobody sees one without the other.
void PagesCanvas::configure(double x, double y) {
  configuring_ = true;
  const double widths[2] = {layout_.width(zoom_), layout_.height(zoom_)};
  const double pages[2] = {width_, height_};
  const double values[2] = {x, y};
  for (std::size_t i = 0; i < 2; ++i) {
    if (!adjustments_[i]) continue;
    // What fits but for the rounding of numbers has nothing to scroll: it would take the swipe that goes back for that.
    const double upper = widths[i] < pages[i] + LeastScroll ? pages[i] : widths[i];
    const double value = std::clamp(values[i], 0.0, upper - pages[i]);
    gtk_adjustment_configure(adjustments_[i], value, 0, upper, pages[i] * 0.1, pages[i] * 0.9, pages[i]);
  }
  configuring_ = false;
  changed();
}

void PagesCanvas::setCount(int count) {
  layout_.setCount(count);
  configure(scrolled(true), scrolled(false));
}

void PagesCanvas::setSizes(int from, const std::vector<PageSize>& sizes) {
  const PagePlace top = placeAt(width_ / 2, 0);
  layout_.setSizes(from, sizes);
  if (fits_) zoom_ = fittingZoom();
  zoomTo(zoom_, top, width_ / 2, 0);
}

double PagesCanvas::fittingZoom() const {
  const double fitting = (width_ - 2 * PagesLayout::Gap) / std::max(layout_.widest(), 1.0);
  return std::clamp(fitting, SmallestZoom, LargestFittingZoom);
}

void PagesCanvas::fit() {
  const PagePlace middle = placeAt(width_ / 2, 0);
  zoomTo(fittingZoom(), middle, width_ / 2, 0);
  fits_ = true;
}

void PagesCanvas::zoomTo(double zoom, double x, double y) { zoomTo(zoom, placeAt(x, y), x, y); }

void PagesCanvas::zoomTo(double zoom, const PagePlace& place, double x, double y) {
  const double clamped = std::clamp(zoom, SmallestZoom, LargestZoom);
  fits_ = fits_ && clamped == zoom_;
  zoom_ = clamped;
  if (layout_.count() == 0) return configure(0, 0);
  const PageArea area = layout_.area(std::clamp(place.page, 0, layout_.count() - 1), zoom_, width_);
  configure(area.x + place.x * zoom_ - x, area.y + place.y * zoom_ - y);
}

void PagesCanvas::expectWidth(double width) {
  if (height_ > 0) return;
  width_ = width;
  if (fits_) zoom_ = fittingZoom();
}

void PagesCanvas::scrollBy(double x, double y) { configure(scrolled(true) + x, scrolled(false) + y); }

void PagesCanvas::showPage(int page, double top) {
  if (layout_.count() == 0) return;
  const PageArea area = layout_.area(std::clamp(page, 0, layout_.count() - 1), zoom_, width_);
  configure(scrolled(true), area.y + (top > 0 ? top * zoom_ : -PagesLayout::Gap));
}

void PagesCanvas::reveal(int page, double left, double top, double right, double bottom) {
  if (page < 0 || page >= layout_.count()) return;
  const PageArea area = areaOf(page);
  const auto step = [](double low, double high, double extent) {
    const double margin = std::min(64.0, extent / 6);  // the number of the page lies over the last of it
    if (low < margin) return low - margin;
    return high > extent - margin ? std::min(high - extent + margin, low - margin) : 0;
  };
  const double x = step(area.x + left * zoom_, area.x + right * zoom_, width_);
  // What was far away comes to the upper third, where its context is seen.
  double y = step(area.y + top * zoom_, area.y + bottom * zoom_, height_);
  if (std::abs(y) > height_ / 2) y = area.y + top * zoom_ - height_ / 3;
  configure(scrolled(true) + x, scrolled(false) + y);
}

PagePlace PagesCanvas::placeAt(double x, double y) const {
  if (layout_.count() == 0) return {};
  const int page = layout_.pageAt(y + scrolled(false), zoom_);
  const PageArea area = areaOf(page);
  return {page, (x - area.x) / zoom_, (y - area.y) / zoom_};
}

PageArea PagesCanvas::areaOf(int page) const {
  PageArea area = layout_.area(page, zoom_, width_);
  area.x -= scrolled(true);
  area.y -= scrolled(false);
  return area;
}

std::pair<int, int> PagesCanvas::visiblePages() const {
  if (layout_.count() == 0) return {0, -1};
  const double top = scrolled(false);
  int first = layout_.pageAt(top, zoom_);
  const PageArea area = areaOf(first);
  if (area.y + area.height <= 0 && first + 1 < layout_.count()) ++first;
  return {first, std::max(first, layout_.pageAt(top + std::max(height_ - 1, 0.0), zoom_))};
}

int PagesCanvas::currentPage() const {
  const auto [first, last] = visiblePages();
  if (last <= first) return std::max(first, 0);
  if (scrolled(false) <= 0) return first;
  if (scrolled(false) >= std::max(layout_.height(zoom_) - height_, 0.0) - 1) return last;
  int best = first;
  double most = -1;
  for (int page = first; page <= last; ++page) {
    const PageArea area = areaOf(page);
    const double shown = std::min(area.y + area.height, height_) - std::max(area.y, 0.0);
    if (shown > most + 1) {
      most = shown;
      best = page;
    }
  }
  return best;
}

void PagesCanvas::allocated(double width, double height) {
  allocating_ = true;
  if (width != width_ || height != height_) resized(width, height);
  allocating_ = false;
  parts_.allocate([this](int page) { return areaOf(page); });
}

void PagesCanvas::resized(double width, double height) {
  const PagePlace top = placeAt(width_ / 2, 0);
  width_ = width;
  height_ = height;
  if (fits_) zoom_ = fittingZoom();
  zoomTo(zoom_, top, width_ / 2, 0);
}

void PagesCanvas::snapshot(GtkSnapshot* snapshot) {
  const GdkRGBA shade = {0, 0, 0, 0.08F};
  const graphene_rect_t all = GRAPHENE_RECT_INIT(0, 0, static_cast<float>(width_), static_cast<float>(height_));
  gtk_snapshot_append_color(snapshot, &shade, &all);
  const auto [first, last] = visiblePages();
  for (int page = first; page <= last; ++page) {
    PageArea area = areaOf(page);
    // On whole pixels of the screen, or letters would be blurred.
    const double pixels = gtk_widget_get_scale_factor(area_.get());
    area.x = std::round(area.x * pixels) / pixels;
    area.y = std::round(area.y * pixels) / pixels;
    drawPaper(snapshot, area);
    events_.draw(snapshot, page, area);
  }
}

}  // namespace vaelo
