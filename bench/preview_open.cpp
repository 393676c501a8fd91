// SPDX-License-Identifier: GPL-3.0-or-later
// From tap to first picture: a photograph of 12 megapixels, a portable document of 500 pages and a text of 50 MiB in a
// preview, beside the bare library that decodes the same first screen into the same window. Medians of taking turns.
//   preview_open [ROUNDS]
#include <gtksourceview/gtksource.h>
#include <poppler.h>

#include <cstdio>
#include <cstdlib>
#include <functional>

#include "bench/preview_samples.h"
#include "bench/preview_window.h"
#include "host/gtk/cairo_texture.h"

namespace {

using vaelo::takeCairoTexture;
using vaelo::bench::PreviewWindow;

GtkWidget* photograph(const std::string& path) {
  GdkPixbuf* picture = gdk_pixbuf_new_from_file_at_size(path.c_str(), PreviewWindow::Width, PreviewWindow::Height, nullptr);
  GdkTexture* texture = gdk_texture_new_for_pixbuf(picture);
  GtkWidget* widget = gtk_picture_new_for_paintable(GDK_PAINTABLE(texture));
  g_object_unref(texture);
  g_object_unref(picture);
  return widget;
}

GtkWidget* firstPage(const std::string& path) {
  char* address = g_filename_to_uri(path.c_str(), nullptr, nullptr);
  PopplerDocument* document = poppler_document_new_from_file(address, nullptr, nullptr);
  PopplerPage* page = poppler_document_get_page(document, 0);
  double pageWidth = 0;
  double pageHeight = 0;
  poppler_page_get_size(page, &pageWidth, &pageHeight);
  constexpr int width = PreviewWindow::Width;
  const int height = static_cast<int>(width * pageHeight / pageWidth);
  cairo_surface_t* surface = cairo_image_surface_create(CAIRO_FORMAT_ARGB32, width, height);
  cairo_t* cairo = cairo_create(surface);
  cairo_set_source_rgb(cairo, 1, 1, 1);
  cairo_paint(cairo);
  cairo_scale(cairo, width / pageWidth, width / pageWidth);
  poppler_page_render(page, cairo);
  cairo_destroy(cairo);
  GdkTexture* texture = takeCairoTexture(surface);
  GtkWidget* widget = gtk_picture_new_for_paintable(GDK_PAINTABLE(texture));
  g_object_unref(texture);
  g_object_unref(page);
  g_object_unref(document);
  g_free(address);
  return widget;
}

GtkWidget* firstLines(const std::string& path) {
  std::string text(64 * 1024, '\0');
  std::ifstream(path).read(text.data(), static_cast<std::streamsize>(text.size()));
  GtkSourceBuffer* buffer = gtk_source_buffer_new(nullptr);
  gtk_text_buffer_set_text(GTK_TEXT_BUFFER(buffer), text.data(), static_cast<int>(text.size()));
  GtkWidget* view = gtk_source_view_new_with_buffer(buffer);
  gtk_text_view_set_monospace(GTK_TEXT_VIEW(view), TRUE);
  gtk_text_view_set_wrap_mode(GTK_TEXT_VIEW(view), GTK_WRAP_WORD_CHAR);
  g_object_unref(buffer);
  GtkWidget* scrolled = gtk_scrolled_window_new();
  gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scrolled), view);
  return scrolled;
}

struct Sample {
  const char* title;
  std::string path;
  GtkWidget* (*bare)(const std::string& path);
};

}  // namespace

int main(int argc, char** argv) {
  const int rounds = argc > 1 ? std::max(std::atoi(argv[1]), 1) : 15;
  const vaelo::bench::SampleFolder folder;
  const auto window = PreviewWindow::open(folder.path());
  const std::vector<Sample> samples = {{"photograph of 12 megapixels", folder.pathOf("photograph.jpg"), photograph},
                                       {"portable document of 500 pages", folder.pathOf("document.pdf"), firstPage},
                                       {"text of 50 MiB", folder.pathOf("text.txt"), firstLines}};
  vaelo::bench::writePhotograph(samples[0].path, 4000, 3000);
  vaelo::bench::writePortableDocument(samples[1].path, 500);
  vaelo::bench::writeText(samples[2].path, std::size_t{50} * 1024 * 1024);
  std::printf("%-32s %10s %10s %10s %7s\n", "milliseconds", "preview", "bare", "decoding", "ratio");
  for (const Sample& sample : samples) {
    std::vector<double> preview;
    std::vector<double> bare;
    std::vector<double> decoding;
    for (int round = 0; round <= rounds; ++round) {
      window->showPage();
      window->showNothing();
      const double shown = window->show(sample.path);
      window->showNothing();
      PreviewWindow::run(300);  // a process that ends takes its time
      window->showOther(gtk_label_new("Nothing"));
      window->paint();
      PreviewWindow::rest();
      const double begun = vaelo::bench::now();
      GtkWidget* widget = sample.bare(sample.path);
      const double decoded = vaelo::bench::now() - begun;
      window->showOther(widget);
      window->paint();
      if (round == 0) continue;  // in which everything is loaded from the disk
      bare.push_back(vaelo::bench::now() - begun);
      decoding.push_back(decoded);
      preview.push_back(shown);
    }
    const double first = vaelo::bench::median(preview);
    const double second = vaelo::bench::median(bare);
    std::printf("%-32s %10.1f %10.1f %10.1f %7.2f\n", sample.title, first, second, vaelo::bench::median(decoding),
                first / second);
    std::fflush(stdout);
  }
  window->showPage();
  return 0;
}
