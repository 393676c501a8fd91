// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <vector>

#include "host/gtk/preview/picture_canvas.h"

namespace vaelo {

/// Zooms and moves the picture on a canvas: pinch and double tap, drag and flick, wheel (zooms, with Shift it moves
/// sideways), two fingers on a touchpad (move, with Ctrl they zoom), and keys: + and -, 0 for the whole picture, 1 for its
/// own size, arrows. Main thread; goes before the canvas.
class PictureGestures {
 public:
  explicit PictureGestures(PictureCanvas& canvas);
  ~PictureGestures();
  PictureGestures(const PictureGestures&) = delete;
  PictureGestures& operator=(const PictureGestures&) = delete;
  /// Called for a tap, and when the pointer moves over the picture.
  void setTouched(std::function<void()> touched) { touched_ = std::move(touched); }

  /// A step closer or further away, about the middle.
  void zoomIn();
  void zoomOut();
  void showWhole();

 private:
  void add(GtkEventController* controller);
  void addTouch();
  void addPointer();
  void zoomBy(double factor, PictureViewport::Point at);
  void zoomSmoothly(double scale, PictureViewport::Point at);
  void zoomStep(double progress);
  void pinched(GtkGesture* gesture, double change);
  bool dragged(double x, double y);
  void doubleTapped(PictureViewport::Point at);
  bool scrolled(GtkEventControllerScroll* scroll, double dx, double dy);
  bool pressed(guint key, GdkModifierType state);
  void flick(double velocityX, double velocityY);
  bool flickStep(gint64 now);
  void stopMoving();
  void showCursor(const char* name);
  PictureViewport::Point middle() const;

  PictureCanvas& canvas_;
  std::vector<GtkEventController*> controllers_;
  std::function<void()> touched_;
  AdwAnimation* animation_ = nullptr;
  double zoomedFrom_ = 1;
  double zoomedTo_ = 1;
  PictureViewport::Point zoomedAt_;
  PictureViewport::Point pointer_;
  double pinchedFrom_ = 1;
  PictureViewport::Point pinchedAt_;
  PictureViewport::Point draggedTo_;
  guint flick_ = 0;
  PictureViewport::Point velocity_;  // logical pixels a second
  gint64 flickTime_ = 0;
};

}  // namespace vaelo
