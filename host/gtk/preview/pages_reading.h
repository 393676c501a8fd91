// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>

#include "host/desktop/screen_reader.h"
#include "host/gtk/preview/page_text.h"
#include "host/gtk/preview/pages_canvas.h"

namespace vaelo {

/// Tells screen readers which page is read and, when one is in use, what is written on those that show. Main thread.
class PagesReading {
 public:
  /// `textOf` answers null until a page's text is read, which asking begins.
  PagesReading(PagesCanvas& canvas, std::function<const PageText*(int page)> textOf);
  ~PagesReading();
  PagesReading(const PagesReading&) = delete;
  PagesReading& operator=(const PagesReading&) = delete;

  /// Other pages show, or the text of one was read.
  void update();

 private:
  void tell();

  PagesCanvas& canvas_;
  std::function<const PageText*(int page)> textOf_;
  ScreenReader reader_;
  guint settling_ = 0;
  std::string told_;
};

}  // namespace vaelo
