// SPDX-License-Identifier: GPL-3.0-or-later
#include "preview/preview_base_view_controller.h"

#include <algorithm>
#include <sstream>

#include "fileops/ui_utils.h"
#include "items/launch_utils.h"
#include "items/url_additions.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/navigation_controller.h"
#include "platform/ui/screen_factory.h"
#include "platform/ui/shared_self.h"
#include "platform/ui/visual_format.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

namespace {

constexpr Rect FirstFrame{0, 0, 375, 667};
constexpr double PortraitBottomMargin = -17;
constexpr double ProgressSteps = 20;
constexpr const char* FractionCompleted = "fractionCompleted";

std::optional<URL> urlOf(const std::shared_ptr<PreviewItemManager>& manager) {
  return manager && manager->item() ? manager->item()->url() : std::nullopt;
}

double fractionOf(const Progress& progress) {
  const std::int64_t total = progress.totalUnits();
  return total > 0 ? static_cast<double>(progress.completedUnits()) / static_cast<double>(total) : 0;
}

std::string percentOf(double fraction) {
  std::ostringstream text;
  text << fraction * 100;
  return text.str();
}

}  // namespace

void PreviewBaseViewController::loadView() {
  ViewController::loadView();
  contentView_ = std::make_shared<View>(FirstFrame);
  contentView_->setDebugName("ContentView");
  wrapperView_ = std::make_shared<View>();
  wrapperView_->setDebugName("WrapperView");
  wrapperView_->setTranslatesAutoresizingMaskIntoConstraints(false);
  scrollView_ = std::make_shared<ScrollView>();
  scrollView_->setTranslatesAutoresizingMaskIntoConstraints(false);
  scrollView_->setShowsHorizontalScrollIndicator(false);
  scrollView_->setShowsVerticalScrollIndicator(false);
  scrollView_->setAlwaysBounceVertical(true);
  scrollView_->setAlwaysBounceHorizontal(false);
  scrollView_->setBounces(true);
  view()->addSubview(scrollView_);
  contentView_->addSubview(wrapperView_);
  scrollView_->addSubview(contentView_);
  lastProgressChunk_ = -1;
}

void PreviewBaseViewController::viewDidLoad() {
  ViewController::viewDidLoad();
  view()->setBackgroundColor(Color::white());
}

void PreviewBaseViewController::viewWillAppear(bool animated) {
  ViewController::viewWillAppear(animated);
  configureButtons();
  setupConstraints();
  refreshItem();
}

void PreviewBaseViewController::viewWillDisappear(bool animated) {
  unregisterProgress();
  if (const auto manager = itemManager()) manager->viewControllerWillDisappear(shared_from_this());
  ViewController::viewWillDisappear(animated);
}

// Appearing again makes the constraints again, which must not add up.
void PreviewBaseViewController::setupConstraints() {
  if (!navigationController()) return;
  LayoutConstraint::deactivate(frameConstraints_);
  const VisualFormatBindings bindings = {{"scrollView", scrollView_.get()}, {"contentView", contentView_.get()}};
  frameConstraints_ = constraintsWithVisualFormat("H:|[scrollView]|", bindings);
  for (const LayoutConstraintRef& vertical : constraintsWithVisualFormat("V:|[scrollView]|", bindings)) {
    frameConstraints_.push_back(vertical);
  }
  const auto sameEdge = [this](LayoutAttribute edge) {
    return LayoutConstraint::makeEqual(*wrapperView_, edge, *contentView_, edge);
  };
  parentLeadingConstraint_ = sameEdge(LayoutAttribute::Leading);
  parentTrailingConstraint_ = sameEdge(LayoutAttribute::Trailing);
  parentTopConstraint_ = sameEdge(LayoutAttribute::Top);
  parentBottomConstraint_ = sameEdge(LayoutAttribute::Bottom);
  frameConstraints_.insert(frameConstraints_.end(), {parentLeadingConstraint_, parentTrailingConstraint_,
                                                     parentTopConstraint_, parentBottomConstraint_});
  LayoutConstraint::activate(frameConstraints_);
  configureMargins();
}

