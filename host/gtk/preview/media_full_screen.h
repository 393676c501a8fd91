// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <memory>

#include "host/gtk/preview/media_controls.h"

namespace vaelo {

/// A film that fills the screen. Its controls come with the pointer, and go while it plays. Main thread.
class MediaFullScreen {
 public:
  /// `leave` is called when the user wants out, and then ends this object.
  MediaFullScreen(GtkWindow* parent, GtkMediaStream* stream, std::function<void()> leave);
  ~MediaFullScreen();
  MediaFullScreen(const MediaFullScreen&) = delete;
  MediaFullScreen& operator=(const MediaFullScreen&) = delete;
  GtkWidget* window() const { return window_; }

 private:
  void showControls();
  bool key(guint key);
  static void leaveLater(MediaFullScreen* self);

  GRef<GtkMediaStream> stream_;
  std::function<void()> leave_;
  GtkWidget* window_;
  GtkWidget* revealer_;
  std::unique_ptr<MediaControls> controls_;
  guint timer_ = 0;
  guint leaving_ = 0;
  double pointerX_ = -1;
  double pointerY_ = -1;
};

}  // namespace vaelo
