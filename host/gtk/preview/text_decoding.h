// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

namespace vaelo {

/// Turns the bytes of a text document, piece by piece, into UTF-8 that a text view takes: valid, and without NUL. The
/// encoding is told by a byte order mark; else it is UTF-8, unless the first bytes that are not ASCII are no UTF-8, which
/// makes it Latin-1 in the form that Windows wrote. What can't be read becomes a replacement character.
class TextDecoding {
 public:
  /// What an incomplete character at the end stands for is known with the next call; `last` says that there is none.
  std::string decode(std::string_view bytes, bool last);
  /// True when the first bytes of a document, some kilobytes of it, are no text in any of these encodings.
  static bool isBinary(std::string_view beginning);

 private:
  enum class Encoding { Unknown, Ascii, Utf8, Utf16Little, Utf16Big, Latin1 };

  void chooseEncoding(std::string_view& bytes, bool last);
  void decodeUtf8(std::string_view bytes, bool last, std::string& text);
  void decodeUtf16(std::string_view bytes, bool last, std::string& text);

  Encoding encoding_ = Encoding::Unknown;
  std::string pending_;  // begins a character
};

}  // namespace vaelo
