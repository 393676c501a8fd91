// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <deque>

namespace vaelo {

/// What a finger on a row of a list is about, and how far it has moved the row aside. Lengths are pixels. Main thread.
class SwipeTrack {
 public:
  enum class Claim {
    Undecided,
    Taken,  ///< it moves the row
    Left,   ///< a scroll, the way back, or whatever else it is
  };

  /// The finger came down on a row that uncovers so much already.
  SwipeTrack(double uncovered, bool rightToLeft);

  /// The finger is so far from where it came down. What was decided once stays so.
  Claim moved(double x, double y, std::uint32_t milliseconds);
  /// How much the row uncovers now of what is `width` wide.
  double uncovered(double width) const;
  /// Whether the row is to stay aside when the finger is lifted: after a flick as it went, else by where it is.
  bool endsOpen(double width, std::uint32_t milliseconds) const;

 private:
  struct Sample {
    std::uint32_t milliseconds;
    double uncovering;
  };

  double begin_;
  bool rightToLeft_;
  Claim claim_ = Claim::Undecided;
  double slack_ = 0;  ///< what the finger had moved when it was decided, which the row doesn't follow
  double uncovered_;  ///< without any limit
  std::deque<Sample> latest_;
};

}  // namespace vaelo
