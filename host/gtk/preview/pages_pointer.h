// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>

#include "host/gtk/preview/pages_canvas.h"

namespace vaelo {

/// What a pointer or a finger does on the pages beside scrolling and zooming: drags, long presses, and asking for a menu.
/// Coordinates are those of the canvas. Main thread.
class PagesPointer {
 public:
  struct Events {
    std::function<bool(bool finger)> wantsDrag;  ///< asked as one begins; else it is left to others
    std::function<void(double x, double y, int presses)> begin;
    std::function<void(double x, double y)> move;
    std::function<void(bool cancelled)> end;
    std::function<void(double x, double y)> longPress;  ///< of a finger whose drag was not wanted; it may go on with moves
    std::function<void(double x, double y)> menu;
    std::function<void(double x, double y)> click;  ///< of a pointer or a finger, without a drag
    std::function<bool()> scrollsAtEdges;           ///< whether a drag beyond the window's edge scrolls
  };

  PagesPointer(PagesCanvas& canvas, Events events);
  ~PagesPointer();
  PagesPointer(const PagesPointer&) = delete;
  PagesPointer& operator=(const PagesPointer&) = delete;

 private:
  void began(double x, double y);
  void moved(double x, double y);
  void ended(bool cancelled);
  void pressedLong(double x, double y);
  void stopScrolling();
  int countPresses(double x, double y);
  bool isFinger() const;
  gboolean scroll();

  PagesCanvas& canvas_;
  Events events_;
  GtkGesture* drag_;
  GtkGesture* longPress_;
  GtkGesture* secondary_;
  GtkGesture* click_;
  bool dragging_ = false;
  double x_ = 0;
  double y_ = 0;
  guint tick_ = 0;
  guint32 pressedAt_ = 0;
  double pressedX_ = 0;
  double pressedY_ = 0;
  int presses_ = 0;
};

}  // namespace vaelo
