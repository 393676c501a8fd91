// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/markdown_table.h"

#include <cmark.h>
#include <glib.h>

#include <algorithm>
#include <memory>

namespace vaelo {

namespace {

constexpr std::size_t MostCells = 5000;
constexpr std::size_t MostColumns = 40;
constexpr std::size_t WidestColumn = 80;  // which others are made as wide as

enum class Side { Start, Middle, End };

std::string_view trimmed(std::string_view text) {
  constexpr std::string_view blanks = " \t\r";
  const std::size_t begin = std::min(text.find_first_not_of(blanks), text.size());
  text.remove_prefix(begin);
  const std::size_t last = text.find_last_not_of(blanks);
  return text.substr(0, last == std::string_view::npos ? 0 : last + 1);
}

std::vector<std::string> cellsOf(std::string_view line) {
  line = trimmed(line);
  if (line.starts_with('|')) line.remove_prefix(1);
  if (line.ends_with('|') && !line.ends_with("\\|")) line.remove_suffix(1);
  std::vector<std::string> cells(1);
  for (std::size_t i = 0; i < line.size(); ++i) {
    if (line[i] == '\\' && i + 1 < line.size() && line[i + 1] == '|') {
      cells.back() += line[++i];
    } else if (line[i] == '|') {
      cells.emplace_back();
    } else {
      cells.back() += line[i];
    }
  }
  for (std::string& cell : cells) cell = std::string(trimmed(cell));
  return cells;
}

bool isDivider(const std::vector<std::string>& cells) {
  return std::all_of(cells.begin(), cells.end(), [](const std::string& cell) {
    return cell.find('-') != std::string::npos && cell.find_first_not_of("-:") == std::string::npos;
  });
}

Side sideOf(const std::string& divider) {
  const bool atEnd = divider.ends_with(':');
  if (atEnd && divider.starts_with(':')) return Side::Middle;
  return atEnd ? Side::End : Side::Start;
}

// A cell without the signs of its forms, which columns of letters of one width can't show.
std::string plainText(const std::string& cell) {
  const std::unique_ptr<cmark_node, decltype(&cmark_node_free)> document(
      cmark_parse_document(cell.data(), cell.size(), CMARK_OPT_DEFAULT), cmark_node_free);
  const std::unique_ptr<cmark_iter, decltype(&cmark_iter_free)> iter(cmark_iter_new(document.get()), cmark_iter_free);
  std::string text;
  for (cmark_event_type event = cmark_iter_next(iter.get()); event != CMARK_EVENT_DONE;
       event = cmark_iter_next(iter.get())) {
    const cmark_node_type type = cmark_node_get_type(cmark_iter_get_node(iter.get()));
    if (event != CMARK_EVENT_ENTER || (type != CMARK_NODE_TEXT && type != CMARK_NODE_CODE)) continue;
    text += cmark_node_get_literal(cmark_iter_get_node(iter.get()));
  }
  return text;
}

std::size_t widthOf(const std::string& text) {
  std::size_t width = 0;
  for (const char* place = text.c_str(); *place; place = g_utf8_next_char(place)) {
    const gunichar character = g_utf8_get_char(place);
    if (!g_unichar_iszerowidth(character)) width += g_unichar_iswide(character) ? 2 : 1;
  }
  return width;
}

std::string padded(const std::string& text, std::size_t width, Side side) {
  const std::size_t blanks = width - std::min(width, widthOf(text));
  const std::size_t before = side == Side::Start ? 0 : side == Side::End ? blanks : blanks / 2;
  return std::string(before, ' ') + text + std::string(blanks - before, ' ');
}

}  // namespace

std::string markdownTable(const std::vector<std::string_view>& lines) {
  if (lines.size() < 2 || lines[0].find('|') == std::string_view::npos) return "";
  const std::vector<std::string> dividers = cellsOf(lines[1]);
  const std::size_t columns = dividers.size();
  if (!isDivider(dividers) || columns > MostColumns || columns * lines.size() > MostCells ||
      cellsOf(lines[0]).size() != columns) {
    return "";
  }
  std::vector<std::vector<std::string>> rows;
  std::vector<std::size_t> widths(columns, 1);
  for (std::size_t line = 0; line < lines.size(); ++line) {
    if (line == 1) continue;
    std::vector<std::string>& row = rows.emplace_back(cellsOf(lines[line]));
    row.resize(columns);
    for (std::size_t column = 0; column < columns; ++column) {
      row[column] = plainText(row[column]);
      widths[column] = std::max(widths[column], std::min(widthOf(row[column]), WidestColumn));
    }
  }
  std::string table;
  for (std::size_t row = 0; row < rows.size(); ++row) {
    for (std::size_t column = 0; column < columns; ++column) {
      table += (column ? " │ " : "") + padded(rows[row][column], widths[column], sideOf(dividers[column]));
    }
    table += '\n';
    if (row > 0) continue;
    for (std::size_t column = 0; column < columns; ++column) {
      table += column ? "─┼─" : "";
      for (std::size_t i = 0; i < widths[column]; ++i) table += "─";
    }
    table += '\n';
  }
  return table;
}

}  // namespace vaelo
