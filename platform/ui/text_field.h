// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>

#include "platform/ui/font.h"
#include "platform/ui/view.h"

namespace vaelo {

class TextField;

/// Asked and told about editing, in this order: should begin, did begin, should change (each edit), should return, should
/// end, did end.
class TextFieldDelegate {
 public:
  virtual ~TextFieldDelegate() = default;
  virtual bool textFieldShouldBeginEditing(TextField&) { return true; }
  virtual void textFieldDidBeginEditing(TextField&) {}
  /// `start` and `length` count characters of the text that `replacement` would replace.
  virtual bool textFieldShouldChangeCharactersInRangeReplacementString(TextField&, std::size_t, std::size_t,
                                                                       const std::string&) {
    return true;
  }
  virtual bool textFieldShouldReturn(TextField&) { return true; }
  virtual bool textFieldShouldEndEditing(TextField&) { return true; }
  virtual void textFieldDidEndEditing(TextField&) {}
};

/// One line of text that the user edits.
class TextField : public View {
 public:
  enum class Capitalization { None, Words, Sentences };
  struct Selection {
    std::size_t start = 0;  ///< in characters from the start
    std::size_t length = 0;
    friend bool operator==(const Selection&, const Selection&) = default;
  };

  const std::string& text() const { return text_; }
  void setText(std::string text) { set(text_, std::move(text)); }
  const std::string& placeholder() const { return placeholder_; }
  void setPlaceholder(std::string text) { set(placeholder_, std::move(text)); }
  const Font& font() const { return font_; }
  void setFont(Font font) { set(font_, font); }
  const std::optional<Selection>& selection() const { return selection_; }
  void setSelection(Selection selection) { set(selection_, std::optional(selection)); }
  Capitalization capitalization() const { return capitalization_; }
  void setCapitalization(Capitalization capitalization) { set(capitalization_, capitalization); }
  bool autocorrects() const { return autocorrects_; }
  void setAutocorrects(bool autocorrects) { set(autocorrects_, autocorrects); }
  bool showsClearButtonWhileEditing() const { return clearButton_; }
  void setShowsClearButtonWhileEditing(bool shows) { set(clearButton_, shows); }
  /// The keyboard's return key.
  bool isReturnKeyEnabled() const { return returnKeyEnabled_; }
  void setReturnKeyEnabled(bool enabled) { set(returnKeyEnabled_, enabled); }
  void setDelegate(std::weak_ptr<TextFieldDelegate> delegate) { delegate_ = std::move(delegate); }
  /// Called after the user changed the text.
  void setOnEditingChanged(std::function<void(TextField&)> changed) { editingChanged_ = std::move(changed); }

  bool isEditing() const { return editing_; }
  /// Asks the delegate; true when editing began (or goes on).
  bool becomeFirstResponder();
  /// Asks the delegate; true when editing ended.
  bool resignFirstResponder();

  /// For the host: the user replaced the characters of `range`; false when the delegate refused.
  bool userReplaced(Selection range, const std::string& replacement, std::string newText);
  /// For the host: the user pressed return.
  bool userPressedReturn();

 private:
  std::string text_;
  std::string placeholder_;
  Font font_;
  std::optional<Selection> selection_;
  Capitalization capitalization_ = Capitalization::Sentences;
  bool autocorrects_ = true;
  bool clearButton_ = false;
  bool returnKeyEnabled_ = true;
  bool editing_ = false;
  std::weak_ptr<TextFieldDelegate> delegate_;
  std::function<void(TextField&)> editingChanged_;
};

}  // namespace vaelo
