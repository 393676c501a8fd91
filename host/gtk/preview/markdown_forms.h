// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <string>
#include <string_view>

namespace vaelo {

/// What the forms of Markdown look like in a text buffer. Main thread.
class MarkdownForms {
 public:
  /// Makes tags in the buffer, which outlives this object.
  explicit MarkdownForms(GtkTextBuffer* buffer);

  void setDark(bool dark);
  /// As MarkdownText names forms and their words; from the character `first` to `end`. Unknown ones change nothing.
  void apply(std::string_view form, int first, int end, std::string_view word);

 private:
  GtkTextTag* tag(const std::string& name) const;
  GtkTextTag* levelTag(const char* form, int level, bool fromRight);

  GtkTextBuffer* buffer_;
};

}  // namespace vaelo
