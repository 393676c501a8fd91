// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/media_controls.h"

#include <algorithm>
#include <cmath>
#include <cstdio>

#include "host/support/texts.h"

namespace vaelo {

namespace {

GtkWidget* makeMediaButton(const char* icon, const char* label) {
  GtkWidget* button = gtk_button_new_from_icon_name(icon);
  gtk_widget_set_tooltip_text(button, label);
  gtk_widget_set_size_request(button, 44, 44);
  gtk_widget_set_valign(button, GTK_ALIGN_CENTER);
  for (const char* style : {"flat", "circular"}) gtk_widget_add_css_class(button, style);
  gtk_accessible_update_property(GTK_ACCESSIBLE(button), GTK_ACCESSIBLE_PROPERTY_LABEL, label, -1);
  return button;
}

GtkWidget* makeTime(const char* label) {
  GtkWidget* time = gtk_label_new("0:00");
  for (const char* style : {"numeric", "caption"}) gtk_widget_add_css_class(time, style);
  gtk_widget_set_tooltip_text(time, label);
  return time;
}

}  // namespace

void toggleMedia(GtkMediaStream* stream) {
  if (gtk_media_stream_get_playing(stream)) return gtk_media_stream_pause(stream);
  if (gtk_media_stream_get_ended(stream)) gtk_media_stream_seek(stream, 0);
  gtk_media_stream_play(stream);
}

std::string mediaTime(std::int64_t microseconds) {
  const std::int64_t seconds = std::max<std::int64_t>(microseconds, 0) / G_USEC_PER_SEC;
  char text[48];
  if (seconds >= 3600) {
    std::snprintf(text, sizeof text, "%lld:%02lld:%02lld", static_cast<long long>(seconds / 3600),
                  static_cast<long long>(seconds / 60 % 60), static_cast<long long>(seconds % 60));
  } else {
    std::snprintf(text, sizeof text, "%lld:%02lld", static_cast<long long>(seconds / 60),
                  static_cast<long long>(seconds % 60));
  }
  return text;
}

MediaControls::MediaControls(GtkMediaStream* stream, bool isFullScreen, std::function<void()> fullScreen)
    : stream_(GTK_MEDIA_STREAM(g_object_ref(stream))),
      fullScreen_(std::move(fullScreen)),
      bar_(GTK_WIDGET(g_object_ref_sink(gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 6)))),
      play_(makeMediaButton("media-playback-start-symbolic", _("Play"))),
      time_(makeTime(_("Position"))),
      place_(gtk_scale_new_with_range(GTK_ORIENTATION_HORIZONTAL, 0, 1, 1)),
      length_(makeTime(_("Duration"))),
      volume_(gtk_volume_button_new()) {
  gtk_widget_add_css_class(bar_, "toolbar");
  // Time runs from the left in every language, as players have it.
  for (GtkWidget* widget : {bar_, place_}) gtk_widget_set_direction(widget, GTK_TEXT_DIR_LTR);
  gtk_widget_set_hexpand(place_, TRUE);
  gtk_scale_set_draw_value(GTK_SCALE(place_), FALSE);
  gtk_range_set_increments(GTK_RANGE(place_), 5, 30);
  gtk_accessible_update_property(GTK_ACCESSIBLE(place_), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Position"), -1);
  // The keyboard comes to the button in it.
  for (GtkWidget* named : {volume_, gtk_widget_get_first_child(volume_)}) {
    gtk_accessible_update_property(GTK_ACCESSIBLE(named), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Volume"), -1);
  }
  gtk_widget_set_valign(volume_, GTK_ALIGN_CENTER);
  for (GtkWidget* child : {play_, time_, place_, length_, volume_}) gtk_box_append(GTK_BOX(bar_), child);
  g_signal_connect_swapped(play_, "clicked", G_CALLBACK(toggleMedia), stream);
  g_signal_connect(place_, "change-value",
                   G_CALLBACK(+[](GtkRange*, GtkScrollType, double value, MediaControls* self) -> gboolean {
                     self->seek(value);
                     return FALSE;
                   }),
                   this);
  g_signal_connect(volume_, "value-changed", G_CALLBACK(+[](GtkScaleButton*, double value, MediaControls* self) {
                     gtk_media_stream_set_volume(self->stream_.get(), value);
                     gtk_media_stream_set_muted(self->stream_.get(), value <= 0);
                   }),
                   this);
  if (fullScreen_) {
    GtkWidget* button = makeMediaButton(isFullScreen ? "view-restore-symbolic" : "view-fullscreen-symbolic",
                                        isFullScreen ? _("Leave Full Screen") : _("Full Screen"));
    gtk_box_append(GTK_BOX(bar_), button);
    g_signal_connect_swapped(button, "clicked", G_CALLBACK(+[](MediaControls* self) { self->fullScreen_(); }), this);
  }
  const auto playing = G_CALLBACK(+[](MediaControls* self) { self->showPlaying(); });
  const auto time = G_CALLBACK(+[](MediaControls* self) { self->showTime(); });
  const auto volume = G_CALLBACK(+[](MediaControls* self) { self->showVolume(); });
  for (const char* signal : {"notify::playing", "notify::ended"}) g_signal_connect_swapped(stream, signal, playing, this);
  for (const char* signal : {"notify::timestamp", "notify::duration", "notify::seekable"}) {
    g_signal_connect_swapped(stream, signal, time, this);
  }
  for (const char* signal : {"notify::volume", "notify::muted", "notify::has-audio"}) {
    g_signal_connect_swapped(stream, signal, volume, this);
  }
  g_signal_connect_swapped(stream, "notify::seeking", G_CALLBACK(+[](MediaControls* self) { self->seekOn(); }), this);
  showPlaying();
  showTime();
  showVolume();
}

MediaControls::~MediaControls() {
  g_signal_handlers_disconnect_by_data(stream_.get(), this);
  for (GtkWidget* child : {place_, volume_, gtk_widget_get_last_child(bar_)}) {
    g_signal_handlers_disconnect_by_data(child, this);
  }
  g_signal_handlers_disconnect_by_data(play_, stream_.get());
  g_object_unref(bar_);
}

void MediaControls::showPlaying() {
  const bool plays = gtk_media_stream_get_playing(stream_.get());
  const char* label = plays ? _("Pause") : _("Play");
  gtk_button_set_icon_name(GTK_BUTTON(play_), plays ? "media-playback-pause-symbolic" : "media-playback-start-symbolic");
  gtk_widget_set_tooltip_text(play_, label);
  gtk_accessible_update_property(GTK_ACCESSIBLE(play_), GTK_ACCESSIBLE_PROPERTY_LABEL, label, -1);
}

void MediaControls::showTime() {
  const std::int64_t length = gtk_media_stream_get_duration(stream_.get());
  const std::int64_t now = wanted_ >= 0 ? wanted_ : gtk_media_stream_get_timestamp(stream_.get());
  gtk_widget_set_sensitive(place_, gtk_media_stream_is_seekable(stream_.get()) && length > 0);
  gtk_widget_set_visible(length_, length > 0);
  gtk_label_set_text(GTK_LABEL(time_), mediaTime(now).c_str());
  gtk_label_set_text(GTK_LABEL(length_), mediaTime(length).c_str());
  gtk_range_set_range(GTK_RANGE(place_), 0, std::max(static_cast<double>(length) / G_USEC_PER_SEC, 0.001));
  gtk_range_set_value(GTK_RANGE(place_), static_cast<double>(now) / G_USEC_PER_SEC);
}

void MediaControls::showVolume() {
  gtk_widget_set_visible(volume_, gtk_media_stream_has_audio(stream_.get()));
  const bool isMuted = gtk_media_stream_get_muted(stream_.get());
  const double volume = isMuted ? 0 : gtk_media_stream_get_volume(stream_.get());
  g_signal_handlers_block_matched(volume_, G_SIGNAL_MATCH_DATA, 0, 0, nullptr, nullptr, this);
  gtk_scale_button_set_value(GTK_SCALE_BUTTON(volume_), volume);
  g_signal_handlers_unblock_matched(volume_, G_SIGNAL_MATCH_DATA, 0, 0, nullptr, nullptr, this);
}

// A slider moves faster than a film can follow: the last place that it was at is what counts.
void MediaControls::seek(double seconds) {
  const double length = static_cast<double>(gtk_media_stream_get_duration(stream_.get())) / G_USEC_PER_SEC;
  wanted_ = std::llround(std::clamp(seconds, 0.0, std::max(length, 0.0)) * G_USEC_PER_SEC);
  if (!gtk_media_stream_is_seeking(stream_.get())) seekOn();
}

void MediaControls::seekOn() {
  if (wanted_ < 0 || gtk_media_stream_is_seeking(stream_.get())) return;
  const std::int64_t place = wanted_;
  wanted_ = -1;
  gtk_media_stream_seek(stream_.get(), place);
}

}  // namespace vaelo
