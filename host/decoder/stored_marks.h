// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <poppler.h>

#include <map>
#include <string>
#include <vector>

#include "host/decoder/document_text.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// A mark that a page of the file has already.
struct StoredMark {
  GRef<PopplerAnnot> annotation;
  PopplerAnnotFlag flags = POPPLER_ANNOT_FLAG_UNKNOWN;
  PageBox area = {};
};

/// All annotations of the page. Their places in the list are what each is known by, in every process.
std::vector<StoredMark> storedMarksOf(PopplerPage* page);

/// The marks that the pages of an open document have in the file. To be gone before the document.
class StoredMarks {
 public:
  /// From now on these, and no others, are left out when the page is painted.
  void hide(PopplerPage* page, const std::vector<int>& hidden);
  /// What is painted uppermost within so many points of the place: "INDEX KIND MAYBECHANGED TEXT", where KIND is highlight,
  /// ink or note, MAYBECHANGED 1 or 0, and each line of TEXT but the last ends with a carriage return. Empty when there is
  /// nothing.
  std::string touched(PopplerPage* page, double x, double y, double reach);
  void clear() { pages_.clear(); }

 private:
  std::vector<StoredMark>& of(PopplerPage* page);

  std::map<int, std::vector<StoredMark>> pages_;
};

}  // namespace vaelo
