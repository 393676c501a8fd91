// SPDX-License-Identifier: GPL-3.0-or-later
// Large documents for the programs that time previews, made anew in a folder of their own and gone with it.
#pragma once

#include <cairo-pdf.h>
#include <gdk-pixbuf/gdk-pixbuf.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

namespace vaelo::bench {

class SampleFolder {
 public:
  SampleFolder() : path_(std::filesystem::temp_directory_path() / "vaelo-bench-XXXXXX") {
    if (!::mkdtemp(path_.data())) std::abort();
  }
  ~SampleFolder() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
  }
  SampleFolder(const SampleFolder&) = delete;
  SampleFolder& operator=(const SampleFolder&) = delete;
  const std::string& path() const { return path_; }
  std::string pathOf(const std::string& name) const { return path_ + "/" + name; }

 private:
  std::string path_;
};

/// Like a photograph: slopes of colour with grain, so that it neither shrinks to nothing nor is nothing but noise.
inline void writePhotograph(const std::string& path, int width, int height) {
  GdkPixbuf* picture = gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, width, height);
  guchar* rows = gdk_pixbuf_get_pixels(picture);
  const int stride = gdk_pixbuf_get_rowstride(picture);
  unsigned grain = 1;
  for (int y = 0; y < height; ++y) {
    guchar* pixel = rows + static_cast<std::size_t>(y) * static_cast<std::size_t>(stride);
    for (int x = 0; x < width; ++x, pixel += 3) {
      grain = grain * 1664525U + 1013904223U;
      const unsigned noise = grain >> 28;
      pixel[0] = static_cast<guchar>(static_cast<unsigned>(x * 200 / width) + noise);
      pixel[1] = static_cast<guchar>(static_cast<unsigned>(y * 200 / height) + noise);
      pixel[2] = static_cast<guchar>(static_cast<unsigned>((x / 64 + y / 64) % 2 * 90 + 60) + noise);
    }
  }
  if (!gdk_pixbuf_save(picture, path.c_str(), "jpeg", nullptr, "quality", "90", nullptr)) std::abort();
  g_object_unref(picture);
}

/// Pages of A4 full of text, each with a drawing.
inline void writePortableDocument(const std::string& path, int pages) {
  cairo_surface_t* surface = cairo_pdf_surface_create(path.c_str(), 595, 842);
  cairo_t* cairo = cairo_create(surface);
  cairo_select_font_face(cairo, "Serif", CAIRO_FONT_SLANT_NORMAL, CAIRO_FONT_WEIGHT_NORMAL);
  cairo_set_font_size(cairo, 11);
  for (int page = 1; page <= pages; ++page) {
    for (int line = 0; line < 52; ++line) {
      cairo_move_to(cairo, 50, 60 + line * 14);
      const std::string text =
          std::to_string(page) + "." + std::to_string(line) +
          " The river rises in the hills, and every river has a name until it meets the sea, where none is.";
      cairo_show_text(cairo, text.c_str());
    }
    for (int petal = 0; petal < 200; ++petal) {
      cairo_set_source_rgba(cairo, petal / 200.0, 0.4, 0.6, 0.3);
      cairo_arc(cairo, 300 + (petal * 37 + page) % 200, 400 + (petal * 53) % 200, 20, 0, 6.28);
      cairo_fill(cairo);
    }
    cairo_set_source_rgb(cairo, 0, 0, 0);
    cairo_show_page(cairo);
  }
  cairo_destroy(cairo);
  cairo_surface_finish(surface);
  cairo_surface_destroy(surface);
}

inline void writeText(const std::string& path, std::size_t bytes) {
  std::ofstream file(path);
  std::size_t written = 0;
  for (std::size_t line = 1; written < bytes; ++line) {
    const std::string text = std::to_string(line) + " All work and no play makes for a dull day, said the clerk.\n";
    file << text;
    written += text.size();
  }
}

/// Source text as programs write it for programs: all of it in few lines.
inline void writeLongLines(const std::string& path, std::size_t lines, std::size_t lineBytes) {
  std::ofstream file(path);
  for (std::size_t line = 0; line < lines; ++line) {
    std::size_t written = 0;
    for (std::size_t word = 0; written < lineBytes; ++word) {
      const std::string text =
          "function f" + std::to_string(word) + "(a,b){return a+\"text\"+(b?" + std::to_string(line) + ":'x');}";
      file << text;
      written += text.size();
    }
    file << '\n';
  }
}

}  // namespace vaelo::bench
