// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cairo-pdf.h>
#include <gtk/gtk.h>

#include <fstream>
#include <functional>
#include <sstream>
#include <string>
#include <vector>

#include "host/gtk/preview/decoder_process.h"
#include "tests/host/list_test_folder.h"

namespace vaelo::portable_document_test {

/// Writes a document of so many pages, each with its number and what `draw` draws.
inline void writeDocument(const std::string& path, int pages, double width = 400, double height = 600,
                          const std::function<void(cairo_t*, int page)>& draw = {}) {
  cairo_surface_t* surface = cairo_pdf_surface_create(path.c_str(), width, height);
  cairo_t* context = cairo_create(surface);
  for (int page = 0; page < pages; ++page) {
    cairo_select_font_face(context, "DejaVu Sans", CAIRO_FONT_SLANT_NORMAL, CAIRO_FONT_WEIGHT_NORMAL);
    cairo_set_font_size(context, 20);
    cairo_move_to(context, 40, 60);
    cairo_show_text(context, ("This is page " + std::to_string(page + 1) + ".").c_str());
    if (draw) draw(context, page);
    cairo_show_page(context);
  }
  cairo_destroy(context);
  cairo_surface_finish(surface);
  cairo_surface_destroy(surface);
}

/// A document of one empty page, made by hand, with more words in its page's dictionary and in that of the file, and with
/// more objects, of which the first is 5.
inline std::string smallDocument(const std::string& pageWords = "", const std::string& content = "",
                                 const std::string& contentWords = "", const std::vector<std::string>& more = {}) {
  std::vector<std::string> objects = {
      "<< /Type /Catalog /Pages 2 0 R >>", "<< /Type /Pages /Kids [3 0 R] /Count 1 >>",
      "<< /Type /Page /Parent 2 0 R /MediaBox [0 0 400 600] /Contents 4 0 R " + pageWords + " >>",
      "<< /Length " + std::to_string(content.size()) + " " + contentWords + " >>\nstream\n" + content + "\nendstream"};
  objects.insert(objects.end(), more.begin(), more.end());
  const std::string count = std::to_string(objects.size() + 1);
  std::string text = "%PDF-1.4\n";
  std::string table = "xref\n0 " + count + "\n0000000000 65535 f \n";
  int number = 0;
  for (const std::string& object : objects) {
    char line[32];
    g_snprintf(line, sizeof line, "%010zu 00000 n \n", text.size());
    table += line;
    text += std::to_string(++number) + " 0 obj\n" + object + "\nendobj\n";
  }
  const std::size_t start = text.size();
  return text + table + "trailer\n<< /Size " + count + " /Root 1 0 R >>\nstartxref\n" + std::to_string(start) + "\n%%EOF\n";
}

inline std::string readFile(const std::string& path) {
  std::stringstream content;
  content << std::ifstream(path, std::ios::binary).rdbuf();
  return content.str();
}

/// Asks the decoder and waits for its answer.
inline DecoderProcess::Answer askDecoder(DecoderProcess& decoder, const std::string& request,
                                         std::chrono::milliseconds limit = std::chrono::seconds(20)) {
  DecoderProcess::Answer got;
  bool answered = false;
  decoder.ask(
      request,
      [&](DecoderProcess::Answer answer) {
        got = std::move(answer);
        answered = true;
      },
      limit);
  while (!answered) g_main_context_iteration(nullptr, TRUE);
  return got;
}

}  // namespace vaelo::portable_document_test
