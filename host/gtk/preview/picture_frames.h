// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <string>

#include "host/gtk/preview/decoder_process.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// Plays an animation: the next picture is decoded while one is seen, and shown when it is due. Plays from its construction
/// on for as long as it lives; the process outlives it. Main thread.
class PictureFrames {
 public:
  using Show = std::function<void(GRef<GdkTexture>)>;
  /// `delay`: of the picture that is seen, milliseconds. `bounds` gives the words of the size to ask for.
  PictureFrames(DecoderProcess& process, int delay, std::function<std::string()> bounds, Show show);
  ~PictureFrames();
  PictureFrames(const PictureFrames&) = delete;
  PictureFrames& operator=(const PictureFrames&) = delete;

 private:
  void ask();
  void got(DecoderProcess::Answer answer);
  void showNext();

  DecoderProcess& process_;
  std::function<std::string()> bounds_;
  Show show_;
  gint64 due_;  // microseconds of the monotonic clock
  GRef<GdkTexture> next_;
  int nextDelay_ = -1;
  guint timer_ = 0;
  std::shared_ptr<bool> alive_ = std::make_shared<bool>(true);
};

}  // namespace vaelo
