// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "platform/image.h"
#include "platform/ui/geometry.h"

namespace vaelo {

/// An image that knows how it came about.
class MemoryImage : public Image {
 public:
  MemoryImage(Size size, std::vector<std::string> origin) : origin_(std::move(origin)), size_(size) {}
  double width() const override { return size_.width; }
  double height() const override { return size_.height; }
  /// The drawing's operations in order, or "icon NAME TYPE FORMAT".
  const std::vector<std::string>& origin() const { return origin_; }

 private:
  std::vector<std::string> origin_;
  Size size_;
};

}  // namespace vaelo
