// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/markdown_text.h"

#include <algorithm>
#include <array>
#include <memory>

#include "host/decoder/markdown_table.h"

namespace vaelo {

namespace {

constexpr int MostLevels = 12;
constexpr const char* LineInParagraph = "\u2028";
constexpr std::array<const char*, 3> Bullets = {"•", "◦", "▪"};

std::size_t charactersIn(std::string_view text) {
  return static_cast<std::size_t>(
      std::count_if(text.begin(), text.end(), [](char byte) { return (static_cast<unsigned char>(byte) & 0xc0) != 0x80; }));
}

std::vector<std::string_view> linesOf(std::string_view text) {
  std::vector<std::string_view> lines;
  while (!text.empty()) {
    const std::size_t end = std::min(text.find_first_of("\r\n"), text.size());
    lines.push_back(text.substr(0, end));
    const std::size_t length = text.substr(end).starts_with("\r\n") ? 2 : 1;
    text.remove_prefix(std::min(end + length, text.size()));
  }
  return lines;
}

std::string withoutControls(std::string_view text) {
  std::string clean(text);
  std::erase_if(clean, [](char byte) { return static_cast<unsigned char>(byte) < ' ' || byte == '\x7f'; });
  return clean;
}

std::string_view orEmpty(const char* text) { return text ? text : ""; }

std::string_view lastComponent(std::string_view address) { return address.substr(address.rfind('/') + 1); }

// "-- a comment", tags and the like are left out.
std::string textOfHtml(std::string_view html) {
  std::string text;
  while (!html.empty()) {
    const std::size_t open = std::min(html.find('<'), html.size());
    text += html.substr(0, open);
    html.remove_prefix(open);
    const std::string_view closing = html.starts_with("<!--") ? "-->" : ">";
    const std::size_t close = html.find(closing);
    if (html.starts_with("<br")) text += LineInParagraph;
    html = close == std::string_view::npos ? std::string_view() : html.substr(close + closing.size());
  }
  const std::size_t begin = text.find_first_not_of(" \t\r\n");
  if (begin == std::string::npos) return "";
  return text.substr(begin, text.find_last_not_of(" \t\r\n") + 1 - begin);
}

}  // namespace

MarkdownText::MarkdownText(const std::string& source) {
  const std::string body = frontMatter(source);
  sourceLines_ = linesOf(body);
  const std::unique_ptr<cmark_node, decltype(&cmark_node_free)> document(
      cmark_parse_document(body.data(), body.size(), CMARK_OPT_DEFAULT), cmark_node_free);
  const std::unique_ptr<cmark_iter, decltype(&cmark_iter_free)> iter(cmark_iter_new(document.get()), cmark_iter_free);
  for (cmark_event_type event = cmark_iter_next(iter.get()); event != CMARK_EVENT_DONE;
       event = cmark_iter_next(iter.get())) {
    cmark_node* node = cmark_iter_get_node(iter.get());
    event == CMARK_EVENT_ENTER ? enter(node, iter.get()) : leave(node);
  }
  sourceLines_.clear();
  std::stable_sort(forms_.begin(), forms_.end(),
                   [](const Form& left, const Form& right) { return left.begin < right.begin; });
}

// Settings at the beginning, between lines of three dashes, would be taken for a rule and a heading.
std::string MarkdownText::frontMatter(const std::string& source) {
  const std::size_t end = source.find("\n---\n", 3);
  if (!source.starts_with("---\n") || end == std::string::npos) return source;
  if (end > 4) appendLines("code", std::string_view(source).substr(4, end - 3));
  return source.substr(end + 5);
}

void MarkdownText::append(std::string_view text) {
  text_ += text;
  characters_ += charactersIn(text);
}

std::string MarkdownText::level() const {
  return std::to_string(std::min<int>(static_cast<int>(lists_.size()) + quotes_, MostLevels));
}

void MarkdownText::beginBlock() {
  if (!text_.empty() && text_.back() != '\n') append("\n");
  block_ = characters_;
  blockBytes_ = text_.size();
  blockForms_ = forms_.size();
  append(marker_);
  blockMarker_ = std::move(marker_);
  marker_.clear();
}

// "[ ] to do" is a box in place of the item's bullet.
void MarkdownText::tickBox() {
  const std::string_view text = std::string_view(text_).substr(blockBytes_ + blockMarker_.size());
  const bool isDone = text.starts_with("[x] ") || text.starts_with("[X] ");
  if (blockMarker_.empty() || (!isDone && !text.starts_with("[ ] "))) return;
  const std::string box = isDone ? "☑\t" : "☐\t";
  const std::size_t fewer = charactersIn(blockMarker_) + 4 - charactersIn(box);
  text_.replace(blockBytes_, blockMarker_.size() + 4, box);
  characters_ -= fewer;
  for (std::size_t form = blockForms_; form < forms_.size(); ++form) {
    forms_[form].begin -= fewer;
    forms_[form].end -= fewer;
  }
}

void MarkdownText::endBlock(const char* name, std::string word) {
  // A heading or code in an item is moved in like any other block of it.
  forms_.push_back({blockMarker_.empty() ? "paragraph" : "item", block_, characters_, level()});
  if (quotes_ > 0) forms_.push_back({"quote", block_, characters_, ""});
  if (*name) forms_.push_back({name, block_, characters_, std::move(word)});
}

void MarkdownText::appendLines(const char* name, std::string_view lines) {
  beginBlock();
  while (lines.ends_with('\n')) lines.remove_suffix(1);
  const std::size_t first = characters_ + charactersIn(lines.substr(0, lines.find('\n')));
  const std::size_t last = characters_ + charactersIn(lines.substr(0, lines.rfind('\n') + 1));
  append(lines.empty() ? " " : lines);
  endBlock(name);
  forms_.push_back({"first", block_, first, ""});
  forms_.push_back({"last", last, characters_, ""});
}

void MarkdownText::appendHtml(std::string_view html) {
  const std::string text = textOfHtml(html);
  if (text.empty()) return;
  beginBlock();
  append(text);
  endBlock("");
}

bool MarkdownText::appendTable(cmark_node* paragraph) {
  const auto first = static_cast<std::size_t>(std::max(cmark_node_get_start_line(paragraph), 1));
  const auto end = static_cast<std::size_t>(std::max(cmark_node_get_end_line(paragraph), 0));
  if (end > sourceLines_.size() || first >= end) return false;
  const auto column = static_cast<std::size_t>(std::max(cmark_node_get_start_column(paragraph) - 1, 0));
  std::vector<std::string_view> lines;
  for (std::size_t line = first - 1; line < end; ++line) {
    const std::string_view text = sourceLines_[line];
    // What stands before it belongs to the list or the quote that it is in.
    const std::size_t before = line == first - 1 ? column : std::min(text.find_first_not_of(" \t>"), column);
    lines.push_back(text.substr(std::min(before, text.size())));
  }
  const std::string table = markdownTable(lines);
  if (table.empty()) return false;
  appendLines("table", table);
  return true;
}

void MarkdownText::enter(cmark_node* node, cmark_iter* iter) {
  switch (cmark_node_get_type(node)) {
    case CMARK_NODE_BLOCK_QUOTE:
      ++quotes_;
      return;
    case CMARK_NODE_LIST:
      lists_.push_back({cmark_node_get_list_type(node) == CMARK_ORDERED_LIST, cmark_node_get_list_start(node)});
      return;
    case CMARK_NODE_ITEM:
      marker_ += lists_.back().ordered ? std::to_string(lists_.back().number++) + "."
                                       : std::string(Bullets[std::min(lists_.size(), Bullets.size()) - 1]);
      marker_ += '\t';
      return;
    case CMARK_NODE_PARAGRAPH:
      // Without what is inside, and without leaving it.
      if (appendTable(node)) return cmark_iter_reset(iter, node, CMARK_EVENT_EXIT);
      return beginBlock();
    case CMARK_NODE_HEADING:
      return beginBlock();
    case CMARK_NODE_CODE_BLOCK:
      return appendLines("code", orEmpty(cmark_node_get_literal(node)));
    case CMARK_NODE_HTML_BLOCK:
      return appendHtml(orEmpty(cmark_node_get_literal(node)));
    case CMARK_NODE_THEMATIC_BREAK:
      beginBlock();
      append("\u200b");
      return endBlock("rule");
    case CMARK_NODE_TEXT:
      return append(orEmpty(cmark_node_get_literal(node)));
    case CMARK_NODE_CODE: {
      const std::size_t begin = characters_;
      append(orEmpty(cmark_node_get_literal(node)));
      forms_.push_back({"literal", begin, characters_, ""});
      return;
    }
    case CMARK_NODE_SOFTBREAK:
      return append(" ");
    case CMARK_NODE_LINEBREAK:
      return append(LineInParagraph);
    case CMARK_NODE_HTML_INLINE:
      if (orEmpty(cmark_node_get_literal(node)).starts_with("<br")) append(LineInParagraph);
      return;
    case CMARK_NODE_EMPH:
    case CMARK_NODE_STRONG:
    case CMARK_NODE_LINK:
    case CMARK_NODE_IMAGE:
      opened_.push_back(characters_);
      return;
    default:
      return;
  }
}

void MarkdownText::leave(cmark_node* node) {
  const cmark_node_type type = cmark_node_get_type(node);
  const auto end = [this](const char* name, std::string word = "") {
    const std::size_t begin = opened_.back();
    opened_.pop_back();
    if (begin < characters_) forms_.push_back({name, begin, characters_, std::move(word)});
  };
  switch (type) {
    case CMARK_NODE_BLOCK_QUOTE:
      --quotes_;
      return;
    case CMARK_NODE_LIST:
      lists_.pop_back();
      return;
    case CMARK_NODE_ITEM:
      if (marker_.empty()) return;
      beginBlock();
      return endBlock("");
    case CMARK_NODE_PARAGRAPH:
      tickBox();
      return endBlock("");
    case CMARK_NODE_HEADING:
      return endBlock("heading", std::to_string(cmark_node_get_heading_level(node)));
    case CMARK_NODE_EMPH:
      return end("emphasis");
    case CMARK_NODE_STRONG:
      return end("strong");
    case CMARK_NODE_LINK:
      return end("link", withoutControls(orEmpty(cmark_node_get_url(node))));
    case CMARK_NODE_IMAGE:
      if (opened_.back() == characters_) append(withoutControls(lastComponent(orEmpty(cmark_node_get_url(node)))));
      return end("picture");
    default:
      return;
  }
}

}  // namespace vaelo
