// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include "host/files/long_work.h"

namespace vaelo {

class GtkScreens;

/// What shows, over everything else, while the moves or removals of items take long, with a way to end it. Main thread.
class LongWorkDialog {
 public:
  /// Both outlive it.
  LongWorkDialog(GtkScreens& screens, LongWork& work);
  ~LongWorkDialog();
  LongWorkDialog(const LongWorkDialog&) = delete;
  LongWorkDialog& operator=(const LongWorkDialog&) = delete;

 private:
  void show(const std::string& heading);
  void close();

  GtkScreens& screens_;
  LongWork& work_;
  GtkWidget* dialog_ = nullptr;  // weak pointer
};

}  // namespace vaelo
