// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <array>
#include <map>
#include <string>
#include <vector>

#include "platform/image.h"
#include "platform/ui/color.h"
#include "platform/ui/geometry.h"

namespace vaelo {

/// The user's tags with their colours, which the synced key-value store keeps and other programs write, and the coloured
/// dots that stand for them. Follows the store from the first use on. Any thread, except blipWithTag: main thread.
class FileTags {
 public:
  static std::map<std::string, Color> tagColorsByTag();
  /// In the user's order; a name may be there twice.
  static std::vector<std::string> allTags();
  /// The colours of label indexes 0 to 7.
  static const std::array<Color, 8>& _tagBlipColors();
  /// Reads the tags from the store again.
  static void _tagColorsDidChange();
  /// A dot at the offset in an image of that size, in points; blank for an unknown tag, null without one.
  static ImageRef blipWithTagImageSizeBlipHeightOffset(const std::string& tag, const Size& imageSize, double blipHeight,
                                                       const Point& offset);
};

}  // namespace vaelo
