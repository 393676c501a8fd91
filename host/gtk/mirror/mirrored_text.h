// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "host/gtk/mirror/mirrored_content.h"
#include "platform/ui/font.h"
#include "platform/ui/label.h"

namespace vaelo {

/// A label's text, with pictures in it where it has some.
class MirroredText : public MirroredContent {
 public:
  explicit MirroredText(Label& label);
  GtkWidget* widget() override { return box_; }
  void update() override;

 private:
  GtkWidget* appendText(const std::string& text);
  void style(GtkWidget* text) const;

  Label& label_;
  GtkWidget* box_;
};

/// The attributes that make a text as large as the font says.
PangoAttrList* attributesOf(const Font& font);

}  // namespace vaelo
