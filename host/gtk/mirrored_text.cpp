// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirrored_text.h"

#include "host/gtk/pango_graphics.h"

namespace vaelo {

namespace {

/// The desktop's own words for the colours that screens use most, so that they suit light and dark windows alike.
const char* classOf(const Color& color) {
  if (color == Color::gray()) return "dim-label";
  if (color == Color::systemRed()) return "error";
  return nullptr;
}

float textXalignOf(TextAlignment alignment, bool rightToLeft) {
  switch (alignment) {
    case TextAlignment::Center:
      return 0.5F;
    case TextAlignment::Left:
      return rightToLeft ? 1 : 0;
    case TextAlignment::Right:
      return rightToLeft ? 0 : 1;
    case TextAlignment::Natural:
      break;
  }
  return 0;
}

GtkJustification justificationOf(TextAlignment alignment) {
  switch (alignment) {
    case TextAlignment::Center:
      return GTK_JUSTIFY_CENTER;
    case TextAlignment::Right:
      return GTK_JUSTIFY_RIGHT;
    case TextAlignment::Left:
    case TextAlignment::Natural:
      break;
  }
  return GTK_JUSTIFY_LEFT;
}

}  // namespace

PangoAttrList* attributesOf(const Font& font) {
  PangoAttrList* attributes = pango_attr_list_new();
  pango_attr_list_insert(attributes,
                         pango_attr_size_new_absolute(static_cast<int>(font.pointSize * textScale() * PANGO_SCALE)));
  // The family that text is measured in.
  pango_attr_list_insert(attributes, pango_attr_family_new(PangoGraphics::FontFamilies));
  return attributes;
}

MirroredText::MirroredText(Label& label) : label_(label), box_(gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 0)) { update(); }

void MirroredText::update() {
  while (GtkWidget* child = gtk_widget_get_first_child(box_)) gtk_box_remove(GTK_BOX(box_), child);
  if (!label_.attributedText()) {
    gtk_widget_set_hexpand(appendText(label_.text()), TRUE);
    return;
  }
  for (const AttributedString::Run& run : label_.attributedText()->runs()) {
    const auto* image = dynamic_cast<const GtkImageData*>(run.image.get());
    if (!image) {
      appendText(run.text);
      continue;
    }
    GtkWidget* picture = gtk_picture_new_for_paintable(image->paintable());
    gtk_picture_set_can_shrink(GTK_PICTURE(picture), FALSE);
    gtk_widget_set_valign(picture, GTK_ALIGN_CENTER);
    gtk_box_append(GTK_BOX(box_), picture);
  }
}

GtkWidget* MirroredText::appendText(const std::string& text) {
  GtkWidget* widget = gtk_label_new(text.c_str());
  style(widget);
  gtk_box_append(GTK_BOX(box_), widget);
  return widget;
}

void MirroredText::style(GtkWidget* text) const {
  GtkLabel* widget = GTK_LABEL(text);
  const bool rightToLeft = gtk_widget_get_direction(box_) == GTK_TEXT_DIR_RTL;
  PangoAttrList* attributes = attributesOf(label_.font());
  gtk_label_set_attributes(widget, attributes);
  pango_attr_list_unref(attributes);
  gtk_label_set_xalign(widget, textXalignOf(label_.textAlignment(), rightToLeft));
  gtk_label_set_justify(widget, justificationOf(label_.textAlignment()));
  gtk_label_set_ellipsize(widget, label_.numberOfLines() == 0 ? PANGO_ELLIPSIZE_NONE : PANGO_ELLIPSIZE_END);
  gtk_label_set_wrap(widget, label_.numberOfLines() != 1);
  gtk_label_set_wrap_mode(widget, PANGO_WRAP_WORD_CHAR);
  if (label_.numberOfLines() > 0) gtk_label_set_lines(widget, label_.numberOfLines());
  if (const char* name = classOf(label_.textColor())) gtk_widget_add_css_class(text, name);
}

}  // namespace vaelo
