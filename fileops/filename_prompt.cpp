// SPDX-License-Identifier: GPL-3.0-or-later
#include "fileops/filename_prompt.h"

#include "fileops/ui_utils.h"
#include "items/file_utils.h"
#include "items/vlo_log.h"
#include "platform/localized.h"
#include "platform/platform.h"
#include "platform/ui/screen_factory.h"
#include "platform/ui/shared_self.h"

namespace vaelo {

namespace {

constexpr double FieldHeightInLines = 1.2;

std::string trimmed(const std::string& text) {
  return Platform::current().characterClasses.trimmingWhitespaceAndNewlines(text);
}

}  // namespace

std::shared_ptr<FilenamePrompt> FilenamePrompt::newWithTitleMessagePlaceholderFilenameDoneButtonTextCompletion(
    const OptionalText& title, const OptionalText& message, const OptionalText& placeholder, const OptionalText& filename,
    const OptionalText& doneButtonText, ValidateNewFilename completion) {
  struct Prompt : FilenamePrompt {};
  const std::shared_ptr<FilenamePrompt> prompt = std::make_shared<Prompt>();
  prompt->initWithTitleMessagePlaceholderFilenameDoneButtonTextCompletion(title, message, placeholder, filename,
                                                                          doneButtonText, std::move(completion));
  return prompt;
}

FilenamePrompt::~FilenamePrompt() = default;

void FilenamePrompt::initWithTitleMessagePlaceholderFilenameDoneButtonTextCompletion(
    const OptionalText& title, const OptionalText& message, const OptionalText& placeholder, const OptionalText& filename,
    const OptionalText& doneButtonText, ValidateNewFilename completion) {
  origFilename_ = filename;
  validateNewFilenameCallback_ = std::move(completion);
  alert_ = AlertController::make(AlertStyle::Alert, title.value_or(""), message.value_or(""));
  alert_->addTextField(
      [this, &placeholder](const std::shared_ptr<TextField>& field) { configureTextField(field, placeholder); });
  addCancelAction(nullptr);
  addDefaultAction(doneButtonText);
  errMsgViewController_ = std::make_shared<SimpleTextViewController>();
  alert_->setContentViewController(errMsgViewController_);
  updateErrorMessage("");
  keyboardObservation_ = Platform::current().notifications.addObserver(KeyboardWillShowNotification,
                                                                       [weak = weak_from_this()](const Notification&) {
                                                                         if (const auto self = weak.lock())
                                                                           self->keyboardWillShow();
                                                                       });
}

void FilenamePrompt::configureTextField(const std::shared_ptr<TextField>& field, const OptionalText& placeholder) {
  textField_ = field;
  if (origFilename_) field->setText(*origFilename_);
  if (placeholder) field->setPlaceholder(*placeholder);
  field->setClearButtonMode(ClearButtonMode::WhileEditing);
  field->setReturnKeyType(ReturnKeyType::Done);
  field->setEnablesReturnKeyAutomatically(false);
  field->setAutocapitalizationType(AutocapitalizationType::Words);
  field->setAutocorrectionType(AutocorrectionType::No);
  field->setDelegate(weak_from_this());
  field->addAction(ControlEvent::EditingChanged, [weak = weak_from_this()] {
    if (const auto self = weak.lock()) self->folderPromptTextFieldChanged(*self->textField_);
  });
  const double line = Platform::current().screens.graphics().fontMetrics(field->font()).lineHeight;
  LayoutConstraint::makeConstant(*field, LayoutAttribute::Height, line * FieldHeightInLines)->setActive(true);
}

void FilenamePrompt::addCancelAction(AlertAction::Handler handler) {
  alert_->addAction(AlertAction::make(localized("Cancel"), AlertActionStyle::Cancel, std::move(handler)));
}

void FilenamePrompt::addDefaultAction(const OptionalText& doneButtonText) {
  const bool given = doneButtonText && !doneButtonText->empty();
  defaultAction_ = AlertAction::make(given ? *doneButtonText : localized("Done"), AlertActionStyle::Default);
  defaultAction_->setShouldDismiss([weak = weak_from_this()] {
    const auto self = weak.lock();
    return !self || self->handleDoneAction();
  });
  if (origFilename_.value_or("").empty()) defaultAction_->setEnabled(false);
  alert_->addAction(defaultAction_);
}

void FilenamePrompt::folderPromptTextFieldChanged(TextField& field) {
  if (!defaultAction_) return;
  const std::string name = trimmed(field.text());
  const bool valid = FileUtils::isValidFilename(name);
  if (valid) {
    updateErrorMessage(std::nullopt);
  } else if (name.empty()) {
    updateErrorMessage("");
  } else {
    updateErrorMessage(name.front() == '.' ? localized("Choose a different name.")
                                           : localized("Character not allowed in filename"));
  }
  setDoneButtonEnabled(valid);
}

bool FilenamePrompt::handleDoneAction() {
  if (alert_->textFields().empty()) return false;
  const std::string name = trimmed(textField_->text());
  // What is wrong with it was said while it was typed.
  if (!FileUtils::isValidFilename(name)) return false;
  bool accepted = false;
  const std::string message = validateNewFilenameCallback_(name, accepted);
  if (!accepted) updateErrorMessage(message);
  return accepted;
}

void FilenamePrompt::updateErrorMessage(const OptionalText& message) {
  const ViewRef& line = errMsgViewController_->view();
  errMsgViewController_->messageLabel()->setText(message.value_or(""));
  const bool hidden = message.value_or("").empty();
  if (line->hidden() != hidden) line->setHidden(hidden);
}

void FilenamePrompt::setDoneButtonEnabled(bool enabled) {
  defaultAction_->setEnabled(enabled);
  textField_->setReturnKeyEnabled(enabled);
}

void FilenamePrompt::keyboardWillShow() {
  if (textField_->isFirstResponder()) textField_->setReturnKeyEnabled(defaultAction_->enabled());
}

bool FilenamePrompt::textFieldShouldReturn(TextField& field) {
  VLO_DEBUG("textFieldShouldReturn");
  const bool done = handleDoneAction();
  if (done) {
    field.resignFirstResponder();
    alert_->dismissViewControllerAnimated(true);
  }
  return done;
}

void FilenamePrompt::textFieldDidBeginEditing(TextField& field) { UIUtils::setCursorInTextFieldToBeforeExtension(field); }

}  // namespace vaelo
