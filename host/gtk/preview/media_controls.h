// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <cstdint>
#include <functional>
#include <string>

#include "host/support/glib_ptr.h"

namespace vaelo {

/// A bar that plays, seeks and sets the volume of sound or film. Main thread.
class MediaControls {
 public:
  /// `fullScreen` makes the film fill the screen, or no longer; without it there is no button for it.
  MediaControls(GtkMediaStream* stream, bool isFullScreen, std::function<void()> fullScreen);
  ~MediaControls();
  MediaControls(const MediaControls&) = delete;
  MediaControls& operator=(const MediaControls&) = delete;
  GtkWidget* widget() const { return bar_; }
  /// So that the space bar plays.
  void takeFocus() { gtk_widget_grab_focus(play_); }

 private:
  void showPlaying();
  void showTime();
  void showVolume();
  void seek(double seconds);
  void seekOn();

  GRef<GtkMediaStream> stream_;
  std::function<void()> fullScreen_;
  GtkWidget* bar_;
  GtkWidget* play_;
  GtkWidget* time_;
  GtkWidget* place_;
  GtkWidget* length_;
  GtkWidget* volume_;
  std::int64_t wanted_ = -1;  // microseconds, while another place is being sought
};

/// Plays, from the beginning when it is at the end, or pauses.
void toggleMedia(GtkMediaStream* stream);
/// "1:05" or "1:01:05".
std::string mediaTime(std::int64_t microseconds);

}  // namespace vaelo
