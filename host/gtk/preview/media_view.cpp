// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/media_view.h"

#include <adwaita.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <string_view>

#include "host/gtk/list/worker.h"
#include "host/gtk/preview/decoder_process.h"
#include "host/gtk/preview/media_controls.h"
#include "host/gtk/preview/media_framework.h"
#include "host/gtk/preview/media_full_screen.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr std::chrono::milliseconds LoadingTakes = std::chrono::seconds(12);
constexpr const char* CannotPlay =
    N_("This document can’t be played. It may be damaged or of a kind that this computer doesn’t know.");
constexpr const char* NoPlayer = N_("Sound and film can’t be played on this computer.");

// Which say sound or film and are lists of addresses.
constexpr std::array<std::string_view, 8> ListTypes = {"audio/x-mpegurl",   "audio/mpegurl",  "audio/x-scpls",
                                                       "audio/scpls",       "audio/x-ms-asx", "video/x-mpegurl",
                                                       "video/vnd.mpegurl", "audio/x-ms-wax"};
constexpr std::array<std::string_view, 5> OtherTypes = {"application/ogg", "application/x-matroska", "application/mxf",
                                                        "application/vnd.ms-asf", "application/vnd.rn-realmedia"};

template <std::size_t Count>
bool has(const std::array<std::string_view, Count>& types, const std::string& type) {
  return std::find(types.begin(), types.end(), type) != types.end();
}

// Some of what the framework would wait for without end.
std::string problemWith(const std::string& path) {
  struct stat status = {};
  if (::stat(path.c_str(), &status) != 0) return messageForDecoderError(DecoderError::Gone);
  if (::access(path.c_str(), R_OK) != 0) return messageForDecoderError(DecoderError::Unreadable);
  return S_ISREG(status.st_mode) && status.st_size > 0 ? "" : _(CannotPlay);
}

class MediaView : public DocumentView {
 public:
  MediaView(const PreviewedDocument& document, DocumentViewEvents events)
      : document_(document),
        events_(std::move(events)),
        box_(GTK_WIDGET(g_object_ref_sink(gtk_box_new(GTK_ORIENTATION_VERTICAL, 0)))) {
    g_signal_connect_swapped(box_, "unmap", G_CALLBACK(+[](MediaView* self) { self->pause(); }), this);
    g_signal_connect_swapped(box_, "map", G_CALLBACK(+[](MediaView* self) {
                               if (self->controls_) self->controls_->takeFocus();
                             }),
                             this);
    addShortcuts();
    refresh();
  }

  ~MediaView() override {
    stop();
    g_signal_handlers_disconnect_by_data(box_, this);
    g_object_unref(box_);
  }

  GtkWidget* widget() override { return box_; }

  // From the beginning, since nobody knows what became of the place that played.
  void refresh() override {
    stop();
    timer_ = g_timeout_add(
        static_cast<guint>(std::min(LoadingTakes, document_.patience).count()),
        +[](gpointer data) -> gboolean {
          auto* self = static_cast<MediaView*>(data);
          self->timer_ = 0;
          self->fail(messageForDecoderError(DecoderError::TooSlow));
          return G_SOURCE_REMOVE;
        },
        this);
    worker_.run([this, path = document_.path]() -> std::function<void()> {
      const std::string problem = prepareMediaFramework() ? problemWith(path) : _(NoPlayer);
      return [this, problem] { problem.empty() ? load() : fail(problem); };
    });
  }

  bool follow(const std::string& path, const std::string& name) override {
    if (!controls_) return false;
    document_.path = path;
    document_.name = name;
    showName();
    return true;
  }

 private:
  void load() {
    stream_.reset(gtk_media_file_new_for_filename(document_.path.c_str()));
    for (const char* signal : {"notify::prepared", "notify::error"}) {
      g_signal_connect_swapped(stream_.get(), signal, G_CALLBACK(+[](MediaView* self) { self->changed(); }), this);
    }
    changed();
  }

