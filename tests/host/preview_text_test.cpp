// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "host/gtk/preview/text_decoding.h"
#include "host/gtk/preview/text_languages.h"
#include "host/gtk/preview/text_lines.h"
#include "host/gtk/preview/text_load.h"
#include "host/support/decoder_error.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

using list_test::TestFolder;
using list_test::waitUntil;

std::string decoded(std::string_view bytes) { return TextDecoding().decode(bytes, true); }

TEST(TextDecodingTest, TellsTheEncodings) {
  EXPECT_EQ(decoded("Gr\xc3\xbc\xc3\x9f"), "Grüß");
  EXPECT_EQ(decoded("Gr\xfc\xdf"), "Grüß") << "Latin-1";
  EXPECT_EQ(decoded("\x80"), "€") << "in the form that Windows wrote";
  EXPECT_EQ(decoded("\xef\xbb\xbfGr\xc3\xbc"), "Grü") << "the mark is no text";
  EXPECT_EQ(decoded(std::string_view("\xff\xfeG\0\xfc\0", 6)), "Gü");
  EXPECT_EQ(decoded(std::string_view("\xfe\xff\0G\0\xfc", 6)), "Gü");
  EXPECT_EQ(decoded(""), "");
}

TEST(TextDecodingTest, PiecesMayCutCharacters) {
  TextDecoding decoding;
  std::string text = decoding.decode("\xc3", false);
  text += decoding.decode("\xbc and \xe2\x82", false);
  text += decoding.decode("\xac", true);
  EXPECT_EQ(text, "ü and €");
}

TEST(TextDecodingTest, WhatCannotBeReadIsReplaced) {
  TextDecoding decoding;
  std::string text = decoding.decode("\xc3\xbc", false);
  text += decoding.decode("\xff!", true);
  EXPECT_EQ(text, "ü\xef\xbf\xbd!");
  const std::string withNul = decoded(std::string_view("a\0b", 3));
  EXPECT_EQ(withNul.find('\0'), std::string::npos);
  EXPECT_TRUE(g_utf8_validate(withNul.data(), static_cast<gssize>(withNul.size()), nullptr));
}

TEST(TextDecodingTest, TellsTextFromBytes) {
  EXPECT_FALSE(TextDecoding::isBinary("A line.\nAnother.\n"));
  EXPECT_FALSE(TextDecoding::isBinary("Gr\xfc\xdf"));
  EXPECT_TRUE(
      TextDecoding::isBinary(std::string_view("\x7f"
                                              "ELF\2\1\1\0\0\0\0\0\0\0\0\0\3\0>\0\1\0\0\0",
                                              24)));
}

TEST(TextLinesTest, EndsOfLinesBecomeNewlinesAndLongLinesGoOn) {
  TextLines lines(4, 100);
  EXPECT_EQ(lines.arrange("a\r\nb\rc\n"), "a\nb\nc\n");
  EXPECT_FALSE(lines.brokeLines());
  EXPECT_EQ(lines.arrange("abcdefgh"), "abcd\nefgh");
  EXPECT_TRUE(lines.brokeLines());
}

TEST(TextLinesTest, ThereIsAMostOfLines) {
  TextLines lines(100, 3);
  EXPECT_EQ(lines.arrange("1\n2\n3\n4\n5\n"), "1\n2\n3\n");
  EXPECT_TRUE(lines.isFull());
}

TEST(TextLinesTest, TheLongestLineIsKnown) {
  TextLines lines(10, 100);
  lines.arrange("ab\nabc");
  EXPECT_EQ(lines.longestLine(), 3U);
  lines.arrange("de\nü\n");
  EXPECT_EQ(lines.longestLine(), 5U) << "it goes on in the next piece";
  lines.arrange("abcdefghijklmno");
  EXPECT_EQ(lines.longestLine(), 10U);
}

class TextLoadTest : public testing::Test {
 protected:
  void SetUp() override {
    if (!gtk_init_check()) GTEST_SKIP() << "no display";
  }
  void load(const std::string& name, const std::string& content) {
    folder_.write(name, content);
    TextLoad::Events events;
    events.advanced = [this] { ++advanced_; };
    events.failed = [this](const std::string& error) { failure_ = error; };
    load_ = std::make_unique<TextLoad>(folder_.path() + "/" + name, name, "text/plain", std::move(events));
  }
  std::string text() {
    GtkTextIter start;
    GtkTextIter end;
    gtk_text_buffer_get_bounds(GTK_TEXT_BUFFER(load_->buffer()), &start, &end);
    char* all = gtk_text_buffer_get_text(GTK_TEXT_BUFFER(load_->buffer()), &start, &end, TRUE);
    std::string result = all;
    g_free(all);
    return result;
  }

  TestFolder folder_;
  std::unique_ptr<TextLoad> load_;
  int advanced_ = 0;
  std::string failure_;
};

TEST_F(TextLoadTest, ADocumentFillsTheBuffer) {
  load("a.txt", "One\nTwo\n");
  ASSERT_TRUE(waitUntil([this] { return load_->finished(); }));
  EXPECT_EQ(text(), "One\nTwo\n");
  EXPECT_GE(advanced_, 1);
  EXPECT_EQ(failure_, "");
}