EdgeInsets PreviewBaseViewController::scrollViewDefaultEdgeInsets() const {
  const std::shared_ptr<NavigationController> navigation = navigationController();
  const Rect statusBar = Platform::current().screens.device().statusBarFrame();
  EdgeInsets insets;
  insets.top = std::min(statusBar.width, statusBar.height);
  if (!navigation) return insets;
  insets.top += navigation->navigationBarHeight();
  if (!navigation->toolbarHidden()) insets.bottom = navigation->toolbarHeight();
  return insets;
}

void PreviewBaseViewController::viewWillLayoutSubviews() {
  ViewController::viewWillLayoutSubviews();
  const EdgeInsets insets = scrollViewDefaultEdgeInsets();
  Rect frame = view()->bounds();
  frame.height -= insets.top + insets.bottom;
  contentView_->setFrame(frame);
  scrollView_->setContentSize(frame.size());
  configureMargins();
}

void PreviewBaseViewController::configureMargins() {
  if (!parentBottomConstraint_) return;
  const InterfaceOrientation orientation = currentPseudoOrientation();
  const bool portrait =
      orientation == InterfaceOrientation::Portrait || orientation == InterfaceOrientation::PortraitUpsideDown;
  parentBottomConstraint_->setConstant(portrait ? PortraitBottomMargin : 0);
}

InterfaceOrientation PreviewBaseViewController::currentPseudoOrientation() const {
  const TraitCollection traits = traitCollection();
  if (traits.verticalSizeClass == SizeClass::Regular && traits.horizontalSizeClass == SizeClass::Compact) {
    return InterfaceOrientation::Portrait;
  }
  return Platform::current().screens.device().statusBarOrientation();
}

void PreviewBaseViewController::refreshItem() {
  const bool hasURL = urlOf(itemManager()).has_value();
  for (const BarButtonItemRef& button : {barButtonActionItem_, barButtonDeleteItem_, barButtonMoveItem_}) {
    if (button) button->setEnabled(hasURL);
  }
  lastProgressChunk_ = -1;
}

BarButtonItemRef PreviewBaseViewController::buttonFor(SystemItem item, void (PreviewBaseViewController::*action)()) {
  const auto weak = weakSelf(this);
  return BarButtonItem::system(item, [weak, action](const BarButtonItemRef&) {
    if (const auto self = weak.lock()) (self.get()->*action)();
  });
}

void PreviewBaseViewController::configureButtons() {
  const BarButtonItemRef flexible = BarButtonItem::system(SystemItem::FlexibleSpace);
  const BarButtonItemRef fixed = BarButtonItem::system(SystemItem::FixedSpace);
  barButtonMoveItem_ = buttonFor(SystemItem::Organize, &PreviewBaseViewController::showMoveTarget);
  barButtonDeleteItem_ = buttonFor(SystemItem::Trash, &PreviewBaseViewController::showWarningAndDeleteDocument);
  barButtonActionItem_ = buttonFor(SystemItem::Action, &PreviewBaseViewController::showDocumentActivities);
  BarButtonItemRef openItem;
  if (const std::shared_ptr<Button> open = openInAppNavControllerButton()) {
    const auto weak = weakSelf(this);
    open->removeAllActions();
    open->addAction(ControlEvent::TouchUpInside, [weak] {
      if (const auto self = weak.lock()) self->openInDefaultApp();
    });
    open->sizeToFit();
    openItem = BarButtonItem::withCustomView(open);
  }
  if (!urlOf(itemManager())) {
    for (const BarButtonItemRef& button : {barButtonActionItem_, barButtonDeleteItem_, barButtonMoveItem_}) {
      button->setEnabled(false);
    }
  }
  const std::shared_ptr<NavigationController> navigation = navigationController();
  const bool slate = UIUtils::slateMode();
  if (slate) {
    navigationItem().setRightBarButtonItems({barButtonActionItem_, fixed, barButtonDeleteItem_, fixed, barButtonMoveItem_});
  } else {
    setToolbarItems({barButtonActionItem_, flexible, barButtonDeleteItem_, flexible, barButtonMoveItem_});
    if (openItem && mode_ == 1) navigationItem().setRightBarButtonItem(openItem);
  }
  if (navigation) navigation->setToolbarHidden(slate);
}

void PreviewBaseViewController::openInDefaultApp() {
  VLO_USER_ACTION("Pressed Open in <app>");
  const std::optional<URL> url = urlOf(itemManager());
  if (!url || !LaunchUtils::openInDefaultAppViewControllerRequireOpenIn(*url, shared_from_this(), true)) {
    VLO_WARNING("Failed to open document %@ in default app", url);
  }
}

