// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/ui/view.h"

namespace vaelo {

/// Progress as a slice of a pie that grows clockwise. Main thread.
class PieProgressIndicatorView : public View {
 public:
  explicit PieProgressIndicatorView(const Rect& frame = {});
  /// From 0 to 1.
  double progress() const { return progress_; }
  void setProgress(double progress);
  void drawRect(DrawingContext& context, const Rect& rect) override;
  bool drawsContent() const override { return true; }

 private:
  double progress_ = 0;
};

}  // namespace vaelo
