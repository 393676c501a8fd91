// SPDX-License-Identifier: GPL-3.0-or-later
#include "fileops/ui_utils.h"

#include "platform/localized.h"
#include "platform/platform.h"
#include "platform/ui/alert_controller.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

namespace {

std::string wordsOf(const std::optional<Error>& error) {
  if (error && error->localizedDescription) return *error->localizedDescription;
  if (error && error->localizedFailureReason) return localized(error->localizedFailureReason->c_str());
  // The one error that is made without words, and is told: a folder that would get the name of a file, and the reverse.
  if (error && error->code == FileErrorCode::FeatureUnsupported) return localized("This can’t be done with this item.");
  return localized("Error exception");
}

}  // namespace

void UIUtils::showAlertMessageParentViewController(const std::string& title, const std::string& message,
                                                   const ViewControllerRef& parent) {
  auto alert = AlertController::make(AlertStyle::Alert, title, message);
  alert->addAction(AlertAction::make(localized("OK"), AlertActionStyle::Default));
  if (parent) parent->presentViewController(alert, true);
}

void UIUtils::showErrorParentViewController(const std::optional<Error>& error, const ViewControllerRef& parent) {
  showAlertMessageParentViewController(wordsOf(error), "", parent);
}

void UIUtils::showFriendlyMoveErrorParentViewController(const Error& error, const ViewControllerRef& parent) {
  const auto path = error.userInfo.find(DestinationFilePathErrorKey);
  const std::string* text = path == error.userInfo.end() ? nullptr : path->second.get<std::string>();
  showFriendlyMoveOrRenameErrorBasenameMovingToDirParentViewController(
      error, text ? URL(*text).lastPathComponent() : std::string(), true, parent);
}

void UIUtils::showFriendlyRenameErrorBasenameParentViewController(const Error& error, const std::string& basename,
                                                                  const ViewControllerRef& parent) {
  showFriendlyMoveOrRenameErrorBasenameMovingToDirParentViewController(error, basename, false, parent);
}

void UIUtils::showFriendlyMoveOrRenameErrorBasenameMovingToDirParentViewController(const Error& error,
                                                                                   const std::string& basename,
                                                                                   bool movingToDir,
                                                                                   const ViewControllerRef& parent) {
  switch (error.code) {
    case FileErrorCode::WriteFileExists:
      showItemExistsAlertMovingToDirParentViewController(basename, movingToDir, parent);
      break;
    case FileErrorCode::WriteInvalidFileName:
      showInvalidItemNameAlertParentViewController(basename, parent);
      break;
    default:
      showErrorParentViewController(error, parent);
  }
}

void UIUtils::showItemExistsAlertMovingToDirParentViewController(const std::string& basename, bool movingToDir,
                                                                 const ViewControllerRef& parent) {
  Formatting& formatting = Platform::current().formatting;
  if (movingToDir) {
    const std::string title =
        formatting.filled(localized("An item named “%@” already exists in the new location."), {basename});
    showAlertMessageParentViewController(title, "", parent);
    return;
  }
  const std::string extension = URL("/" + basename).pathExtension();
  const std::string stem = extension.empty() ? basename : basename.substr(0, basename.size() - extension.size() - 1);
  const std::string title =
      extension.empty()
          ? formatting.filled(localized("The name “%@” is already taken."), {stem})
          : formatting.filled(localized("The name “%1$@” with extension “.%2$@” is already taken."), {stem, extension});
  showAlertMessageParentViewController(title, localized("Choose a different name."), parent);
}

void UIUtils::showInvalidItemNameAlertParentViewController(const std::string& basename, const ViewControllerRef& parent) {
  const std::string message = Platform::current().formatting.filled(
      localized("The name “%@” can’t be used. Try using a name with fewer characters, or with no punctuation marks."),
      {basename});
  showAlertMessageParentViewController("", message, parent);
}

void UIUtils::showUnsupportedError(const ViewControllerRef& parent) {
  showErrorParentViewController(Error{FileErrorDomain, FileErrorCode::FeatureUnsupported, {}, {}, {}}, parent);
}

std::string UIUtils::bestMessage(const std::optional<Error>& error) {
  if (!error) return "";
  if (error->code == FileErrorCode::WriteFileExists) return localized("Name is already taken");
  if (error->code == FileErrorCode::WriteInvalidFileName) return localized("Character not allowed in filename");
  return wordsOf(error);
}

void UIUtils::setCursorInTextFieldToBeforeExtension(TextField& field) {
  const std::string& text = field.text();
  const std::size_t dot = text.rfind('.');
  if (dot == std::string::npos) return;
  selectTextInTextFieldRange(field, {characterCount(std::string_view(text).substr(0, dot)), 0});
}

void UIUtils::selectTextInTextFieldRange(TextField& field, const TextRange& range) { field.setSelectedRange(range); }

void UIUtils::addChildViewControllerChildViewController(const ViewControllerRef& parent, const ViewControllerRef& child) {
  parent->addChild(child);
  parent->view()->addSubview(child->view());
  child->didMoveToParent(parent.get());
}

bool UIUtils::slateMode() { return Platform::current().screens.device().userInterfaceIdiom() == InterfaceIdiom::Slate; }

}  // namespace vaelo
