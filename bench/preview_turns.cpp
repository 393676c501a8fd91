// SPDX-License-Identifier: GPL-3.0-or-later
// How long the main loop is held at most while a long portable document is scrolled through, while a long text comes, and
// while source text with very long lines comes and is scrolled.
//   preview_turns [NAME OF ONE DOCUMENT]
#include <cstdio>

#include "bench/preview_samples.h"
#include "bench/preview_window.h"
#include "bench/turns.h"

namespace {

using vaelo::bench::PreviewWindow;
using vaelo::bench::Turns;

/// Of what shows and can be scrolled.
GtkAdjustment* verticalOf(GtkWidget* widget) {
  if (!gtk_widget_get_mapped(widget)) return nullptr;
  if (GTK_IS_SCROLLABLE(widget)) {
    GtkAdjustment* found = gtk_scrollable_get_vadjustment(GTK_SCROLLABLE(widget));
    if (found && gtk_adjustment_get_upper(found) > gtk_adjustment_get_page_size(found)) return found;
  }
  for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
    if (GtkAdjustment* found = verticalOf(child)) return found;
  }
  return nullptr;
}

/// A screen's share a frame, for so long, back and forth.
void scroll(GtkWidget* view, double milliseconds) {
  struct Road {
    GtkAdjustment* adjustment;
    double step;
  } road{verticalOf(view), 300};
  if (!road.adjustment) return void(std::printf("nothing to scroll\n"));
  const guint tick = gtk_widget_add_tick_callback(
      view,
      [](GtkWidget*, GdkFrameClock*, gpointer data) -> gboolean {
        auto* way = static_cast<Road*>(data);
        const double before = gtk_adjustment_get_value(way->adjustment);
        gtk_adjustment_set_value(way->adjustment, before + way->step);
        if (gtk_adjustment_get_value(way->adjustment) == before) way->step = -way->step;
        return G_SOURCE_CONTINUE;
      },
      &road, nullptr);
  PreviewWindow::run(milliseconds);
  gtk_widget_remove_tick_callback(view, tick);
}

struct Document {
  const char* title;
  const char* name;
  double scrolled;  // milliseconds
};

void measure(const Document& document, PreviewWindow& window, const std::string& path) {
  window.showNothing();
  Turns::forget();
  const double shown = window.show(path);
  const double opening = Turns::longest();
  Turns::forget();
  PreviewWindow::run(3000);
  const double after = Turns::longest();
  Turns::forget();
  scroll(window.shownView(), document.scrolled);
  const double scrolling = Turns::longest();
  Turns::forget();
  window.showNothing();
  PreviewWindow::run(500);
  std::printf(
      "%-36s shown after %6.1f ms; longest turn until then %5.1f, while it comes %5.1f, scrolling %5.1f, leaving %5.1f ms\n",
      document.title, shown, opening, after, scrolling, Turns::longest());
  std::fflush(stdout);
}

}  // namespace

int main(int argc, char** argv) {
  const vaelo::bench::SampleFolder folder;
  const auto window = PreviewWindow::open(folder.path());
  vaelo::bench::writePortableDocument(folder.pathOf("document.pdf"), 500);
  vaelo::bench::writeText(folder.pathOf("text.txt"), std::size_t{50} * 1024 * 1024);
  vaelo::bench::writeText(folder.pathOf("source.cpp"), std::size_t{4} * 1024 * 1024);
  vaelo::bench::writeLongLines(folder.pathOf("one.js"), 1, std::size_t{4} * 1024 * 1024);
  vaelo::bench::writeLongLines(folder.pathOf("long.js"), 2000, 1900);
  vaelo::bench::writeLongLines(folder.pathOf("long.txt"), 2000, 1900);
  vaelo::bench::writeLongLines(folder.pathOf("middle.js"), 8000, 250);
  vaelo::bench::writeLongLines(folder.pathOf("late.js"), 50000, 40);
  {
    std::ifstream lines(folder.pathOf("long.js"));
    std::ofstream(folder.pathOf("late.js"), std::ios::app) << lines.rdbuf();
  }
  Turns::watch();
  for (const Document& document : std::vector<Document>{{"portable document of 500 pages", "document.pdf", 6000},
                                                        {"text of 50 MiB", "text.txt", 4000},
                                                        {"source text of 4 MiB", "source.cpp", 4000},
                                                        {"source text in one line of 4 MiB", "one.js", 4000},
                                                        {"source text in lines of 1900", "long.js", 4000},
                                                        {"source text in lines of 300", "middle.js", 4000},
                                                        {"source text that ends in long lines", "late.js", 4000},
                                                        {"text in lines of 1900", "long.txt", 4000}}) {
    if (argc < 2 || document.name == std::string(argv[1])) measure(document, *window, folder.pathOf(document.name));
  }
  window->showNothing();
  return 0;
}
