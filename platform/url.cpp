// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/url.h"

#include <algorithm>
#include <cctype>

#include "platform/url_components.h"

namespace vaelo {

namespace {

std::string normalised(std::string_view path) {
  std::string result;
  result.reserve(path.size());
  for (char c : path) {
    if (c == '/' && !result.empty() && result.back() == '/') continue;
    result.push_back(c);
  }
  if (result.size() > 1 && result.back() == '/') result.pop_back();
  if (result.empty()) result = "/";
  return result;
}

int hexDigit(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return -1;
}

std::optional<std::string> percentDecodedBytes(std::string_view text) {
  std::string result;
  result.reserve(text.size());
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] != '%') {
      result.push_back(text[i]);
      continue;
    }
    if (i + 2 >= text.size()) return std::nullopt;
    const int high = hexDigit(text[i + 1]);
    const int low = hexDigit(text[i + 2]);
    if (high < 0 || low < 0) return std::nullopt;
    result.push_back(static_cast<char>(high * 16 + low));
    i += 2;
  }
  return result;
}

bool isUtf8(std::string_view text) {
  for (std::size_t i = 0; i < text.size();) {
    const auto lead = static_cast<unsigned char>(text[i]);
    const std::size_t length = lead < 0x80                   ? 1
                               : lead >= 0xC2 && lead < 0xE0 ? 2
                               : (lead & 0xF0) == 0xE0       ? 3
                               : lead >= 0xF0 && lead < 0xF5 ? 4
                                                             : 0;
    if (length == 0 || i + length > text.size()) return false;
    unsigned long code = length == 1 ? lead : lead & (0xFFu >> (length + 1));
    for (std::size_t k = 1; k < length; ++k) {
      const auto next = static_cast<unsigned char>(text[i + k]);
      if ((next & 0xC0) != 0x80) return false;
      code = code << 6 | (next & 0x3F);
    }
    const bool overlong = (length == 3 && code < 0x800) || (length == 4 && code < 0x10000);
    if (overlong || (code >= 0xD800 && code < 0xE000) || code > 0x10FFFF) return false;
    i += length;
  }
  return true;
}

}  // namespace

URL::URL(std::string_view path, bool isDirectory)
    : rep_(std::make_shared<const Rep>(Rep{normalised(path), isDirectory || (path.size() > 1 && path.back() == '/')})) {}

std::optional<URL> URL::fromFileURLString(std::string_view text) {
  constexpr std::string_view scheme = "file://";
  if (text.substr(0, scheme.size()) != scheme) return std::nullopt;
  text.remove_prefix(scheme.size());
  constexpr std::string_view localhost = "localhost/";
  if (text.substr(0, localhost.size()) == localhost) text.remove_prefix(localhost.size() - 1);
  if (text.empty() || text.front() != '/') return std::nullopt;
  const std::optional<std::string> path = percentDecodedBytes(text.substr(0, text.find_first_of("?#")));
  if (!path || path->find('\0') != std::string::npos) return std::nullopt;
  return URL(*path);
}

std::string URL::lastPathComponent() const {
  if (path().size() == 1) return path();
  return path().substr(path().rfind('/') + 1);
}

std::string URL::pathExtension() const {
  const std::string name = lastPathComponent();
  const std::size_t dot = name.rfind('.');
  if (dot == std::string::npos || dot == 0) return {};
  const std::string extension = name.substr(dot + 1);
  return extension.find(' ') == std::string::npos ? extension : std::string();
}

std::vector<std::string> URL::pathComponents() const {
  std::vector<std::string> components;
  std::size_t start = 0;
  if (path().front() == '/') {
    components.emplace_back("/");
    start = 1;
  }
  while (start < path().size()) {
    const std::size_t end = std::min(path().find('/', start), path().size());
    components.push_back(path().substr(start, end - start));
    start = end + 1;
  }
  return components;
}

URL URL::deletingLastPathComponent() const {
  const std::size_t slash = path().rfind('/');
  if (slash == std::string::npos || slash == 0) return URL("/", true);
  return URL(path().substr(0, slash), true);
}

URL URL::appendingPathComponent(std::string_view name, bool isDirectory) const {
  return URL(path() + "/" + std::string(name), isDirectory);
}

bool URL::isInside(const URL& folder) const {
  const std::string& base = folder.path();
  if (base == "/") return true;
  return path().compare(0, base.size(), base) == 0 && (path().size() == base.size() || path()[base.size()] == '/');
}

std::string URL::absoluteString() const {
  std::string text = "file://" + percentEncoded(path());
  if (hasDirectoryPath() && text.back() != '/') text.push_back('/');
  return text;
}

std::optional<std::string> percentDecoded(std::string_view text) {
  std::optional<std::string> decoded = percentDecodedBytes(text);
  if (!decoded || !isUtf8(*decoded) || decoded->find('\0') != std::string::npos) return std::nullopt;
  return decoded;
}

std::string percentEncoded(std::string_view text, std::string_view alsoAllowed) {
  constexpr char digits[] = "0123456789ABCDEF";
  std::string result;
  for (char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    const bool unreserved =
        byte < 0x80 && (std::isalnum(byte) || std::string_view("-._~").find(c) != std::string_view::npos);
    if (unreserved || alsoAllowed.find(c) != std::string_view::npos) {
      result.push_back(c);
    } else {
      result.push_back('%');
      result.push_back(digits[byte >> 4]);
      result.push_back(digits[byte & 15]);
    }
  }
  return result;
}

}  // namespace vaelo
