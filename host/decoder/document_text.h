// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <poppler.h>

#include <array>
#include <string>
#include <vector>

#include "host/support/glib_ptr.h"
#include "host/support/unique_fd.h"

namespace vaelo {

/// Left, top, right, bottom; points from the upper left corner of the page as it is shown.
using PageBox = std::array<float, 4>;

/// The characters of a page in the order in which people read, and the box of each.
struct PageText {
  std::string text;  ///< UTF-8, as many characters as boxes
  std::vector<PageBox> boxes;
};

/// Where the library counts upwards from the lower edge.
PageBox flipped(const PopplerRectangle& area, double height);

/// Reads the document in the file, which stays open; `password` may be empty. Null with a word of DecoderError in `problem`
/// when that can't be done.
GRef<PopplerDocument> openPortableDocument(const UniqueFd& file, const std::string& password, const char*& problem);

PageText textOf(PopplerPage* page);
/// Where the text stands on the page, whatever its case; at most `most` places.
std::vector<PageBox> findText(PopplerPage* page, const std::string& text, int most);
/// Links into the document, links out of it, and notes, a line each as DocumentDecoder sends them.
std::vector<std::string> areasOf(PopplerDocument* document, PopplerPage* page);

}  // namespace vaelo
