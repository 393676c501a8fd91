// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <array>
#include <string>
#include <string_view>
#include <vector>

#include "host/decoder/document_text.h"
#include "host/support/unique_fd.h"

namespace vaelo {

/// A mark that a person made on a page, or what became of one that the page has already.
struct DocumentMark {
  enum class Kind { Highlight, Ink, Note, Removal, Rewriting };
  Kind kind = Kind::Highlight;
  int page = 0;
  std::array<double, 3> colour = {};          ///< red, green, blue, 0 to 1
  double width = 0;                           ///< of ink, points
  std::vector<PageBox> lines;                 ///< what is highlighted
  std::vector<std::array<double, 2>> points;  ///< of ink; the place of a note
  std::string text;                           ///< of a note, also of one that is rewritten
  std::size_t stored = 0;                     ///< of the page's annotations, that which is removed or rewritten

  bool isChange() const { return kind == Kind::Removal || kind == Kind::Rewriting; }
};

/// The marks to be written, in the order in which they were made.
class DocumentMarks {
 public:
  /// Takes one, after the word "mark"; false when it isn't one on these pages:
  ///   highlight PAGE R G B X0 Y0 X1 Y1 …   ink PAGE R G B WIDTH X Y X Y …   note PAGE R G B X Y TEXT
  ///   remove PAGE INDEX   rewrite PAGE INDEX TEXT, where INDEX is that of StoredMarks
  bool add(std::string_view words, int pages);
  void clear() { marks_.clear(); }
  /// The document with the marks, in a file of its own; none, with a word of DecoderError, when it can't be written.
  UniqueFd apply(const UniqueFd& original, const std::string& password, const char*& problem) const;
  /// Whether that was made of the original.
  bool areIn(PopplerDocument* marked, PopplerDocument* original) const;

 private:
  std::vector<DocumentMark> marks_;
};

}  // namespace vaelo
