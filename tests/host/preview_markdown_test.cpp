// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtksourceview/gtksource.h>

#include <algorithm>

#include "host/gtk/preview/markdown_links.h"
#include "host/gtk/preview/markdown_load.h"
#include "tests/host/preview_view_test.h"

namespace vaelo {
namespace {

using list_test::waitUntil;

class PreviewMarkdownTest : public preview_test::PreviewViewTest {
 protected:
  void openMarkdown(const std::string& source, const std::string& name = "a.md") {
    folder_.write(name, source);
    open(name, "text/markdown");
    ASSERT_EQ(failure_, "");
  }
  GtkTextBuffer* buffer() { return gtk_text_view_get_buffer(GTK_TEXT_VIEW(findIn(shownPage(), GTK_TYPE_TEXT_VIEW))); }
  GtkWidget* shownPage() { return gtk_stack_get_visible_child(GTK_STACK(view_->widget())); }
  std::string text() {
    GtkTextIter begin;
    GtkTextIter end;
    gtk_text_buffer_get_bounds(buffer(), &begin, &end);
    return takeString(gtk_text_buffer_get_text(buffer(), &begin, &end, TRUE));
  }
  /// The names of the forms that the first place with this text has, sorted.
  std::string formsOf(const std::string& words) {
    GtkTextIter begin;
    GtkTextIter end;
    gtk_text_buffer_get_start_iter(buffer(), &begin);
    if (!gtk_text_iter_forward_search(&begin, words.c_str(), GTK_TEXT_SEARCH_TEXT_ONLY, &begin, &end, nullptr))
      return "not there";
    std::vector<std::string> names;
    GSList* tags = gtk_text_iter_get_tags(&begin);
    for (GSList* tag = tags; tag; tag = tag->next) {
      char* name = nullptr;
      g_object_get(tag->data, "name", &name, nullptr);
      if (name) names.push_back(takeString(name));
    }
    g_slist_free(tags);
    std::sort(names.begin(), names.end());
    std::string all;
    for (const std::string& name : names) all += (all.empty() ? "" : " ") + name;
    return all;
  }
  GtkToggleButton* sourceSwitch(const std::vector<GtkWidget*>& widgets) {
    for (GtkWidget* widget : widgets) {
      if (GTK_IS_TOGGLE_BUTTON(widget)) return GTK_TOGGLE_BUTTON(widget);
    }
    return nullptr;
  }
};

TEST_F(PreviewMarkdownTest, IsShownAsItIsMeant) {
  openMarkdown(
      "# Title *slanted*\n\nSome **strong** and `literal` words\nin two lines.\n\n"
      "Second\n------\n\n> Quoted\n\n```sh\nrun this\nand that\n```\n\n* * *\n\n![A cat](http://127.0.0.1:9/cat.png)\n");
  EXPECT_EQ(text(),
            "Title slanted\nSome strong and literal words in two lines.\nSecond\nQuoted\nrun this\nand that\n\u200b\nA cat");
  EXPECT_EQ(formsOf("Title"), "heading1");
  EXPECT_EQ(formsOf("slanted"), "emphasis heading1");
  EXPECT_EQ(formsOf("strong"), "strong");
  EXPECT_EQ(formsOf("literal"), "literal");
  EXPECT_EQ(formsOf("Some "), "");
  EXPECT_EQ(formsOf("Second"), "heading2");
  EXPECT_EQ(formsOf("Quoted"), "paragraph1 quote");
  EXPECT_EQ(formsOf("run this"), "code first");
  EXPECT_EQ(formsOf("and that"), "code last");
  EXPECT_EQ(formsOf("\u200b"), "rule");
  EXPECT_EQ(formsOf("A cat"), "picture");
}

TEST_F(PreviewMarkdownTest, ListsHangAndNest) {
  openMarkdown("- one\n- two\n  1. first\n  2. second\n\n     more of it\n- [ ] to do **now**\n- [x] done\n-\n");
  EXPECT_EQ(text(), "•\tone\n•\ttwo\n1.\tfirst\n2.\tsecond\nmore of it\n☐\tto do now\n☑\tdone\n•\t");
  EXPECT_EQ(formsOf("one"), "item1");
  EXPECT_EQ(formsOf("first"), "item2");
  EXPECT_EQ(formsOf("more of it"), "paragraph2");
  EXPECT_EQ(formsOf("now"), "item1 strong");
  EXPECT_EQ(formsOf("to do "), "item1");
}

TEST_F(PreviewMarkdownTest, WhatIsReadFromTheRightIsMovedInFromThere) {
  openMarkdown("> ציטוט\n\n- אחת\n");
  EXPECT_EQ(formsOf("ציטוט"), "paragraph1r quote");
  EXPECT_EQ(formsOf("אחת"), "item1r");
}

TEST_F(PreviewMarkdownTest, TablesStandInColumns) {
  openMarkdown("| Name | Number |\n|:-----|-------:|\n| **Ada** | 1 |\n| 東京 | 1000 |\n\nAfter | it\n");
  EXPECT_EQ(text(), "Name │ Number\n─────┼───────\nAda  │      1\n東京 │   1000\nAfter | it");
  EXPECT_EQ(formsOf("Ada"), "table");
  EXPECT_EQ(formsOf("After"), "");
}

TEST_F(PreviewMarkdownTest, SettingsAtTheBeginningAreNoHeading) {
  openMarkdown("---\ntitle: x\n---\n# Title\n");
  EXPECT_EQ(text(), "title: x\nTitle");
  EXPECT_EQ(formsOf("title: x"), "code first last");
}

TEST_F(PreviewMarkdownTest, OfMarkupTheTextIsShown) {
  openMarkdown("One<br>two <b>bold</b><!-- hidden -->\n\n<div onclick=\"x()\">\nInside\n</div>\n\n<!-- a\ncomment -->\n");
  EXPECT_EQ(text(), "One\u2028two bold\nInside");
}

TEST_F(PreviewMarkdownTest, LatinOneAndSmileysAreRead) {
  openMarkdown(
      "Gr\xfc\xdf"
      "e");
  EXPECT_EQ(text(), "Grüße");
  openMarkdown("😀 **stark** 日本\n");
  EXPECT_EQ(formsOf("stark"), "strong");
  EXPECT_EQ(formsOf(" 日"), "");
}

TEST_F(PreviewMarkdownTest, LinksKnowTheirAddress) {
  folder_.write("a.md", "[page](https://example.org/a?b#c) and <mailto:a@example.org> and [bad](javascript:x)\n");
  bool begun = false;
  MarkdownLoad load(pathOf("a.md"), {[&] { begun = true; }, [](const std::string&) {}});
  ASSERT_TRUE(waitUntil([&] { return begun && load.finished(); }));
  ASSERT_EQ(load.links().size(), 3U);
  EXPECT_EQ(load.links()[0].begin, 0);
  EXPECT_EQ(load.links()[0].end, 4);
  EXPECT_EQ(load.links()[0].address, "https://example.org/a?b#c");
  EXPECT_EQ(load.links()[1].address, "mailto:a@example.org");
}

TEST_F(PreviewMarkdownTest, OnlyPagesAndMailAreOpened) {
  EXPECT_TRUE(MarkdownLinks::isOpenable("https://example.org"));
  EXPECT_TRUE(MarkdownLinks::isOpenable("HTTP://example.org"));
  EXPECT_TRUE(MarkdownLinks::isOpenable("mailto:a@example.org"));
  for (const char* address : {"javascript:x", "file:///etc/passwd", "vaelodriveapp:x", "other.md", "#place", "", "//host"}) {
    EXPECT_FALSE(MarkdownLinks::isOpenable(address)) << address;
  }
  std::vector<std::string> opened;
  std::vector<MarkdownLink> links = {{0, 1, "https://example.org"}, {1, 2, "file:///x"}};
  GtkWidget* view = GTK_WIDGET(g_object_ref_sink(gtk_text_view_new()));
  {
    MarkdownLinks tested(
        GTK_TEXT_VIEW(view), [&]() -> const std::vector<MarkdownLink>& { return links; },
        [&](const std::string& address) { opened.push_back(address); });
    for (const MarkdownLink& link : links) tested.activate(link);
  }
  g_object_unref(view);
  EXPECT_EQ(opened, std::vector<std::string>{"https://example.org"});
}

TEST_F(PreviewMarkdownTest, TheSourceIsAButtonAway) {
  openMarkdown("# Title\n");
  const std::vector<GtkWidget*> widgets = view_->headerWidgets();
  for (GtkWidget* widget : widgets) g_object_ref_sink(widget);
  GtkToggleButton* source = sourceSwitch(widgets);
  ASSERT_NE(source, nullptr);
  gtk_toggle_button_set_active(source, TRUE);
  EXPECT_TRUE(waitUntil([this] { return text() == "# Title\n"; }));
  gtk_toggle_button_set_active(source, FALSE);
  EXPECT_EQ(text(), "Title");
  for (GtkWidget* widget : widgets) g_object_unref(widget);
}

TEST_F(PreviewMarkdownTest, WhatIsTooLongIsShownAsText) {
  openMarkdown(std::string(1'100'000, 'x') + "\n");
  EXPECT_NE(findIn(shownPage(), GTK_SOURCE_TYPE_VIEW), nullptr);
  EXPECT_EQ(text().substr(0, 4), "xxxx");
  openMarkdown(std::string(50'000, 'y') + "\n");
  EXPECT_EQ(text().substr(0, 4), "yyyy");
  EXPECT_EQ(sourceSwitch(view_->headerWidgets()), nullptr) << "there is nothing to switch to";
}

TEST_F(PreviewMarkdownTest, WhatIsInvolvedIsShownInTheEnd) {
  openMarkdown(std::string(100'000, '>') + "x\n");
  openMarkdown(std::string(100'000, '[') + "](x)\n");
  openMarkdown(std::string(200'000, '*') + "x\n");
  std::string lists;
  for (int i = 0; i < 700; ++i) lists += std::string(static_cast<std::size_t>(i), ' ') + "- x\n";
  openMarkdown(lists);
}

TEST_F(PreviewMarkdownTest, ALongDocumentIsShownBeforeAllOfItIsThere) {
  std::string source;
  for (int i = 0; i < 3000; ++i) source += "## Part " + std::to_string(i) + "\n\nSome **strong** text of it.\n\n";
  openMarkdown(source);
  EXPECT_EQ(formsOf("Part 0"), "heading2");
  ASSERT_TRUE(
      waitUntil([this] { return text().ends_with("Some strong text of it.") && formsOf("Part 2999") == "heading2"; }));
}

TEST_F(PreviewMarkdownTest, EmptyMissingAndBinaryDocumentsSaySo) {
  openMarkdown("");
  EXPECT_NE(labelsIn(view_->widget()).find("This document is empty."), std::string::npos);
  open("gone.md", "text/markdown");
  EXPECT_EQ(failure_, "This document is no longer there.");
  folder_.write("b.md", std::string(4096, '\0'));
  open("b.md", "text/markdown");
  EXPECT_EQ(failure_, "This document’s name says text, but its content isn’t.");
}

TEST_F(PreviewMarkdownTest, ADocumentThatChangedIsReadAnew) {
  openMarkdown("before\n");
  folder_.write("a.md", "after\n");
  view_->refresh();
  EXPECT_TRUE(waitUntil([this] { return text() == "after"; }));
}

TEST_F(PreviewMarkdownTest, LeavingWhileItLoadsIsHarmless) {
  folder_.write("a.md", std::string(500'000, 'x'));
  for (int i = 0; i < 10; ++i) begin("a.md", "text/markdown");
  openMarkdown("x");
}

}  // namespace
}  // namespace vaelo
