// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <map>
#include <optional>

#include "host/gtk/preview/page_text.h"
#include "host/gtk/preview/portable_document_source.h"

namespace vaelo {

/// The texts of the pages that were asked for, read one after the other in the decoder's process. Main thread.
class PagesTexts {
 public:
  /// `arrived` is called with each text that is read.
  PagesTexts(PortableDocumentSource& source, std::function<void()> arrived)
      : source_(source), arrived_(std::move(arrived)) {}
  /// Null until it is read, which asking begins.
  const PageText* of(int page);

 private:
  PortableDocumentSource& source_;
  std::function<void()> arrived_;
  std::map<int, std::optional<PageText>> texts_;  // nothing while one is being read
};

}  // namespace vaelo
