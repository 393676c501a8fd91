// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>

namespace vaelo {

/// Buttons over a picture that zoom it. They appear with a movement of the pointer or a tap, and go when nothing happens.
/// Main thread.
class PictureControls {
 public:
  struct Actions {
    std::function<void()> zoomIn;
    std::function<void()> zoomOut;
    std::function<void()> showWhole;
  };
  explicit PictureControls(Actions actions);
  ~PictureControls();
  PictureControls(const PictureControls&) = delete;
  PictureControls& operator=(const PictureControls&) = delete;
  GtkWidget* widget() const { return revealer_; }

  void appear();
  /// What of the picture's own size is shown, 1 being all; and whether the picture is seen whole.
  void setScale(double scale, bool isFitting, bool isLargest);

 private:
  GtkWidget* addButton(GtkWidget* box, const char* icon, const char* label, std::function<void()> Actions::*action);
  bool isInUse() const;

  Actions actions_;
  GtkWidget* revealer_;
  GtkWidget* in_;
  GtkWidget* out_;
  GtkWidget* whole_;
  GtkWidget* scale_;
  guint timer_ = 0;
};

}  // namespace vaelo
