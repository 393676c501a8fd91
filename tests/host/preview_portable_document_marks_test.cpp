// SPDX-License-Identifier: GPL-3.0-or-later
#include <sys/resource.h>
#include <sys/xattr.h>

#include <csignal>
#include <filesystem>
#include <utility>

#include "tests/host/preview_portable_document_marking_test.h"

namespace vaelo {
namespace {

using portable_document_test::marksIn;
using portable_document_test::pagesIn;
using portable_document_test::readFile;
using portable_document_test::ReadMark;
using portable_document_test::writeDocument;

class PortableDocumentMarksTest : public portable_document_test::MarkingTest {
 protected:
  /// The tooltips of the buttons for the header bar.
  std::string headerText() {
    std::string text;
    for (GtkWidget* widget : screen_->headerWidgets()) {
      g_object_ref_sink(widget);
      text += tooltips(widget);
      g_object_unref(widget);
    }
    return text;
  }
  static std::string tooltips(GtkWidget* widget) {
    const char* own = gtk_widget_get_tooltip_text(widget);
    std::string text = own ? own : "";
    for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
      text += tooltips(child);
    }
    return text;
  }
};

TEST_F(PortableDocumentMarksTest, HighlightInkAndNoteAreInTheFile) {
  openToMark();
  dragFrom(at(0, 30, 55), at(0, 390, 55));
  ASSERT_TRUE(waitUntil([this] { return screen_->selecting().selection().text().has_value(); }));
  screen_->markup().bar().choose(MarkTool::Highlight);
  drawLine();
  screen_->markup().bar().choose(MarkTool::Note);
  screen_->markup().askForNote(at(0, 200, 400).first, at(0, 200, 400).second);
  ASSERT_TRUE(screen_->markup().note().isOpen());
  screen_->markup().note().setText("Grüße,\nzweite Zeile");
  screen_->markup().note().finish();
  EXPECT_EQ(asked_, 3);
  ASSERT_EQ(screen_->markup().marks()->edits().marks().size(), 3U);
  ASSERT_TRUE(waitFor(State::Saved));

  const std::vector<ReadMark> marks = marksIn(path(), 0);
  ASSERT_EQ(marks.size(), 3U);
  EXPECT_EQ(marks[0].type, POPPLER_ANNOT_HIGHLIGHT);
  EXPECT_GT(marks[0].area.y1, 600 - 80) << "over the first line; the library counts from below";
  EXPECT_LT(marks[0].area.y2, 600 - 30);
  EXPECT_EQ(marks[1].type, POPPLER_ANNOT_INK);
  EXPECT_NEAR(marks[1].area.x1, 50, 6);
  EXPECT_NEAR(marks[1].area.y2, 400, 6);
  EXPECT_EQ(marks[2].type, POPPLER_ANNOT_TEXT);
  EXPECT_EQ(marks[2].text, "Grüße,\nzweite Zeile");
  EXPECT_NEAR(marks[2].area.x1, 200, 2);
  EXPECT_NEAR(marks[2].area.y2, 200, 2);
  EXPECT_TRUE(marksIn(path(), 1).empty());
  EXPECT_EQ(pagesIn(path()), 2);
  EXPECT_EQ(names(), std::vector<std::string>{"a.pdf"});
}

TEST_F(PortableDocumentMarksTest, TheDragOfTheHighlighterMarks) {
  openToMark();
  screen_->markup().bar().choose(MarkTool::Highlight);
  dragFrom(at(0, 30, 55), at(0, 390, 55));
  ASSERT_TRUE(waitUntil([this] { return screen_->markup().marks()->edits().marks().size() == 1; }));
  EXPECT_EQ(screen_->selecting().selection().pages(), (std::pair{0, -1}));
  ASSERT_TRUE(waitFor(State::Saved));
  EXPECT_EQ(marksIn(path(), 0).size(), 1U);
}

TEST_F(PortableDocumentMarksTest, UndoTakesTheLastMarkBackToTheOriginal) {
  openToMark();
  drawLine();
  ASSERT_TRUE(waitFor(State::Saved));
  drawLine(1);
  ASSERT_TRUE(waitFor(State::Saving));
  ASSERT_TRUE(waitFor(State::Saved));
  EXPECT_EQ(marksIn(path(), 0).size(), 1U);
  EXPECT_EQ(marksIn(path(), 1).size(), 1U);
  EXPECT_TRUE(screen_->markup().undo());
  EXPECT_TRUE(screen_->markup().undo());
  EXPECT_FALSE(screen_->markup().undo());
  ASSERT_TRUE(waitFor(State::Saving));
  ASSERT_TRUE(waitFor(State::Saved));
  EXPECT_EQ(readFile(path()), original_);
}

TEST_F(PortableDocumentMarksTest, WhatWasSavedHereIsNotReadAnew) {
  openToMark();
  drawLine();
  ASSERT_TRUE(waitFor(State::Saved));
  screen_->refresh();
  drawLine();
  EXPECT_EQ(screen_->markup().marks()->edits().marks().size(), 2U);
  ASSERT_TRUE(waitFor(State::Saving));
  screen_->refresh();
  ASSERT_TRUE(waitFor(State::Saved));
  EXPECT_EQ(marksIn(path(), 0).size(), 2U);
}

TEST_F(PortableDocumentMarksTest, LeavingSavesWhatIsNotSavedYet) {
  openToMark();
  drawLine();
  ASSERT_EQ(screen_->markup().marks()->state(), State::Unsaved);
  close();
  PortableDocumentMarks::finishAll();
  EXPECT_EQ(marksIn(path(), 0).size(), 1U);
}

TEST_F(PortableDocumentMarksTest, TheEndOfTheProgramSavesWhatIsNotSavedYet) {
  openToMark();
  drawLine();
  PortableDocumentMarks::finishAll();
  EXPECT_EQ(marksIn(path(), 0).size(), 1U);
}

TEST_F(PortableDocumentMarksTest, TheEndOfTheProgramKeepsTheNoteThatIsBeingWritten) {
  openToMark();
  screen_->markup().askForNote(100, 100);
  screen_->markup().note().setText("Mind the bridge");
  PortableDocumentMarks::finishAll();
  ASSERT_EQ(marksIn(path(), 0).size(), 1U);
  EXPECT_EQ(marksIn(path(), 0).front().text, "Mind the bridge");
}

TEST_F(PortableDocumentMarksTest, TheNoteThatIsBeingWrittenIsKeptWhenTheWindowIsClosed) {
  openToMark();
  screen_->markup().askForNote(100, 100);
  screen_->markup().note().setText("Mind the bridge");
  gtk_window_destroy(GTK_WINDOW(std::exchange(window_, nullptr)));
  toasts_ = nullptr;
  PortableDocumentMarks::finishAll();
  EXPECT_EQ(marksIn(path(), 0).size(), 1U);
}

TEST_F(PortableDocumentMarksTest, ANoteIsWrittenWithinTheWindowThatAKeyboardMakesLower) {
  openToMark();
  screen_->markup().askForNote(100, 600);
  screen_->markup().note().setText("Mind the bridge");
  GtkWidget* popover = gtk_widget_get_ancestor(gtk_root_get_focus(GTK_ROOT(window_)), GTK_TYPE_POPOVER);
  ASSERT_TRUE(popover);
  const auto isWithin = [&] {
    GdkRectangle pointed;
    gtk_popover_get_pointing_to(GTK_POPOVER(popover), &pointed);
    double x = 0;
    double y = 0;
    gtk_widget_translate_coordinates(gtk_widget_get_parent(popover), window_, pointed.x, pointed.y, &x, &y);
    const bool above = gtk_popover_get_position(GTK_POPOVER(popover)) == GTK_POS_TOP;
    const int height = gtk_widget_get_height(popover);
    return above ? y >= height && y < gtk_widget_get_height(window_) : y + height <= gtk_widget_get_height(window_);
  };
  for (const int height : {400, 260, 700}) {
    gtk_window_set_default_size(GTK_WINDOW(window_), 424, height);
    EXPECT_TRUE(waitUntil([&] { return gtk_widget_get_height(window_) == height && isWithin(); })) << height;
  }
  EXPECT_EQ(screen_->markup().note().text(), "Mind the bridge");
}

/// Files of this process can't grow beyond a few bytes, as on a full disk.
class FullDisk {
 public:
  FullDisk() : handler_(::signal(SIGXFSZ, SIG_IGN)) {
    ::getrlimit(RLIMIT_FSIZE, &before_);
    const rlimit small = {100, before_.rlim_max};
    ::setrlimit(RLIMIT_FSIZE, &small);
  }
  ~FullDisk() {
    ::setrlimit(RLIMIT_FSIZE, &before_);
    ::signal(SIGXFSZ, handler_);
  }
  FullDisk(const FullDisk&) = delete;
  FullDisk& operator=(const FullDisk&) = delete;

