// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "host/gtk/preview/picture_viewport.h"

namespace vaelo {
namespace {

class PictureViewportTest : public testing::Test {
 protected:
  PictureViewportTest() {
    viewport.setWindow({400, 300});
    viewport.setPicture({1600, 800}, false);
  }
  /// Which point of the picture is at a point of the window.
  PictureViewport::Point seenAt(double x, double y) const {
    const PictureViewport::Area area = viewport.pictureArea();
    return {(x - area.x) / viewport.scale(), (y - area.y) / viewport.scale()};
  }
  void expectSeen(double x, double y, double width, double height) const {
    const PictureViewport::Area seen = viewport.visiblePart();
    EXPECT_NEAR(seen.x, x, 0.01);
    EXPECT_NEAR(seen.y, y, 0.01);
    EXPECT_NEAR(seen.width, width, 0.01);
    EXPECT_NEAR(seen.height, height, 0.01);
  }

  PictureViewport viewport;
};

TEST_F(PictureViewportTest, AtFirstAllOfThePictureIsSeenInTheMiddle) {
  EXPECT_TRUE(viewport.isFitting());
  EXPECT_FALSE(viewport.canPan());
  EXPECT_DOUBLE_EQ(viewport.scale(), 0.25);
  const PictureViewport::Area area = viewport.pictureArea();
  EXPECT_NEAR(area.x, 0, 0.01);
  EXPECT_NEAR(area.y, 50, 0.01);
  EXPECT_NEAR(area.width, 400, 0.01);
  EXPECT_NEAR(area.height, 200, 0.01);
  expectSeen(0, 0, 1600, 800);
}

TEST_F(PictureViewportTest, ASmallPictureStaysSmallUnlessItIsSharpAtAnySize) {
  viewport.setPicture({40, 30}, false);
  EXPECT_DOUBLE_EQ(viewport.scale(), 1);
  viewport.setPicture({40, 30}, true);
  EXPECT_DOUBLE_EQ(viewport.scale(), 10);
}

TEST_F(PictureViewportTest, WhatIsUnderTheFingersStaysThere) {
  viewport.zoom(1, {200, 150});
  viewport.pan(100, 40);
  const PictureViewport::Point before = seenAt(120, 80);
  viewport.zoom(2, {120, 80});
  EXPECT_DOUBLE_EQ(viewport.scale(), 2);
  EXPECT_NEAR(seenAt(120, 80).x, before.x, 0.01);
  EXPECT_NEAR(seenAt(120, 80).y, before.y, 0.01);
  EXPECT_FALSE(viewport.isFitting());
  EXPECT_TRUE(viewport.canPan());
}

TEST_F(PictureViewportTest, ThereIsALargestScaleAndTheSmallestShowsAll) {
  viewport.zoom(1000, {200, 150});
  EXPECT_DOUBLE_EQ(viewport.scale(), 20);
  viewport.zoom(0.01, {10, 10});
  EXPECT_TRUE(viewport.isFitting());
  EXPECT_DOUBLE_EQ(viewport.scale(), 0.25);
  expectSeen(0, 0, 1600, 800);
}

TEST_F(PictureViewportTest, ACloserLookIsTheOwnSizeAtMostFourTimesAsLargeAndAtLeastTwice) {
  EXPECT_DOUBLE_EQ(viewport.closerScale(), 1);  // four times a quarter
  viewport.setPicture({16000, 8000}, false);
  EXPECT_DOUBLE_EQ(viewport.closerScale(), 0.1);  // four times, and not its own size
  viewport.setPicture({800, 400}, false);
  EXPECT_DOUBLE_EQ(viewport.closerScale(), 1);
  viewport.setPicture({40, 30}, false);
  EXPECT_DOUBLE_EQ(viewport.closerScale(), 2);  // twice, although that is more than its own
}

TEST_F(PictureViewportTest, ThePictureIsMovedNoFurtherThanToItsEdges) {
  EXPECT_FALSE(viewport.pan(10, 10)) << "all is seen";
  viewport.zoom(1, {200, 150});
  expectSeen(600, 250, 400, 300);
  EXPECT_TRUE(viewport.pan(-30, -20));
  expectSeen(630, 270, 400, 300);
  EXPECT_TRUE(viewport.pan(10000, 10000));
  expectSeen(0, 0, 400, 300);
  EXPECT_FALSE(viewport.pan(1, 1));
  EXPECT_TRUE(viewport.pan(-10000, -10000));
  expectSeen(1200, 500, 400, 300);
  viewport.zoom(2, {400, 300});
  expectSeen(1400, 650, 200, 150);
  EXPECT_TRUE(viewport.pan(40, 20));
  expectSeen(1380, 640, 200, 150);
  viewport.zoom(0.3, {200, 150});
  EXPECT_NEAR(viewport.pictureArea().y, 30, 0.01) << "a side that is seen whole is in the middle";
}

TEST_F(PictureViewportTest, InAnotherWindowTheMiddleStaysAndWhatFitGoesOnFitting) {
  viewport.setWindow({800, 300});
  EXPECT_DOUBLE_EQ(viewport.scale(), 0.375);
  viewport.zoom(2, {400, 150});
  const PictureViewport::Point middle = seenAt(400, 150);
  viewport.setWindow({300, 600});
  EXPECT_DOUBLE_EQ(viewport.scale(), 2);
  EXPECT_NEAR(seenAt(150, 300).x, middle.x, 0.01);
  EXPECT_NEAR(seenAt(150, 300).y, middle.y, 0.01);
  viewport.zoom(0.3, {150, 300});
  viewport.setWindow({800, 600});
  EXPECT_TRUE(viewport.isFitting()) << "there is nothing left that is out of sight";
}

TEST_F(PictureViewportTest, APictureOfTheSameSizeIsSeenAsTheOneBefore) {
  viewport.zoom(1, {0, 0});
  const PictureViewport::Area before = viewport.visiblePart();
  viewport.setPicture({1600, 800}, false);
  EXPECT_TRUE(viewport.visiblePart().covers(before) && before.covers(viewport.visiblePart()));
  viewport.setPicture({1600, 900}, false);
  EXPECT_TRUE(viewport.isFitting());
}

TEST_F(PictureViewportTest, WithoutAPictureOrAWindowNothingIsDividedByZero) {
  PictureViewport empty;
  EXPECT_DOUBLE_EQ(empty.fitScale(), 1);
  empty.setPicture({10, 10}, true);
  EXPECT_DOUBLE_EQ(empty.scale(), 1);
  EXPECT_FALSE(PictureViewport::Area({0, 0, 1, 1}).covers({0, 0, 2, 1}));
}

}  // namespace
}  // namespace vaelo
