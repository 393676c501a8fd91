// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/notifications.h"
#include "platform/ui/keyboard_notice.h"
#include "platform/ui/stack_view.h"
#include "platform/ui/text_field.h"
#include "preview/file_info_stack_view.h"
#include "preview/preview_base_view_controller.h"
#include "preview/thumbnail_image_view.h"

namespace vaelo {

/// What is known of a document: its thumbnail, its name, which can be changed here, and the facts about its file. Main
/// thread.
class PreviewDetailsViewController : public PreviewBaseViewController, public TextFieldDelegate {
 public:
  std::string className() const override { return "PreviewDetailsViewController"; }

  const std::shared_ptr<ThumbnailImageView>& thumbnailView() const { return thumbnailView_; }
  const std::shared_ptr<TextField>& filenameTextField() const { return filenameTextField_; }
  const std::shared_ptr<FileInfoStackView>& fileInfoView() const { return fileInfoView_; }
  /// The name as it was shown or renamed last; what giving up restores.
  const std::optional<std::string>& originalFilename() const { return originalFilename_; }
  /// The extension of that name, where it is shown.
  const std::optional<std::string>& originalSuffix() const { return originalSuffix_; }
  const LayoutConstraintRef& filenameTextFieldFullWidthConstraint() const { return filenameTextFieldFullWidthConstraint_; }
  const std::shared_ptr<StackView>& mainStackView() const { return mainStackView_; }
  const std::vector<LayoutConstraintRef>& portraitConstraints() const { return portraitConstraints_; }
  const std::vector<LayoutConstraintRef>& landscapeConstraints() const { return landscapeConstraints_; }
  const std::shared_ptr<StackView>& filenameStackView() const { return filenameStackView_; }
  const std::shared_ptr<StackView>& fileDetailsView() const { return fileDetailsView_; }
  /// Null when no application opens the document.
  const std::shared_ptr<Button>& openInAppButton() const { return openInAppButton_; }
  /// What stood on the right of the bar before the rename.
  const std::vector<BarButtonItemRef>& originalRightBarButtonItems() const { return originalRightBarButtonItems_; }

  void viewDidLoad() override;
  void viewWillDisappear(bool animated) override;
  void viewWillTransitionToSize(const Size& size, TransitionCoordinator& coordinator) override;
  void refreshItem() override;

  /// True where there is room for the button below the facts.
  bool shouldDisplayOpenInAppButtonInView() const;
  std::shared_ptr<Button> openInAppNavControllerButton() override;

  void viewWasTapped() { forceRenameDone(); }
  void forceRenameCancel();
  void forceRenameDone();
  void updateNavBarForRename(bool renaming);

  bool textFieldShouldBeginEditing(TextField& field) override;
  void textFieldDidBeginEditing(TextField& field) override;
  bool textFieldShouldEndEditing(TextField& field) override;
  void textFieldDidEndEditing(TextField& field) override;
  bool textFieldShouldChangeCharactersInRangeReplacementString(TextField& field, const TextRange& range,
                                                               const std::string& replacement) override;
  bool textFieldShouldReturn(TextField& field) override;
  /// Never: keyboardWillBeShown scrolls.
  bool textFieldShouldScrollToVisibleWhenBecomingFirstResponder(TextField&) override { return false; }

  void registerForKeyboardNotifications();
  void unregisterForKeyboardNotifications();
  void keyboardWillBeShown(const Notification& notification);
  void keyboardWillBeHidden(const Notification& notification);

  void setupViewsAndConstraints();
  void buildStackViewForFilenameWithHairlines();
  void buildFileDetailsStackView();
  std::shared_ptr<StackView> buildVerticalStackWithSubviewsSpacing(const std::vector<ViewRef>& subviews, double spacing);
  void stretchSubviewWithinViewIncludeBottom(View& subview, View& view, bool includeBottom);
  /// The two constraints, not active yet.
  std::vector<LayoutConstraintRef> stretchSubviewWidthWithinView(View& subview, View& view);
  void setupPortraitConstraints();
  void setupLandscapeConstraints();
  void adjustViewsForOrientation(InterfaceOrientation orientation);

 private:
  std::shared_ptr<DRItem> shownItem() const;
  void makeOpenInAppButton();
  void animateWith(const KeyboardNotice& notice, const std::function<void()>& changes);

  std::shared_ptr<ThumbnailImageView> thumbnailView_;
  std::shared_ptr<TextField> filenameTextField_;
  std::shared_ptr<FileInfoStackView> fileInfoView_;
  std::optional<std::string> originalFilename_;
  std::optional<std::string> originalSuffix_;
  LayoutConstraintRef filenameTextFieldFullWidthConstraint_;
  std::shared_ptr<StackView> mainStackView_;
  std::vector<LayoutConstraintRef> portraitConstraints_;
  std::vector<LayoutConstraintRef> landscapeConstraints_;
  std::shared_ptr<StackView> filenameStackView_;
  std::shared_ptr<StackView> fileDetailsView_;
  std::shared_ptr<Button> openInAppButton_;
  std::vector<BarButtonItemRef> originalRightBarButtonItems_;
  std::vector<NotificationCenter::Token> keyboardObservations_;
};

}  // namespace vaelo
