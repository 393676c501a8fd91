// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/picture_frames.h"

#include <algorithm>
#include <sstream>

#include "host/gtk/preview/shared_bytes.h"

namespace vaelo {

PictureFrames::PictureFrames(DecoderProcess& process, int delay, std::function<std::string()> bounds, Show show)
    : process_(process),
      bounds_(std::move(bounds)),
      show_(std::move(show)),
      due_(g_get_monotonic_time() + gint64{1000} * delay) {
  ask();
}

PictureFrames::~PictureFrames() { g_clear_handle_id(&timer_, g_source_remove); }

void PictureFrames::ask() {
  process_.ask("next " + bounds_(), [this, alive = std::weak_ptr(alive_)](DecoderProcess::Answer answer) {
    if (!alive.expired()) got(std::move(answer));
  });
}

// A picture that can't be decoded ends the animation; the one before it stays.
void PictureFrames::got(DecoderProcess::Answer answer) {
  std::istringstream words(answer.text);
  int width = 0;
  int height = 0;
  if (!answer.error.empty() || !(words >> width >> height >> nextDelay_)) return;
  next_ = takeTexture(std::move(answer.file), width, height);
  if (!next_) return;
  const gint64 wait = std::max<gint64>(0, due_ - g_get_monotonic_time()) / 1000;
  timer_ = g_timeout_add(
      static_cast<guint>(std::min<gint64>(wait, G_MAXINT)),
      +[](gpointer self) -> gboolean {
        static_cast<PictureFrames*>(self)->showNext();
        return G_SOURCE_REMOVE;
      },
      this);
}

void PictureFrames::showNext() {
  timer_ = 0;
  show_(std::move(next_));
  if (nextDelay_ < 0) return;
  // Late pictures are not caught up with, which would look worse.
  due_ = std::max(due_, g_get_monotonic_time() - 1000) + gint64{1000} * nextDelay_;
  ask();
}

}  // namespace vaelo
