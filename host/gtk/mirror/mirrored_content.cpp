// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirror/mirrored_content.h"

#include "host/gtk/mirror/mirrored_button.h"
#include "host/gtk/mirror/mirrored_drawing.h"
#include "host/gtk/mirror/mirrored_name.h"
#include "host/gtk/mirror/mirrored_picture.h"
#include "host/gtk/mirrored_text.h"

namespace vaelo {

namespace {

/// Follows one of the classes that mirror a model, which it makes and keeps.
template <typename Mirror, typename Model>
class Following : public MirroredContent {
 public:
  explicit Following(Model& model) : mirror_(model) {}
  GtkWidget* widget() override { return mirror_.widget(); }
  void update() override { mirror_.update(); }

 private:
  Mirror mirror_;
};

class Separator : public MirroredContent {
 public:
  GtkWidget* widget() override { return line_; }
  void update() override {}

 private:
  GtkWidget* line_ = gtk_separator_new(GTK_ORIENTATION_HORIZONTAL);
};

}  // namespace

std::unique_ptr<MirroredContent> makeMirroredContent(View& view) {
  if (auto* label = dynamic_cast<Label*>(&view)) return std::make_unique<Following<MirroredText, Label>>(*label);
  if (auto* field = dynamic_cast<TextField*>(&view)) return std::make_unique<Following<MirroredName, TextField>>(*field);
  if (auto* button = dynamic_cast<Button*>(&view)) return std::make_unique<Following<MirroredButton, Button>>(*button);
  if (auto* image = dynamic_cast<ImageView*>(&view)) return std::make_unique<Following<MirroredPicture, ImageView>>(*image);
  if (view.drawsContent()) return std::make_unique<Following<MirroredDrawing, View>>(view);
  // The theme's line suits light and dark windows alike.
  if (view.backgroundColor() == Color::barHairlineShadow()) return std::make_unique<Separator>();
  return nullptr;
}

}  // namespace vaelo
