// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/ui/graphics.h"

namespace vaelo {

/// Letters of five points each, in one line; pictures that keep what was drawn.
class MemoryGraphics : public Graphics {
 public:
  FontMetrics fontMetrics(const Font& font) override;
  Size measure(const std::string& text, const Font& font, double maxWidth = 0, int maxLines = 1) override;
  ImageRef renderImage(const Size& size, const std::function<void(DrawingContext&)>& draw) override;
  ImageRef documentIcon(const std::string& fileName, const std::optional<std::string>& typeIdentifier,
                        IconFormat format) override;
};

}  // namespace vaelo
