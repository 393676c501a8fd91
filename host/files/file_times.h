// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <sys/stat.h>

#include <optional>

#include "platform/date.h"

namespace vaelo {

/// Nothing for a time that does not fit into the clock, which ends in the year 2262: file systems keep later ones.
inline std::optional<Date> dateOf(const statx_timestamp& time) {
  constexpr auto most = std::chrono::duration_cast<std::chrono::seconds>(Date::duration::max()).count() - 1;
  if (time.tv_sec > most || time.tv_sec < -most) return std::nullopt;
  const auto whole = std::chrono::seconds(time.tv_sec) + std::chrono::nanoseconds(time.tv_nsec);
  return Date(std::chrono::duration_cast<Date::duration>(whole));
}

}  // namespace vaelo
