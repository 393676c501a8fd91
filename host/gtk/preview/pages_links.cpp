// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_links.h"

#include <glib.h>

#include <algorithm>
#include <sstream>

#include "host/decoder/document_words.h"

namespace vaelo {

std::optional<PageLink> pageLinkIn(const std::string& line) {
  std::string_view words = line;
  const std::string_view kind = nextWord(words);
  PageLink link;
  for (double* edge : {&link.rect.left, &link.rect.top, &link.rect.right, &link.rect.bottom}) {
    if (!nextNumber(words, *edge)) return std::nullopt;
  }
  if (kind == "page") {
    link.kind = PageLink::Kind::Page;
    if (!nextNumber(words, link.page) || !nextNumber(words, link.top) || link.page < 0) return std::nullopt;
    return link;
  }
  if (kind != "link" && kind != "note") return std::nullopt;
  link.kind = kind == "link" ? PageLink::Kind::Address : PageLink::Kind::Note;
  link.text = words;
  if (link.text.empty() || !g_utf8_validate(link.text.c_str(), static_cast<gssize>(link.text.size()), nullptr)) {
    return std::nullopt;
  }
  return link;
}

void PagesLinks::at(const PagePlace& place, std::function<void(const PageLink*)> found) {
  if (pages_.contains(place.page)) return tell(place, found);
  source_.ask("areas " + std::to_string(place.page),
              [this, place, found = std::move(found)](const DecoderProcess::Answer& answer) {
                std::vector<PageLink>& links = pages_[place.page];
                links.clear();
                std::istringstream lines(answer.text);
                for (std::string line; std::getline(lines, line);) {
                  if (const auto link = pageLinkIn(line)) links.push_back(*link);
                }
                tell(place, found);
              });
}

void PagesLinks::tell(const PagePlace& place, const std::function<void(const PageLink*)>& found) const {
  const std::vector<PageLink>& links = pages_.at(place.page);
  const auto hit = std::find_if(links.rbegin(), links.rend(), [&](const PageLink& link) {
    return place.x >= link.rect.left && place.x <= link.rect.right && place.y >= link.rect.top &&
           place.y <= link.rect.bottom;
  });
  found(hit == links.rend() ? nullptr : &*hit);
}

}  // namespace vaelo
