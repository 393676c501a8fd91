// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <sys/stat.h>

#include "platform/date.h"

namespace vaelo {

inline Date dateOf(const statx_timestamp& time) {
  const auto whole = std::chrono::seconds(time.tv_sec) + std::chrono::nanoseconds(time.tv_nsec);
  return Date(std::chrono::duration_cast<Date::duration>(whole));
}

}  // namespace vaelo