void PreviewBaseViewController::showWarningAndDeleteDocument() {
  VLO_USER_ACTION("Pressed Delete (preview base)");
  if (const auto manager = itemManager()) {
    manager->showWarningAndDeleteDocumentBarButton(shared_from_this(), barButtonDeleteItem_);
  }
}

void PreviewBaseViewController::showMoveTarget() {
  if (const auto manager = itemManager()) manager->showMoveTarget(shared_from_this());
}

void PreviewBaseViewController::showDocumentActivities() {
  VLO_USER_ACTION("Pressed Share (sheet) button (preview base)");
  const std::shared_ptr<PreviewItemManager> manager = itemManager();
  if (!urlOf(manager)) return;
  const std::optional<URL> shown = manager->item()->resolvedURL();
  if (!shown) {
    VLO_WARNING("showDocumentActivities: url is wrong class: %{public}@", shown);
    return;
  }
  VLO_INFO("showDocumentActivities: %@", *shown);
  const std::optional<URL> resolved = vlo_URLByResolvingBookmark(*shown);
  if (resolved != shown) VLO_INFO("URL resolved to %@", resolved);
  if (!resolved) return;
  const auto sheet = Platform::current().screens.makeDocumentInteraction(*resolved);
  manager->setDocumentInteractionController(sheet);
  sheet->presentOptionsMenuFromBarButtonItem(barButtonActionItem_, true);
}

void PreviewBaseViewController::registerForProgress() {
  const std::shared_ptr<PreviewItemManager> manager = itemManager();
  const std::optional<URL> url = manager && manager->item() ? manager->item()->resolvedURL() : std::nullopt;
  if (!url) return;
  const auto weak = weakSelf(this);
  subscriber_ = Platform::current().fileProgress.subscribe(*url, [weak](std::shared_ptr<Progress> progress) {
    const auto self = weak.lock();
    return self ? self->progressPublished(progress) : FileProgress::Withdrawn([] {});
  });
}

FileProgress::Withdrawn PreviewBaseViewController::progressPublished(const std::shared_ptr<Progress>& progress) {
  const auto weak = weakSelf(this);
  const std::weak_ptr<Progress> weakProgress = progress;
  const auto observation = progress->observe(FractionCompleted, [weak, weakProgress](const std::string& keyPath) {
    const auto self = weak.lock();
    const auto alive = weakProgress.lock();
    if (self && alive) self->observeValueForKeyPathOfObjectChangeContext(keyPath, alive);
  });
  observations_.push_back(observation);
  if (progress->kind() != FileProgressKind) {
    VLO_DEBUG("ignoring progress with different kind %{public}@, kind = %{public}@", progress, progress->kind());
  } else if (progress->completedUnits() == 0) {
    VLO_DEBUG("ignoring progress with no progress done yet %{public}@", progress);
  } else {
    VLO_DEBUG("got progress %{public}@", progress);
  }
  return [weak, observed = std::weak_ptr(observation)] {
    const auto self = weak.lock();
    if (!self) return;
    std::erase(self->observations_, observed.lock());
    self->subscriber_.reset();
  };
}

void PreviewBaseViewController::unregisterProgress() { subscriber_.reset(); }

void PreviewBaseViewController::observeValueForKeyPathOfObjectChangeContext(const std::string& keyPath,
                                                                            const std::shared_ptr<Progress>& progress) {
  if (keyPath != FractionCompleted) return;
  const double fraction = fractionOf(*progress);
  const auto chunk = static_cast<std::int32_t>(std::clamp(fraction * ProgressSteps, -1e6, 1e6));
  // The steps are what is worth an INFO line; that a download has begun is none.
  const bool isStep = chunk != lastProgressChunk_ && !(lastProgressChunk_ < 0 && chunk == 0);
  lastProgressChunk_ = chunk;
  if (isStep) {
    VLO_INFO("Progress %{public}@%%: %{public}@", percentOf(fraction), progress);
  } else {
    VLO_DEBUG("Progress %{public}@%%: %{public}@", percentOf(fraction), progress);
  }
  updateProgress(progress);
}

}  // namespace vaelo
