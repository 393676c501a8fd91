// SPDX-License-Identifier: GPL-3.0-or-later
// How the details' screen is built and laid out.
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "preview/hairline_view.h"
#include "preview/preview_details_view_controller.h"

namespace vaelo {

namespace {

constexpr double TitleSize = 24;  // points
constexpr double FieldHeightInLines = 1.3;
constexpr double NameSpacing = 7;
constexpr double DetailsSpacing = 15;
constexpr double SideMargins = -16;  // both together

}  // namespace

void PreviewDetailsViewController::setupViewsAndConstraints() {
  thumbnailView_ = ThumbnailImageView::initWithFrame({});
  for (const LayoutAxis axis : {LayoutAxis::Horizontal, LayoutAxis::Vertical}) {
    thumbnailView_->setContentHuggingPriority(LayoutPriority::DefaultLow - 1, axis);
    thumbnailView_->setContentCompressionResistancePriority(LayoutPriority::Required, axis);
  }
  buildStackViewForFilenameWithHairlines();
  buildFileDetailsStackView();
  mainStackView_ = buildVerticalStackWithSubviewsSpacing({thumbnailView_, fileDetailsView_}, 0);
  mainStackView_->setDebugName("MainStackView");
  mainStackView_->setAlignment(StackAlignment::Center);  // side by side neither is higher than it needs to be
  wrapperView()->addSubview(mainStackView_);
  stretchSubviewWithinViewIncludeBottom(*mainStackView_, *wrapperView(), true);
  setupPortraitConstraints();
  setupLandscapeConstraints();
  adjustViewsForOrientation(currentPseudoOrientation());
}

void PreviewDetailsViewController::adjustViewsForOrientation(InterfaceOrientation orientation) {
  const bool landscape =
      orientation == InterfaceOrientation::LandscapeRight || orientation == InterfaceOrientation::LandscapeLeft;
  LayoutConstraint::deactivate(landscape ? portraitConstraints_ : landscapeConstraints_);
  mainStackView_->setAxis(landscape ? LayoutAxis::Horizontal : LayoutAxis::Vertical);
  mainStackView_->setDistribution(landscape ? StackDistribution::FillEqually : StackDistribution::Fill);
  const StackAlignment alignment = landscape ? StackAlignment::Leading : StackAlignment::Center;
  fileDetailsView_->setAlignment(alignment);
  filenameStackView_->setAlignment(alignment);
  filenameTextField_->setTextAlignment(landscape ? TextAlignment::Natural : TextAlignment::Center);
  LayoutConstraint::activate(landscape ? landscapeConstraints_ : portraitConstraints_);
}

std::shared_ptr<StackView> PreviewDetailsViewController::buildVerticalStackWithSubviewsSpacing(
    const std::vector<ViewRef>& subviews, double spacing) {
  const auto stack = std::make_shared<StackView>();
  stack->setTranslatesAutoresizingMaskIntoConstraints(false);
  stack->setAxis(LayoutAxis::Vertical);
  stack->setDistribution(StackDistribution::Fill);
  stack->setSpacing(spacing);
  for (const ViewRef& subview : subviews) stack->addArrangedSubview(subview);
  return stack;
}

void PreviewDetailsViewController::buildStackViewForFilenameWithHairlines() {
  filenameTextField_ = std::make_shared<TextField>();
  TextField& field = *filenameTextField_;
  field.setReturnKeyType(ReturnKeyType::Done);
  field.setEnablesReturnKeyAutomatically(true);
  field.setAutocapitalizationType(AutocapitalizationType::Words);
  field.setAutocorrectionType(AutocorrectionType::No);
  field.setClearButtonMode(ClearButtonMode::WhileEditing);
  field.setFont(Font::preferred(TextStyle::Title2).withSize(TitleSize));
  field.setAccessibilityLabel(Platform::current().formatting.localizedString("Name"));
  field.setDelegate(weakSelf(this));
  const double line = Platform::current().screens.graphics().fontMetrics(field.font()).lineHeight;
  LayoutConstraint::makeConstant(field, LayoutAttribute::Height, line * FieldHeightInLines)->setActive(true);
  const ViewRef above = HairlineView::init();
  const ViewRef below = HairlineView::init();
  filenameStackView_ = buildVerticalStackWithSubviewsSpacing({above, filenameTextField_, below}, NameSpacing);
  filenameStackView_->setDebugName("FilenameStackView");
  // A line has no width of its own.
  for (const ViewRef& hairline : {above, below}) {
    LayoutConstraint::activate(stretchSubviewWidthWithinView(*hairline, *filenameStackView_));
  }
}

void PreviewDetailsViewController::buildFileDetailsStackView() {
  fileInfoView_ = FileInfoStackView::initWithFrame({});
  fileInfoView_->setAxis(LayoutAxis::Vertical);
  fileDetailsView_ = buildVerticalStackWithSubviewsSpacing({filenameStackView_, fileInfoView_}, DetailsSpacing);
  fileDetailsView_->setDebugName("FileDetailsView");
  fileDetailsView_->setContentHuggingPriority(LayoutPriority::Required, LayoutAxis::Vertical);
  if (shouldDisplayOpenInAppButtonInView()) {
    openInAppButton_->titleLabel()->setFont(Font::preferred(TextStyle::Title2).withSize(TitleSize));
    for (const LayoutAxis axis : {LayoutAxis::Horizontal, LayoutAxis::Vertical}) {
      openInAppButton_->setContentCompressionResistancePriority(LayoutPriority::Required, axis);
    }
    openInAppButton_->addAction(ControlEvent::TouchUpInside, [weak = weakSelf(this)] {
      if (const auto self = weak.lock()) self->openInDefaultApp();
    });
    const ViewRef hairline = HairlineView::init();
    fileDetailsView_->addArrangedSubview(hairline);
    fileDetailsView_->addArrangedSubview(openInAppButton_);
    LayoutConstraint::activate(stretchSubviewWidthWithinView(*hairline, *fileDetailsView_));
  }
  using enum LayoutAttribute;
  View& details = *fileDetailsView_;
  filenameTextFieldFullWidthConstraint_ =
      LayoutConstraint::makeEqual(*filenameTextField_, Width, details, Width, SideMargins);
  LayoutConstraint::activate({
      filenameTextFieldFullWidthConstraint_,
      LayoutConstraint::makeEqual(*fileInfoView_, CenterX, details, CenterX),
      LayoutConstraint::make(*fileInfoView_, Width, LayoutRelation::LessThanOrEqual, &details, Width, 1, SideMargins),
  });
}

void PreviewDetailsViewController::stretchSubviewWithinViewIncludeBottom(View& subview, View& view, bool includeBottom) {
  std::vector<LayoutConstraintRef> edges = stretchSubviewWidthWithinView(subview, view);
  edges.push_back(LayoutConstraint::makeEqual(subview, LayoutAttribute::Top, view, LayoutAttribute::Top));
  if (includeBottom) {
    edges.push_back(LayoutConstraint::makeEqual(subview, LayoutAttribute::Bottom, view, LayoutAttribute::Bottom));
  }
  LayoutConstraint::activate(edges);
}

std::vector<LayoutConstraintRef> PreviewDetailsViewController::stretchSubviewWidthWithinView(View& subview, View& view) {
  return {LayoutConstraint::makeEqual(subview, LayoutAttribute::Leading, view, LayoutAttribute::Leading),
          LayoutConstraint::makeEqual(subview, LayoutAttribute::Trailing, view, LayoutAttribute::Trailing)};
}

void PreviewDetailsViewController::setupPortraitConstraints() {
  portraitConstraints_ = stretchSubviewWidthWithinView(*thumbnailView_, *mainStackView_);
  for (const LayoutConstraintRef& edge : stretchSubviewWidthWithinView(*fileDetailsView_, *mainStackView_)) {
    portraitConstraints_.push_back(edge);
  }
}

void PreviewDetailsViewController::setupLandscapeConstraints() {
  using enum LayoutAttribute;
  landscapeConstraints_ = {
      LayoutConstraint::makeEqual(*fileDetailsView_, CenterY, *mainStackView_, CenterY),
      LayoutConstraint::make(*thumbnailView_, Height, LayoutRelation::LessThanOrEqual, mainStackView_.get(), Height),
      LayoutConstraint::makeEqual(*thumbnailView_, Height, *fileDetailsView_, Height),
  };
}

}  // namespace vaelo
