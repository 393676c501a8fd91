// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <string>

namespace vaelo {

/// A toast whose text is shown whole on a phone, and a button beside it when one is named.
AdwToast* makeToast(const std::string& text, const char* button = nullptr);

}  // namespace vaelo
