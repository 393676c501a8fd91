// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <string>

#include "platform/ui/font.h"
#include "platform/ui/label.h"

namespace vaelo {

/// A label's text, with pictures in it where it has some.
class MirroredText {
 public:
  explicit MirroredText(Label& label);
  GtkWidget* widget() { return box_; }
  /// Takes over what changed in the model.
  void update();

 private:
  GtkWidget* appendLine();
  GtkWidget* appendText(const std::string& text, GtkWidget* line);
  void style(GtkWidget* text) const;

  Label& label_;
  GtkWidget* box_;
};

/// How high the label's text is in so much room, in points. Where people have letters so large that a line holds few words
/// it takes twice the lines that the label says, and things with pictures stand below each other.
double heightOf(const Label& label, double width);

/// The attributes that make a text as large as the font says.
PangoAttrList* attributesOf(const Font& font);

}  // namespace vaelo
