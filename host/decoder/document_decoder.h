// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <poppler.h>

#include <string>
#include <string_view>

#include "host/decoder/decoder.h"
#include "host/decoder/document_marks.h"
#include "host/decoder/stored_marks.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

/// Portable documents. Pages count from 0; coordinates and sizes are points from the upper left corner of a page as it is
/// shown. What is asked, after which words follow "ok", and what that is:
///
/// - `open PASSWORD`, `PAGES MARKS W H W H …`: the number of pages, 1 when the document allows marks, sizes of first pages
/// - `sizes FROM`, `W H W H …`: the sizes of some pages from FROM on
/// - `render PAGE SCALE X Y W H INDEX …`, and a file: the pixels of this rectangle of the page at SCALE pixels a point,
/// without
///   the marks of these indices
/// - `text PAGE`, `COUNT`, and a file: COUNT rectangles of four floats, then as many characters in UTF-8
/// - `find FROM TEXT`, `NEXT X0 Y0 X1 Y1 …`: where TEXT is on page NEXT - 1; the pages from FROM to NEXT - 2 don't have it
/// - `areas PAGE`, a line for each: `page X0 Y0 X1 Y1 TARGET TOP`, `link X0 Y0 X1 Y1 ADDRESS`, `note X0 Y0 X1 Y1 TEXT`
/// - `touched PAGE X Y REACH`, `INDEX KIND MAYBECHANGED TEXT` or nothing: a mark of the file, see StoredMarks
/// - `mark …`: takes a mark, see DocumentMarks
/// - `unmark`: gives up all marks
/// - `save`, and a file: the document with the marks; what is rendered stays without
class DocumentDecoder : public Decoder {
 public:
  explicit DocumentDecoder(UniqueFd document);
  DecoderMessage answer(const std::string& request) override;

 private:
  DecoderMessage open(const std::string& password);
  DecoderMessage sizes(std::string_view words);
  DecoderMessage render(std::string_view words);
  DecoderMessage text(std::string_view words);
  DecoderMessage find(std::string_view words);
  DecoderMessage areas(std::string_view words);
  DecoderMessage touched(std::string_view words);
  DecoderMessage save();
  std::string sizesFrom(int page) const;
  GRef<PopplerPage> page(int index) const;

  UniqueFd original_;
  std::string password_;
  DocumentMarks marks_;
  GRef<PopplerDocument> document_;
  StoredMarks stored_;
  int pages_ = 0;
};

}  // namespace vaelo
