// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/folder_row.h"

#include <algorithm>
#include <utility>

#include "host/gtk/pango_graphics.h"
#include "host/support/texts.h"

namespace vaelo {
namespace {

constexpr int Margin = 8;
constexpr int Gap = 12;
constexpr int MarkSize = 22;
constexpr int CloudSize = 16;
constexpr int LeastRowHeight = 48;
constexpr int CellWidth = 100;

struct Row {
  GtkWidget parent;
  RowContext* context;
  GObject* item;
  PangoLayout* name;
  PangoLayout* second;
  bool blank;  // drew nothing, being far from what is seen
  float uncovered;
};

struct RowClass {
  GtkWidgetClass parent;
};

GType rowGetType();
Row* rowOf(gpointer widget) { return static_cast<Row*>(widget); }

GtkWidgetClass* parentClass() { return static_cast<GtkWidgetClass*>(g_type_class_peek(GTK_TYPE_WIDGET)); }

/// Letters of twice the size need wider cells, of which two are still to stand side by side on a phone.
int cellWidth() { return static_cast<int>(CellWidth * std::clamp(textScale(), 1.0, 1.4)); }

struct TextHeights {
  int name;
  int second;
};

TextHeights textHeights(GtkWidget* widget) {
  PangoContext* context = gtk_widget_get_pango_context(widget);
  PangoFontMetrics* metrics = pango_context_get_metrics(context, nullptr, nullptr);
  const int height = PANGO_PIXELS_CEIL(pango_font_metrics_get_height(metrics));
  pango_font_metrics_unref(metrics);
  return {height, height * 9 / 10 + 1};
}

void dropLayouts(Row* row) {
  g_clear_object(&row->name);
  g_clear_object(&row->second);
}

/// `small`: the second line, whose end matters least; of a name, beginning and extension matter.
PangoLayout* makeLayout(GtkWidget* widget, const std::string& text, bool small, bool centered, int lines) {
  PangoLayout* layout = gtk_widget_create_pango_layout(widget, nullptr);
  pango_layout_set_text(layout, text.c_str(), static_cast<int>(text.size()));
  pango_layout_set_ellipsize(layout, small ? PANGO_ELLIPSIZE_END : PANGO_ELLIPSIZE_MIDDLE);
  pango_layout_set_wrap(layout, PANGO_WRAP_WORD_CHAR);
  pango_layout_set_height(layout, -lines);
  // A line break in a name would make it two lines.
  pango_layout_set_single_paragraph_mode(layout, TRUE);
  PangoAttrList* attributes = pango_attr_list_new();
  // A hyphen at the end of a line would be read as the name's.
  pango_attr_list_insert(attributes, pango_attr_insert_hyphens_new(FALSE));
  if (small) pango_attr_list_insert(attributes, pango_attr_scale_new(0.88));
  pango_layout_set_attributes(layout, attributes);
  pango_attr_list_unref(attributes);
  // Text stands at the row's start, whichever way the name itself is read: "left" is where the row begins, but for a text
  // that is read from the right it is where the row ends. A digit at its beginning doesn't tell which that is.
  const PangoDirection read = pango_layout_line_get_resolved_direction(pango_layout_get_line_readonly(layout, 0));
  const PangoAlignment side = read == PANGO_DIRECTION_RTL ? PANGO_ALIGN_RIGHT : PANGO_ALIGN_LEFT;
  pango_layout_set_alignment(layout, centered ? PANGO_ALIGN_CENTER : side);
  return layout;
}

const std::string& nameOf(const FolderItem& item) {
  return item.details && !item.details->displayName.empty() ? item.details->displayName : item.displayName;
}

/// What stands below the name: at the side of an icon everything, below one the first of it.
std::string factsOf(const FolderItem& item, bool grid) {
  std::string facts;
  if (item.details) facts = grid ? item.details->shortLine : item.details->secondLine;
  if (facts.empty() && isPromised(item.kind)) facts = _("Not downloaded");
  if (item.place.empty()) return facts;
  return grid || facts.empty() ? item.place : item.place + " · " + facts;
}

void makeLayouts(Row* row) {
  if (row->name) return;
  GtkWidget* widget = GTK_WIDGET(row);
  const FolderItem& item = folderItemOf(row->item);
  const bool grid = row->context->grid;
  row->name = makeLayout(widget, nameOf(item), false, grid, grid ? 2 : 1);
  row->second = makeLayout(widget, factsOf(item, grid), true, grid, 1);
}

void drawLayout(GtkSnapshot* snapshot, PangoLayout* layout, int x, int y, int width, const GdkRGBA& color) {
  pango_layout_set_width(layout, std::max(width, 1) * PANGO_SCALE);
  const graphene_point_t at = GRAPHENE_POINT_INIT(static_cast<float>(x), static_cast<float>(y));
  gtk_snapshot_save(snapshot);
  gtk_snapshot_translate(snapshot, &at);
  gtk_snapshot_append_layout(snapshot, layout, &color);
  gtk_snapshot_restore(snapshot);
}

void drawPaintable(GtkSnapshot* snapshot, GdkPaintable* paintable, int x, int y, int size) {
  double width = gdk_paintable_get_intrinsic_width(paintable);
  double height = gdk_paintable_get_intrinsic_height(paintable);
  if (width <= 0 || height <= 0) width = height = size;
  const double scale = size / std::max(width, height);
  const graphene_point_t at = GRAPHENE_POINT_INIT(static_cast<float>(x + (size - width * scale) / 2),
                                                  static_cast<float>(y + (size - height * scale) / 2));
  gtk_snapshot_save(snapshot);
  gtk_snapshot_translate(snapshot, &at);
  gdk_paintable_snapshot(paintable, snapshot, width * scale, height * scale);
  gtk_snapshot_restore(snapshot);
}

void drawSymbol(GtkSnapshot* snapshot, GtkWidget* widget, const char* name, int x, int y, int size, const GdkRGBA& color) {
  GtkIconPaintable* icon = gtk_icon_theme_lookup_icon(gtk_icon_theme_get_for_display(gtk_widget_get_display(widget)), name,
                                                      nullptr, size, gtk_widget_get_scale_factor(widget),
                                                      gtk_widget_get_direction(widget), static_cast<GtkIconLookupFlags>(0));
  const graphene_point_t at = GRAPHENE_POINT_INIT(static_cast<float>(x), static_cast<float>(y));
  gtk_snapshot_save(snapshot);
  gtk_snapshot_translate(snapshot, &at);
  gtk_symbolic_paintable_snapshot_symbolic(GTK_SYMBOLIC_PAINTABLE(icon), snapshot, size, size, &color, 1);
  gtk_snapshot_restore(snapshot);
  g_object_unref(icon);
}

void drawMark(GtkSnapshot* snapshot, GtkWidget* widget, bool checked, int x, int y, const GdkRGBA& text) {
  GskRoundedRect circle;
  const graphene_rect_t bounds = GRAPHENE_RECT_INIT(static_cast<float>(x), static_cast<float>(y), MarkSize, MarkSize);
  gsk_rounded_rect_init_from_rect(&circle, &bounds, MarkSize / 2.0F);
  if (!checked) {
    GdkRGBA dim = text;
    dim.alpha *= 0.4F;
    const float widths[4] = {2, 2, 2, 2};
    const GdkRGBA colors[4] = {dim, dim, dim, dim};
    gtk_snapshot_append_border(snapshot, &circle, widths, colors);
    return;
  }
  GdkRGBA accent = {0.21F, 0.52F, 0.89F, 1};
  GdkRGBA tick = {1, 1, 1, 1};
  GtkStyleContext* style = gtk_widget_get_style_context(widget);
  gtk_style_context_lookup_color(style, "accent_bg_color", &accent);
  gtk_style_context_lookup_color(style, "accent_fg_color", &tick);
  gtk_snapshot_push_rounded_clip(snapshot, &circle);
  gtk_snapshot_append_color(snapshot, &accent, &bounds);
  gtk_snapshot_pop(snapshot);
  drawSymbol(snapshot, widget, "object-select-symbolic", x + 3, y + 3, MarkSize - 6, tick);
}

/// Rows within a page of what is seen count as visible: they are next.
bool isNear(Row* row) {
  graphene_rect_t bounds;
  GtkWidget* list = row->context->list;
  if (!gtk_widget_compute_bounds(GTK_WIDGET(row), list, &bounds)) return true;
  const float page = static_cast<float>(gtk_widget_get_height(list));
  return bounds.origin.y < 1.5F * page && bounds.origin.y + bounds.size.height > -0.5F * page;
}

void drawContent(GtkWidget* widget, GtkSnapshot* snapshot) {
  Row* row = rowOf(widget);
  FolderItem& item = folderItemOf(row->item);
  makeLayouts(row);
  RowContext& context = *row->context;
  const int width = gtk_widget_get_width(widget);
  const int height = gtk_widget_get_height(widget);
  const bool rtl = gtk_widget_get_direction(widget) == GTK_TEXT_DIR_RTL;
  const int iconSize = context.grid ? GridIconSize : ListIconSize;
  /// The left edge of something `size` wide at `start` from the row's start.
  const auto left = [&](int start, int size) { return rtl ? width - start - size : start; };

  GdkRGBA color;
  gtk_style_context_get_color(gtk_widget_get_style_context(widget), &color);
  GdkRGBA dim = color;
  dim.alpha *= 0.6F;
  GdkPaintable* icon = item.details && item.details->thumbnail ? GDK_PAINTABLE(item.details->thumbnail)
                                                               : context.icons->iconFor(item, iconSize, widget);
  const bool checked = context.editing && context.isSelected(item);
  int nameHeight = 0;
  int secondHeight = 0;
  pango_layout_get_pixel_size(row->second, nullptr, &secondHeight);
  const bool hasSecond = pango_layout_get_character_count(row->second) > 0;
  if (isPromised(item.kind)) gtk_snapshot_push_opacity(snapshot, 0.6);
  if (context.grid) {
    if (icon) drawPaintable(snapshot, icon, (width - iconSize) / 2, Margin, iconSize);
    if (isPromised(item.kind)) gtk_snapshot_pop(snapshot);
    drawLayout(snapshot, row->name, 4, Margin + iconSize + 4, width - 8, color);
    pango_layout_get_pixel_size(row->name, nullptr, &nameHeight);
    if (hasSecond) drawLayout(snapshot, row->second, 4, Margin + iconSize + 4 + nameHeight, width - 8, dim);
    if (context.editing) drawMark(snapshot, widget, checked, left(Margin, MarkSize), Margin, color);
    if (isPromised(item.kind)) {
      drawSymbol(snapshot, widget, "vaelo-drive-not-downloaded-symbolic", left(width - Margin - CloudSize, CloudSize),
                 Margin, CloudSize, dim);
    }
  } else {
    int start = Margin;
    const int markStart = start;
    if (context.editing) start += MarkSize + Gap;
    if (icon) drawPaintable(snapshot, icon, left(start, iconSize), (height - iconSize) / 2, iconSize);
    if (isPromised(item.kind)) gtk_snapshot_pop(snapshot);
    if (context.editing) drawMark(snapshot, widget, checked, left(markStart, MarkSize), (height - MarkSize) / 2, color);
    start += iconSize + Gap;
    int end = Margin;
    if (isPromised(item.kind)) {
      drawSymbol(snapshot, widget, "vaelo-drive-not-downloaded-symbolic", left(width - end - CloudSize, CloudSize),
                 (height - CloudSize) / 2, CloudSize, dim);
      end += CloudSize + Gap;
    }
    const int textWidth = width - start - end;
    pango_layout_set_width(row->name, std::max(textWidth, 1) * PANGO_SCALE);
    pango_layout_get_pixel_size(row->name, nullptr, &nameHeight);
    // The name doesn't jump up when the second line comes: its place is kept.
    const int top = (height - nameHeight - secondHeight) / 2;
    drawLayout(snapshot, row->name, left(start, textWidth), top, textWidth, color);
    if (hasSecond) drawLayout(snapshot, row->second, left(start, textWidth), top + nameHeight, textWidth, dim);
  }
  context.drawn(item);
}

void snapshotRow(GtkWidget* widget, GtkSnapshot* snapshot) {
  Row* row = rowOf(widget);
  if (!row->item) return;
  row->blank = !isNear(row);
  if (row->blank) return;
  if (row->uncovered <= 0) return drawContent(widget, snapshot);
  const auto width = static_cast<float>(gtk_widget_get_width(widget));
  const auto height = static_cast<float>(gtk_widget_get_height(widget));
  const bool rtl = gtk_widget_get_direction(widget) == GTK_TEXT_DIR_RTL;
  const graphene_rect_t covered = GRAPHENE_RECT_INIT(rtl ? row->uncovered : 0, 0, width - row->uncovered, height);
  const graphene_point_t aside = GRAPHENE_POINT_INIT(rtl ? row->uncovered : -row->uncovered, 0);
  gtk_snapshot_push_clip(snapshot, &covered);
  gtk_snapshot_save(snapshot);
  gtk_snapshot_translate(snapshot, &aside);
  drawContent(widget, snapshot);
  gtk_snapshot_restore(snapshot);
  gtk_snapshot_pop(snapshot);
}

void measure(GtkWidget* widget, GtkOrientation orientation, int, int* minimum, int* natural, int*, int*) {
  const bool grid = rowOf(widget)->context->grid;
  if (orientation == GTK_ORIENTATION_HORIZONTAL) {
    *minimum = *natural = grid ? cellWidth() : 160;
    return;
  }
  const TextHeights text = textHeights(widget);
  *minimum = *natural = grid ? 2 * Margin + GridIconSize + 4 + 2 * text.name + text.second
                             : std::max(LeastRowHeight, text.name + text.second + 10);
}

void tellAccessibility(Row* row) {
  GtkWidget* listItem = gtk_widget_get_parent(GTK_WIDGET(row));
  if (!listItem) return;
  const FolderItem& item = folderItemOf(row->item);
  const std::string facts = factsOf(item, false);
  const std::string label = facts.empty() ? nameOf(item) : listedText(nameOf(item), facts);
  gtk_accessible_update_property(GTK_ACCESSIBLE(listItem), GTK_ACCESSIBLE_PROPERTY_LABEL, label.c_str(), -1);
}

void dispose(GObject* object) {
  Row* row = rowOf(object);
  folderRowSetItem(GTK_WIDGET(row), nullptr);
  if (row->context) row->context->rows.erase(GTK_WIDGET(row));
  row->context = nullptr;
  G_OBJECT_CLASS(parentClass())->dispose(object);
}

void initClass(gpointer rowClass, gpointer) {
  G_OBJECT_CLASS(rowClass)->dispose = dispose;
  auto* widgetClass = static_cast<GtkWidgetClass*>(rowClass);
  widgetClass->snapshot = snapshotRow;
  widgetClass->measure = measure;
  widgetClass->get_request_mode = [](GtkWidget*) { return GTK_SIZE_REQUEST_CONSTANT_SIZE; };
  widgetClass->css_changed = [](GtkWidget* widget, GtkCssStyleChange* change) {
    dropLayouts(rowOf(widget));
    parentClass()->css_changed(widget, change);
  };
  widgetClass->direction_changed = [](GtkWidget* widget, GtkTextDirection before) {
    dropLayouts(rowOf(widget));
    parentClass()->direction_changed(widget, before);
  };
  // The list's own item around it has the label.
  gtk_widget_class_set_accessible_role(widgetClass, GTK_ACCESSIBLE_ROLE_PRESENTATION);
}

GType rowGetType() {
  static const GType type = g_type_register_static_simple(GTK_TYPE_WIDGET, "VaeloFolderRow", sizeof(RowClass), initClass,
                                                          sizeof(Row), nullptr, G_TYPE_FLAG_NONE);
  return type;
}

}  // namespace

GtkWidget* folderRowNew(RowContext& context) {
  auto* row = static_cast<Row*>(g_object_new(rowGetType(), nullptr));
  row->context = &context;
  context.rows.insert(GTK_WIDGET(row));
  return GTK_WIDGET(row);
}

void folderRowSetItem(GtkWidget* widget, GObject* item) {
  Row* row = rowOf(widget);
  if (row->context && row->context->itemChanges) row->context->itemChanges(widget);
  if (row->item) {
    FolderItem& before = folderItemOf(row->item);
    if (before.row == widget) before.row = nullptr;
  }
  dropLayouts(row);
  g_clear_object(&row->item);
  if (!item) return;
  row->item = G_OBJECT(g_object_ref(item));
  folderItemOf(item).row = widget;
  tellAccessibility(row);
  gtk_widget_queue_draw(widget);
}

void folderRowsPart(RowContext& context) {
  for (GtkWidget* widget : context.rows) {
    folderRowSetItem(widget, nullptr);
    rowOf(widget)->context = nullptr;
  }
  context.rows.clear();
}

GObject* folderRowItem(GtkWidget* widget) { return rowOf(widget)->item; }

void folderRowItemChanged(GtkWidget* widget) {
  dropLayouts(rowOf(widget));
  tellAccessibility(rowOf(widget));
  gtk_widget_queue_draw(widget);
}

bool folderRowMarkIsAt(GtkWidget* widget, double x) {
  const RowContext* context = rowOf(widget)->context;
  if (!context || !context->editing || context->grid) return false;
  const bool rtl = gtk_widget_get_direction(widget) == GTK_TEXT_DIR_RTL;
  return (rtl ? gtk_widget_get_width(widget) - x : x) < Margin + MarkSize + Gap;
}

void folderRowSetUncovered(GtkWidget* widget, double pixels) {
  rowOf(widget)->uncovered = static_cast<float>(pixels);
  gtk_widget_queue_draw(widget);
}

void folderRowsScrolled(RowContext& context) {
  for (GtkWidget* row : context.rows) {
    if (rowOf(row)->blank) gtk_widget_queue_draw(row);
  }
}

GtkWidget* folderRowAt(GtkWidget* widget) { return gtk_widget_get_ancestor(widget, rowGetType()); }

GtkWidget* folderRowIn(GtkWidget* widget) {
  if (!widget) return nullptr;
  if (GtkWidget* row = folderRowAt(widget)) return row;
  GtkWidget* child = gtk_widget_get_first_child(widget);
  return child ? folderRowAt(child) : nullptr;
}

}  // namespace vaelo
