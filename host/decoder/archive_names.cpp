// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/archive_names.h"

#include <glib.h>

#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr int MostCharacters = 1000;

std::string validText(const char* bytes) {
  if (g_utf8_validate(bytes, -1, nullptr)) return bytes;
  if (char* converted = g_convert(bytes, -1, "UTF-8", "CP437", nullptr, nullptr, nullptr)) return takeString(converted);
  return takeString(g_utf8_make_valid(bytes, -1));
}

// Signs of direction make "gpj.exe" of "exe.jpg".
bool changesDirection(gunichar character) {
  return character == 0x061c || character == 0x200e || character == 0x200f || (character >= 0x202a && character <= 0x202e) ||
         (character >= 0x2066 && character <= 0x2069);
}

bool isShown(gunichar character) {
  return !g_unichar_iscntrl(character) && character != 0x2028 && character != 0x2029 && !changesDirection(character);
}

}  // namespace

std::string archiveName(const char* bytes) {
  const std::string text = validText(bytes);
  std::string name;
  int count = 0;
  for (const char* place = text.c_str(); *place; place = g_utf8_next_char(place)) {
    if (++count > MostCharacters) return name + "…";
    if (isShown(g_utf8_get_char(place))) {
      name.append(place, static_cast<std::size_t>(g_utf8_next_char(place) - place));
    } else {
      name += "\xef\xbf\xbd";
    }
  }
  return name;
}

}  // namespace vaelo
