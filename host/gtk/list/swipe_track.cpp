// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/swipe_track.h"

#include <algorithm>
#include <cmath>

namespace vaelo {
namespace {

constexpr double SwipeDecidesAfter = 16;
constexpr double FlickSpeed = 300;  // pixels a second
constexpr std::uint32_t SpeedWindow = 150;

}  // namespace

SwipeTrack::SwipeTrack(double uncovered, bool rightToLeft)
    : begin_(uncovered), rightToLeft_(rightToLeft), uncovered_(uncovered) {}

SwipeTrack::Claim SwipeTrack::moved(double x, double y, std::uint32_t milliseconds) {
  const double uncovering = rightToLeft_ ? x : -x;
  if (claim_ == Claim::Undecided && std::max(std::abs(x), std::abs(y)) >= SwipeDecidesAfter) {
    // Where nothing is uncovered, the other way is that of the page itself, back.
    const bool goesBack = begin_ <= 0 && uncovering < 0;
    claim_ = std::abs(y) >= std::abs(x) || goesBack ? Claim::Left : Claim::Taken;
    slack_ = uncovering;
  }
  if (claim_ != Claim::Taken) return claim_;
  uncovered_ = begin_ + uncovering - slack_;
  latest_.push_back({milliseconds, uncovering});
  while (milliseconds - latest_.front().milliseconds > SpeedWindow) latest_.pop_front();
  return claim_;
}

double SwipeTrack::uncovered(double width) const { return std::clamp(uncovered_, 0.0, width); }

bool SwipeTrack::endsOpen(double width, std::uint32_t milliseconds) const {
  const bool rested = latest_.empty() || milliseconds - latest_.back().milliseconds > SpeedWindow;
  if (!rested && latest_.back().milliseconds > latest_.front().milliseconds) {
    const double seconds = (latest_.back().milliseconds - latest_.front().milliseconds) / 1000.0;
    const double speed = (latest_.back().uncovering - latest_.front().uncovering) / seconds;
    if (std::abs(speed) >= FlickSpeed) return speed > 0;
  }
  return uncovered_ > width / 2;
}

}  // namespace vaelo
