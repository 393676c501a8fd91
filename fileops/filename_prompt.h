// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "fileops/simple_text_view_controller.h"
#include "platform/notifications.h"
#include "platform/ui/alert_controller.h"
#include "platform/ui/text_field_delegate.h"

namespace vaelo {

/// An alert that asks for a name, judges it while it is typed, and closes once its caller has done something with it. The
/// caller presents alert() and keeps the prompt while it is shown. Main thread.
class FilenamePrompt : public TextFieldDelegate, public std::enable_shared_from_this<FilenamePrompt> {
 public:
  /// Tries the operation with the name, which has no blanks around it. Sets `accepted` when it is done; else what it answers
  /// is shown under the field.
  using ValidateNewFilename = std::function<std::string(const std::string& name, bool& accepted)>;
  using OptionalText = std::optional<std::string>;

  static std::shared_ptr<FilenamePrompt> newWithTitleMessagePlaceholderFilenameDoneButtonTextCompletion(
      const OptionalText& title, const OptionalText& message, const OptionalText& placeholder, const OptionalText& filename,
      const OptionalText& doneButtonText, ValidateNewFilename completion);
  ~FilenamePrompt() override;

  const std::shared_ptr<AlertController>& alert() const { return alert_; }
  const std::shared_ptr<SimpleTextViewController>& errMsgViewController() const { return errMsgViewController_; }
  /// The Done action.
  const AlertActionRef& defaultAction() const { return defaultAction_; }
  /// The name at the start; absent for a new folder.
  const OptionalText& origFilename() const { return origFilename_; }
  const ValidateNewFilename& validateNewFilenameCallback() const { return validateNewFilenameCallback_; }
  const std::shared_ptr<TextField>& textField() const { return textField_; }

  void addCancelAction(AlertAction::Handler handler);
  void addDefaultAction(const OptionalText& doneButtonText);
  /// May the alert close?
  bool handleDoneAction();
  /// Empty or absent hides the line.
  void updateErrorMessage(const OptionalText& message);
  void setDoneButtonEnabled(bool enabled);
  void folderPromptTextFieldChanged(TextField& field);
  void keyboardWillShow();

  bool textFieldShouldReturn(TextField& field) override;
  void textFieldDidBeginEditing(TextField& field) override;

 protected:
  FilenamePrompt() = default;
  /// Builds the alert; once, by whoever made the object.
  void initWithTitleMessagePlaceholderFilenameDoneButtonTextCompletion(
      const OptionalText& title, const OptionalText& message, const OptionalText& placeholder, const OptionalText& filename,
      const OptionalText& doneButtonText, ValidateNewFilename completion);

 private:
  void configureTextField(const std::shared_ptr<TextField>& field, const OptionalText& placeholder);

  std::shared_ptr<AlertController> alert_;
  std::shared_ptr<SimpleTextViewController> errMsgViewController_;
  AlertActionRef defaultAction_;
  OptionalText origFilename_;
  ValidateNewFilename validateNewFilenameCallback_;
  std::shared_ptr<TextField> textField_;
  NotificationCenter::Token keyboardObservation_;
};

}  // namespace vaelo
