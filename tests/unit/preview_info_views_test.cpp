// SPDX-License-Identifier: GPL-3.0-or-later
// The small views that the details are made of.
#include <algorithm>
#include <cmath>
#include <tuple>

#include "items/file_tags.h"
#include "items/file_utils.h"
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
  EXPECT_EQ(value.contentHuggingPriority(LayoutAxis::Vertical), 1000);
  EXPECT_EQ(value.contentCompressionResistancePriority(LayoutAxis::Horizontal), 250);
  EXPECT_EQ(value.contentCompressionResistancePriority(LayoutAxis::Vertical), 1000);
  const auto& asked = cell->constraints();
  ASSERT_THAT(asked, SizeIs(6)) << "the name's sides and top, the value's side, top and bottom";
  const auto gap = std::find_if(asked.begin(), asked.end(), [&](const LayoutConstraintRef& each) {
    return each->firstItem() && each->secondItem() && each->firstItem() != cell.get() && each->secondItem() != cell.get();
  });
  ASSERT_NE(gap, asked.end());
  EXPECT_EQ(std::abs((*gap)->constant()), 10);
  const auto bottoms = std::count_if(asked.begin(), asked.end(), [](const LayoutConstraintRef& each) {
    return each->firstAttribute() == LayoutAttribute::Bottom;
  });
  EXPECT_EQ(bottoms, 1) << "of the value, which may have several lines";
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
  EXPECT_EQ(stack->distribution(), StackDistribution::Fill);
  EXPECT_FALSE(stack->translatesAutoresizingMaskIntoConstraints());
  stack->setItem(item());
  EXPECT_THAT(names(*stack), ElementsAre("Kind", "Size", "Where", "Created", "Modified", "Tags"));
  EXPECT_EQ(row(*stack, 2)->valueLabel()->numberOfLines(), 4);
  EXPECT_EQ(row(*stack, 0)->valueLabel()->numberOfLines(), 1);
  EXPECT_EQ(stack->creationDateCell(), row(*stack, 3));
  EXPECT_EQ(stack->modifiedDateCell(), row(*stack, 4));
  ASSERT_THAT(stack->constraints(), SizeIs(5)) << "each name as wide as the one above";
  for (std::size_t i = 0; i < 5; ++i) {
    EXPECT_EQ(stack->constraints()[i]->firstItem(), row(*stack, i + 1)->nameLabel().get());
    EXPECT_EQ(stack->constraints()[i]->secondItem(), row(*stack, i)->nameLabel().get());
  }
  stack->setItem(nullptr);
  EXPECT_EQ(stack->item(), nullptr);
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
  shown->setLocalizedTypeDescription(std::nullopt);
  stack->setItem(shown);
  EXPECT_THAT(names(*stack), ElementsAre("Where", "Modified"));
}

TEST_F(InfoViewsTest, APlaceThatCannotBeToldHasNoRow) {
  const auto shown = DRItem::initWithURL(addOutsideFile("/elsewhere/Report.pdf"));
  shown->setLocalizedTypeDescription("Portable document");
  shown->setContentModificationDate(Date(seconds(1)));
  ASSERT_EQ(FileUtils::displayableLocationForURL(*shown->url()), std::nullopt);
  const auto stack = FileInfoStackView::initWithFrame({});
  stack->setItem(shown);
  EXPECT_THAT(names(*stack), ::testing::Not(::testing::Contains("Where")));
  EXPECT_EQ(names(*stack).front(), "Kind");
  EXPECT_EQ(names(*stack).back(), "Modified");
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
  for (const std::size_t i : {0, 2, 4}) EXPECT_NE(text->runs()[i].image, nullptr);
  EXPECT_EQ(text->runs()[1].text, "Work ");
  EXPECT_EQ(text->runs()[3].text, "Home ");
  EXPECT_EQ(text->runs()[5].text, "Late");
}

TEST_F(InfoViewsTest, ADotStandsOnTheRaisedBaselineAndIsAsHighAsACapital) {
  const auto shown = item();
  const Value work = Dictionary{{"n", Value("Work")}, {"l", Value(std::uint64_t{6})}};
  memory.syncedStore.values["RoverTagDict"] =
      Value(Dictionary{{"RoverTagDictVersion", Value(std::uint64_t{2})}, {"RoverTags", Value(Array{work})}});
  FileTags::_tagColorsDidChange();
  shown->setTags(std::vector<std::string>{"Work"});
  // A font of 20 points is 20 high here: 15 above its baseline, 5 below, its capitals 10.
  const Font font = Font::preferred(TextStyle::Subheadline).withSize(20);
  const auto text = FileInfoStackView::buildTagsWithImagesStringFont(*shown, font);
  ASSERT_TRUE(text);
  ASSERT_THAT(text->runs(), SizeIs(2));
  const auto dot = std::dynamic_pointer_cast<const MemoryImage>(text->runs()[0].image);
  ASSERT_NE(dot, nullptr);
  EXPECT_EQ(dot->width(), 12);
  EXPECT_EQ(dot->height(), 20);
  // At (0, 15 - 10 + 1), 10 high, less a point on each side.
  EXPECT_THAT(dot->origin(), ::testing::Contains("fillEllipse 1 7 8 8"));
  EXPECT_EQ(text->runs()[1].attributes.baselineOffset, 5);
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
    stack->creationDateCell()->setNeedsLayout();
    stack->layoutSubviews();
    EXPECT_FALSE(stack->creationDateCell()->needsLayout()) << "the rows are laid out before they are measured";
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
  created.setText("as it was");
  layOut(0, 0);
  EXPECT_EQ(created.text(), "as it was") << "not even the text";
}

