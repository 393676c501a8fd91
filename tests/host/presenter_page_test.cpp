// SPDX-License-Identifier: GPL-3.0-or-later
// What a preview's page says of a document that is not there, goes, comes, or becomes something else.
#include <sys/stat.h>

#include "host/drive/drive_file_progress.h"
#include "host/drive/promise_file.h"
#include "tests/host/list_test_folder.h"
#include "tests/host/preview_page_support.h"
#include "tests/host/preview_portable_document_support.h"

namespace vaelo {

namespace {

using list_test::waitUntil;

std::string progressShownIn(GtkWidget* widget) {
  if (!gtk_widget_get_mapped(widget)) return "";
  if (GTK_IS_PROGRESS_BAR(widget)) {
    const char* text = gtk_progress_bar_get_text(GTK_PROGRESS_BAR(widget));
    return text ? text : "";
  }
  for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
    const std::string found = progressShownIn(child);
    if (!found.empty()) return found;
  }
  return "";
}

GtkWidget* shownIn(const PreviewPage& page) { return gtk_stack_get_visible_child(GTK_STACK(page.widget())); }

std::string textIn(GtkWidget* widget) {
  if (GTK_IS_TEXT_VIEW(widget)) {
    GtkTextBuffer* buffer = gtk_text_view_get_buffer(GTK_TEXT_VIEW(widget));
    GtkTextIter begin;
    GtkTextIter end;
    gtk_text_buffer_get_bounds(buffer, &begin, &end);
    return takeString(gtk_text_buffer_get_text(buffer, &begin, &end, FALSE));
  }
  for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
    const std::string found = textIn(child);
    if (!found.empty()) return found;
  }
  return "";
}

/// A second of it, in a WAVE file.
std::string silence() {
  const char header[] = "RIFF\xa4\x3e\0\0WAVEfmt \x10\0\0\0\1\0\1\0\x40\x1f\0\0\x80\x3e\0\0\2\0\x10\0data\x80\x3e\0\0";
  return std::string(header, sizeof header - 1) + std::string(16000, '\0');
}

class PresenterPageTest : public preview_test::PreviewPageTest {
 protected:
  bool says(const std::string& part) {
    return waitUntil([&] { return said().find(part) != std::string::npos; });
  }
  /// The view that shows, once there is one; it is kept, so that no other can be taken for it.
  GRef<GtkWidget> waitForView() {
    const bool shown =
        waitUntil([&] { return shownIn(*page) && !gtk_stack_get_visible_child_name(GTK_STACK(page->widget())); });
    return shown ? GRef<GtkWidget>(GTK_WIDGET(g_object_ref(shownIn(*page)))) : GRef<GtkWidget>();
  }
  void promise(const std::string& name, std::uint64_t size) {
    PromiseInfo info;
    info.name = name;
    info.size = size;
    ASSERT_FALSE(writePromise(drive, info));
  }

  const std::string document = drive + "/Table.unknown";
  const std::string noText = std::string("\0\1\2\3\xff\xfe\0\0\1", 9);
};

TEST_F(PresenterPageTest, ADocumentThatIsDeletedWhileItLoads) {
  write(document, noText);
  show(document);
  std::filesystem::remove(document);
  EXPECT_TRUE(says("This document is no longer there.")) << said();
}

TEST_F(PresenterPageTest, ADocumentThatIsMovedIsShownOn) {
  for (const char* name : {"/Minutes.txt", "/Rivers.pdf", "/Tone.wav", "/Welcome.md"}) {
    const std::string moved = drive + "/Moved" + std::string(name).substr(1);
    write(drive + name, silence());
    if (std::string_view(name).ends_with(".txt") || std::string_view(name).ends_with(".md"))
      write(drive + name, "Minutes\n");
    if (std::string_view(name).ends_with(".pdf")) portable_document_test::writeDocument(drive + name, 2);
    show(drive + name);
    const GRef<GtkWidget> view = waitForView();
    ASSERT_TRUE(view) << name;
    std::filesystem::rename(drive + name, moved);
    source->pointTo(moved);
    controller->reloadData();
    EXPECT_EQ(shownIn(*page), view.get()) << name;
    // Whatever else is there by now is no reason to go on.
    write(drive + name, "Something else\n");
    source->pointTo(drive + name);
    controller->reloadData();
    EXPECT_TRUE(waitUntil([&] { return shownIn(*page) != view.get(); })) << name;
  }
}

TEST_F(PresenterPageTest, ADocumentThatWasMovedIsReadAnewWhereItIs) {
  write(drive + "/Minutes.txt", "Minutes\n");
  show(drive + "/Minutes.txt");
  const GRef<GtkWidget> view = waitForView();
  ASSERT_TRUE(view);
  std::filesystem::rename(drive + "/Minutes.txt", drive + "/Moved.txt");
  source->pointTo(drive + "/Moved.txt");
  controller->reloadData();
  write(drive + "/Moved.txt", "Other minutes\n");
  controller->refreshCurrentPreviewItem();
  EXPECT_TRUE(waitUntil([&] { return textIn(view.get()) == "Other minutes\n"; })) << textIn(view.get());
}

TEST_F(PresenterPageTest, ADocumentThatIsDeletedAndReadAnew) {
  write(document, noText);
  show(document);
  ASSERT_TRUE(says("9 bytes")) << said();
  std::filesystem::remove(document);
  controller->refreshCurrentPreviewItem();
  EXPECT_TRUE(says("This document is no longer there.")) << said();
}

TEST_F(PresenterPageTest, AFolderInADocumentsPlace) {
  write(document, noText);
  show(document);
  std::filesystem::remove(document);
  makeFolder(document);
  EXPECT_TRUE(says("There is a folder in this document’s place now.")) << said();
  std::filesystem::remove(document);
  write(document, noText);
  controller->refreshCurrentPreviewItem();
  EXPECT_TRUE(says("9 bytes")) << said();
  EXPECT_EQ(said().find("folder"), std::string::npos);
}

