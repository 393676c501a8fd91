// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <memory>
#include <string>

namespace vaelo {

class TextField;

/// Offsets and lengths count Unicode code points from the start of the text.
struct TextRange {
  std::size_t location = 0;
  std::size_t length = 0;
  friend bool operator==(const TextRange&, const TextRange&) = default;
};

/// Is asked and told about the editing of a text field. The defaults allow everything. Main thread.
class TextFieldDelegate {
 public:
  virtual ~TextFieldDelegate() = default;
  virtual bool textFieldShouldBeginEditing(TextField&) { return true; }
  virtual void textFieldDidBeginEditing(TextField&) {}
  virtual bool textFieldShouldEndEditing(TextField&) { return true; }
  virtual void textFieldDidEndEditing(TextField&) {}
  virtual bool textFieldShouldChangeCharactersInRangeReplacementString(TextField&, const TextRange&, const std::string&) {
    return true;
  }
  virtual bool textFieldShouldReturn(TextField&) { return true; }
  /// Whether the host may scroll the field into view by itself when editing begins.
  virtual bool textFieldShouldScrollToVisibleWhenBecomingFirstResponder(TextField&) { return true; }
};

}  // namespace vaelo