 private:
  sighandler_t handler_;
  rlimit before_ = {};
};

TEST_F(PortableDocumentMarksTest, AFailedSaveKeepsTheDocumentAndIsTriedAgain) {
  openToMark();
  {
    const FullDisk full;
    drawLine();
    ASSERT_TRUE(waitFor(State::Failed));
  }
  EXPECT_EQ(readFile(path()), original_);
  EXPECT_EQ(names(), std::vector<std::string>{"a.pdf"});
  EXPECT_EQ(screen_->markup().marks()->edits().marks().size(), 1U);
  close();
  PortableDocumentMarks::finishAll();
  EXPECT_EQ(marksIn(path(), 0).size(), 1U);
}

TEST_F(PortableDocumentMarksTest, ADocumentChangedMeanwhileIsNotOverwritten) {
  openToMark();
  drawLine();
  writeDocument(path() + ".new", 7);
  std::filesystem::rename(path() + ".new", path());
  const std::string others = readFile(path());
  ASSERT_TRUE(waitFor(State::Saved));
  EXPECT_EQ(readFile(path()), others);
  EXPECT_EQ(names(), (std::vector<std::string>{"a (marked).pdf", "a.pdf"}));
  EXPECT_EQ(marksIn(folder_.path() + "/a (marked).pdf", 0).size(), 1U);
  EXPECT_EQ(pagesIn(folder_.path() + "/a (marked).pdf"), 2);
  // The next mark goes to the same copy.
  drawLine();
  ASSERT_TRUE(waitFor(State::Saving));
  ASSERT_TRUE(waitFor(State::Saved));
  EXPECT_EQ(names().size(), 2U);
  EXPECT_EQ(marksIn(folder_.path() + "/a (marked).pdf", 0).size(), 2U);
  screen_->refresh();
  EXPECT_TRUE(waitUntil([this] { return screen_->canvas().layout().count() == 7; }));
}

TEST_F(PortableDocumentMarksTest, ADocumentMovedMeanwhileIsMarkedWhereItIs) {
  openToMark();
  drawLine();
  std::filesystem::rename(path(), folder_.path() + "/b.pdf");
  ASSERT_TRUE(waitFor(State::Saved));
  EXPECT_EQ(names(), std::vector<std::string>{"b.pdf"});
  EXPECT_EQ(marksIn(folder_.path() + "/b.pdf", 0).size(), 1U);
}

TEST_F(PortableDocumentMarksTest, ModeAndAttributesStay) {
  writeDocument(path(), 1);
  std::filesystem::permissions(path(), std::filesystem::perms(0640));
  if (::setxattr(path().c_str(), "user.xdg.tags", "Red", 3, 0) != 0) GTEST_SKIP() << "no attributes here";
  open(true);
  drawLine();
  ASSERT_TRUE(waitFor(State::Saved));
  char tags[8] = {};
  EXPECT_EQ(::getxattr(path().c_str(), "user.xdg.tags", tags, sizeof tags), 3);
  EXPECT_EQ(static_cast<int>(std::filesystem::status(path()).permissions()), 0640);
}

TEST_F(PortableDocumentMarksTest, NothingIsMarkedThatMayNotBe) {
  writeDocument(path(), 1);
  open(false);
  EXPECT_FALSE(screen_->markup().mayMark());
  EXPECT_EQ(headerText(), "Find in This Document");
  close();
  open(true);
  maySave_ = false;
  drawLine();
  EXPECT_TRUE(screen_->markup().marks()->edits().marks().empty());
  EXPECT_NE(headerText().find("Mark This Document"), std::string::npos);
}

TEST_F(PortableDocumentMarksTest, TheToolsFitAPhone) {
  openToMark();
  int width = 0;
  gtk_widget_measure(screen_->markup().bar().widget(), GTK_ORIENTATION_HORIZONTAL, -1, &width, nullptr, nullptr, nullptr);
  EXPECT_LE(width, 360);
  screen_->toggleFind();
  gtk_widget_measure(screen_->widget(), GTK_ORIENTATION_HORIZONTAL, -1, &width, nullptr, nullptr, nullptr);
  EXPECT_LE(width, 360);
}

TEST(MarkedFile, ACopyHasANameOfItsOwn) {
  EXPECT_EQ(markedCopyName("a.pdf", 1), "a (marked).pdf");
  EXPECT_EQ(markedCopyName("a.pdf", 2), "a (marked 2).pdf");
  EXPECT_EQ(markedCopyName("a", 1), "a (marked)");
  std::string letters;
  for (int i = 0; i < 120; ++i) letters += "ü";
  const std::string name = markedCopyName(letters + "0123456789.pdf", 1);
  EXPECT_LE(name.size(), 255U);
  EXPECT_TRUE(g_utf8_validate(name.c_str(), -1, nullptr));
}

TEST(PageMark, ALongLineIsInPiecesThatMeet) {
  std::vector<std::array<double, 2>> points(5000);
  for (std::size_t i = 0; i < points.size(); ++i) points[i] = {static_cast<double>(i), 0};
  const std::vector<PageMark> marks = inkOf(3, points, 2);
  ASSERT_EQ(marks.size(), 3U);
  EXPECT_EQ(marks[0].points.back(), marks[1].points.front());
  EXPECT_EQ(marks[2].points.back()[0], 4999);
  for (const PageMark& mark : marks) EXPECT_LT(wordsOf(mark).size(), DecoderMessage::MaximumText);
}

TEST(PageMark, ALongNoteEndsBetweenLetters) {
  std::string text;
  for (int i = 0; i < 20'000; ++i) text += "€";
  const PageMark note = noteOf(0, 1, 2, text);
  EXPECT_LT(wordsOf(note).size(), DecoderMessage::MaximumText);
  EXPECT_TRUE(g_utf8_validate(note.text.c_str(), -1, nullptr));
}

}  // namespace
}  // namespace vaelo
