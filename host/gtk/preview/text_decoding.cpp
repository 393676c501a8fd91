// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_decoding.h"

#include <glib.h>

#include <algorithm>
#include <array>
#include <cstdint>

namespace vaelo {

namespace {

constexpr std::string_view Utf8Mark = "\xef\xbb\xbf";
constexpr std::string_view Utf16LittleMark = "\xff\xfe";
constexpr std::string_view Utf16BigMark = "\xfe\xff";
constexpr std::string_view Replacement = "\xef\xbf\xbd";
constexpr gunichar NulPicture = 0x2400;  // a NUL would end the text

// What Windows put where Latin-1 has control characters: 0x80 to 0x9f.
constexpr std::array<std::uint16_t, 32> WindowsCharacters = {0x20ac, 0xfffd, 0x201a, 0x0192, 0x201e, 0x2026, 0x2020, 0x2021,
                                                             0x02c6, 0x2030, 0x0160, 0x2039, 0x0152, 0xfffd, 0x017d, 0xfffd,
                                                             0xfffd, 0x2018, 0x2019, 0x201c, 0x201d, 0x2022, 0x2013, 0x2014,
                                                             0x02dc, 0x2122, 0x0161, 0x203a, 0x0153, 0xfffd, 0x017e, 0x0178};

void append(std::string& text, gunichar character) {
  char bytes[6];
  text.append(bytes, static_cast<std::size_t>(g_unichar_to_utf8(character ? character : NulPicture, bytes)));
}

void decodeLatin1(std::string_view bytes, std::string& text) {
  for (const char byte : bytes) {
    const auto code = static_cast<unsigned char>(byte);
    append(text, code >= 0x80 && code < 0xa0 ? WindowsCharacters[code - 0x80u] : code);
  }
}

// Of text, but for the odd one in a log or a program's output.
bool isOddControl(unsigned char code) { return code < 0x20 && !(code >= '\b' && code <= '\r') && code != 0x1b; }

}  // namespace

bool TextDecoding::isBinary(std::string_view beginning) {
  if (beginning.starts_with(Utf16LittleMark) || beginning.starts_with(Utf16BigMark)) return false;
  if (beginning.find('\0') != std::string_view::npos) return true;
  const char* end = nullptr;
  g_utf8_validate_len(beginning.data(), beginning.size(), &end);
  const std::string_view rest = beginning.substr(static_cast<std::size_t>(end - beginning.data()));
  const bool valid =
      rest.empty() || g_utf8_get_char_validated(rest.data(), static_cast<gssize>(rest.size())) == gunichar(-2);
  const auto odd = std::count_if(beginning.begin(), beginning.end(), [valid](char byte) {
    const auto code = static_cast<unsigned char>(byte);
    return isOddControl(code) || (!valid && code >= 0x80 && code < 0xa0);
  });
  return static_cast<std::size_t>(odd) * 10 > beginning.size();
}

void TextDecoding::chooseEncoding(std::string_view& bytes, bool last) {
  if (bytes.size() < Utf8Mark.size() && !last) return;
  encoding_ = Encoding::Ascii;
  std::size_t mark = 0;
  if (bytes.starts_with(Utf8Mark)) {
    encoding_ = Encoding::Utf8;
    mark = Utf8Mark.size();
  } else if (bytes.starts_with(Utf16LittleMark) || bytes.starts_with(Utf16BigMark)) {
    encoding_ = bytes.starts_with(Utf16LittleMark) ? Encoding::Utf16Little : Encoding::Utf16Big;
    mark = Utf16BigMark.size();
  }
  bytes.remove_prefix(mark);
}

std::string TextDecoding::decode(std::string_view bytes, bool last) {
  std::string joined;
  if (!pending_.empty()) {
    joined = std::move(pending_);
    pending_.clear();
    bytes = joined.append(bytes);
  }
  if (encoding_ == Encoding::Unknown) chooseEncoding(bytes, last);
  std::string text;
  switch (encoding_) {
    case Encoding::Unknown:
      pending_ = bytes;
      break;
    case Encoding::Ascii:
    case Encoding::Utf8:
      decodeUtf8(bytes, last, text);
      break;
    case Encoding::Utf16Little:
    case Encoding::Utf16Big:
      decodeUtf16(bytes, last, text);
      break;
    case Encoding::Latin1:
      decodeLatin1(bytes, text);
      break;
  }
  return text;
}

void TextDecoding::decodeUtf8(std::string_view bytes, bool last, std::string& text) {
  text.reserve(bytes.size());
  while (!bytes.empty()) {
    const char* end = nullptr;
    g_utf8_validate_len(bytes.data(), bytes.size(), &end);
    const std::string_view valid = bytes.substr(0, static_cast<std::size_t>(end - bytes.data()));
    const auto isAscii = [](char byte) { return static_cast<unsigned char>(byte) < 0x80; };
    if (encoding_ == Encoding::Ascii && !std::all_of(valid.begin(), valid.end(), isAscii)) encoding_ = Encoding::Utf8;
    text += valid;
    bytes.remove_prefix(valid.size());
    if (bytes.empty()) return;
    if (bytes.front() == '\0') {
      append(text, 0);
    } else if (!last && g_utf8_get_char_validated(bytes.data(), static_cast<gssize>(bytes.size())) == gunichar(-2)) {
      pending_ = bytes;
      return;
    } else if (encoding_ == Encoding::Ascii) {
      encoding_ = Encoding::Latin1;
      return decodeLatin1(bytes, text);
    } else {
      text += Replacement;
    }
    bytes.remove_prefix(1);
  }
}

void TextDecoding::decodeUtf16(std::string_view bytes, bool last, std::string& text) {
  const auto unitAt = [this, &bytes](std::size_t at) {
    const auto first = static_cast<unsigned char>(bytes[at]);
    const auto second = static_cast<unsigned char>(bytes[at + 1]);
    return static_cast<gunichar>(encoding_ == Encoding::Utf16Little ? first | second << 8 : first << 8 | second);
  };
  std::size_t at = 0;
  while (at + 2 <= bytes.size()) {
    const gunichar unit = unitAt(at);
    const bool high = unit >= 0xd800 && unit < 0xdc00;
    if (high && at + 4 > bytes.size() && !last) break;
    const gunichar low = high && at + 4 <= bytes.size() ? unitAt(at + 2) : 0;
    if (low >= 0xdc00 && low < 0xe000) {
      append(text, 0x10000 + ((unit - 0xd800) << 10) + (low - 0xdc00));
      at += 4;
      continue;
    }
    unit >= 0xd800 && unit < 0xe000 ? void(text += Replacement) : append(text, unit);
    at += 2;
  }
  if (!last)
    pending_ = bytes.substr(at);
  else if (at < bytes.size())
    text += Replacement;
}

}  // namespace vaelo
