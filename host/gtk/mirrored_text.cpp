// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirrored_text.h"

#include <algorithm>
#include <cmath>

#include "host/gtk/fitting_line.h"
#include "host/gtk/pango_graphics.h"
#include "host/support/glib_ptr.h"

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

bool isLargeText() {
  constexpr double large = 1.5;
  return textScale() >= large;
}

// A word as long as those of German is broken and fills two lines by itself.
int linesOf(const Label& label) { return isLargeText() ? 3 * label.numberOfLines() : label.numberOfLines(); }

/// Pictures that were drawn for a fine screen have more pixels than points.
GdkPaintable* inPoints(const GtkImageData& image) {
  const auto length = [](double points) { return static_cast<float>(std::ceil(points)); };
  const graphene_rect_t place = GRAPHENE_RECT_INIT(0, 0, length(image.width()), length(image.height()));
  GtkSnapshot* snapshot = gtk_snapshot_new();
  gdk_paintable_snapshot(image.paintable(), snapshot, static_cast<double>(place.size.width),
                         static_cast<double>(place.size.height));
  return gtk_snapshot_free_to_paintable(snapshot, &place.size);
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

double heightOf(const Label& label, double width) {
  const Size usual = label.sizeThatFits({width, 0});
  if (!isLargeText()) return usual.height;
  if (!label.attributedText()) {
    return PangoGraphics().measure(label.text(), label.font(), width, linesOf(label)).height;
  }
  const auto& runs = label.attributedText()->runs();
  const auto pictures = std::count_if(runs.begin(), runs.end(), [](const auto& run) { return run.image != nullptr; });
  return usual.height * static_cast<double>(std::max<std::ptrdiff_t>(pictures, 1));
}

MirroredText::MirroredText(Label& label) : label_(label), box_(gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 0)) { update(); }

void MirroredText::update() {
  while (GtkWidget* child = gtk_widget_get_first_child(box_)) gtk_box_remove(GTK_BOX(box_), child);
  if (!label_.attributedText()) {
    gtk_widget_set_layout_manager(box_, gtk_box_layout_new(GTK_ORIENTATION_HORIZONTAL));
    gtk_widget_set_hexpand(appendText(label_.text(), box_), TRUE);
    return;
  }
  const bool isColumn = isLargeText();
  gtk_widget_set_layout_manager(box_, isColumn ? gtk_box_layout_new(GTK_ORIENTATION_VERTICAL) : makeFittingLineLayout());
  GtkWidget* line = isColumn ? appendLine() : box_;
  for (const AttributedString::Run& run : label_.attributedText()->runs()) {
    const auto* image = dynamic_cast<const GtkImageData*>(run.image.get());
    if (!image) {
      appendText(run.text, line);
      continue;
    }
    if (isColumn && gtk_widget_get_first_child(line)) line = appendLine();
    const GRef<GdkPaintable> paintable(inPoints(*image));
    GtkWidget* picture = gtk_picture_new_for_paintable(paintable.get());
    gtk_picture_set_can_shrink(GTK_PICTURE(picture), FALSE);
    gtk_widget_set_valign(picture, GTK_ALIGN_CENTER);
    if (gtk_widget_get_first_child(line)) {
      gtk_widget_set_margin_start(picture, static_cast<int>(AttributedString::RoomBeforeImage));
    }
    gtk_box_append(GTK_BOX(line), picture);
  }
  if (!isColumn) appendText("…", box_);
}

GtkWidget* MirroredText::appendLine() {
  GtkWidget* line = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 0);
  gtk_widget_set_vexpand(line, TRUE);
  gtk_box_append(GTK_BOX(box_), line);
  return line;
}

GtkWidget* MirroredText::appendText(const std::string& text, GtkWidget* line) {
  GtkWidget* widget = gtk_label_new(text.c_str());
  style(widget);
  gtk_box_append(GTK_BOX(line), widget);
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
  const int lines = linesOf(label_);
  gtk_label_set_ellipsize(widget, lines == 0 ? PANGO_ELLIPSIZE_NONE : PANGO_ELLIPSIZE_END);
  gtk_label_set_wrap(widget, lines != 1);
  gtk_label_set_wrap_mode(widget, PANGO_WRAP_WORD_CHAR);
  if (lines > 0) gtk_label_set_lines(widget, lines);
  if (const char* name = classOf(label_.textColor())) gtk_widget_add_css_class(text, name);
}

}  // namespace vaelo