TEST_F(TextLoadTest, ALongDocumentIsThereWholeAndItsBeginningFirst) {
  std::string content;
  for (int i = 0; i < 200'000; ++i) content += "A line of a long document.\n";
  load("long.txt", content);
  ASSERT_TRUE(waitUntil([this] { return advanced_ > 0; }));
  EXPECT_FALSE(load_->finished()) << "the first screen comes before the rest";
  ASSERT_TRUE(waitUntil([this] { return load_->finished(); }));
  EXPECT_EQ(text().size(), content.size());
}

TEST_F(TextLoadTest, BytesThatAreNoTextFail) {
  std::string bytes(4096, '\0');
  for (std::size_t i = 0; i < bytes.size(); ++i) bytes[i] = static_cast<char>(i * 37 % 251);
  load("b.txt", bytes);
  ASSERT_TRUE(waitUntil([this] { return !failure_.empty(); }));
}

TEST_F(TextLoadTest, AMissingDocumentFails) {
  TextLoad::Events events;
  events.advanced = [] {};
  events.failed = [this](const std::string& error) { failure_ = error; };
  load_ = std::make_unique<TextLoad>(folder_.path() + "/gone.txt", "gone.txt", "text/plain", std::move(events));
  ASSERT_TRUE(waitUntil([this] { return !failure_.empty(); }));
}

TEST_F(TextLoadTest, WhereTheFileWasNeverWrittenTheTextEnds) {
  std::string content;
  while (content.size() < 100'000) content += "A line of the log\n";
  load("hole.txt", content + std::string((3U << 20) - content.size(), '\0'));
  ASSERT_TRUE(waitUntil([this] { return load_->finished(); }));
  EXPECT_EQ(text(), content);
  EXPECT_TRUE(load_->progress().shortened);
  EXPECT_EQ(load_->progress().bytesRead, content.size());
  EXPECT_EQ(load_->progress().documentBytes, 3U << 20);
}

TEST_F(TextLoadTest, SourceIsAnalysedUnlessItsLinesAreLong) {
  const auto isAnalysed = [this] { return gtk_source_buffer_get_language(load_->buffer()) != nullptr; };
  const std::string usual = "function add(a, b) { return a + b; }\n";
  std::string many;
  while (many.size() < 200'000) many += usual;
  const std::string longLine = "x = '" + std::string(301, 'y') + "';\n";
  load("a.js", many);
  ASSERT_TRUE(waitUntil([this] { return load_->finished(); }));
  EXPECT_TRUE(load_->isSource());
  EXPECT_TRUE(isAnalysed());
  load("long.js", usual + longLine);
  ASSERT_TRUE(waitUntil([this] { return load_->finished(); }));
  EXPECT_TRUE(load_->isSource());
  EXPECT_FALSE(isAnalysed());
  load("late.js", many + longLine);
  ASSERT_TRUE(waitUntil([this] { return load_->finished(); }));
  EXPECT_FALSE(isAnalysed());
  load("a.txt", usual);
  ASSERT_TRUE(waitUntil([this] { return load_->finished(); }));
  EXPECT_FALSE(load_->isSource());
}

// The library takes as long to forget a highlighted text at once as to highlight it.
TEST_F(TextLoadTest, WhatIsLeftGoesBitByBit) {
  std::string many;
  while (many.size() < 3'000'000) many += "function add(a, b) { return a + b; }\n";
  load("a.js", many);
  ASSERT_TRUE(waitUntil([this] { return load_->finished(); }));
  GtkTextBuffer* buffer = GTK_TEXT_BUFFER(load_->buffer());
  g_object_add_weak_pointer(G_OBJECT(buffer), reinterpret_cast<gpointer*>(&buffer));
  const int whole = gtk_text_buffer_get_char_count(buffer);
  load_.reset();
  ASSERT_NE(buffer, nullptr);
  ASSERT_TRUE(waitUntil([&] { return !buffer || gtk_text_buffer_get_char_count(buffer) < whole; }));
  EXPECT_NE(buffer, nullptr) << "not at once";
  EXPECT_TRUE(waitUntil([&] { return !buffer; }));
}

TEST_F(TextLoadTest, GrammarsAreReadWithoutBeingValidated) {
  const char* const* folders = gtk_source_language_manager_get_search_path(textLanguages());
  EXPECT_TRUE(g_file_test((std::string(folders[0]) + "/language2.rng").c_str(), G_FILE_TEST_IS_REGULAR)) << folders[0];
  EXPECT_EQ(textLanguages(), textLanguages());
  GtkSourceLanguageManager* all = textLanguages();
  for (const char* id : {"cpp", "html", "typescript"}) {
    const GRef<GtkSourceBuffer> buffer(
        gtk_source_buffer_new_with_language(gtk_source_language_manager_get_language(all, id)));
    EXPECT_NE(gtk_source_buffer_get_language(buffer.get()), nullptr) << id;
  }
}

TEST_F(TextLoadTest, LeavingInTheMiddleEndsIt) {
  load("long.txt", std::string(8'000'000, 'x'));
  load_.reset();
  EXPECT_TRUE(waitUntil([] { return true; }));
  EXPECT_EQ(failure_, "");
}

}  // namespace
}  // namespace vaelo
