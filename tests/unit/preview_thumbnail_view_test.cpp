// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_image.h"
#include "tests/unit/preview_fixture.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;

class ThumbnailViewTest : public PreviewFixture {
 protected:
  static ImageRef image(double width, double height) {
    return std::make_shared<MemoryImage>(Size{width, height}, std::vector<std::string>());
  }
  Rect fit(double width, double height) {
    return view->aspectFitImageInRectWithMargins({width, height}, {0, 0, 400, 400}, 17);
  }

  std::shared_ptr<ThumbnailImageView> view = ThumbnailImageView::initWithFrame({0, 0, 400, 400});
};

// Single precision's epsilon is 1.19e-7.
TEST_F(ThumbnailViewTest, AHeightUpToEpsilonIsNone) {
  const auto shown = DRItem::initWithURL(document);
  shown->setThumbnail(image(30, 1.1e-7));
  view->setItem(shown);
  EXPECT_TRUE(view->isGenericImage());
  shown->setThumbnail(image(30, 1.3e-7));
  view->setItem(shown);
  EXPECT_FALSE(view->isGenericImage());
}

TEST_F(ThumbnailViewTest, ASideUpToEpsilonIsNotEnlarged) {
  EXPECT_EQ(fit(1.1e-7, 10), (Rect{200, 200, 0, 0}));
  EXPECT_EQ(fit(10, 1.1e-7), (Rect{200, 200, 0, 0}));
  EXPECT_EQ(fit(1.3e-7, 10).height, 80);
  EXPECT_EQ(fit(10, 1.3e-7).width, 80);
}

TEST_F(ThumbnailViewTest, TheIconIsThatOfTheFileWhichALinkLeadsTo) {
  const auto shown = DRItem::initWithURL(document);
  shown->setResolvedURL(URL("/elsewhere/Letter.txt"));
  shown->setTypeIdentifier("com.example.letter");
  view->setItem(shown);
  const auto icon = std::dynamic_pointer_cast<const MemoryImage>(view->thumbnailView()->image());
  ASSERT_NE(icon, nullptr);
  EXPECT_THAT(icon->origin(), ElementsAre("icon Letter.txt com.example.letter 12"));
}

}  // namespace
}  // namespace vaelo