TEST_F(InfoViewsTest, TheRowsAreFilledInTheLongStyle) {
  const auto shown = item();
  shown->setCreationDate(Date(seconds(1)));
  shown->setContentModificationDate(Date(seconds(2)));
  const auto stack = FileInfoStackView::initWithFrame({});
  stack->setItem(shown);
  EXPECT_EQ(stack->creationDateCell()->valueLabel()->text(), *shown->friendlyCreationDate(DateStyle::Long));
  EXPECT_EQ(stack->modifiedDateCell()->valueLabel()->text(), *shown->friendlyContentModificationDate(DateStyle::Long));
}

// The date of modification is never measured.
TEST_F(InfoViewsTest, WithoutADateOfCreationTheOtherStaysLong) {
  const auto shown = item();
  shown->setCreationDate(std::nullopt);
  shown->setContentModificationDate(Date(seconds(2)));
  const auto stack = FileInfoStackView::initWithFrame({});
  stack->setItem(shown);
  stack->modifiedDateCell()->valueLabel()->setFrame({0, 0, 1, 20});
  stack->layoutSubviews();
  EXPECT_EQ(stack->modifiedDateCell()->valueLabel()->text(), *shown->friendlyContentModificationDate(DateStyle::Long));
}

/// Counts the texts that were set.
struct TextCounter : ViewObserver {
  void viewChanged(View&, ViewChange change) override { texts += change == ViewChange::Content ? 1 : 0; }
  void animationWillBegin(View&, const Animation&) override {}
  void animationDidEnd(View&) override {}
  void viewWillBeDestroyed(View&) override {}
  int texts = 0;
};

