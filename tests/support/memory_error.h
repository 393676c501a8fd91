// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "platform/error.h"

namespace vaelo {

/// Of the drive: the item is not in it.
inline constexpr int NotInDrive = 7;

/// An error as the services make it: about a path, with a sentence for a person.
inline Error memoryError(int code, const std::string& path, std::string words = "It can't be used") {
  return {FileErrorDomain, code, {{FilePathErrorKey, path}}, std::move(words), {}};
}
inline Error noSuchItem(const std::string& path, int code = FileErrorCode::NoSuchFile) {
  return memoryError(code, path, "No such file");
}

}  // namespace vaelo
