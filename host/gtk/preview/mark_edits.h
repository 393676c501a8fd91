// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <string>
#include <vector>

#include "host/gtk/preview/page_mark.h"

namespace vaelo {

/// What a person does to the marks of a document, one thing after the other, of which the last can always be taken back.
class MarkEdits {
 public:
  /// A mark of the file that isn't as it was.
  struct Changed {
    PageMark mark;  ///< with the text that it has now
    bool removed = false;
  };

  void add(PageMark mark);
  void remove(const PageMark& mark);
  void rewrite(const PageMark& mark, std::string text);
  /// False when there is nothing to be taken back.
  bool undo();
  bool empty() const { return edits_.empty(); }

  /// Those that were made and are still there.
  const std::vector<PageMark>& marks() const { return marks_; }
  const std::vector<Changed>& changed() const { return changed_; }
  /// By pages, the places of those marks of the file that are there no more.
  std::map<int, std::vector<int>> removed() const;
  /// What becomes of the file, as requests to the decoder without their first word.
  std::vector<std::string> requests() const;

 private:
  struct Edit {
    enum class Kind { Add, Remove, Rewrite };
    Kind kind = Kind::Add;
    PageMark mark;
  };
  void apply(const Edit& edit);

  std::vector<Edit> edits_;
  std::vector<PageMark> marks_;
  std::vector<Changed> changed_;
  int lastNumber_ = 0;
};

}  // namespace vaelo
