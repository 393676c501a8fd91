// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <poppler.h>

#include <algorithm>
#include <filesystem>
#include <string>
#include <vector>

#include "tests/host/preview_portable_document_screen_test.h"

namespace vaelo::portable_document_test {

struct ReadMark {
  PopplerAnnotType type = POPPLER_ANNOT_UNKNOWN;
  std::string text;
  PopplerRectangle area = {};
};

/// What the library finds on a page of the document, links left out.
inline std::vector<ReadMark> marksIn(const std::string& path, int page) {
  std::vector<ReadMark> found;
  const std::string uri = "file://" + path;
  const GRef<PopplerDocument> document(poppler_document_new_from_file(uri.c_str(), nullptr, nullptr));
  if (!document) return found;
  const GRef<PopplerPage> read(poppler_document_get_page(document.get(), page));
  GList* list = poppler_page_get_annot_mapping(read.get());
  for (GList* each = list; each; each = each->next) {
    const auto* mapping = static_cast<PopplerAnnotMapping*>(each->data);
    found.push_back({poppler_annot_get_annot_type(mapping->annot), takeString(poppler_annot_get_contents(mapping->annot)),
                     mapping->area});
  }
  poppler_page_free_annot_mapping(list);
  return found;
}

inline int pagesIn(const std::string& path) {
  const GRef<PopplerDocument> document(poppler_document_new_from_file(("file://" + path).c_str(), nullptr, nullptr));
  return document ? poppler_document_get_n_pages(document.get()) : -1;
}

/// A document that may be marked, on a screen.
class MarkingTest : public ScreenTest {
 protected:
  using State = PortableDocumentMarks::State;

  void openToMark(int pages = 2) {
    writeDocument(path(), pages);
    original_ = readFile(path());
    open(true);
    ASSERT_TRUE(screen_->markup().mayMark());
    screen_->markup().bar().open(true);
  }
  bool waitFor(State state) {
    return waitUntil([&] { return screen_->markup().marks()->state() == state; });
  }
  void drawLine(int page = 0) {
    screen_->markup().bar().choose(MarkTool::Ink);
    dragFrom(at(page, 50, 200), at(page, 150, 300));
  }
  std::vector<std::string> names() const {
    std::vector<std::string> found;
    for (const auto& entry : std::filesystem::directory_iterator(folder_.path())) found.push_back(entry.path().filename());
    std::sort(found.begin(), found.end());
    return found;
  }

  std::string original_;
};

}  // namespace vaelo::portable_document_test
