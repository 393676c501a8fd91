// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <memory>

#include "platform/ui/text_field.h"

namespace vaelo {

/// One line of text that the user edits: what is typed is told to the model, which may refuse it.
class MirroredField {
 public:
  explicit MirroredField(TextField& field);
  ~MirroredField();
  GtkWidget* widget() { return entry_; }
  /// Takes over what changed in the model.
  void update();

 private:
  void typed();
  void focusCame();
  void focusLeft();
  void giveFocusBack();
  void selectionMoved();
  void keepSelection();
  void beginWithCaret();

  std::shared_ptr<TextField> field_;
  GtkWidget* entry_;
  GtkEventController* focus_;
  guint idle_ = 0;
  GtkGesture* press_;
  bool pressed_ = false;  ///< and what comes of it is on its way
  guint refusal_ = 0;
  TextRange first_;      ///< the selection with which editing began
  bool edited_ = false;  ///< it was being edited at the latest update
  TextRange known_;      ///< the selection that widget and model agreed on last
  bool taking_ = false;  ///< one of the two is being made to say what the other says
};

}  // namespace vaelo
