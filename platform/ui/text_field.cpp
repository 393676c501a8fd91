// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/text_field.h"

namespace vaelo {

bool TextField::becomeFirstResponder() {
  if (editing_) return true;
  const std::shared_ptr<TextFieldDelegate> delegate = delegate_.lock();
  if (delegate && !delegate->textFieldShouldBeginEditing(*this)) return false;
  set(editing_, true);
  if (delegate) delegate->textFieldDidBeginEditing(*this);
  return true;
}

bool TextField::resignFirstResponder() {
  if (!editing_) return true;
  const std::shared_ptr<TextFieldDelegate> delegate = delegate_.lock();
  if (delegate && !delegate->textFieldShouldEndEditing(*this)) return false;
  set(editing_, false);
  if (delegate) delegate->textFieldDidEndEditing(*this);
  return true;
}

bool TextField::userReplaced(Selection range, const std::string& replacement, std::string newText) {
  const std::shared_ptr<TextFieldDelegate> delegate = delegate_.lock();
  if (delegate && !delegate->textFieldShouldChangeCharactersInRangeReplacementString(*this, range.start, range.length,
                                                                                     replacement)) {
    return false;
  }
  setText(std::move(newText));
  if (editingChanged_) editingChanged_(*this);
  return true;
}

bool TextField::userPressedReturn() {
  const std::shared_ptr<TextFieldDelegate> delegate = delegate_.lock();
  return !delegate || delegate->textFieldShouldReturn(*this);
}

}  // namespace vaelo
