// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <sys/types.h>

#include <cstddef>
#include <vector>

#include "host/decoder/document_marks.h"
#include "host/support/unique_fd.h"

namespace vaelo {

/// Bytes that are enough for the words of a stroke of so many points.
std::size_t inkWordsLength(std::size_t points);

/// Makes ink of the highlights that stand for it behind the original's end. An object keeps its length in bytes, so that the
/// table of objects that was written after it stays right; and it gets no text, so that it is as well in an encrypted
/// document. False when the file isn't as expected; it is of no use then.
bool writeInk(const UniqueFd& file, off_t originalSize, const std::vector<DocumentMark>& marks);

}  // namespace vaelo
