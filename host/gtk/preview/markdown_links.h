// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <string>
#include <vector>

#include "host/gtk/preview/markdown_load.h"

namespace vaelo {

/// The links in a text view: the address as tooltip, opened by a tap, and by Tab and Enter. Main thread.
class MarkdownLinks {
 public:
  using Links = std::function<const std::vector<MarkdownLink>&()>;
  /// `links` are those of the buffer that shows; `open` is called with addresses that isOpenable() only.
  MarkdownLinks(GtkTextView* view, Links links, std::function<void(const std::string& address)> open);
  ~MarkdownLinks();
  MarkdownLinks(const MarkdownLinks&) = delete;
  MarkdownLinks& operator=(const MarkdownLinks&) = delete;

  /// Pages of the web and mail; anything else could start a program that the reader didn't ask for.
  static bool isOpenable(const std::string& address);
  /// The link at a place of the view; null where there is none.
  const MarkdownLink* at(double x, double y) const;
  void activate(const MarkdownLink& link);

 private:
  bool key(guint key, GdkModifierType state);
  bool step(bool forward);
  const MarkdownLink* selected() const;

  GtkTextView* view_;
  Links links_;
  std::function<void(const std::string& address)> open_;
  GtkEventController* controllers_[3];
  gulong tooltip_;
};

}  // namespace vaelo
