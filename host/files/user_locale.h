// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

namespace vaelo {

/// The user's choice for one purpose ("LC_TIME", "LC_COLLATE"), read from the environment as the C library reads it, whether
/// or not that has been done yet. The C locale's order and dates are not for people: with "C.UTF-8" it is the first language
/// of LANGUAGE, as for texts; else, and where there is no choice, "en_US".
std::string userLocale(const char* purpose);

}  // namespace vaelo
