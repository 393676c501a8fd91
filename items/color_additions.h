// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "platform/ui/color.h"
#include "platform/ui/compositing_filter.h"

namespace vaelo {

/// `color` laid over `backdrop`, by one of the CompositingFilter names; none: source-over. An unknown name, no colour and a
/// transparent one give the backdrop. Apart from the plus modes nothing is clamped to 0..1.
Color vlo_colorBlendedWithColorCompositingFilter(const Color& backdrop, const std::optional<Color>& color,
                                                 const std::optional<std::string>& compositingFilter);
Color vlo_colorBlendedWithColor(const Color& backdrop, const std::optional<Color>& color);

}  // namespace vaelo
