// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/url_components.h"

#include <algorithm>
#include <cctype>

#include "platform/url.h"

namespace vaelo {

namespace {

/// Characters that RFC 3986 allows somewhere in a URL; anything else makes the text no URL at all.
bool mayStandInURL(char c) {
  const auto byte = static_cast<unsigned char>(c);
  return byte < 0x80 &&
         (std::isalnum(byte) || std::string_view("-._~:/?#[]@!$&'()*+,;=%").find(c) != std::string_view::npos);
}

bool isScheme(std::string_view text) {
  return !text.empty() && std::isalpha(static_cast<unsigned char>(text.front())) &&
         std::all_of(text.begin(), text.end(),
                     [](char c) { return std::isalnum(static_cast<unsigned char>(c)) || c == '+' || c == '-' || c == '.'; });
}

bool parseQuery(std::string_view query, std::vector<URLComponents::QueryItem>& items) {
  while (!query.empty()) {
    const std::string_view pair = query.substr(0, query.find('&'));
    query.remove_prefix(std::min(pair.size() + 1, query.size()));
    const std::size_t equals = pair.find('=');
    std::optional<std::string> name = percentDecoded(pair.substr(0, equals));
    if (!name) return false;
    URLComponents::QueryItem item{std::move(*name), std::nullopt};
    if (equals != std::string_view::npos) {
      item.value = percentDecoded(pair.substr(equals + 1));
      if (!item.value) return false;
    }
    items.push_back(std::move(item));
  }
  return true;
}

}  // namespace

std::optional<URLComponents> URLComponents::parse(std::string_view text) {
  if (!std::all_of(text.begin(), text.end(), mayStandInURL)) return std::nullopt;
  URLComponents parts;
  text = text.substr(0, text.find('#'));
  const std::size_t question = text.find('?');
  if (question != std::string_view::npos) {
    if (!parseQuery(text.substr(question + 1), parts.queryItems)) return std::nullopt;
    text = text.substr(0, question);
  }
  const std::size_t colon = text.find(':');
  const std::size_t slash = text.find('/');
  if (colon != std::string_view::npos && (slash == std::string_view::npos || colon < slash)) {
    if (!isScheme(text.substr(0, colon))) return std::nullopt;
    parts.scheme = text.substr(0, colon);
    text.remove_prefix(colon + 1);
  }
  if (text.substr(0, 2) == "//") {
    text.remove_prefix(2);
    const std::string_view host = text.substr(0, text.find('/'));
    text.remove_prefix(host.size());
    std::optional<std::string> decoded = percentDecoded(host);
    if (!decoded) return std::nullopt;
    parts.host = std::move(*decoded);
  }
  std::optional<std::string> path = percentDecoded(text);
  if (!path) return std::nullopt;
  parts.path = std::move(*path);
  return parts;
}

}  // namespace vaelo
