// SPDX-License-Identifier: GPL-3.0-or-later
// The name that is changed in its place on the details' screen, and the keyboard that comes up for it.
#include <algorithm>

#include "fileops/ui_utils.h"
#include "items/dr_item.h"
#include "items/vlo_log.h"
#include "platform/platform.h"
#include "preview/preview_details_view_controller.h"
#include "preview/preview_item_manager.h"

namespace vaelo {

namespace {

constexpr double FieldMarginAtRest = -16;  // points, both sides together
constexpr double KeyboardGap = 30;         // points

}  // namespace

void PreviewDetailsViewController::forceRenameCancel() {
  filenameTextField_->setText(originalFilename_.value_or(""));
  forceRenameDone();
}

void PreviewDetailsViewController::forceRenameDone() {
  if (filenameTextField_->isEditing()) filenameTextField_->endEditing(true);
}

bool PreviewDetailsViewController::textFieldShouldBeginEditing(TextField&) {
  const std::shared_ptr<DRItem> item = shownItem();
  const bool renameable = item && item->renameable();
  VLO_DEBUG("ShouldBeginEditing: %{public}@", renameable);
  return renameable;
}

void PreviewDetailsViewController::textFieldDidBeginEditing(TextField& field) {
  const std::shared_ptr<DRItem> item = shownItem();
  VLO_DEBUG("DidBeginEditing '%@' = '%@'", originalFilename_, item ? item->localizedName() : std::nullopt);
  if (item && !item->hasHiddenExtension()) UIUtils::setCursorInTextFieldToBeforeExtension(field);
  updateNavBarForRename(true);
  filenameTextFieldFullWidthConstraint_->setConstant(0);
}

bool PreviewDetailsViewController::textFieldShouldChangeCharactersInRangeReplacementString(TextField& field,
                                                                                           const TextRange&,
                                                                                           const std::string& replacement) {
  if (replacement != "\n") return true;
  field.resignFirstResponder();
  return false;
}

bool PreviewDetailsViewController::textFieldShouldReturn(TextField& field) {
  VLO_DEBUG("textFieldShouldReturn");
  field.resignFirstResponder();
  return true;
}

bool PreviewDetailsViewController::textFieldShouldEndEditing(TextField& field) {
  const std::string typed = field.text();
  VLO_DEBUG("ShouldEndEditing: old:'%@', new:'%@'", originalFilename_, typed);
  // What went wrong before is being told; it isn't tried again behind the alert.
  if (presentedViewController()) return true;
  if (typed.empty()) {
    field.setText(originalFilename_.value_or(""));
    return true;
  }
  const std::shared_ptr<DRItem> item = shownItem();
  if (typed == originalFilename_ || !item || !item->url()) return true;
  const std::optional<Error> error = UIUtils::renameItemAtURLToName(*item->url(), typed);
  if (!error) {
    originalFilename_ = typed;
    return true;
  }
  UIUtils::showFriendlyRenameErrorBasenameParentViewController(*error, typed, shared_from_this());
  return false;
}

void PreviewDetailsViewController::textFieldDidEndEditing(TextField& field) {
  VLO_DEBUG("DidEndEditing: old:'%@', new:'%@'", originalFilename_, field.text());
  updateNavBarForRename(false);
  filenameTextFieldFullWidthConstraint_->setConstant(FieldMarginAtRest);
}

void PreviewDetailsViewController::updateNavBarForRename(bool renaming) {
  NavigationItem& bar = navigationItem();
  if (!renaming) {
    bar.setTitle("");
    bar.setLeftItemsSupplementBackButton(false);
    bar.setLeftBarButtonItem(nullptr);
    bar.setHidesBackButton(false);
    bar.setRightBarButtonItems({});
    bar.setRightBarButtonItems(originalRightBarButtonItems_);
    return;
  }
  const auto button = [weak = weakSelf(this)](SystemItem item, void (PreviewDetailsViewController::*action)()) {
    return BarButtonItem::system(item, [weak, action](const BarButtonItemRef&) {
      if (const auto self = weak.lock()) (self.get()->*action)();
    });
  };
  bar.setTitle(Platform::current().formatting.localizedString("Rename File"));
  originalRightBarButtonItems_ = bar.rightBarButtonItems();
  bar.setHidesBackButton(true);
  bar.setLeftItemsSupplementBackButton(true);
  bar.setLeftBarButtonItem(button(SystemItem::Cancel, &PreviewDetailsViewController::forceRenameCancel));
  bar.setRightBarButtonItems({button(SystemItem::Done, &PreviewDetailsViewController::forceRenameDone)});
}

void PreviewDetailsViewController::registerForKeyboardNotifications() {
  NotificationCenter& center = Platform::current().notifications;
  const auto observe = [&](const char* name, void (PreviewDetailsViewController::*handler)(const Notification&)) {
    keyboardObservations_.push_back(
        center.addObserver(name, [weak = weakSelf(this), handler](const Notification& notification) {
          if (const auto self = weak.lock()) (self.get()->*handler)(notification);
        }));
  };
  observe(KeyboardWillShowNotification, &PreviewDetailsViewController::keyboardWillBeShown);
  observe(KeyboardWillHideNotification, &PreviewDetailsViewController::keyboardWillBeHidden);
}

void PreviewDetailsViewController::unregisterForKeyboardNotifications() { keyboardObservations_.clear(); }

void PreviewDetailsViewController::animateWith(const KeyboardNotice& notice, const std::function<void()>& changes) {
  Animation animation;
  animation.seconds = notice.seconds;
  animation.curve = notice.curve;
  animation.layoutSubviews = true;
  animation.beginFromCurrentState = true;
  view()->animate(animation, changes);
}

void PreviewDetailsViewController::keyboardWillBeShown(const Notification& notification) {
  const KeyboardNotice notice = KeyboardNotice::from(notification);
  ScrollView& scroll = *scrollView();
  const auto inScrollView = [&scroll](const View& view) { return view.convertRectTo(view.bounds(), scroll); };
  const double below = std::max(0.0, contentView()->frame().maxY() - inScrollView(*mainStackView_).maxY());
  EdgeInsets inset = scroll.contentInset();
  inset.bottom = notice.beginFrame.height - below + KeyboardGap;
  animateWith(notice, [&] {
    scroll.setContentInset(inset);
    const double last = std::max(0.0, scroll.contentSize().height - scroll.frame().height + inset.bottom);
    const double wanted = std::max(0.0, inScrollView(*filenameTextField_).y - inset.top - KeyboardGap);
    scroll.setContentOffset({0, std::min(last, wanted)});
  });
}

void PreviewDetailsViewController::keyboardWillBeHidden(const Notification& notification) {
  animateWith(KeyboardNotice::from(notification), [this] { scrollView()->setContentInset(scrollViewDefaultEdgeInsets()); });
}

}  // namespace vaelo
