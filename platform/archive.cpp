// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/archive.h"

#include <string>

namespace vaelo {

namespace {

constexpr std::string_view UrlTag = "vlo-archive-1:url:";
constexpr std::string_view TokenTag = "vlo-archive-1:token:";

Data archived(std::string_view tag, const std::string& text) {
  Data data(tag.begin(), tag.end());
  data.insert(data.end(), text.begin(), text.end());
  return data;
}

std::optional<std::string> unarchived(std::string_view tag, const Data& data) {
  const std::string text(data.begin(), data.end());
  if (text.compare(0, tag.size(), tag) != 0) return std::nullopt;
  return text.substr(tag.size());
}

}  // namespace

Data archiveURL(const URL& url) { return archived(UrlTag, url.absoluteString()); }

std::optional<URL> unarchiveURL(const Data& data) {
  const std::optional<std::string> text = unarchived(UrlTag, data);
  return text ? URL::fromFileURLString(*text) : std::nullopt;
}

Data archiveToken(const UbiquityIdentityToken& token) { return archived(TokenTag, token.opaque); }

std::optional<UbiquityIdentityToken> unarchiveToken(const Data& data) {
  std::optional<std::string> text = unarchived(TokenTag, data);
  if (!text || text->empty()) return std::nullopt;
  return UbiquityIdentityToken{std::move(*text)};
}

}  // namespace vaelo
