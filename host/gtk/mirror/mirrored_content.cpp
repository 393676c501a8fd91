// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirror/mirrored_content.h"

#include "host/gtk/mirror/mirrored_field.h"
#include "host/gtk/mirror/mirrored_text.h"
#include "host/gtk/pango_graphics.h"
#include "platform/ui/button.h"
#include "platform/ui/image_view.h"

namespace vaelo {

namespace {

class MirroredPicture : public MirroredContent {
 public:
  explicit MirroredPicture(ImageView& view) : view_(view), picture_(gtk_picture_new()) {
    gtk_picture_set_can_shrink(GTK_PICTURE(picture_), TRUE);
    gtk_picture_set_content_fit(GTK_PICTURE(picture_), GTK_CONTENT_FIT_FILL);
    update();
  }
  GtkWidget* widget() override { return picture_; }
  void update() override {
    const auto* image = dynamic_cast<const GtkImageData*>(view_.image().get());
    gtk_picture_set_paintable(GTK_PICTURE(picture_), image ? image->paintable() : nullptr);
    if (view_.borderWidth() > 0) {
      gtk_widget_add_css_class(picture_, "thumbnail");
    } else {
      gtk_widget_remove_css_class(picture_, "thumbnail");
    }
  }

 private:
  ImageView& view_;
  GtkWidget* picture_;
};

class MirroredButton : public MirroredContent {
 public:
  explicit MirroredButton(Button& view)
      : view_(std::static_pointer_cast<Button>(view.shared_from_this())),
        button_(GTK_WIDGET(g_object_ref_sink(gtk_button_new()))) {
    gtk_widget_add_css_class(button_, "flat");
    g_signal_connect_swapped(button_, "clicked", G_CALLBACK(+[](Button* pressed) {
                               const ViewRef kept = pressed->shared_from_this();
                               pressed->sendActions(ControlEvent::TouchUpInside);
                             }),
                             view_.get());
    update();
  }
  ~MirroredButton() override {
    g_signal_handlers_disconnect_by_data(button_, view_.get());
    g_object_unref(button_);
  }
  GtkWidget* widget() override { return button_; }
  void update() override {
    gtk_button_set_label(GTK_BUTTON(button_), view_->title().c_str());
    gtk_widget_set_sensitive(button_, view_->enabled());
  }

 private:
  std::shared_ptr<Button> view_;
  GtkWidget* button_;
};

class MirroredDrawing : public MirroredContent {
 public:
  explicit MirroredDrawing(View& view) : area_(GTK_WIDGET(g_object_ref_sink(gtk_drawing_area_new()))) {
    gtk_drawing_area_set_draw_func(
        GTK_DRAWING_AREA(area_),
        [](GtkDrawingArea*, cairo_t* cairo, int, int, gpointer drawn) {
          auto* shown = static_cast<View*>(drawn);
          drawWithCairo(cairo, [shown](DrawingContext& context) { shown->drawRect(context, shown->bounds()); });
        },
        &view, nullptr);
  }
  ~MirroredDrawing() override {
    gtk_drawing_area_set_draw_func(GTK_DRAWING_AREA(area_), nullptr, nullptr, nullptr);
    g_object_unref(area_);
  }
  GtkWidget* widget() override { return area_; }
  void update() override { gtk_widget_queue_draw(area_); }

 private:
  GtkWidget* area_;
};

}  // namespace

std::unique_ptr<MirroredContent> makeMirroredContent(View& view) {
  if (auto* label = dynamic_cast<Label*>(&view)) return std::make_unique<MirroredText>(*label);
  if (auto* field = dynamic_cast<TextField*>(&view)) return std::make_unique<MirroredField>(*field);
  if (auto* button = dynamic_cast<Button*>(&view)) return std::make_unique<MirroredButton>(*button);
  if (auto* picture = dynamic_cast<ImageView*>(&view)) return std::make_unique<MirroredPicture>(*picture);
  if (view.drawsContent()) return std::make_unique<MirroredDrawing>(view);
  return nullptr;
}

}  // namespace vaelo
