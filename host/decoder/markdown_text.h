// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cmark.h>

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace vaelo {

/// Markdown as text, and what form its parts have. Nothing that the document refers to is looked at.
class MarkdownText {
 public:
  /// The names of forms, with their words: of paragraphs heading (1 to 6), paragraph, item, code (block), first and last
  /// (line of a block), table, quote, rule, each but the last with the number of levels that it is moved in; of characters
  /// strong, emphasis, literal, picture (its description), link (its address).
  struct Form {
    const char* name;
    std::size_t begin;  ///< in characters
    std::size_t end;
    std::string word;
  };

  /// `source` is valid UTF-8.
  explicit MarkdownText(const std::string& source);

  const std::string& text() const { return text_; }
  std::size_t characters() const { return characters_; }
  /// In the order of their beginnings.
  const std::vector<Form>& forms() const { return forms_; }

 private:
  struct List {
    bool ordered;
    int number;
  };
  void enter(cmark_node* node, cmark_iter* iter);
  void leave(cmark_node* node);
  void append(std::string_view text);
  void beginBlock();
  void endBlock(const char* name, std::string word = "");
  void tickBox();
  void appendLines(const char* name, std::string_view lines);
  void appendHtml(std::string_view html);
  bool appendTable(cmark_node* paragraph);
  std::string frontMatter(const std::string& source);
  std::string level() const;

  std::vector<std::string_view> sourceLines_;
  std::string text_;
  std::size_t characters_ = 0;
  std::vector<Form> forms_;
  std::vector<List> lists_;
  std::vector<std::size_t> opened_;  // where what is being read inside a block began
  std::string marker_;               // of an item whose first block is still to come
  std::size_t block_ = 0;            // where the current block began
  int quotes_ = 0;
  std::size_t blockBytes_ = 0;  // the same in bytes of text_
  std::size_t blockForms_ = 0;  // and in forms
  std::string blockMarker_;     // what the current block begins with
};

}  // namespace vaelo
