// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <string_view>

#include "platform/ui/control.h"
#include "platform/ui/label.h"
#include "platform/ui/text_field_delegate.h"

namespace vaelo {

/// The characters of the text as ranges count them: Unicode code points, and every byte that is part of none.
std::size_t characterCount(std::string_view text);

enum class ClearButtonMode { Never, WhileEditing, Always };
enum class ReturnKeyType { Default, Done, Search };
enum class AutocapitalizationType { None, Words, Sentences };
enum class AutocorrectionType { Default, No, Yes };

/// One line of text that the user edits. Main thread.
///
/// The host reports with userReplace, pressReturn, becomeFirstResponder and resignFirstResponder; when one of them answers
/// false the widget must go back to what the model says.
class TextField : public Control {
 public:
  explicit TextField(const Rect& frame = {}) : Control(frame) {}

  const std::string& text() const { return text_; }
  /// Sets the text from code: no delegate is asked, no action is sent. The caret goes to the end.
  void setText(std::string text);
  const std::string& placeholder() const { return placeholder_; }
  void setPlaceholder(std::string placeholder);
  const Font& font() const { return font_; }
  void setFont(const Font& font);
  const Color& textColor() const { return textColor_; }
  void setTextColor(const Color& color);
  TextAlignment textAlignment() const { return alignment_; }
  void setTextAlignment(TextAlignment alignment);
  /// An empty selection is the caret.
  const TextRange& selectedRange() const { return selectedRange_; }
  /// Ranges beyond the text are cut to it.
  void setSelectedRange(const TextRange& range);

  ClearButtonMode clearButtonMode() const { return clearButtonMode_; }
  void setClearButtonMode(ClearButtonMode mode);
  ReturnKeyType returnKeyType() const { return returnKeyType_; }
  void setReturnKeyType(ReturnKeyType type);
  /// The return key works only when there is text.
  bool enablesReturnKeyAutomatically() const { return enablesReturnKeyAutomatically_; }
  void setEnablesReturnKeyAutomatically(bool enables);
  /// The state that code gives the return key of the keyboard while the field is edited.
  bool returnKeyEnabled() const { return returnKeyEnabled_; }
  void setReturnKeyEnabled(bool enabled);
  AutocapitalizationType autocapitalizationType() const { return autocapitalization_; }
  void setAutocapitalizationType(AutocapitalizationType type);
  AutocorrectionType autocorrectionType() const { return autocorrection_; }
  void setAutocorrectionType(AutocorrectionType type);

  std::shared_ptr<TextFieldDelegate> delegate() const { return delegate_.lock(); }
  void setDelegate(std::weak_ptr<TextFieldDelegate> delegate) { delegate_ = std::move(delegate); }

  bool isEditing() const { return editing_; }
  bool isFirstResponder() const { return editing_; }
  /// Begins editing when enabled and the delegate allows; true when the field is being edited afterwards.
  bool becomeFirstResponder();
  /// Ends editing when the delegate allows; true when the field is not being edited afterwards.
  bool resignFirstResponder();
  /// As resignFirstResponder; with `force` the delegate is asked but can't refuse.
  bool endEditing(bool force) override;

  /// For the host: the user replaces characters. Asks the delegate, changes the text, puts the caret behind the
  /// replacement and sends EditingChanged. False when refused.
  bool userReplace(const TextRange& range, const std::string& replacement);
  /// For the host: the user made the whole text this, by typing, pasting or the clear button.
  bool userSetText(const std::string& text);
  /// For the host: the return key. False when the key is disabled or the delegate answers false.
  bool pressReturn();

  Size intrinsicContentSize() const override;

 private:
  bool finishEditing(bool force);
  std::string text_;
  std::string placeholder_;
  Font font_ = Font::preferred(TextStyle::Body);
  Color textColor_ = Color::black();
  TextAlignment alignment_ = TextAlignment::Natural;
  TextRange selectedRange_;
  ClearButtonMode clearButtonMode_ = ClearButtonMode::Never;
  ReturnKeyType returnKeyType_ = ReturnKeyType::Default;
  AutocapitalizationType autocapitalization_ = AutocapitalizationType::Sentences;
  AutocorrectionType autocorrection_ = AutocorrectionType::Default;
  bool enablesReturnKeyAutomatically_ = false;
  bool returnKeyEnabled_ = true;
  bool editing_ = false;
  bool ending_ = false;
  std::weak_ptr<TextFieldDelegate> delegate_;
};

}  // namespace vaelo