  void changed() {
    if (change_) return;
    // Not from within the stream's signal: it may be over with it.
    change_ = g_idle_add(
        +[](gpointer data) -> gboolean {
          auto* self = static_cast<MediaView*>(data);
          self->change_ = 0;
          if (gtk_media_stream_get_error(self->stream_.get())) {
            self->fail(_(CannotPlay));
          } else if (gtk_media_stream_is_prepared(self->stream_.get()) && !self->controls_) {
            self->show();
          }
          return G_SOURCE_REMOVE;
        },
        this);
  }

  void show() {
    if (!gtk_media_stream_has_audio(stream_.get()) && !gtk_media_stream_has_video(stream_.get())) return fail(_(CannotPlay));
    g_clear_handle_id(&timer_, g_source_remove);
    const bool isFilm = gtk_media_stream_has_video(stream_.get());
    controls_ = std::make_unique<MediaControls>(stream_.get(), false,
                                                isFilm ? [this] { toggleFullScreen(); } : std::function<void()>());
    GtkWidget* content = isFilm ? makeFilm() : makeCover();
    gtk_widget_set_vexpand(content, TRUE);
    gtk_box_append(GTK_BOX(box_), content);
    gtk_box_append(GTK_BOX(box_), controls_->widget());
    events_.shown();
  }

  GtkWidget* makeFilm() {
    GtkWidget* overlay = gtk_overlay_new();
    GtkWidget* picture = gtk_picture_new_for_paintable(GDK_PAINTABLE(stream_.get()));
    gtk_widget_add_css_class(overlay, "view");
    named_ = picture;
    showName();
    GtkGesture* tap = gtk_gesture_click_new();
    g_signal_connect(tap, "released", G_CALLBACK(+[](GtkGestureClick*, int presses, double, double, MediaView* self) {
                       toggleMedia(self->stream_.get());
                       if (presses == 2) self->toggleFullScreen();
                     }),
                     this);
    gtk_widget_add_controller(overlay, GTK_EVENT_CONTROLLER(tap));
    // No second button for those who don't see it.
    GtkWidget* play = gtk_button_new_from_icon_name("media-playback-start-symbolic");
    for (const char* style : {"osd", "circular"}) gtk_widget_add_css_class(play, style);
    gtk_image_set_pixel_size(GTK_IMAGE(gtk_button_get_child(GTK_BUTTON(play))), 32);
    gtk_widget_set_size_request(play, 84, 84);
    gtk_widget_set_can_focus(play, FALSE);
    gtk_accessible_update_state(GTK_ACCESSIBLE(play), GTK_ACCESSIBLE_STATE_HIDDEN, TRUE, -1);
    gtk_widget_set_halign(play, GTK_ALIGN_CENTER);
    gtk_widget_set_valign(play, GTK_ALIGN_CENTER);
    gtk_widget_set_can_target(play, FALSE);
    g_object_bind_property(stream_.get(), "playing", play, "visible",
                           GBindingFlags(G_BINDING_SYNC_CREATE | G_BINDING_INVERT_BOOLEAN));
    gtk_overlay_set_child(GTK_OVERLAY(overlay), picture);
    gtk_overlay_add_overlay(GTK_OVERLAY(overlay), play);
    return overlay;
  }

  GtkWidget* makeCover() {
    GtkWidget* cover = adw_status_page_new();
    adw_status_page_set_icon_name(ADW_STATUS_PAGE(cover), "audio-x-generic-symbolic");
    named_ = cover;
    showName();
    return cover;
  }

  void showName() {
    if (!ADW_IS_STATUS_PAGE(named_)) {
      gtk_accessible_update_property(GTK_ACCESSIBLE(named_), GTK_ACCESSIBLE_PROPERTY_LABEL, document_.name.c_str(), -1);
      return;
    }
    char* title = g_markup_escape_text(document_.name.c_str(), -1);
    adw_status_page_set_title(ADW_STATUS_PAGE(named_), title);
    g_free(title);
  }

