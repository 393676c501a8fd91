// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "host/gtk/list/folder_row.h"
#include "host/gtk/list/swipe_track.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// Lets a finger move a row of a list towards its start, which uncovers buttons at its end. One row at a time; a press
/// elsewhere, a scroll or another item in the row covers them again. Main thread.
class RowSwipe {
 public:
  struct Button {
    const char* icon;
    std::string label;
    const char* style;  ///< a style class; null for none
    /// Gets where the button is, in the scroller's coordinates. The row covers it meanwhile.
    std::function<void(const GdkRectangle& at)> pressed;
  };
  /// The buttons for an item, from the row's start to its end; none: its row stays.
  using Offers = std::function<std::vector<Button>(FolderItem& item)>;

  /// `context` is that of the rows in `scroller`, both outlive this.
  RowSwipe(GtkWidget* scroller, RowContext& context, Offers offers);
  ~RowSwipe();
  RowSwipe(const RowSwipe&) = delete;
  RowSwipe& operator=(const RowSwipe&) = delete;

  /// Slides the row back.
  void close();
  /// Every press in the scroller, before anybody else hears of it.
  void pressedAt(double x, double y);
  /// Once true for a press that only covered buttons, and so means no row.
  bool takesPress() { return std::exchange(tookPress_, false); }

 private:
  struct Pressed {
    RowSwipe* swipe;
    std::function<void(const GdkRectangle& at)> act;
  };

  bool isInStrip(GtkWidget* widget) const;
  GtkWidget* rowAt(double x, double y) const;
  void began(double x, double y);
  void moved(double x, double y);
  void ended();
  /// The finger moves the row that it touched; false when that has no buttons, or isn't there any more.
  bool takeRow();
  void makeStrip(GtkWidget* row, const std::vector<Button>& buttons);
  void buttonPressed(GtkWidget* button, const std::function<void(const GdkRectangle& at)>& act);
  void uncover(double pixels);
  void slideTo(double pixels);
  void drop();
  std::uint32_t time() const;

  GtkWidget* scroller_;
  RowContext& context_;
  Offers offers_;
  GtkGesture* drag_;
  GRef<AdwAnimation> slide_;
  std::optional<SwipeTrack> track_;
  std::string touched_;         ///< the item under the finger
  bool dragging_ = false;       ///< the finger moves row_
  GtkWidget* row_ = nullptr;    ///< stands aside, or is on its way
  GtkWidget* strip_ = nullptr;  ///< its buttons
  double uncovered_ = 0;
  int width_ = 0;  ///< of all buttons
  bool tookPress_ = false;
};

}  // namespace vaelo
