// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "host/gtk/list/swipe_track.h"

namespace vaelo {
namespace {

using Claim = SwipeTrack::Claim;

constexpr double ButtonsWidth = 200;

TEST(SwipeTrack, IsDecidedByTheFirstStretch) {
  struct Case {
    const char* what;
    double uncovered;
    bool rightToLeft;
    double x, y;
    Claim claim;
  };
  const Case cases[] = {
      {"a finger that trembles", 0, false, -15, 3, Claim::Undecided},
      {"to the start", 0, false, -16, 3, Claim::Taken},
      {"to the end is the way back", 0, false, 16, 0, Claim::Left},
      {"down is a scroll", 0, false, -3, 16, Claim::Left},
      {"up is a scroll", 0, false, 0, -16, Claim::Left},
      {"as much down as aside", 0, false, -16, 16, Claim::Left},
      {"to the end, of a row that stands aside", 120, false, 16, 0, Claim::Taken},
      {"right to left: to the start", 0, true, 16, 0, Claim::Taken},
      {"right to left: to the end", 0, true, -16, 0, Claim::Left},
  };
  for (const Case& one : cases) {
    SwipeTrack track(one.uncovered, one.rightToLeft);
    EXPECT_EQ(track.moved(one.x, one.y, 10), one.claim) << one.what;
  }
}

TEST(SwipeTrack, StaysDecided) {
  SwipeTrack scroll(0, false);
  scroll.moved(0, 20, 10);
  EXPECT_EQ(scroll.moved(-100, 20, 20), Claim::Left);
  SwipeTrack swipe(0, false);
  swipe.moved(-20, 0, 10);
  EXPECT_EQ(swipe.moved(-20, 100, 20), Claim::Taken);
}

TEST(SwipeTrack, TheRowFollowsTheFingerWithinItsButtons) {
  SwipeTrack track(0, false);
  track.moved(-20, 0, 10);
  EXPECT_EQ(track.uncovered(ButtonsWidth), 0) << "it doesn't jump";
  track.moved(-100, 0, 20);
  EXPECT_EQ(track.uncovered(ButtonsWidth), 80);
  track.moved(-500, 0, 30);
  EXPECT_EQ(track.uncovered(ButtonsWidth), ButtonsWidth);
  track.moved(50, 0, 40);
  EXPECT_EQ(track.uncovered(ButtonsWidth), 0);
  SwipeTrack closing(ButtonsWidth, true);
  closing.moved(-20, 0, 10);
  closing.moved(-70, 0, 20);
  EXPECT_EQ(closing.uncovered(ButtonsWidth), 150);
}

TEST(SwipeTrack, EndsWhereItIsNearerTo) {
  for (const auto& [x, open] : {std::pair(-110.0, false), std::pair(-130.0, true)}) {
    SwipeTrack track(0, false);
    track.moved(-20, 0, 0);
    track.moved(x, 0, 1000);
    EXPECT_EQ(track.endsOpen(ButtonsWidth, 1000), open) << x;
  }
}

TEST(SwipeTrack, AFlickGoesOn) {
  SwipeTrack opening(0, false);
  opening.moved(-20, 0, 0);
  opening.moved(-60, 0, 100);
  EXPECT_TRUE(opening.endsOpen(ButtonsWidth, 110)) << "400 pixels a second";
  EXPECT_FALSE(opening.endsOpen(ButtonsWidth, 400)) << "the finger rested before it was lifted";
  SwipeTrack slow(0, false);
  slow.moved(-20, 0, 0);
  slow.moved(-40, 0, 100);
  EXPECT_FALSE(slow.endsOpen(ButtonsWidth, 110));
  SwipeTrack closing(ButtonsWidth, false);
  closing.moved(20, 0, 0);
  closing.moved(60, 0, 100);
  EXPECT_FALSE(closing.endsOpen(ButtonsWidth, 110));
  SwipeTrack turning(0, false);
  turning.moved(-20, 0, 0);
  turning.moved(-180, 0, 1000);
  turning.moved(-140, 0, 1100);
  EXPECT_FALSE(turning.endsOpen(ButtonsWidth, 1100)) << "only its latest way counts";
}

}  // namespace
}  // namespace vaelo
