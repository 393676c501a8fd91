// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

namespace vaelo {

/// A picture that the platform holds decoded. Immutable; safe to hand between threads.
class Image {
 public:
  virtual ~Image() = default;
  /// Size in points.
  virtual double width() const = 0;
  virtual double height() const = 0;
};

using ImageRef = std::shared_ptr<const Image>;

}  // namespace vaelo
