// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "preview/preview_base_view_controller.h"

namespace vaelo {

/// The details of one document. Main thread.
class PreviewDetailsViewController : public PreviewBaseViewController {
 public:
  std::string className() const override { return "PreviewDetailsViewController"; }
};

}  // namespace vaelo
