// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <glib.h>

#include <string>

#include "host/support/glib_ptr.h"
#include "platform/url.h"

namespace vaelo {

/// The item's name for people: a label of bytes that are no UTF-8 ends the process as soon as a screen reader asks for it.
inline std::string displayNameOf(const URL& item) {
  return takeString(g_filename_display_name(item.lastPathComponent().c_str()));
}

}  // namespace vaelo