  void addShortcuts() {
    GtkEventController* shortcuts = gtk_shortcut_controller_new();
    // Wherever the focus is in the page's window, unless it is on what takes the key for itself.
    gtk_shortcut_controller_set_scope(GTK_SHORTCUT_CONTROLLER(shortcuts), GTK_SHORTCUT_SCOPE_GLOBAL);
    const auto add = [&](const char* keys, GtkShortcutFunc action) {
      gtk_shortcut_controller_add_shortcut(
          GTK_SHORTCUT_CONTROLLER(shortcuts),
          gtk_shortcut_new(gtk_shortcut_trigger_parse_string(keys), gtk_callback_action_new(action, this, nullptr)));
    };
    add("space", [](GtkWidget*, GVariant*, gpointer self) -> gboolean {
      return static_cast<MediaView*>(self)->act([](MediaView& view) { toggleMedia(view.stream_.get()); });
    });
    add("m", [](GtkWidget*, GVariant*, gpointer self) -> gboolean {
      return static_cast<MediaView*>(self)->act([](MediaView& view) {
        gtk_media_stream_set_muted(view.stream_.get(), !gtk_media_stream_get_muted(view.stream_.get()));
      });
    });
    add("f|F11", [](GtkWidget*, GVariant*, gpointer self) -> gboolean {
      return static_cast<MediaView*>(self)->act([](MediaView& view) { view.toggleFullScreen(); });
    });
    gtk_widget_add_controller(box_, shortcuts);
  }

  gboolean act(void (*action)(MediaView& view)) {
    if (!controls_) return FALSE;
    action(*this);
    return TRUE;
  }

  void toggleFullScreen() {
    if (fullScreen_) return fullScreen_.reset();
    if (!gtk_media_stream_has_video(stream_.get())) return;
    GtkWindow* window = GTK_WINDOW(gtk_widget_get_ancestor(box_, GTK_TYPE_WINDOW));
    fullScreen_ = std::make_unique<MediaFullScreen>(window, stream_.get(), [this] { fullScreen_.reset(); });
  }

  void pause() {
    if (stream_ && !fullScreen_) gtk_media_stream_pause(stream_.get());
  }

  void fail(const std::string& sentence) {
    stop();
    events_.failed(sentence);
  }

  // Frees the file as well, so that nothing of it is heard or held any more.
  void stop() {
    g_clear_handle_id(&timer_, g_source_remove);
    g_clear_handle_id(&change_, g_source_remove);
    fullScreen_.reset();
    controls_.reset();
    while (GtkWidget* child = gtk_widget_get_first_child(box_)) gtk_box_remove(GTK_BOX(box_), child);
    if (!stream_) return;
    g_signal_handlers_disconnect_by_data(stream_.get(), this);
    gtk_media_stream_pause(stream_.get());
    gtk_media_file_clear(GTK_MEDIA_FILE(stream_.get()));
    stream_.reset();
  }

  PreviewedDocument document_;
  DocumentViewEvents events_;
  GtkWidget* box_;
  GtkWidget* named_ = nullptr;  // while there are controls
  GRef<GtkMediaStream> stream_;
  std::unique_ptr<MediaControls> controls_;
  std::unique_ptr<MediaFullScreen> fullScreen_;
  guint timer_ = 0;
  guint change_ = 0;
  Worker worker_;
};

}  // namespace

bool showsMedia(const std::string& contentType) {
  const bool isOne = contentType.starts_with("audio/") || contentType.starts_with("video/") || has(OtherTypes, contentType);
  return isOne && !has(ListTypes, contentType);
}

std::unique_ptr<DocumentView> makeMediaView(const PreviewedDocument& document, DocumentViewEvents events) {
  return std::make_unique<MediaView>(document, std::move(events));
}

}  // namespace vaelo
