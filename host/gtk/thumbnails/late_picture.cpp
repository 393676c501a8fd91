// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/thumbnails/late_picture.h"

#include <utility>

namespace vaelo {

namespace {

struct LatePictureState {
  int width;
  int height;
  std::future<GRef<GdkTexture>> coming;
  GRef<GdkTexture> texture;

  GdkTexture* wait() {
    if (coming.valid()) texture = coming.get();
    return texture.get();
  }
};

struct LatePicture {
  GObject parent;
  LatePictureState* state;
};

struct LatePictureClass {
  GObjectClass parent;
};

LatePictureState& stateOf(gpointer object) { return *static_cast<LatePicture*>(object)->state; }

void snapshotLate(GdkPaintable* paintable, GdkSnapshot* snapshot, double width, double height) {
  if (GdkTexture* texture = stateOf(paintable).wait()) {
    gdk_paintable_snapshot(GDK_PAINTABLE(texture), snapshot, width, height);
  }
}

void implementPaintable(gpointer interface, gpointer) {
  auto* paintable = static_cast<GdkPaintableInterface*>(interface);
  paintable->snapshot = snapshotLate;
  paintable->get_flags = [](GdkPaintable*) {
    return static_cast<GdkPaintableFlags>(GDK_PAINTABLE_STATIC_SIZE | GDK_PAINTABLE_STATIC_CONTENTS);
  };
  paintable->get_intrinsic_width = [](GdkPaintable* self) { return stateOf(self).width; };
  paintable->get_intrinsic_height = [](GdkPaintable* self) { return stateOf(self).height; };
}

void initLatePictureClass(gpointer type, gpointer) {
  G_OBJECT_CLASS(type)->finalize = [](GObject* object) {
    delete &stateOf(object);
    G_OBJECT_CLASS(g_type_class_peek(G_TYPE_OBJECT))->finalize(object);
  };
}

GType latePictureType() {
  static const GType type = [] {
    const GType made = g_type_register_static_simple(G_TYPE_OBJECT, "VaeloLatePicture", sizeof(LatePictureClass),
                                                     initLatePictureClass, sizeof(LatePicture), nullptr, G_TYPE_FLAG_NONE);
    const GInterfaceInfo paintable{implementPaintable, nullptr, nullptr};
    g_type_add_interface_static(made, GDK_TYPE_PAINTABLE, &paintable);
    return made;
  }();
  return type;
}

}  // namespace

GRef<GdkPaintable> makeLatePicture(int width, int height, std::future<GRef<GdkTexture>> coming) {
  gpointer made = g_object_new(latePictureType(), nullptr);
  static_cast<LatePicture*>(made)->state = new LatePictureState{width, height, std::move(coming), {}};
  return GRef<GdkPaintable>(GDK_PAINTABLE(made));
}

}  // namespace vaelo
