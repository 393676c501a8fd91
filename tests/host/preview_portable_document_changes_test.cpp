// SPDX-License-Identifier: GPL-3.0-or-later
// Marks that the file has already, of whatever program, are removed and rewritten.
#include "host/gtk/preview/mark_edits.h"
#include "tests/host/preview_portable_document_marking_test.h"

namespace vaelo {
namespace {

using portable_document_test::askDecoder;
using portable_document_test::marksIn;
using portable_document_test::pagesIn;
using portable_document_test::readFile;
using portable_document_test::ReadMark;
using portable_document_test::smallDocument;

class PortableDocumentChangesTest : public portable_document_test::MarkingTest {
 protected:
  /// A document with a highlight, ink and a note on its first page, which an earlier session made.
  void openMarked() {
    openToMark();
    dragFrom(at(0, 30, 55), at(0, 390, 55));
    ASSERT_TRUE(waitUntil([this] { return screen_->selecting().selection().text().has_value(); }));
    screen_->markup().bar().choose(MarkTool::Highlight);
    drawLine();
    screen_->markup().bar().choose(MarkTool::Note);
    screen_->markup().askForNote(at(0, 200, 400).first, at(0, 200, 400).second);
    screen_->markup().note().setText("First line,\nsecond line");
    screen_->markup().note().finish();
    ASSERT_TRUE(waitFor(State::Saved));
    close();
    ASSERT_EQ(marksIn(path(), 0).size(), 3U);
    openAgain();
  }
  void openAgain() {
    original_ = readFile(path());
    open(true);
  }
  void write(const std::string& document) { folder_.write("a.pdf", document); }
  MarkPopover& popover() { return screen_->markup().popover(); }
  void click(double x, double y) {
    popover().close();
    const auto [left, top] = at(0, x, y);
    screen_->click(left, top);
  }
  /// What is offered for the place; empty when nothing comes.
  std::string touched(double x, double y) {
    click(x, y);
    return waitUntil([this] { return popover().isOpen(); }) ? popover().text() : "";
  }
  /// Waits, once in a test, until the decoder has answered a click on a page whose links are known: it answers in order, and
  /// the text of the other page has not been asked for yet.
  void settle() {
    const auto [left, top] = at(1, 60, 50);
    screen_->selecting().clear();
    screen_->press(left, top, 2);
    screen_->release(false);
    ASSERT_TRUE(waitUntil([this] { return screen_->selecting().selection().text().has_value(); }));
  }
  bool save() { return waitFor(State::Saving) && waitFor(State::Saved); }
  std::vector<PopplerAnnotType> typesIn(const std::string& file) {
    std::vector<PopplerAnnotType> types;
    for (const ReadMark& mark : marksIn(file, 0)) types.push_back(mark.type);
    return types;
  }
  /// Whether the screen is white at the place, as paper is.
  bool isWhite(double x, double y) {
    GtkWidget* canvas = screen_->canvas().widget();
    const int width = gtk_widget_get_width(canvas);
    const int height = gtk_widget_get_height(canvas);
    GtkSnapshot* snapshot = gtk_snapshot_new();
    screen_->canvas().snapshot(snapshot);
    GskRenderNode* node = gtk_snapshot_free_to_node(snapshot);
    cairo_surface_t* surface = cairo_image_surface_create(CAIRO_FORMAT_ARGB32, width, height);
    cairo_t* context = cairo_create(surface);
    gsk_render_node_draw(node, context);
    cairo_destroy(context);
    cairo_surface_flush(surface);
    const auto [left, top] = at(0, x, y);
    const unsigned char* pixel = cairo_image_surface_get_data(surface) +
                                 static_cast<std::ptrdiff_t>(top) * cairo_image_surface_get_stride(surface) +
                                 static_cast<std::ptrdiff_t>(left) * 4;
    const bool isWhite = std::all_of(pixel, pixel + 3, [](unsigned char part) { return part == 255; });
    cairo_surface_destroy(surface);
    gsk_render_node_unref(node);
    return isWhite;
  }
};

TEST_F(PortableDocumentChangesTest, ADrawingOfAnEarlierSessionIsRemoved) {
  openMarked();
  EXPECT_FALSE(isWhite(100, 250));
  EXPECT_EQ(touched(100, 252), "Drawing") << "a finger is never exact";
  EXPECT_FALSE(popover().mayEdit());
  popover().remove();
  EXPECT_FALSE(popover().isOpen());
  EXPECT_TRUE(waitUntil([this] { return isWhite(100, 250); })) << "at once, before it is saved";
  ASSERT_TRUE(save());
  EXPECT_EQ(typesIn(path()), (std::vector{POPPLER_ANNOT_HIGHLIGHT, POPPLER_ANNOT_TEXT}));
  EXPECT_EQ(readFile(path()).compare(0, original_.size(), original_), 0) << "what was there stays readable";
  EXPECT_EQ(names(), std::vector<std::string>{"a.pdf"});
  EXPECT_EQ(pagesIn(path()), 2);
}

TEST_F(PortableDocumentChangesTest, BesideADrawingThereIsNothingToRemove) {
  openMarked();
  ASSERT_EQ(touched(100, 252), "Drawing");
  click(55, 295);  // in the rectangle around the line, but far from it
  settle();
  EXPECT_FALSE(popover().isOpen());
}

TEST_F(PortableDocumentChangesTest, AHighlightOfAnEarlierSessionIsRemovedAndComesBack) {
  openMarked();
  ASSERT_EQ(touched(100, 54), "Highlighted Text");
  popover().remove();
  ASSERT_TRUE(save());
  EXPECT_EQ(typesIn(path()), (std::vector{POPPLER_ANNOT_INK, POPPLER_ANNOT_TEXT}));
  click(100, 54);
  settle();
  EXPECT_FALSE(popover().isOpen()) << "it is there no more";
  EXPECT_TRUE(screen_->markup().undo());
  ASSERT_TRUE(save());
  EXPECT_EQ(readFile(path()), original_);
  EXPECT_FALSE(screen_->markup().undo());
  EXPECT_EQ(touched(100, 54), "Highlighted Text");
}

TEST_F(PortableDocumentChangesTest, ANoteOfAnEarlierSessionIsRewritten) {
  openMarked();
  ASSERT_EQ(touched(210, 410), "First line,\nsecond line");
  ASSERT_TRUE(popover().mayEdit());
  popover().edit();
  ASSERT_TRUE(screen_->markup().note().isOpen());
  EXPECT_EQ(screen_->markup().note().text(), "First line,\nsecond line");
  screen_->markup().note().setText("Grüße,\nneu");
  screen_->markup().note().finish();
  EXPECT_EQ(touched(210, 410), "Grüße,\nneu") << "before it is saved";
  ASSERT_TRUE(save());
  ASSERT_EQ(marksIn(path(), 0).size(), 3U);
  EXPECT_EQ(marksIn(path(), 0)[2].text, "Grüße,\nneu");
  popover().remove();
  ASSERT_TRUE(save());
  EXPECT_EQ(typesIn(path()), (std::vector{POPPLER_ANNOT_HIGHLIGHT, POPPLER_ANNOT_INK}));
  EXPECT_TRUE(screen_->markup().undo());
  EXPECT_TRUE(screen_->markup().undo());
  ASSERT_TRUE(save());
  EXPECT_EQ(readFile(path()), original_);
}

TEST_F(PortableDocumentChangesTest, ANoteThatIsLeftAsItWasIsNotSaved) {
  openMarked();
  ASSERT_EQ(touched(210, 410), "First line,\nsecond line");
  popover().edit();
  screen_->markup().note().finish();
  EXPECT_EQ(screen_->markup().marks()->state(), State::Unchanged);
  EXPECT_TRUE(screen_->markup().marks()->edits().empty());
}

TEST_F(PortableDocumentChangesTest, SeveralMarksOfAPageGoTogetherWithNewOnes) {
  openMarked();
  for (const auto& [x, y] : {std::pair{100, 54}, {100, 250}}) {
    ASSERT_NE(touched(x, y), "");
    popover().remove();
  }
  screen_->markup().bar().choose(MarkTool::Ink);
  dragFrom(at(0, 250, 200), at(0, 350, 300));
  screen_->markup().bar().putToolAway();
  ASSERT_TRUE(save());
  EXPECT_EQ(typesIn(path()), (std::vector{POPPLER_ANNOT_TEXT, POPPLER_ANNOT_INK}));
}

TEST_F(PortableDocumentChangesTest, AMarkOfThisSessionIsRemovedToo) {
  openToMark();
  drawLine();
  ASSERT_TRUE(waitFor(State::Saved));
  screen_->markup().bar().putToolAway();
  ASSERT_EQ(touched(100, 250), "Drawing");
  popover().remove();
  ASSERT_TRUE(save());
  EXPECT_EQ(readFile(path()), original_);
  EXPECT_TRUE(screen_->markup().undo());
  ASSERT_TRUE(save());
  EXPECT_EQ(typesIn(path()), std::vector{POPPLER_ANNOT_INK});
}

TEST_F(PortableDocumentChangesTest, NothingIsRemovedWhereNothingMayBeSaved) {
  openMarked();
  maySave_ = false;
  ASSERT_EQ(touched(100, 250), "Drawing");
  popover().remove();
  EXPECT_EQ(screen_->markup().marks()->state(), State::Unchanged);
  close();
  open(false);
  click(100, 250);
  click(210, 410);
  EXPECT_TRUE(waitUntil([this] { return screen_->linkPopover().text() == "First line, second line"; }));
  EXPECT_FALSE(popover().isOpen());
}

TEST_F(PortableDocumentChangesTest, ALockedNoteIsOnlyRead) {
  write(smallDocument("/Annots [5 0 R]", "", "",
                      {"<< /Type /Annot /Subtype /Text /Rect [100 500 124 524] /F 128 "
                       "/Contents (Mind the bridge) >>"}));
  openAgain();
  click(112, 88);
  EXPECT_TRUE(waitUntil([this] { return screen_->linkPopover().text() == "Mind the bridge"; }));
  EXPECT_FALSE(popover().isOpen());
}

TEST_F(PortableDocumentChangesTest, OnATurnedPageMarksAreWhereTheyAreSeen) {
  write(smallDocument("/Rotate 90 /Annots [5 0 R]", "", "",
                      {"<< /Type /Annot /Subtype /Highlight /F 4 /C [1 0 0] /Rect [100 500 200 520] "
                       "/QuadPoints [100 520 200 520 100 500 200 500] >>"}));
  openAgain();
  // A page turned to the right: what was far up is far right, and what was left is up.
  EXPECT_EQ(touched(510, 150), "Highlighted Text");
  popover().remove();
  ASSERT_TRUE(save());
  EXPECT_TRUE(marksIn(path(), 0).empty());
}

constexpr const char* MarkInThePage =
    "/Annots [<< /Type /Annot /Subtype /Highlight /F 4 /C [1 0 0] /Rect [100 500 200 520] /QuadPoints [100 520 200 520 100 "
    "500 200 500] >>]";

TEST_F(PortableDocumentChangesTest, WhatCannotBeRemovedStaysAndIsToldOf) {
  write(smallDocument(MarkInThePage));
  openAgain();
  ASSERT_EQ(touched(150, 90), "Highlighted Text");
  popover().remove();
  ASSERT_TRUE(waitFor(State::Failed));
  EXPECT_EQ(readFile(path()), original_);
  EXPECT_TRUE(screen_->markup().undo());
  EXPECT_TRUE(waitFor(State::Unchanged));
}

TEST_F(PortableDocumentChangesTest, InkOnAPageWithMarksInItsDictionary) {
  write(smallDocument(MarkInThePage));
  openAgain();
  drawLine();
  ASSERT_TRUE(waitFor(State::Saved));
  EXPECT_EQ(typesIn(path()), (std::vector{POPPLER_ANNOT_HIGHLIGHT, POPPLER_ANNOT_INK}));
}

TEST(MarkEdits, TheLastThingIsTakenBack) {
  MarkEdits edits;
  edits.add(noteOf(1, 10, 20, "one"));
  edits.add(noteOf(1, 30, 40, "two"));
  edits.rewrite(edits.marks().front(), "ONE");
  edits.remove(edits.marks().back());
  PageMark stored;
  stored.kind = PageMark::Kind::Note;
  stored.page = 2;
  stored.stored = 5;
  stored.text = "old";
  edits.rewrite(stored, "new");
  EXPECT_EQ(edits.requests(), (std::vector<std::string>{"note 1 1.00 0.85 0.20 10.00 20.00 ONE", "rewrite 2 5 new"}));
  edits.remove(stored);
  EXPECT_EQ(edits.requests().back(), "remove 2 5");
  EXPECT_EQ(edits.removed(), (std::map<int, std::vector<int>>{{2, {5}}}));
  EXPECT_TRUE(edits.undo());
  EXPECT_EQ(edits.changed().front().mark.text, "new");
  EXPECT_TRUE(edits.removed().empty());
  EXPECT_TRUE(edits.undo());
  EXPECT_TRUE(edits.changed().empty());
  EXPECT_TRUE(edits.undo());
  EXPECT_EQ(edits.marks().size(), 2U);
  EXPECT_TRUE(edits.undo());
  EXPECT_EQ(edits.marks().front().text, "one");
  EXPECT_TRUE(edits.undo());
  EXPECT_TRUE(edits.undo());
  EXPECT_FALSE(edits.undo());
  EXPECT_TRUE(edits.requests().empty());
}

TEST(PageMark, IsAtItsLinesItsStrokeOrItsIcon) {
  PageMark highlight;
  highlight.lines = {{10, 10, 100, 20}, {10, 30, 50, 40}};
  EXPECT_TRUE(isMarkAt(highlight, 40, 35, 0));
  EXPECT_FALSE(isMarkAt(highlight, 80, 35, 0));
  EXPECT_TRUE(isMarkAt(highlight, 53, 35, 4));
  const PageMark ink = inkOf(0, {{0, 0}, {100, 100}}, 2).front();
  EXPECT_TRUE(isMarkAt(ink, 52, 50, 1));
  EXPECT_FALSE(isMarkAt(ink, 80, 20, 5));
  EXPECT_FALSE(isMarkAt(ink, 110, 110, 5)) << "beyond its end";
  EXPECT_TRUE(isMarkAt(noteOf(0, 10, 10, "x"), 30, 30, 0));
  EXPECT_FALSE(isMarkAt(noteOf(0, 10, 10, "x"), 40, 30, 0));
}

TEST(PageMark, ATouchedMarkIsReadWithCare) {
  const std::optional<TouchedMark> note = touchedMarkIn(3, "7 note 1 two\rlines");
  ASSERT_TRUE(note);
  EXPECT_EQ(note->mark.page, 3);
  EXPECT_EQ(note->mark.stored, 7);
  EXPECT_EQ(note->mark.kind, PageMark::Kind::Note);
  EXPECT_EQ(note->mark.text, "two\nlines");
  EXPECT_TRUE(note->mayBeChanged);
  EXPECT_FALSE(touchedMarkIn(3, "7 ink 0 ")->mayBeChanged);
  for (const char* words : {"", "x ink 1 ", "-1 ink 1 ", "1 square 1 ", "1 note 1 \xff"}) {
    EXPECT_FALSE(touchedMarkIn(3, words)) << words;
  }
}

}  // namespace
}  // namespace vaelo
