// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirror/mirror_area.h"

#include <algorithm>

namespace {

struct VaeloMirrorArea {
  GtkWidget parent;
  void (*allocated)(gpointer data);
  gpointer data;
};

struct VaeloMirrorAreaClass {
  GtkWidgetClass parent;
};

G_DEFINE_TYPE(VaeloMirrorArea, vaelo_mirror_area, GTK_TYPE_WIDGET)

void measure(GtkWidget*, GtkOrientation, int, int* minimum, int* natural, int* minimumBaseline, int* naturalBaseline) {
  *minimum = *natural = 0;
  *minimumBaseline = *naturalBaseline = -1;
}

void sizeAllocate(GtkWidget* widget, int width, int height, int baseline) {
  if (GtkWidget* child = gtk_widget_get_first_child(widget)) {
    int leastWidth = 0;
    int leastHeight = 0;
    gtk_widget_measure(child, GTK_ORIENTATION_HORIZONTAL, -1, &leastWidth, nullptr, nullptr, nullptr);
    const int childWidth = std::max(width, leastWidth);
    gtk_widget_measure(child, GTK_ORIENTATION_VERTICAL, childWidth, &leastHeight, nullptr, nullptr, nullptr);
    gtk_widget_allocate(child, childWidth, std::max(height, leastHeight), baseline, nullptr);
  }
  auto* area = reinterpret_cast<VaeloMirrorArea*>(widget);
  if (area->allocated) area->allocated(area->data);
}

void dispose(GObject* object) {
  reinterpret_cast<VaeloMirrorArea*>(object)->allocated = nullptr;
  if (GtkWidget* child = gtk_widget_get_first_child(GTK_WIDGET(object))) gtk_widget_unparent(child);
  G_OBJECT_CLASS(vaelo_mirror_area_parent_class)->dispose(object);
}

void vaelo_mirror_area_class_init(VaeloMirrorAreaClass* klass) {
  GTK_WIDGET_CLASS(klass)->measure = measure;
  GTK_WIDGET_CLASS(klass)->size_allocate = sizeAllocate;
  G_OBJECT_CLASS(klass)->dispose = dispose;
}

void vaelo_mirror_area_init(VaeloMirrorArea*) {}

}  // namespace

namespace vaelo {

GtkWidget* makeMirrorArea(GtkWidget* child, void (*allocated)(gpointer data), gpointer data) {
  auto* area = static_cast<VaeloMirrorArea*>(g_object_new(vaelo_mirror_area_get_type(), nullptr));
  area->allocated = allocated;
  area->data = data;
  if (child) gtk_widget_set_parent(child, GTK_WIDGET(area));
  gtk_widget_set_overflow(GTK_WIDGET(area), GTK_OVERFLOW_VISIBLE);
  return GTK_WIDGET(area);
}

}  // namespace vaelo
