// SPDX-License-Identifier: GPL-3.0-or-later
// The small views that the details are made of.
#include <cmath>

#include "platform/ui/window.h"
#include "preview/constraint_utils.h"
#include "preview/hairline_view.h"
#include "preview/pie_progress_indicator_view.h"
#include "tests/support/memory_image.h"
#include "tests/unit/preview_fixture.h"

namespace vaelo {
namespace {

using std::chrono::seconds;
using ::testing::ElementsAre;
using ::testing::SizeIs;

class InfoViewsTest : public PreviewFixture {
 protected:
  std::shared_ptr<DRItem> item() {
    const auto made = DRItem::initWithURL(document);
    made->setLocalizedTypeDescription("Portable document");
    return made;
  }
  static std::vector<std::string> names(const FileInfoStackView& stack) {
    std::vector<std::string> found;
    for (const ViewRef& row : stack.arrangedSubviews()) {
      found.push_back(std::dynamic_pointer_cast<FileInfoCell>(row)->nameLabel()->text());
    }
    return found;
  }
  std::shared_ptr<FileInfoCell> row(const FileInfoStackView& stack, std::size_t i) {
    return std::dynamic_pointer_cast<FileInfoCell>(stack.arrangedSubviews().at(i));
  }
  double widthOf(const std::string& text) { return memory.screens.drawn.measure(text, FileInfoCell::font(), 0, 1).width; }
};

TEST_F(InfoViewsTest, ACellHasANameBesideAValue) {
  const auto cell = FileInfoCell::initWithNameAndValueValueMaxLines("Kind", "Text", 4);
  const Label& name = *cell->nameLabel();
  const Label& value = *cell->valueLabel();
  EXPECT_EQ(name.text(), "Kind");
  EXPECT_EQ(name.textColor(), Color::gray());
  EXPECT_EQ(name.font(), FileInfoCell::font());
  EXPECT_EQ(name.textAlignment(), TextAlignment::Right);
  EXPECT_EQ(name.contentHuggingPriority(LayoutAxis::Horizontal), 251);
  EXPECT_EQ(name.contentHuggingPriority(LayoutAxis::Vertical), 1000);
  EXPECT_EQ(name.contentCompressionResistancePriority(LayoutAxis::Vertical), 1000);
  EXPECT_EQ(value.text(), "Text");
  EXPECT_EQ(value.textColor(), Color::black());
  EXPECT_EQ(value.font(), Font::preferred(TextStyle::Subheadline));
  EXPECT_EQ(value.numberOfLines(), 4);
  EXPECT_EQ(value.contentHuggingPriority(LayoutAxis::Horizontal), 250);
  EXPECT_EQ(value.contentCompressionResistancePriority(LayoutAxis::Horizontal), 250);
  EXPECT_EQ(value.contentCompressionResistancePriority(LayoutAxis::Vertical), 1000);
  EXPECT_THAT(cell->constraints(), SizeIs(6));
  EXPECT_EQ(FileInfoCell::init()->nameLabel()->text(), "");
}

TEST_F(InfoViewsTest, NamesLineUpAgainstValuesWhicheverWayPeopleRead) {
  const auto cell = FileInfoCell::initWithNameAndValueValueMaxLines("Kind", "Text", 1);
  TraitCollection traits;
  traits.layoutDirection = LayoutDirection::RightToLeft;
  window->setTraitCollection(traits);
  const auto screen = std::make_shared<ViewController>();
  screen->view()->addSubview(cell);
  window->setRootViewController(screen);
  window->makeKeyAndVisible();
  EXPECT_EQ(cell->nameLabel()->textAlignment(), TextAlignment::Left);
}

TEST_F(InfoViewsTest, RowsComeInTheirOrderAndShareTheirColumn) {
  memory.disk.items.at(document.path()).tags = {"Work"};
  setModified(document, seconds(10));
  const auto stack = FileInfoStackView::initWithFrame({});
  EXPECT_EQ(stack->alignment(), StackAlignment::Leading);
  EXPECT_EQ(stack->spacing(), 10);
  stack->setItem(item());
  EXPECT_THAT(names(*stack), ElementsAre("Kind", "Size", "Where", "Created", "Modified", "Tags"));
  EXPECT_EQ(row(*stack, 2)->valueLabel()->numberOfLines(), 4);
  EXPECT_EQ(row(*stack, 0)->valueLabel()->numberOfLines(), 1);
  EXPECT_EQ(stack->creationDateCell(), row(*stack, 3));
  EXPECT_EQ(stack->modifiedDateCell(), row(*stack, 4));
  ASSERT_THAT(stack->constraints(), SizeIs(5)) << "each name as wide as the one above";
  EXPECT_EQ(stack->constraints()[0]->firstItem(), row(*stack, 1)->nameLabel().get());
  EXPECT_EQ(stack->constraints()[0]->secondItem(), row(*stack, 0)->nameLabel().get());
  stack->setItem(nullptr);
  EXPECT_THAT(stack->arrangedSubviews(), SizeIs(6)) << "nothing keeps the rows";
  stack->setItem(item());
  EXPECT_THAT(stack->subviews(), SizeIs(6)) << "the old rows are gone";
}

TEST_F(InfoViewsTest, RowsWithoutAValueAreAbsent) {
  const auto shown = item();
  shown->setFriendlyFileSize(std::nullopt);
  shown->setCreationDate(std::nullopt);
  shown->setLocalizedTypeDescription("Kind of file");
  shown->setContentModificationDate(Date(seconds(1)));
  const auto stack = FileInfoStackView::initWithFrame({});
  stack->setItem(shown);
  EXPECT_THAT(names(*stack), ElementsAre("Kind", "Where", "Modified"));
  EXPECT_EQ(stack->creationDateCell(), nullptr);
}

TEST_F(InfoViewsTest, TagsReadAsDotsAndNames) {
  const auto shown = item();
  EXPECT_EQ(FileInfoStackView::buildTagsWithImagesStringFont(*shown, FileInfoCell::font()), std::nullopt);
  shown->setTags(std::vector<std::string>{});
  EXPECT_EQ(FileInfoStackView::buildTagsWithImagesStringFont(*shown, FileInfoCell::font()), std::nullopt);
  shown->setTags(std::vector<std::string>{"Work", "Home", "Late"});
  const auto text = FileInfoStackView::buildTagsWithImagesStringFont(*shown, FileInfoCell::font());
  ASSERT_TRUE(text);
  ASSERT_THAT(text->runs(), SizeIs(6));
  EXPECT_EQ(text->plainText(), "Work Home Late");
  const FontMetrics metrics = memory.screens.drawn.fontMetrics(FileInfoCell::font());
  EXPECT_NE(text->runs()[0].image, nullptr);
  EXPECT_EQ(text->runs()[0].image->width(), metrics.capHeight + 2);
  EXPECT_EQ(text->runs()[0].image->height(), metrics.lineHeight);
  EXPECT_EQ(text->runs()[1].text, "Work ");
  EXPECT_EQ(text->runs()[1].attributes.baselineOffset, -metrics.descender);
  EXPECT_EQ(text->runs()[5].text, "Late");
}

TEST_F(InfoViewsTest, DatesTakeTheLongestStyleThatFits) {
  const auto shown = item();
  shown->setCreationDate(Date(seconds(1)));
  shown->setContentModificationDate(Date(seconds(2)));
  const auto stack = FileInfoStackView::initWithFrame({});
  stack->setItem(shown);
  Label& created = *stack->creationDateCell()->valueLabel();
  Label& modified = *stack->modifiedDateCell()->valueLabel();
  const auto layOut = [&](double createdWidth, double modifiedWidth) {
    created.setFrame({0, 0, createdWidth, 20});
    modified.setFrame({0, 0, modifiedWidth, 20});
    stack->layoutSubviews();
  };
  const std::string longText = *shown->friendlyCreationDate(DateStyle::Long);
  const std::string mediumText = *shown->friendlyCreationDate(DateStyle::Medium);
  const std::string shortText = *shown->friendlyCreationDate(DateStyle::Short);
  ASSERT_GT(widthOf(longText), widthOf(mediumText));
  ASSERT_GT(widthOf(mediumText), widthOf(shortText));
  layOut(widthOf(mediumText), 1);
  EXPECT_EQ(created.text(), mediumText);
  EXPECT_EQ(modified.text(), *shown->friendlyContentModificationDate(DateStyle::Medium));
  layOut(1, widthOf(longText));
  EXPECT_EQ(created.text(), longText) << "the larger of the widths counts";
  layOut(1, 1);
  EXPECT_EQ(created.text(), shortText) << "the shortest, fit or not";
  layOut(0, 0);
  EXPECT_EQ(created.text(), shortText) << "without a width nothing changes";
}

TEST_F(InfoViewsTest, AThumbnailFitsWithItsMargins) {
  const auto view = ThumbnailImageView::initWithFrame({0, 0, 400, 400});
  const auto fit = [&](Size size, Rect rect, double margin) {
    return view->aspectFitImageInRectWithMargins(size, rect, margin);
  };
  EXPECT_EQ(fit({10, 10}, {0, 0, 400, 400}, 17), (Rect{160, 160, 80, 80})) << "eight times, no more";
  EXPECT_EQ(fit({732, 366}, {0, 0, 400, 400}, 17), (Rect{17, 108.5, 366, 183}));
  EXPECT_EQ(fit({100, 200}, {10, 20, 234, 434}, 17), (Rect{10 + 17, 20 + 17, 200, 400}));
  EXPECT_EQ(fit({0, 10}, {0, 0, 400, 400}, 17), (Rect{200, 200, 0, 0}));
  EXPECT_EQ(view->thumbnailView()->contentMode(), ContentMode::TopLeft);
  EXPECT_EQ(view->thumbnailView()->magnificationFilter(), MagnificationFilter::Nearest);
  EXPECT_EQ(view->margins(), 17);
}

TEST_F(InfoViewsTest, WithoutAThumbnailTheIconShowsAtTwiceItsSize) {
  const auto view = ThumbnailImageView::initWithFrame({0, 0, 400, 400});
  const auto shown = item();
  view->setItem(shown);
  EXPECT_TRUE(view->isGenericImage());
  ASSERT_NE(view->thumbnailView()->image(), nullptr);
  EXPECT_EQ(view->thumbnailView()->borderWidth(), 0);
  EXPECT_EQ(view->aspectFitImageInRectWithMargins({64, 64}, {0, 0, 40, 40}, 17), (Rect{-44, -44, 128, 128}));
  shown->setThumbnail(std::make_shared<MemoryImage>(Size{30, 20}, std::vector<std::string>()));
  view->setItem(shown);
  EXPECT_FALSE(view->isGenericImage());
  EXPECT_EQ(view->thumbnailView()->borderWidth(), 1);
  EXPECT_EQ(view->thumbnailView()->borderColor(), Color::black().withAlpha(0.16));
  view->layoutIfNeeded();
  EXPECT_EQ(view->thumbnailView()->frame(), (Rect{80, 120, 240, 160}));
  view->setItem(nullptr);
  EXPECT_FALSE(view->isGenericImage()) << "nothing changes nothing else";
}

TEST_F(InfoViewsTest, LargeScreensHaveLargerMargins) {
  TraitCollection traits;
  traits.horizontalSizeClass = traits.verticalSizeClass = SizeClass::Regular;
  window->setTraitCollection(traits);
  const auto view = ThumbnailImageView::initWithFrame({0, 0, 400, 400});
  nav->view()->addSubview(view);
  EXPECT_EQ(view->margins(), 45);
  view->removeFromSuperview();
}

TEST_F(InfoViewsTest, AHairlineIsOnePixel) {
  for (const auto& [scale, points] : {std::pair(1.0, 1.0), std::pair(2.0, 0.5), std::pair(3.0, 1.0 / 3)}) {
    memory.screens.deviceShown.screen.scale = scale;
    EXPECT_EQ(HairlineView::_hairlineThicknessInPoints(), points);
    const auto line = HairlineView::init();
    ASSERT_THAT(line->constraints(), SizeIs(1));
    EXPECT_EQ(line->constraints()[0]->constant(), points);
    EXPECT_EQ(line->backgroundColor(), Color::barHairlineShadow());
    EXPECT_EQ(line->contentCompressionResistancePriority(LayoutAxis::Vertical), 1000);
  }
}

/// Keeps what was drawn.
class Canvas : public DrawingContext {
 public:
  void setFillColor(const Color& color) override { fill = color; }
  void setStrokeColor(const Color& color) override { stroke = color; }
  void setLineWidth(double) override {}
  void fillRect(const Rect&) override {}
  void fillEllipse(const Rect&) override {}
  void strokeEllipse(const Rect& rect) override { outline = rect; }
  void fillWedge(const Point& at, double length, double from, double to) override {
    center = at;
    radius = length;
    start = from;
    end = to;
  }
  void drawImage(const ImageRef&, const Rect&) override {}
  Color fill;
  Color stroke;
  Rect outline;
  Point center;
  double radius = 0;
  double start = 0;
  double end = 0;
};

TEST_F(InfoViewsTest, APieIsNeverEmptyNorFull) {
  constexpr double pi = 3.14159265358979323846;
  PieProgressIndicatorView pie({0, 0, 40, 31});
  EXPECT_EQ(pie.backgroundColor(), Color::clear());
  const auto draw = [&pie](double progress) {
    Canvas canvas;
    pie.setProgress(progress);
    pie.drawRect(canvas, pie.bounds());
    return canvas;
  };
  const Canvas quarter = draw(0.25);
  EXPECT_EQ(quarter.center, (Point{20, 15.5}));
  EXPECT_EQ(quarter.radius, 16);
  EXPECT_DOUBLE_EQ(quarter.start, -pi / 2);
  EXPECT_NEAR(quarter.end, 0, 1e-12);
  EXPECT_EQ(quarter.outline, (Rect{0, 0, 40, 31}));
  EXPECT_EQ(quarter.fill, Color::lightGray());
  EXPECT_EQ(quarter.stroke, Color::lightGray());
  EXPECT_NEAR(draw(0).end, -pi / 2 + 0.005 * 2 * pi, 1e-12);
  EXPECT_NEAR(draw(1).end, -pi / 2 + 0.995 * 2 * pi, 1e-12);
}

TEST_F(InfoViewsTest, SetsOfConstraints) {
  View parent;
  const auto top = std::make_shared<View>();
  const auto bottom = std::make_shared<View>();
  parent.addSubview(top);
  parent.addSubview(bottom);
  const auto stacked =
      ConstraintUtils::verticallyStackedConstraintsInParentTopChildBottomChildMiddleGap(parent, *top, *bottom, 12);
  ASSERT_THAT(stacked, SizeIs(7));
  EXPECT_EQ(stacked[1]->relation(), LayoutRelation::LessThanOrEqual);
  EXPECT_EQ(stacked[5]->constant(), 12);
  EXPECT_EQ(stacked[5]->secondAttribute(), LayoutAttribute::Bottom);
  for (const LayoutConstraintRef& constraint : stacked) EXPECT_FALSE(constraint->active());
  const auto stretched = ConstraintUtils::stretchSubviewConstraintsWithinView(*top, parent);
  std::vector<LayoutAttribute> edges;
  for (const LayoutConstraintRef& constraint : stretched) edges.push_back(constraint->firstAttribute());
  EXPECT_THAT(
      edges, ElementsAre(LayoutAttribute::Top, LayoutAttribute::Bottom, LayoutAttribute::CenterX, LayoutAttribute::Leading));
}

}  // namespace
}  // namespace vaelo
