// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/document_marks.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>

#include <algorithm>
#include <cstdio>
#include <map>
#include <set>

#include "host/decoder/document_ink.h"
#include "host/decoder/document_words.h"
#include "host/decoder/page_height.h"
#include "host/decoder/stored_marks.h"
#include "host/support/decoder_error.h"

namespace vaelo {

namespace {

constexpr std::size_t MostMarks = 5000;
constexpr off_t LargestDocument = 256 * 1024 * 1024;  // bytes; the marked one is made in memory

PopplerColor colourOf(const DocumentMark& mark) {
  const auto part = [&](std::size_t i) { return static_cast<guint16>(std::clamp(mark.colour[i], 0.0, 1.0) * 65535); };
  return {part(0), part(1), part(2)};
}

// Where the library counts upwards from the lower edge.
PopplerQuadrilateral quadOf(const PageBox& box, double height) {
  const double left = static_cast<double>(box[0]);
  const double top = height - static_cast<double>(box[1]);
  const double right = static_cast<double>(box[2]);
  const double bottom = height - static_cast<double>(box[3]);
  return {{left, top}, {right, top}, {left, bottom}, {right, bottom}};
}

GRef<PopplerAnnot> highlightOf(PopplerDocument* document, const std::vector<PageBox>& lines, double height) {
  GArray* quads = g_array_new(FALSE, FALSE, sizeof(PopplerQuadrilateral));
  PopplerRectangle all = {1e9, 1e9, -1e9, -1e9};
  for (const PageBox& line : lines) {
    const PopplerQuadrilateral quad = quadOf(line, height);
    g_array_append_val(quads, quad);
    all = {std::min(all.x1, quad.p3.x), std::min(all.y1, quad.p3.y), std::max(all.x2, quad.p2.x),
           std::max(all.y2, quad.p2.y)};
  }
  GRef<PopplerAnnot> annotation(poppler_annot_text_markup_new_highlight(document, &all, quads));
  g_array_unref(quads);
  return annotation;
}

GRef<PopplerAnnot> noteOf(PopplerDocument* document, const DocumentMark& mark, double height) {
  constexpr double side = 24;  // of the note's icon, points
  const double left = mark.points.front()[0];
  const double top = height - mark.points.front()[1];
  PopplerRectangle place = {left, top - side, left + side, top};
  GRef<PopplerAnnot> annotation(poppler_annot_text_new(document, &place));
  poppler_annot_set_contents(annotation.get(), mark.text.c_str());
  return annotation;
}

// The library can't write ink. It writes a highlight over the whole page in its place, long enough for the ink's words.
GRef<PopplerAnnot> placeOfInk(PopplerDocument* document, const DocumentMark& mark, PopplerPage* page) {
  double width = 0;
  double height = 0;
  poppler_page_get_size(page, &width, &height);
  GRef<PopplerAnnot> annotation =
      highlightOf(document, {{0, 0, static_cast<float>(width), static_cast<float>(height)}}, height);
  poppler_annot_set_contents(annotation.get(), std::string(inkWordsLength(mark.points.size()), '.').c_str());
  return annotation;
}

// By pages, as they are before anything is changed.
std::map<int, std::vector<StoredMark>> storedBy(PopplerDocument* document, const std::vector<DocumentMark>& marks) {
  std::map<int, std::vector<StoredMark>> stored;
  for (const DocumentMark& mark : marks) {
    if (stored.contains(mark.page)) continue;
    if (const GRef<PopplerPage> page(poppler_document_get_page(document, mark.page)); page) {
      stored[mark.page] = storedMarksOf(page.get());
    }
  }
  return stored;
}

bool change(PopplerPage* page, const std::vector<StoredMark>& stored, const DocumentMark& mark) {
  if (mark.stored >= stored.size()) return false;
  PopplerAnnot* annotation = stored[mark.stored].annotation.get();
  if (mark.kind == DocumentMark::Kind::Removal) {
    poppler_page_remove_annot(page, annotation);
  } else {
    poppler_annot_set_contents(annotation, mark.text.c_str());
  }
  return true;
}

template <typename Number>
bool nextNumbers(std::string_view& words, Number* numbers, std::size_t count) {
  return std::all_of(numbers, numbers + count, [&](Number& number) { return nextNumber(words, number); });
}

}  // namespace

bool DocumentMarks::add(std::string_view words, int pages) {
  DocumentMark mark;
  const std::string_view kind = nextWord(words);
  if (!nextNumber(words, mark.page) || mark.page < 0 || mark.page >= pages || marks_.size() == MostMarks) return false;
  if (kind == "remove" || kind == "rewrite") {
    mark.kind = kind == "remove" ? DocumentMark::Kind::Removal : DocumentMark::Kind::Rewriting;
    if (!nextNumber(words, mark.stored)) return false;
    mark.text = words;
    marks_.push_back(std::move(mark));
    return true;
  }
  if (!nextNumbers(words, mark.colour.data(), mark.colour.size())) return false;
  if (kind == "highlight") {
    mark.kind = DocumentMark::Kind::Highlight;
    while (!words.empty()) {
      if (!nextNumbers(words, mark.lines.emplace_back().data(), 4)) return false;
    }
  } else if (kind == "ink") {
    mark.kind = DocumentMark::Kind::Ink;
    if (!nextNumber(words, mark.width) || mark.width <= 0) return false;
    while (!words.empty()) {
      if (!nextNumbers(words, mark.points.emplace_back().data(), 2)) return false;
    }
  } else if (kind == "note") {
    mark.kind = DocumentMark::Kind::Note;
    if (!nextNumbers(words, mark.points.emplace_back().data(), 2)) return false;
    mark.text = words;
  } else {
    return false;
  }
  if (mark.lines.empty() && mark.points.empty()) return false;
  marks_.push_back(std::move(mark));
  return true;
}

UniqueFd DocumentMarks::apply(const UniqueFd& original, const std::string& password, const char*& problem) const {
  struct stat status = {};
  problem = DecoderError::TooBig;
  if (::fstat(original.get(), &status) != 0 || status.st_size > LargestDocument) return UniqueFd();
  const GRef<PopplerDocument> document = openPortableDocument(original, password, problem);
  if (!document) return UniqueFd();
  problem = DecoderError::Unsupported;
  const auto stored = storedBy(document.get(), marks_);
  // In the order in which they were made, which is the order in which they are written.
  for (const DocumentMark& mark : marks_) {
    const GRef<PopplerPage> page(poppler_document_get_page(document.get(), mark.page));
    if (!page) return UniqueFd();
    if (mark.isChange()) {
      if (!change(page.get(), stored.at(mark.page), mark)) return UniqueFd();
      continue;
    }
    GRef<PopplerAnnot> annotation;
    if (mark.kind == DocumentMark::Kind::Highlight)
      annotation = highlightOf(document.get(), mark.lines, heightOf(page.get()));
    if (mark.kind == DocumentMark::Kind::Note) annotation = noteOf(document.get(), mark, heightOf(page.get()));
    if (mark.kind == DocumentMark::Kind::Ink) annotation = placeOfInk(document.get(), mark, page.get());
    PopplerColor colour = colourOf(mark);
    poppler_annot_set_color(annotation.get(), &colour);
    poppler_annot_set_flags(annotation.get(), POPPLER_ANNOT_FLAG_PRINT);
    poppler_page_add_annot(page.get(), annotation.get());
  }
  UniqueFd marked(::memfd_create("marked", MFD_CLOEXEC | MFD_ALLOW_SEALING));
  // The library keeps what it is given.
  const int given = marked ? ::fcntl(marked.get(), F_DUPFD_CLOEXEC, 3) : -1;
  if (given < 0 || !poppler_document_save_to_fd(document.get(), given, !marks_.empty(), nullptr)) return UniqueFd();
  // It neither closes its stream nor writes out what is still in it; only all streams together can be reached from here.
  if (std::fflush(nullptr) != 0) return UniqueFd();
  if (!writeInk(marked, status.st_size, marks_)) return UniqueFd();
  return marked;
}

// What isn't an object of its own in the file is changed by the library, but not written.
bool DocumentMarks::areIn(PopplerDocument* marked, PopplerDocument* original) const {
  const auto before = storedBy(original, marks_);
  const auto after = storedBy(marked, marks_);
  for (const auto& [page, stored] : before) {
    const auto here = [page = page](const DocumentMark& mark) { return mark.page == page; };
    const auto count = [&](auto&& isOne) {
      return std::count_if(marks_.begin(), marks_.end(),
                           [&](const DocumentMark& mark) { return here(mark) && isOne(mark); });
    };
    const auto added = count([](const DocumentMark& mark) { return !mark.isChange(); });
    const auto removed = count([](const DocumentMark& mark) { return mark.kind == DocumentMark::Kind::Removal; });
    const auto found = after.find(page);
    if (found == after.end()) return false;
    // With a mark goes the window that other programs show its text in.
    const auto left = std::ssize(found->second);
    if (left > std::ssize(stored) + added - removed || (removed == 0 && left < std::ssize(stored) + added)) return false;
    std::multiset<std::string> texts;
    for (const StoredMark& mark : found->second) {
      texts.insert(takeString(poppler_annot_get_contents(mark.annotation.get())));
    }
    for (const DocumentMark& mark : marks_) {
      const bool isText = mark.kind == DocumentMark::Kind::Rewriting || mark.kind == DocumentMark::Kind::Note;
      if (here(mark) && isText && !texts.contains(mark.text)) return false;
    }
  }
  return true;
}

}  // namespace vaelo
