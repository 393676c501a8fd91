// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtksourceview/gtksource.h>

#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "host/gtk/preview/decoder_process.h"
#include "host/gtk/preview/markdown_forms.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// Where a link stands in a text, in characters, and where it leads to.
struct MarkdownLink {
  int begin;
  int end;
  std::string address;
};

/// Fills a text buffer with a Markdown document, which a decoder's process reads: the first screen at once, the rest in
/// slices of some milliseconds. Main thread.
class MarkdownLoad {
 public:
  /// Not called by the constructor, and no more after the object is gone; each may end the object.
  struct Events {
    std::function<void()> begun;                           ///< the first screen is in the buffer
    std::function<void(const std::string& error)> failed;  ///< a word of DecoderError
  };

  MarkdownLoad(const std::string& path, Events events);
  ~MarkdownLoad();
  MarkdownLoad(const MarkdownLoad&) = delete;
  MarkdownLoad& operator=(const MarkdownLoad&) = delete;

  GtkSourceBuffer* buffer() const { return buffer_.get(); }
  /// In their order; as far as they are in the buffer.
  const std::vector<MarkdownLink>& links() const { return links_; }
  bool finished() const { return finished_; }
  bool isEmpty() const { return text_.empty(); }
  void setDark(bool dark) { forms_.setDark(dark); }

 private:
  void received(DecoderProcess::Answer answer);
  bool fill();
  void insertSome();

  Events events_;
  GRef<GtkSourceBuffer> buffer_;
  MarkdownForms forms_;
  std::unique_ptr<DecoderProcess> process_;
  std::shared_ptr<GBytes> content_;
  std::string_view text_;       // of the content
  std::string_view left_;       // of the text
  std::string_view leftForms_;  // of the content
  int characters_ = 0;          // in the buffer
  std::vector<MarkdownLink> links_;
  bool finished_ = false;
  guint idle_ = 0;
};

}  // namespace vaelo
