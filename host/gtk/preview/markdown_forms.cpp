// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/markdown_forms.h"

#include <unicode/uchar.h>

#include <algorithm>
#include <charconv>

#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr int LevelWidth = 28;
constexpr int MostLevels = 12;
constexpr double HeadingScales[] = {1.8, 1.45, 1.2, 1.08, 1, 1};
constexpr int MostHeadings = 6;
constexpr int CodePadding = 8;

int numberIn(std::string_view word, int least, int most) {
  int number = least;
  std::from_chars(word.data(), word.data() + word.size(), number);
  return std::clamp(number, least, most);
}

// By the first letter that has a direction, as a paragraph is laid out.
bool isFromRight(const GtkTextIter& from, const GtkTextIter& to) {
  const std::string text = takeString(gtk_text_iter_get_text(&from, &to));
  for (const char* place = text.c_str(); *place; place = g_utf8_next_char(place)) {
    const UCharDirection direction = u_charDirection(static_cast<UChar32>(g_utf8_get_char(place)));
    if (direction == U_LEFT_TO_RIGHT) return false;
    if (direction == U_RIGHT_TO_LEFT || direction == U_RIGHT_TO_LEFT_ARABIC) return true;
  }
  return gtk_widget_get_default_direction() == GTK_TEXT_DIR_RTL;
}

struct Colours {
  const char* heading;
  const char* link;
  const char* dim;
  const char* code;
  const char* rule;
};

constexpr Colours Light = {"#241f31", "#1a5fb4", "#5e5c64", "#f0eff1", "#d5d3d7"};
constexpr Colours Dark = {"#ffffff", "#78aeed", "#b0aeb5", "#343437", "#4a4a4e"};

}  // namespace

MarkdownForms::MarkdownForms(GtkTextBuffer* buffer) : buffer_(buffer) {
  const auto make = [buffer](const char* name, auto... properties) {
    gtk_text_buffer_create_tag(buffer, name, properties..., nullptr);
  };
  // The later ones go before.
  make("quote", "style", PANGO_STYLE_ITALIC);
  for (int heading = 1; heading <= MostHeadings; ++heading) {
    make(("heading" + std::to_string(heading)).c_str(), "weight", PANGO_WEIGHT_BOLD, "scale", HeadingScales[heading - 1],
         "pixels-above-lines", heading < 3 ? 18 : 12, "pixels-below-lines", 4);
  }
  make("code", "family", "monospace", "scale", 0.94, "indent", CodePadding, "pixels-above-lines", 0, "pixels-below-lines",
       0);
  make("table", "family", "monospace", "scale", 0.94, "wrap-mode", GTK_WRAP_NONE, "pixels-above-lines", 0,
       "pixels-below-lines", 0);
  make("first", "pixels-above-lines", CodePadding);
  make("last", "pixels-below-lines", CodePadding);
  make("rule", "size-points", 1.0, "pixels-above-lines", 0, "pixels-below-lines", 0);
  make("strong", "weight", PANGO_WEIGHT_BOLD);
  make("emphasis", "style", PANGO_STYLE_ITALIC);
  make("literal", "family", "monospace", "scale", 0.94);
  make("picture", "style", PANGO_STYLE_ITALIC);
  make("link", "underline", PANGO_UNDERLINE_SINGLE);
  setDark(false);
}

GtkTextTag* MarkdownForms::tag(const std::string& name) const {
  return gtk_text_tag_table_lookup(gtk_text_buffer_get_tag_table(buffer_), name.c_str());
}

void MarkdownForms::setDark(bool dark) {
  const Colours& colours = dark ? Dark : Light;
  g_object_set(tag("link"), "foreground", colours.link, nullptr);
  for (const char* name : {"quote", "picture"}) g_object_set(tag(name), "foreground", colours.dim, nullptr);
  for (int heading = 1; heading <= MostHeadings; ++heading) {
    g_object_set(tag("heading" + std::to_string(heading)), "foreground", colours.heading, nullptr);
  }
  g_object_set(tag("code"), "paragraph-background", colours.code, nullptr);
  g_object_set(tag("literal"), "background", colours.code, nullptr);
  g_object_set(tag("rule"), "paragraph-background", colours.rule, nullptr);
}

// An item's bullet hangs before its text.
GtkTextTag* MarkdownForms::levelTag(const char* form, int level, bool fromRight) {
  const std::string name = form + std::to_string(level) + (fromRight ? "r" : "");
  if (GtkTextTag* found = tag(name)) return found;
  const bool hangs = std::string_view(form) == "item";
  const int margin = LevelWidth * (hangs ? std::max(level - 1, 0) : level);
  GtkTextTag* made = gtk_text_buffer_create_tag(buffer_, name.c_str(), "accumulative-margin", TRUE,
                                                fromRight ? "right-margin" : "left-margin", margin, nullptr);
  if (hangs) {
    PangoTabArray* tabs = pango_tab_array_new_with_positions(1, TRUE, PANGO_TAB_LEFT, LevelWidth);
    g_object_set(made, "indent", -LevelWidth, "tabs", tabs, "pixels-above-lines", 2, "pixels-below-lines", 2, nullptr);
    pango_tab_array_free(tabs);
  }
  gtk_text_tag_set_priority(made, 0);
  return made;
}

void MarkdownForms::apply(std::string_view form, int first, int end, std::string_view word) {
  GtkTextIter from;
  GtkTextIter to;
  gtk_text_buffer_get_iter_at_offset(buffer_, &from, first);
  gtk_text_buffer_get_iter_at_offset(buffer_, &to, end);
  GtkTextTag* applied = nullptr;
  if (form == "item" || form == "paragraph") {
    const int level = numberIn(word, 0, MostLevels);
    if (level > 0) applied = levelTag(form == "item" ? "item" : "paragraph", level, isFromRight(from, to));
  } else if (form == "heading") {
    applied = tag("heading" + std::to_string(numberIn(word, 1, MostHeadings)));
  } else {
    applied = tag(std::string(form));
  }
  if (applied) gtk_text_buffer_apply_tag(buffer_, applied, &from, &to);
}

}  // namespace vaelo
