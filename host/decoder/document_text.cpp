// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/document_text.h"

#include <fcntl.h>

#include <algorithm>

#include "host/decoder/document_words.h"
#include "host/decoder/page_height.h"
#include "host/support/decoder_error.h"

namespace vaelo {

namespace {

constexpr std::size_t MostPageCharacters = 500'000;  // on a page

std::string oneLine(std::string text) {
  std::replace_if(
      text.begin(), text.end(), [](char c) { return static_cast<unsigned char>(c) < ' '; }, ' ');
  return text;
}

std::string areaLine(const char* kind, const PageBox& box) {
  std::string line = kind;
  for (const float edge : box) appendNumber(line, static_cast<double>(edge));
  return line;
}

// " TARGET TOP" of a link into the document; empty when it leads nowhere.
std::string targetOf(PopplerDocument* document, const PopplerDest* dest) {
  PopplerDest* named = nullptr;
  if (dest && dest->type == POPPLER_DEST_NAMED && dest->named_dest) {
    named = poppler_document_find_dest(document, dest->named_dest);
    dest = named;
  }
  std::string target;
  if (dest && dest->page_num > 0) {
    double top = 0;
    if (const GRef<PopplerPage> page(poppler_document_get_page(document, dest->page_num - 1)); page && dest->change_top) {
      top = std::max(0.0, heightOf(page.get()) - dest->top);
    }
    target = " " + std::to_string(dest->page_num - 1);
    appendNumber(target, top);
  }
  if (named) poppler_dest_free(named);
  return target;
}

}  // namespace

PageBox flipped(const PopplerRectangle& area, double height) {
  const auto top = static_cast<float>(height - std::max(area.y1, area.y2));
  const auto bottom = static_cast<float>(height - std::min(area.y1, area.y2));
  return {static_cast<float>(std::min(area.x1, area.x2)), top, static_cast<float>(std::max(area.x1, area.x2)), bottom};
}

GRef<PopplerDocument> openPortableDocument(const UniqueFd& file, const std::string& password, const char*& problem) {
  GError* error = nullptr;
  // The library closes what it is given.
  GRef<PopplerDocument> document(poppler_document_new_from_fd(::fcntl(file.get(), F_DUPFD_CLOEXEC, 3),
                                                              password.empty() ? nullptr : password.c_str(), &error));
  const GErrorPtr owned(error);
  const bool locked = g_error_matches(error, POPPLER_ERROR, POPPLER_ERROR_ENCRYPTED);
  if (!document) problem = locked ? DecoderError::Locked : DecoderError::Damaged;
  return document;
}

PageText textOf(PopplerPage* page) {
  PageText found;
  found.text = takeString(poppler_page_get_text(page));
  PopplerRectangle* boxes = nullptr;
  guint count = 0;
  if (!poppler_page_get_text_layout(page, &boxes, &count)) count = 0;
  const auto characters = static_cast<std::size_t>(g_utf8_strlen(found.text.c_str(), -1));
  const std::size_t used = std::min({static_cast<std::size_t>(count), characters, MostPageCharacters});
  for (std::size_t i = 0; i < used; ++i) {
    found.boxes.push_back({static_cast<float>(boxes[i].x1), static_cast<float>(boxes[i].y1), static_cast<float>(boxes[i].x2),
                           static_cast<float>(boxes[i].y2)});
  }
  g_free(boxes);
  const char* end = g_utf8_offset_to_pointer(found.text.c_str(), static_cast<glong>(used));
  found.text.resize(static_cast<std::size_t>(end - found.text.c_str()));
  return found;
}

std::vector<PageBox> findText(PopplerPage* page, const std::string& text, int most) {
  const double height = heightOf(page);
  std::vector<PageBox> found;
  GList* matches = poppler_page_find_text(page, text.c_str());
  for (GList* match = matches; match && std::ssize(found) < most; match = match->next) {
    found.push_back(flipped(*static_cast<PopplerRectangle*>(match->data), height));
  }
  g_list_free_full(
      matches, +[](gpointer match) { poppler_rectangle_free(static_cast<PopplerRectangle*>(match)); });
  return found;
}

std::vector<std::string> areasOf(PopplerDocument* document, PopplerPage* page) {
  const double height = heightOf(page);
  std::vector<std::string> lines;
  GList* links = poppler_page_get_link_mapping(page);
  for (GList* each = links; each; each = each->next) {
    const auto* link = static_cast<PopplerLinkMapping*>(each->data);
    if (link->action->type == POPPLER_ACTION_GOTO_DEST) {
      const std::string target = targetOf(document, link->action->goto_dest.dest);
      if (!target.empty()) lines.push_back(areaLine("page", flipped(link->area, height)) + target);
    } else if (link->action->type == POPPLER_ACTION_URI && link->action->uri.uri) {
      lines.push_back(areaLine("link", flipped(link->area, height)) + " " + oneLine(link->action->uri.uri));
    }
  }
  poppler_page_free_link_mapping(links);
  GList* annotations = poppler_page_get_annot_mapping(page);
  for (GList* each = annotations; each; each = each->next) {
    const auto* mapping = static_cast<PopplerAnnotMapping*>(each->data);
    if (!POPPLER_IS_ANNOT_TEXT(mapping->annot)) continue;
    const std::string note = takeString(poppler_annot_get_contents(mapping->annot));
    if (!note.empty()) lines.push_back(areaLine("note", flipped(mapping->area, height)) + " " + oneLine(note));
  }
  poppler_page_free_annot_mapping(annotations);
  return lines;
}

}  // namespace vaelo
