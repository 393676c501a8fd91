// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

namespace vaelo {

/// The name of an archive's entry for people: UTF-8 of a bounded length, without what would break a line, or show the name
/// as another one. Bytes that are no UTF-8 are read as the old zip programs wrote them.
std::string archiveName(const char* bytes);

}  // namespace vaelo
