// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/media_full_screen.h"

#include "host/support/texts.h"

namespace vaelo {

namespace {
constexpr guint ControlsGoAfter = 3;  // seconds
}

MediaFullScreen::MediaFullScreen(GtkWindow* parent, GtkMediaStream* stream, std::function<void()> leave)
    : stream_(GTK_MEDIA_STREAM(g_object_ref(stream))),
      leave_(std::move(leave)),
      window_(gtk_window_new()),
      revealer_(gtk_revealer_new()),
      controls_(std::make_unique<MediaControls>(stream, true, [this] { leaveLater(this); })) {
  GtkWidget* picture = gtk_picture_new_for_paintable(GDK_PAINTABLE(stream));
  gtk_widget_add_css_class(controls_->widget(), "osd");
  const GRef<GtkCssProvider> black(gtk_css_provider_new());
  gtk_css_provider_load_from_data(black.get(), "picture { background: black; }", -1);
  gtk_style_context_add_provider(gtk_widget_get_style_context(picture), GTK_STYLE_PROVIDER(black.get()),
                                 GTK_STYLE_PROVIDER_PRIORITY_APPLICATION);
  gtk_revealer_set_transition_type(GTK_REVEALER(revealer_), GTK_REVEALER_TRANSITION_TYPE_CROSSFADE);
  gtk_revealer_set_child(GTK_REVEALER(revealer_), controls_->widget());
  gtk_widget_set_valign(revealer_, GTK_ALIGN_END);
  GtkWidget* overlay = gtk_overlay_new();
  gtk_overlay_set_child(GTK_OVERLAY(overlay), picture);
  gtk_overlay_add_overlay(GTK_OVERLAY(overlay), revealer_);
  gtk_window_set_child(GTK_WINDOW(window_), overlay);
  gtk_window_set_title(GTK_WINDOW(window_), _("Film"));
  gtk_window_set_transient_for(GTK_WINDOW(window_), parent);
  gtk_window_set_modal(GTK_WINDOW(window_), TRUE);

  GtkEventController* keys = gtk_event_controller_key_new();
  g_signal_connect(keys, "key-pressed",
                   G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType,
                                  MediaFullScreen* self) -> gboolean { return self->key(key); }),
                   this);
  gtk_widget_add_controller(window_, keys);
  GtkEventController* motion = gtk_event_controller_motion_new();
  g_signal_connect(motion, "motion", G_CALLBACK(+[](GtkEventControllerMotion*, double x, double y, MediaFullScreen* self) {
                     // The window system tells of a pointer that rests too.
                     if (x == self->pointerX_ && y == self->pointerY_) return;
                     self->pointerX_ = x;
                     self->pointerY_ = y;
                     self->showControls();
                   }),
                   this);
  gtk_widget_add_controller(window_, motion);
  GtkGesture* tap = gtk_gesture_click_new();
  g_signal_connect(tap, "released", G_CALLBACK(+[](GtkGestureClick*, int, double, double, MediaFullScreen* self) {
                     toggleMedia(self->stream_.get());
                     self->showControls();
                   }),
                   this);
  gtk_widget_add_controller(picture, GTK_EVENT_CONTROLLER(tap));
  g_signal_connect(window_, "close-request", G_CALLBACK(+[](GtkWindow*, MediaFullScreen* self) -> gboolean {
                     leaveLater(self);
                     return TRUE;
                   }),
                   this);
  gtk_window_fullscreen(GTK_WINDOW(window_));
  gtk_window_present(GTK_WINDOW(window_));
  showControls();
}

MediaFullScreen::~MediaFullScreen() {
  g_clear_handle_id(&timer_, g_source_remove);
  g_clear_handle_id(&leaving_, g_source_remove);
  gtk_window_destroy(GTK_WINDOW(window_));
}

// Not from within a signal of its own widgets.
void MediaFullScreen::leaveLater(MediaFullScreen* self) {
  if (self->leaving_) return;
  self->leaving_ = g_idle_add(
      +[](gpointer data) -> gboolean {
        auto* leaving = static_cast<MediaFullScreen*>(data);
        leaving->leaving_ = 0;
        const std::function<void()> leave = leaving->leave_;
        leave();
        return G_SOURCE_REMOVE;
      },
      self);
}

bool MediaFullScreen::key(guint key) {
  switch (key) {
    case GDK_KEY_Escape:
    case GDK_KEY_F11:
    case GDK_KEY_f:
      leaveLater(this);
      return true;
    case GDK_KEY_space:
      toggleMedia(stream_.get());
      showControls();
      return true;
    case GDK_KEY_m:
      gtk_media_stream_set_muted(stream_.get(), !gtk_media_stream_get_muted(stream_.get()));
      showControls();
      return true;
    default:
      showControls();
      return false;
  }
}

void MediaFullScreen::showControls() {
  g_clear_handle_id(&timer_, g_source_remove);
  gtk_revealer_set_reveal_child(GTK_REVEALER(revealer_), TRUE);
  gtk_widget_set_cursor(window_, nullptr);
  timer_ = g_timeout_add_seconds(
      ControlsGoAfter,
      +[](gpointer data) -> gboolean {
        auto* self = static_cast<MediaFullScreen*>(data);
        if (!gtk_media_stream_get_playing(self->stream_.get())) return G_SOURCE_CONTINUE;
        self->timer_ = 0;
        gtk_revealer_set_reveal_child(GTK_REVEALER(self->revealer_), FALSE);
        gtk_widget_set_cursor_from_name(self->window_, "none");
        return G_SOURCE_REMOVE;
      },
      this);
}

}  // namespace vaelo