TEST_F(InfoViewsTest, ADateThatFitsIsNotSetAgain) {
  const auto shown = item();
  shown->setCreationDate(Date(seconds(1)));
  const auto stack = FileInfoStackView::initWithFrame({});
  stack->setItem(shown);
  Label& created = *stack->creationDateCell()->valueLabel();
  created.setFrame({0, 0, 1000, 20});
  TextCounter counter;
  created.setObserver(&counter);
  stack->layoutSubviews();
  EXPECT_EQ(counter.texts, 0);
  created.setObserver(nullptr);
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
  EXPECT_EQ(fit({10, 0}, {0, 0, 400, 400}, 17), (Rect{200, 200, 0, 0}));
  EXPECT_EQ(view->thumbnailView()->superview(), view.get());
  EXPECT_TRUE(view->thumbnailView()->translatesAutoresizingMaskIntoConstraints()) << "its frame places it";
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

TEST_F(InfoViewsTest, TheIconIsThatOfTheFilesNameAndType) {
  const auto shown = item();
  shown->setTypeIdentifier("com.example.report");
  const auto view = ThumbnailImageView::initWithFrame({0, 0, 400, 400});
  view->setItem(shown);
  const auto icon = std::dynamic_pointer_cast<const MemoryImage>(view->thumbnailView()->image());
  ASSERT_NE(icon, nullptr);
  EXPECT_THAT(icon->origin(), ElementsAre("icon Report.pdf com.example.report 12"));
}

TEST_F(InfoViewsTest, AThumbnailWithoutHeightIsNone) {
  const auto shown = item();
  const auto view = ThumbnailImageView::initWithFrame({0, 0, 400, 400});
  shown->setThumbnail(std::make_shared<MemoryImage>(Size{30, 0}, std::vector<std::string>()));
  view->setItem(shown);
  EXPECT_TRUE(view->isGenericImage());
  shown->setThumbnail(std::make_shared<MemoryImage>(Size{1, 0.5}, std::vector<std::string>()));
  view->setItem(shown);
  EXPECT_FALSE(view->isGenericImage());
}

TEST_F(InfoViewsTest, AThumbnailStaysInTheMiddleOfItsViewWhereverThatIs) {
  const auto view = ThumbnailImageView::initWithFrame({100, 50, 400, 400});
  const auto shown = item();
  shown->setThumbnail(std::make_shared<MemoryImage>(Size{30, 20}, std::vector<std::string>()));
  view->setItem(shown);
  view->layoutIfNeeded();
  EXPECT_EQ(view->thumbnailView()->frame(), (Rect{80, 120, 240, 160}));
  shown->setThumbnail(std::make_shared<MemoryImage>(Size{20, 30}, std::vector<std::string>()));
  view->setItem(shown);
  view->layoutIfNeeded();
  EXPECT_EQ(view->thumbnailView()->frame(), (Rect{120, 80, 160, 240})) << "another image is placed anew";
}

TEST_F(InfoViewsTest, LargeScreensHaveLargerMargins) {
  const auto view = ThumbnailImageView::initWithFrame({0, 0, 400, 400});
  nav->view()->addSubview(view);
  const auto marginsAt = [&](SizeClass across, SizeClass down) {
    TraitCollection traits;
    traits.horizontalSizeClass = across;
    traits.verticalSizeClass = down;
    window->setTraitCollection(traits);
    return view->margins();
  };
  EXPECT_EQ(marginsAt(SizeClass::Regular, SizeClass::Compact), 17);
  EXPECT_EQ(marginsAt(SizeClass::Compact, SizeClass::Regular), 17);
  EXPECT_EQ(marginsAt(SizeClass::Regular, SizeClass::Regular), 45);
  const auto shown = item();
  shown->setThumbnail(std::make_shared<MemoryImage>(Size{155, 155}, std::vector<std::string>()));
  view->setItem(shown);
  view->layoutIfNeeded();
  EXPECT_EQ(view->thumbnailView()->frame(), (Rect{45, 45, 310, 310})) << "400 - 2 * 45";
  view->removeFromSuperview();
}

TEST_F(InfoViewsTest, AHairlineIsOnePixel) {
  for (const auto& [scale, points] : {std::pair(1.0, 1.0), std::pair(2.0, 0.5), std::pair(3.0, 1.0 / 3)}) {
    memory.screens.deviceShown.screen.scale = scale;
    EXPECT_EQ(HairlineView::_hairlineThicknessInPoints(), points);
    const auto line = HairlineView::init();
    ASSERT_THAT(line->constraints(), SizeIs(1));
    EXPECT_EQ(line->constraints()[0]->firstAttribute(), LayoutAttribute::Height);
    EXPECT_EQ(line->constraints()[0]->constant(), points);
    EXPECT_FALSE(line->translatesAutoresizingMaskIntoConstraints());
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

TEST_F(InfoViewsTest, AnotherProgressIsDrawn) {
  PieProgressIndicatorView pie({0, 0, 40, 40});
  struct : TextCounter {
    void viewChanged(View&, ViewChange change) override { texts += change == ViewChange::Display ? 1 : 0; }
  } counter;
  pie.setObserver(&counter);
  pie.setProgress(0.5);
  EXPECT_EQ(counter.texts, 1);
  pie.setObserver(nullptr);
}

TEST_F(InfoViewsTest, SetsOfConstraints) {
  View parent;
  const auto top = std::make_shared<View>();
  const auto bottom = std::make_shared<View>();
  parent.addSubview(top);
  parent.addSubview(bottom);
  const auto stacked =
      ConstraintUtils::verticallyStackedConstraintsInParentTopChildBottomChildMiddleGap(parent, *top, *bottom, 12);
  using enum LayoutAttribute;
  const auto attributes = [](const LayoutConstraintRef& each) {
    return std::tuple(each->firstItem(), each->firstAttribute(), each->secondItem(), each->secondAttribute());
  };
  using Attributes = std::tuple<View*, LayoutAttribute, View*, LayoutAttribute>;
  ASSERT_THAT(stacked, SizeIs(7));
  EXPECT_EQ(attributes(stacked[0]), (Attributes{top.get(), CenterX, &parent, CenterX}));
  EXPECT_EQ(attributes(stacked[1]), (Attributes{top.get(), Width, &parent, Width}));
  EXPECT_EQ(attributes(stacked[2]), (Attributes{bottom.get(), CenterX, &parent, CenterX}));
  EXPECT_EQ(attributes(stacked[3]), (Attributes{bottom.get(), Width, &parent, Width}));
  EXPECT_EQ(attributes(stacked[4]), (Attributes{&parent, Top, top.get(), Top}));
  EXPECT_EQ(attributes(stacked[5]), (Attributes{bottom.get(), Top, top.get(), Bottom}));
  EXPECT_EQ(attributes(stacked[6]), (Attributes{bottom.get(), Bottom, &parent, Bottom}));
  for (std::size_t i = 0; i < stacked.size(); ++i) {
    EXPECT_EQ(stacked[i]->relation(), i == 1 || i == 3 ? LayoutRelation::LessThanOrEqual : LayoutRelation::Equal);
    EXPECT_EQ(stacked[i]->multiplier(), 1);
    EXPECT_EQ(stacked[i]->constant(), i == 5 ? 12 : 0);
    EXPECT_FALSE(stacked[i]->active());
  }
  const auto stretched = ConstraintUtils::stretchSubviewConstraintsWithinView(*top, parent);
  std::vector<LayoutAttribute> edges;
  for (const LayoutConstraintRef& constraint : stretched) {
    edges.push_back(constraint->firstAttribute());
    EXPECT_EQ(constraint->secondAttribute(), constraint->firstAttribute());
    EXPECT_EQ(constraint->secondItem(), &parent);
    EXPECT_FALSE(constraint->active());
  }
  EXPECT_THAT(
      edges, ElementsAre(LayoutAttribute::Top, LayoutAttribute::Bottom, LayoutAttribute::CenterX, LayoutAttribute::Leading));
}

}  // namespace
}  // namespace vaelo
