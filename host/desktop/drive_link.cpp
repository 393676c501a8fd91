// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/drive_link.h"

#include <glib.h>

namespace vaelo {

std::optional<std::string> driveLinkTo(const URL& item) {
  const std::string& path = item.path();
  if (!g_utf8_validate(path.c_str(), static_cast<gssize>(path.size()), nullptr)) return std::nullopt;
  // Encoded twice, since whoever follows the link decodes its path twice.
  return "vaelodriveapp:" + percentEncoded(percentEncoded(path));
}

}  // namespace vaelo
