// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "host/gtk/preview/page_text.h"
#include "host/gtk/preview/pages_canvas.h"
#include "host/gtk/preview/portable_document_source.h"

namespace vaelo {

/// A place on a page that leads somewhere or tells something.
struct PageLink {
  enum class Kind { Page, Address, Note };
  Kind kind = Kind::Note;
  PageRect rect;
  int page = 0;      ///< where a link into the document leads
  double top = 0;    ///< how far below that page's upper edge, points
  std::string text;  ///< an address out of the document, or what a note says
};

/// Reads a line that the decoder says of a page; nothing when it is none.
std::optional<PageLink> pageLinkIn(const std::string& line);

/// The links and notes of the pages that were asked for. Main thread.
class PagesLinks {
 public:
  explicit PagesLinks(PortableDocumentSource& source) : source_(source) {}
  /// `found` is called, later when the page is not read yet, with the uppermost one at the place; null when there is none.
  void at(const PagePlace& place, std::function<void(const PageLink*)> found);

 private:
  void tell(const PagePlace& place, const std::function<void(const PageLink*)>& found) const;

  PortableDocumentSource& source_;
  std::map<int, std::vector<PageLink>> pages_;
};

}  // namespace vaelo
