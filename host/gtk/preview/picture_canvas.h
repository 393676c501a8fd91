// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>

#include "host/gtk/preview/picture_viewport.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// Draws a picture as its viewport says: all of it coarsely, and over that, where it is known, a part in the detail of the
/// display. Main thread.
class PictureCanvas {
 public:
  PictureCanvas();
  ~PictureCanvas();
  PictureCanvas(const PictureCanvas&) = delete;
  PictureCanvas& operator=(const PictureCanvas&) = delete;
  GtkWidget* widget() const { return widget_; }
  /// Called when the window's size or the viewport changed.
  void setChanged(std::function<void()> changed) { changed_ = std::move(changed); }

  const PictureViewport& viewport() const { return viewport_; }
  /// Changes the viewport and draws it.
  void change(const std::function<void(PictureViewport&)>& change);
  void setWhole(GRef<GdkTexture> texture, bool isTransparent);
  /// `part` in pixels of the picture; without a texture there is none.
  void setDetail(GRef<GdkTexture> texture, const PictureViewport::Area& part);

  /// What the widget's class calls.
  void snapshot(GtkSnapshot* snapshot) const;
  void resized(int width, int height);

 private:
  GtkWidget* widget_;
  std::function<void()> changed_;
  PictureViewport viewport_;
  GRef<GdkTexture> whole_;
  GRef<GdkTexture> detail_;
  PictureViewport::Area detailPart_;
  bool isTransparent_ = false;
};

}  // namespace vaelo
