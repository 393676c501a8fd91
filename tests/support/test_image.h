// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/image.h"

namespace vaelo {

/// A square picture without content.
class TestImage : public Image {
 public:
  double width() const override { return 1024; }
  double height() const override { return 1024; }
};

}  // namespace vaelo