TEST_F(PresenterPageTest, APackageIsADocument) {
  write(drive + "/Album.sketchbundle/page");
  show(drive + "/Album.sketchbundle");
  ASSERT_TRUE(says("Album.sketchbundle")) << said();
  EXPECT_EQ(said().find("in this document’s place"), std::string::npos);
}

TEST_F(PresenterPageTest, ADocumentThatComes) {
  promise("Table.unknown", 200);
  show(document);
  ASSERT_TRUE(says("Not downloaded\n\nIt opens here as soon as it is on this device.")) << said();
  EXPECT_EQ(progressShownIn(window), "");
  const std::string partial = DriveFileProgress::partialPathFor(document);
  write(partial, std::string(50, 'x'));
  ASSERT_TRUE(waitUntil([&] { return progressShownIn(window) == "Downloading… 25%"; }));
  EXPECT_EQ(said().find("Not downloaded"), std::string::npos) << "it is on its way";
  EXPECT_NE(said().find("200 bytes"), std::string::npos) << said();
  std::filesystem::remove(partial);
  ASSERT_TRUE(waitUntil([&] { return progressShownIn(window).empty(); }));
  EXPECT_TRUE(says("Not downloaded"));
  write(partial, std::string(200, '\0'));
  ASSERT_TRUE(waitUntil([&] { return progressShownIn(window) == "Downloading… 100%"; }));
  rename(partial, document);
  std::filesystem::remove(promisePathFor(document));
  EXPECT_TRUE(waitUntil([&] { return !said().empty() && said().find("Not downloaded") == std::string::npos; })) << said();
}

TEST_F(PresenterPageTest, WhatTakesLongSaysSoAfterAFifthOfASecond) {
  const std::string path = g_getenv("PATH");
  write(root + "/bin/soffice", "#!/bin/bash\nexec tail -f /dev/null\n");
  ASSERT_EQ(::chmod((root + "/bin/soffice").c_str(), 0755), 0);
  g_setenv("PATH", (root + "/bin:" + path).c_str(), TRUE);
  write(drive + "/Letter.odt", "PK\x03\x04 a letter");
  const gint64 begun = g_get_monotonic_time();
  show(drive + "/Letter.odt");
  EXPECT_EQ(said(), "");
  EXPECT_TRUE(says("Loading…")) << said();
  EXPECT_GE(g_get_monotonic_time() - begun, 199000);
  EXPECT_TRUE(says("Preparing the document to be shown")) << said();
  write(document, noText);
  source->pointTo(document);
  controller->reloadData();
  EXPECT_TRUE(says("9 bytes")) << "it can be left for another document";
  EXPECT_EQ(said().find("Loading…"), std::string::npos);
  g_setenv("PATH", path.c_str(), TRUE);
}

TEST_F(PresenterPageTest, OnlyWhatIsNotDownloadedIsNotHandedOver) {
  const auto opens = [&] {
    bool opened = false;
    screens->runPreOpenAlert(URL(document), nullptr, [&] { opened = true; });
    return opened;
  };
  EXPECT_TRUE(opens()) << "that it is gone is told by what opens it";
  promise("Table.unknown", 9);
  EXPECT_FALSE(opens());
  write(document, noText);
  EXPECT_TRUE(opens());
}

// An empty frame in between would flicker, and hold up the document by a whole frame.
TEST_F(PresenterPageTest, WhatIsSeenStaysUntilTheNextDocumentIsThere) {
  write(document, noText);
  write(drive + "/Plan.txt", "milk");
  show(document);
  ASSERT_TRUE(says("9 bytes")) << said();
  const std::string seen = said();
  source->pointTo(drive + "/Plan.txt");
  controller->reloadData();
  EXPECT_EQ(said(), seen);
  EXPECT_TRUE(waitUntil([&] { return said() != seen; }));
  EXPECT_EQ(said(), "");
}

TEST_F(PresenterPageTest, APageThatIsOutOfSightDoesNotKeepWhatItShowed) {
  write(document, noText);
  write(drive + "/Plan.txt", "milk");
  show(document);
  ASSERT_TRUE(says("9 bytes")) << said();
  g_object_ref(page->widget());
  gtk_window_set_child(GTK_WINDOW(window), nullptr);
  source->pointTo(drive + "/Plan.txt");
  controller->reloadData();
  gtk_window_set_child(GTK_WINDOW(window), page->widget());
  g_object_unref(page->widget());
  EXPECT_EQ(said(), "");
}

TEST_F(PresenterPageTest, ADownloadOfUnknownSizeTellsItsBytes) {
  promise("Table.unknown", 0);
  show(document);
  write(DriveFileProgress::partialPathFor(document), std::string(50, 'x'));
  EXPECT_TRUE(waitUntil([&] { return progressShownIn(window) == "Downloading… 50 bytes"; })) << progressShownIn(window);
}

TEST_F(PresenterPageTest, APageMayGoWhileItsDocumentComes) {
  promise("Table.unknown", 10);
  show(document);
  write(DriveFileProgress::partialPathFor(document), "12345");
  ASSERT_TRUE(waitUntil([&] { return !progressShownIn(window).empty(); }));
  write(document, noText);
  gtk_window_set_child(GTK_WINDOW(window), nullptr);
  page.reset();
  bool passed = false;
  g_timeout_add(
      150, [](gpointer flag) -> gboolean { return !(*static_cast<bool*>(flag) = true); }, &passed);
  EXPECT_TRUE(waitUntil([&] { return passed; }));
}

}  // namespace

}  // namespace vaelo
