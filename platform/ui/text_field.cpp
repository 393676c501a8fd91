// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/text_field.h"

#include <algorithm>
#include <utility>

#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

namespace {

// File names need not be UTF-8: every byte that does not continue a character counts as the beginning of one.
bool beginsCharacter(char byte) { return (static_cast<unsigned char>(byte) & 0xC0) != 0x80; }

/// The index of the byte at which the character with that offset begins; the text's size at or beyond its end.
std::size_t byteOffset(const std::string& text, std::size_t characters) {
  for (std::size_t at = 0; at < text.size(); ++at) {
    if (beginsCharacter(text[at]) && characters-- == 0) return at;
  }
  return text.size();
}

TextRange cutTo(const std::string& text, const TextRange& range) {
  const std::size_t count = characterCount(text);
  const std::size_t location = std::min(range.location, count);
  return {location, std::min(range.length, count - location)};
}

}  // namespace

std::size_t characterCount(std::string_view text) {
  return static_cast<std::size_t>(std::count_if(text.begin(), text.end(), beginsCharacter));
}

void TextField::setText(std::string text) {
  if (text_ == text) return;
  text_ = std::move(text);
  selectedRange_ = {characterCount(text_), 0};
  notify(ViewChange::Content);
}

void TextField::setPlaceholder(std::string placeholder) {
  if (placeholder_ == placeholder) return;
  placeholder_ = std::move(placeholder);
  notify(ViewChange::Content);
}

void TextField::setFont(const Font& font) {
  if (font_ == font) return;
  font_ = font;
  notify(ViewChange::Appearance);
}

void TextField::setTextColor(const Color& color) {
  if (textColor_ == color) return;
  textColor_ = color;
  notify(ViewChange::Appearance);
}

void TextField::setTextAlignment(TextAlignment alignment) {
  if (alignment_ == alignment) return;
  alignment_ = alignment;
  notify(ViewChange::Appearance);
}

void TextField::setSelectedRange(const TextRange& range) {
  const TextRange cut = cutTo(text_, range);
  if (selectedRange_ == cut) return;
  selectedRange_ = cut;
  notify(ViewChange::Selection);
}

void TextField::setClearButtonMode(ClearButtonMode mode) {
  clearButtonMode_ = mode;
  notify(ViewChange::Interaction);
}

void TextField::setReturnKeyType(ReturnKeyType type) {
  returnKeyType_ = type;
  notify(ViewChange::Interaction);
}

void TextField::setEnablesReturnKeyAutomatically(bool enables) {
  enablesReturnKeyAutomatically_ = enables;
  notify(ViewChange::Interaction);
}

void TextField::setReturnKeyEnabled(bool enabled) {
  if (returnKeyEnabled_ == enabled) return;
  returnKeyEnabled_ = enabled;
  notify(ViewChange::Interaction);
}

void TextField::setAutocapitalizationType(AutocapitalizationType type) {
  autocapitalization_ = type;
  notify(ViewChange::Interaction);
}

void TextField::setAutocorrectionType(AutocorrectionType type) {
  autocorrection_ = type;
  notify(ViewChange::Interaction);
}

bool TextField::becomeFirstResponder() {
  if (editing_) return true;
  if (!enabled()) return false;
  const ViewRef kept = weak_from_this().lock();
  const auto asked = delegate();
  if (asked && !asked->textFieldShouldBeginEditing(*this)) return false;
  View* root = this;
  while (root->superview()) root = root->superview();
  // Only one field of a screen is edited at a time.
  if (!root->endEditing(false)) return false;
  editing_ = true;
  notify(ViewChange::Focus);
  if (asked) asked->textFieldDidBeginEditing(*this);
  return editing_;
}

bool TextField::resignFirstResponder() { return finishEditing(false); }

bool TextField::endEditing(bool force) { return finishEditing(force); }

bool TextField::finishEditing(bool force) {
  if (!editing_) return true;
  // A delegate that shows an alert makes the widget lose the focus, which asks again before the first answer is there.
  if (ending_) return false;
  const ViewRef kept = weak_from_this().lock();
  const auto asked = delegate();
  ending_ = true;
  const bool allowed = !asked || asked->textFieldShouldEndEditing(*this);
  ending_ = false;
  if (!allowed && !force) return false;
  editing_ = false;
  notify(ViewChange::Focus);
  if (asked) asked->textFieldDidEndEditing(*this);
  return true;
}

bool TextField::userReplace(const TextRange& range, const std::string& replacement) {
  const ViewRef kept = weak_from_this().lock();
  const TextRange cut = cutTo(text_, range);
  const auto asked = delegate();
  if (asked && !asked->textFieldShouldChangeCharactersInRangeReplacementString(*this, cut, replacement)) return false;
  const std::size_t begin = byteOffset(text_, cut.location);
  const std::size_t end = byteOffset(text_, cut.location + cut.length);
  text_.replace(begin, end - begin, replacement);
  selectedRange_ = {cut.location + characterCount(replacement), 0};
  notify(ViewChange::Content);
  sendActions(ControlEvent::EditingChanged);
  return true;
}

bool TextField::userSetText(const std::string& text) {
  if (text == text_) return true;
  // What differs is what the user replaced: the text between the common beginning and the common end.
  const std::size_t shorter = std::min(text.size(), text_.size());
  std::size_t head = 0;
  while (head < shorter && text[head] == text_[head]) ++head;
  const auto splits = [](const std::string& whole, std::size_t at) {
    return at < whole.size() && !beginsCharacter(whole[at]);
  };
  while (head > 0 && (splits(text, head) || splits(text_, head))) --head;
  std::size_t tail = 0;
  while (tail < shorter - head && text[text.size() - 1 - tail] == text_[text_.size() - 1 - tail]) ++tail;
  while (tail > 0 && (splits(text, text.size() - tail) || splits(text_, text_.size() - tail))) --tail;
  const std::string removed = text_.substr(head, text_.size() - tail - head);
  return userReplace({characterCount(text_.substr(0, head)), characterCount(removed)},
                     text.substr(head, text.size() - tail - head));
}

bool TextField::pressReturn() {
  if (!returnKeyEnabled_ || (enablesReturnKeyAutomatically_ && text_.empty())) return false;
  const ViewRef kept = weak_from_this().lock();
  const auto asked = delegate();
  return !asked || asked->textFieldShouldReturn(*this);
}

Size TextField::intrinsicContentSize() const {
  return {NoIntrinsicMetric, Platform::current().screens.graphics().fontMetrics(font_).lineHeight};
}

}  // namespace vaelo
