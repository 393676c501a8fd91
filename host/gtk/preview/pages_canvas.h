// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <utility>

#include "host/gtk/preview/page_parts.h"
#include "host/gtk/preview/pages_layout.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// A place on a page, in points from its upper left corner; outside of the page where there is none.
struct PagePlace {
  int page = 0;
  double x = 0;
  double y = 0;
};

/// The scrolled column of a document's pages, of which only the visible ones are drawn. Main thread.
class PagesCanvas {
 public:
  static constexpr double SmallestZoom = 0.1;  ///< pixels a point
  static constexpr double LargestZoom = 16;
  static constexpr double LargestFittingZoom = 1.75;  ///< what fits a wide window is no wider than people like to read

  struct Events {
    std::function<void(GtkSnapshot* snapshot, int page, const PageArea& area)> draw;
    std::function<void()> moved;  ///< other pages are visible, or the same ones elsewhere or in another size
  };

  explicit PagesCanvas(Events events);
  ~PagesCanvas();
  PagesCanvas(const PagesCanvas&) = delete;
  PagesCanvas& operator=(const PagesCanvas&) = delete;
  /// A scrollable widget.
  GtkWidget* widget() const { return area_.get(); }
  void redraw() { gtk_widget_queue_draw(area_.get()); }

  const PagesLayout& layout() const { return layout_; }
  void setCount(int count);
  /// What the user looks at stays where it is.
  void setSizes(int from, const std::vector<PageSize>& sizes);

  double zoom() const { return zoom_; }
  /// The zoom at which the widest page fills the width.
  double fittingZoom() const;
  bool fits() const { return fits_; }
  /// From now on the pages fill the width.
  void fit();
  /// The place under (x, y) stays there.
  void zoomTo(double zoom, double x, double y);
  /// The place comes to be under (x, y).
  void zoomTo(double zoom, const PagePlace& place, double x, double y);
  /// For the time until the canvas has got its own.
  void expectWidth(double width);

  void scrollBy(double x, double y);
  /// `top` points below the page's upper edge come to be at the upper edge.
  void showPage(int page, double top = 0);
  /// Scrolls no further than needed.
  void reveal(int page, double left, double top, double right, double bottom);
  PagePlace placeAt(double x, double y) const;
  PageArea areaOf(int page) const;
  /// First and last; first > last when there are none.
  std::pair<int, int> visiblePages() const;
  /// The one that the user reads.
  int currentPage() const;
  double width() const { return width_; }
  double height() const { return height_; }
  PageParts& parts() { return parts_; }

  // For the widget.
  void allocated(double width, double height);
  void snapshot(GtkSnapshot* snapshot);
  void setAdjustment(bool horizontal, GtkAdjustment* adjustment);
  GtkAdjustment* adjustment(bool horizontal) const { return adjustments_[horizontal ? 0 : 1]; }

 private:
  double scrolled(bool horizontal) const;
  void configure(double x, double y);
  void changed();
  void resized(double width, double height);

  Events events_;
  PagesLayout layout_;
  GRef<GtkWidget> area_;
  PageParts parts_;
  GtkAdjustment* adjustments_[2] = {};
  double width_ = 0;
  double height_ = 0;
  double zoom_ = 1;
  bool fits_ = true;
  bool configuring_ = false;
  bool allocating_ = false;
};

}  // namespace vaelo
