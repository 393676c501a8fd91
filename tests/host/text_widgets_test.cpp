// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_widgets.h"

#include <gtest/gtest.h>

#include "host/gtk/preview/text_languages.h"

namespace vaelo {

namespace {

class TextWidgets : public testing::Test {
 protected:
  void SetUp() override {
    if (!gtk_init_check()) GTEST_SKIP() << "no display";
  }
  static GtkTextBuffer* write(const GRef<GtkSourceBuffer>& buffer, const char* text) {
    gtk_text_buffer_set_text(GTK_TEXT_BUFFER(buffer.get()), text, -1);
    return GTK_TEXT_BUFFER(buffer.get());
  }
  static guint tagsIn(const GRef<GtkSourceBuffer>& buffer) {
    return gtk_text_tag_table_get_size(gtk_text_buffer_get_tag_table(GTK_TEXT_BUFFER(buffer.get())));
  }
  /// Ends it, and answers whether the next one is the same.
  static bool isUsedAgain(GRef<GtkSourceBuffer> buffer) {
    constexpr const char* known = "known";  // an address may be another one's by then
    g_object_set_data(G_OBJECT(buffer.get()), known, GINT_TO_POINTER(1));
    endTextBuffer(std::move(buffer));
    while (g_main_context_iteration(nullptr, FALSE)) continue;
    const GRef<GtkSourceBuffer> next = takeTextBuffer();
    EXPECT_EQ(gtk_text_buffer_get_char_count(GTK_TEXT_BUFFER(next.get())), 0);
    EXPECT_EQ(gtk_source_buffer_get_language(next.get()), nullptr);
    EXPECT_EQ(tagsIn(next), 0U);
    EXPECT_FALSE(gtk_text_buffer_get_enable_undo(GTK_TEXT_BUFFER(next.get())));
    EXPECT_FALSE(gtk_source_buffer_get_highlight_matching_brackets(next.get()));
    return g_object_steal_data(G_OBJECT(next.get()), known) != nullptr;
  }
};

TEST_F(TextWidgets, ABufferIsUsedAgainAsIfItWereNew) {
  GRef<GtkSourceBuffer> buffer = takeTextBuffer();
  gtk_source_buffer_set_language(buffer.get(), gtk_source_language_manager_get_language(textLanguages(), "cpp"));
  write(buffer, "int main() { return 0; }  // a word\n");
  GtkTextIter begin;
  GtkTextIter end;
  gtk_text_buffer_get_bounds(GTK_TEXT_BUFFER(buffer.get()), &begin, &end);
  gtk_source_buffer_ensure_highlight(buffer.get(), &begin, &end);
  EXPECT_GT(tagsIn(buffer), 0U);
  EXPECT_TRUE(isUsedAgain(std::move(buffer)));
}

TEST_F(TextWidgets, ADocumentsOwnTagsGo) {
  GRef<GtkSourceBuffer> buffer = takeTextBuffer();
  gtk_text_buffer_create_tag(write(buffer, "Heading"), "heading", "weight", PANGO_WEIGHT_BOLD, nullptr);
  EXPECT_TRUE(isUsedAgain(std::move(buffer)));
}

TEST_F(TextWidgets, ABufferThatWasSearchedIsUsedAgain) {
  GRef<GtkSourceBuffer> buffer = takeTextBuffer();
  write(buffer, "a word and a word");
  {
    const GRef<GtkSourceSearchSettings> settings(gtk_source_search_settings_new());
    const GRef<GtkSourceSearchContext> context(gtk_source_search_context_new(buffer.get(), settings.get()));
    gtk_source_search_settings_set_search_text(settings.get(), "word");
    while (g_main_context_iteration(nullptr, FALSE)) continue;
    EXPECT_EQ(gtk_source_search_context_get_occurrences_count(context.get()), 2);
  }
  EXPECT_TRUE(isUsedAgain(std::move(buffer)));
}

TEST_F(TextWidgets, WhatSomethingHoldsOrMarksIsNotUsedAgain) {
  const GRef<GtkSourceBuffer> spares[] = {takeTextBuffer(), takeTextBuffer(), takeTextBuffer(), takeTextBuffer()};
  GRef<GtkSourceBuffer> held = takeTextBuffer();
  const GRef<GtkSourceBuffer> holder(GTK_SOURCE_BUFFER(g_object_ref(held.get())));
  EXPECT_FALSE(isUsedAgain(std::move(held)));
  GRef<GtkSourceBuffer> marked = takeTextBuffer();
  gtk_text_buffer_create_tag(write(marked, "Heading"), nullptr, "weight", PANGO_WEIGHT_BOLD, nullptr);
  EXPECT_FALSE(isUsedAgain(std::move(marked)));
}

TEST_F(TextWidgets, ViewsShareTheEmptyBufferTheyBeginWith) {
  const GRef<GtkWidget> first(GTK_WIDGET(g_object_ref_sink(makeTextWidget())));
  const GRef<GtkWidget> second(GTK_WIDGET(g_object_ref_sink(makeTextWidget())));
  EXPECT_EQ(gtk_text_view_get_buffer(GTK_TEXT_VIEW(first.get())), gtk_text_view_get_buffer(GTK_TEXT_VIEW(second.get())));
}

}  // namespace

}  // namespace vaelo
