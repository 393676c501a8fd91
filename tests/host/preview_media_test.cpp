// SPDX-License-Identifier: GPL-3.0-or-later
#include <gio/gio.h>
#include <gst/gst.h>

#include <fstream>

#include "host/gtk/preview/media_controls.h"
#include "host/gtk/preview/media_framework.h"
#include "tests/host/preview_view_test.h"

namespace vaelo {
namespace {

using list_test::waitUntil;

void append(std::string& bytes, std::uint32_t number, int count = 4) {
  for (int i = 0; i < count; ++i) bytes += static_cast<char>(number >> (8 * i));
}

std::string chunk(const std::string& name, const std::string& content) {
  std::string bytes = name;
  append(bytes, static_cast<std::uint32_t>(content.size()));
  return bytes + content + (content.size() % 2 ? std::string(1, '\0') : "");
}

/// Silence of so many seconds.
std::string sound(std::uint32_t seconds) {
  std::string format;
  for (const auto& [number, count] : {std::pair(1U, 2), {1U, 2}, {8000U, 4}, {16000U, 4}, {2U, 2}, {16U, 2}}) {
    append(format, number, count);
  }
  return chunk("RIFF", "WAVE" + chunk("fmt ", format) + chunk("data", std::string(16000UL * seconds, '\0')));
}

/// Ten pictures a second, of one colour, not compressed.
std::string film(std::uint32_t seconds) {
  constexpr std::uint32_t width = 64;
  constexpr std::uint32_t height = 48;
  const std::uint32_t count = seconds * 10;
  const std::string picture(std::size_t(width) * height * 3, '\x60');
  std::string main;
  for (const std::uint32_t number :
       {100'000U, 0U, 0U, 0x10U, count, 0U, 1U, std::uint32_t(picture.size()), width, height, 0U, 0U, 0U, 0U}) {
    append(main, number);
  }
  std::string stream = "vidsDIB ";
  for (const std::uint32_t number : {0U, 0U, 0U, 1U, 10U, 0U, count, std::uint32_t(picture.size()), 0U, 0U, 0U, 0U}) {
    append(stream, number);
  }
  std::string format;
  for (const std::uint32_t number : {40U, width, height}) append(format, number);
  append(format, 1, 2);
  append(format, 24, 2);
  for (const std::uint32_t number : {0U, std::uint32_t(picture.size()), 0U, 0U, 0U, 0U}) append(format, number);
  const std::string header =
      "hdrl" + chunk("avih", main) + chunk("LIST", "strl" + chunk("strh", stream) + chunk("strf", format));
  std::string pictures = "movi";
  std::string index;
  for (std::uint32_t i = 0; i < count; ++i) {
    index += "00db";
    for (const std::uint32_t number : {0x10U, std::uint32_t(pictures.size()), std::uint32_t(picture.size())}) {
      append(index, number);
    }
    pictures += chunk("00db", picture);
  }
  return chunk("RIFF", "AVI " + chunk("LIST", header) + chunk("LIST", pictures) + chunk("idx1", index));
}

class PreviewMediaTest : public preview_test::PreviewViewTest {
 protected:
  void openMedia(const std::string& name, const std::string& type, const std::string& bytes) {
    std::ofstream(pathOf(name), std::ios::binary) << bytes;
    open(name, type);
  }
  /// The first button below the widget that says so.
  GtkWidget* button(const std::string& label, GtkWidget* widget = nullptr) {
    if (!widget) widget = view_->widget();
    const char* tooltip = GTK_IS_BUTTON(widget) ? gtk_widget_get_tooltip_text(widget) : nullptr;
    if (tooltip && label == tooltip) return widget;
    for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
      if (GtkWidget* found = button(label, child)) return found;
    }
    return nullptr;
  }
  void click(const std::string& label) {
    GtkWidget* found = button(label);
    ASSERT_NE(found, nullptr) << label;
    g_signal_emit_by_name(found, "clicked");
  }
  bool labelShows(const std::string& text) { return labelsIn(view_->widget()).find(text) != std::string::npos; }
  static guint windows() { return g_list_model_get_n_items(gtk_window_get_toplevels()); }
};

TEST(MediaTimeTest, ReadsAsOneSaysIt) {
  EXPECT_EQ(mediaTime(0), "0:00");
  EXPECT_EQ(mediaTime(65'999'999), "1:05");
  EXPECT_EQ(mediaTime(3'665'000'000), "1:01:05");
  EXPECT_EQ(mediaTime(-5), "0:00");
}

TEST_F(PreviewMediaTest, SoundIsReadyAndPlaysWhenItIsAskedTo) {
  openMedia("a.wav", "audio/x-wav", sound(75));
  ASSERT_EQ(failure_, "");
  EXPECT_TRUE(labelShows("a.wav"));
  EXPECT_TRUE(waitUntil([this] { return labelShows("1:15"); })) << labelsIn(view_->widget());
  EXPECT_EQ(button("Full Screen"), nullptr) << "there is nothing to see";
  EXPECT_EQ(button("Pause"), nullptr) << "it doesn't begin by itself";
  click("Play");
  EXPECT_TRUE(waitUntil([this] { return button("Pause") != nullptr; }));
  click("Pause");
  EXPECT_TRUE(waitUntil([this] { return button("Play") != nullptr; }));
}

TEST_F(PreviewMediaTest, TheSliderSeeks) {
  openMedia("a.wav", "audio/x-wav", sound(75));
  ASSERT_EQ(failure_, "");
  GtkWidget* slider = findIn(view_->widget(), GTK_TYPE_SCALE);
  ASSERT_TRUE(waitUntil([&] { return gtk_widget_is_sensitive(slider); }));
  gboolean handled = FALSE;
  for (const double place : {10.0, 20.0, 62.0}) {
    g_signal_emit_by_name(slider, "change-value", GTK_SCROLL_JUMP, place, &handled);
  }
  EXPECT_TRUE(waitUntil([this] { return labelShows("1:02"); })) << labelsIn(view_->widget());
}

TEST_F(PreviewMediaTest, TimeRunsFromTheLeftInEveryLanguage) {
  gtk_widget_set_default_direction(GTK_TEXT_DIR_RTL);
  openMedia("sound.wav", "audio/x-wav", sound(2));
  gtk_widget_set_default_direction(GTK_TEXT_DIR_LTR);
  GtkWidget* play = button("Play");
  ASSERT_TRUE(play);
  GtkWidget* bar = gtk_widget_get_parent(play);
  EXPECT_EQ(gtk_widget_get_direction(bar), GTK_TEXT_DIR_LTR);
  int sliders = 0;
  for (GtkWidget* child = gtk_widget_get_first_child(bar); child; child = gtk_widget_get_next_sibling(child)) {
    if (!GTK_IS_SCALE(child)) continue;
    ++sliders;
    EXPECT_EQ(gtk_widget_get_direction(child), GTK_TEXT_DIR_LTR);
  }
  EXPECT_EQ(sliders, 1);
}

TEST_F(PreviewMediaTest, AFilmFillsTheScreenAndLeavesIt) {
  openMedia("a.avi", "video/x-msvideo", film(3));
  ASSERT_EQ(failure_, "");
  EXPECT_NE(findIn(view_->widget(), GTK_TYPE_PICTURE), nullptr);
  const guint before = windows();
  click("Full Screen");
  EXPECT_EQ(windows(), before + 1);
  leave();
  EXPECT_EQ(windows(), before) << "its window goes with it";
}

TEST_F(PreviewMediaTest, LeavingStopsAndFreesIt) {
  openMedia("a.wav", "audio/x-wav", sound(5));
  ASSERT_EQ(failure_, "");
  click("Play");
  EXPECT_TRUE(waitUntil([this] { return button("Pause") != nullptr; }));
  openMedia("b.avi", "video/x-msvideo", film(1));
  GObject* stream = G_OBJECT(gtk_picture_get_paintable(GTK_PICTURE(findIn(view_->widget(), GTK_TYPE_PICTURE))));
  gpointer watched = stream;
  g_object_add_weak_pointer(stream, &watched);
  leave();
  EXPECT_TRUE(waitUntil([&] {
    g_main_context_wakeup(nullptr);
    return watched == nullptr;
  }));
}

TEST_F(PreviewMediaTest, WhatCannotBePlayedSaysSo) {
  constexpr const char* sentence =
      "This document can’t be played. It may be damaged or of a kind that this computer doesn’t know.";
  openMedia("a.wav", "audio/x-wav", "This is no sound.");
  EXPECT_EQ(failure_, sentence);
  openMedia("a.mp4", "video/mp4", "");
  EXPECT_EQ(failure_, sentence);
  openMedia("a.flac", "audio/flac", "fLaC" + std::string(4000, 'x'));
  EXPECT_EQ(failure_, sentence);
  open("gone.webm", "video/webm");
  EXPECT_EQ(failure_, "This document is no longer there.");
}

TEST(MediaFrameworkTest, NothingButFilesCanBeReached) {
  ASSERT_TRUE(prepareMediaFramework());
  const auto sourceOf = [](const char* address) {
    return GRef<GstElement>(gst_element_make_from_uri(GST_URI_SRC, address, nullptr, nullptr));
  };
  EXPECT_NE(sourceOf("file:///tmp/film"), nullptr);
  for (const char* address :
       {"http://127.0.0.1/", "https://127.0.0.1/", "rtsp://127.0.0.1/", "udp://127.0.0.1:9", "tcp://127.0.0.1:9",
        "smb://127.0.0.1/", "v4l2:///dev/video0", "cdda://1", "pushfile:///tmp/film"}) {
    EXPECT_EQ(sourceOf(address), nullptr) << address;
  }
  for (const char* reader : {"hlsdemux2", "dashdemux2", "souphttpsrc", "giosrc", "udpsrc"}) {
    EXPECT_EQ(GRef<GstElementFactory>(gst_element_factory_find(reader)), nullptr) << reader;
  }
}

TEST_F(PreviewMediaTest, AListOfAddressesIsNotFollowed) {
  const GRef<GSocketService> server(g_socket_service_new());
  const guint16 port = g_socket_listener_add_any_inet_port(G_SOCKET_LISTENER(server.get()), nullptr, nullptr);
  int connections = 0;
  g_signal_connect(server.get(), "incoming",
                   G_CALLBACK(+[](GSocketService*, GSocketConnection*, GObject*, int* count) -> gboolean {
                     ++*count;
                     return TRUE;
                   }),
                   &connections);
  const std::string address = "http://127.0.0.1:" + std::to_string(port) + "/part.ts";
  openMedia("a.mp4", "video/mp4",
            "#EXTM3U\n#EXT-X-VERSION:3\n#EXT-X-TARGETDURATION:5\n#EXTINF:5.0,\n" + address + "\n#EXT-X-ENDLIST\n");
  EXPECT_NE(failure_, "");
  openMedia("b.mp4", "video/mp4",
            "<?xml version=\"1.0\"?><MPD xmlns=\"urn:mpeg:dash:schema:mpd:2011\" type=\"static\" "
            "mediaPresentationDuration=\"PT5S\" minBufferTime=\"PT1S\"><Period><AdaptationSet "
            "mimeType=\"video/mp4\"><Representation "
            "id=\"1\" bandwidth=\"1\"><BaseURL>" +
                address + "</BaseURL><SegmentBase indexRange=\"0-9\"/></Representation></AdaptationSet></Period></MPD>");
  EXPECT_NE(failure_, "");
  EXPECT_EQ(connections, 0);
}

TEST_F(PreviewMediaTest, LeavingWhileItLoadsIsHarmless) {
  std::ofstream(pathOf("a.wav"), std::ios::binary) << sound(1);
  for (int i = 0; i < 10; ++i) begin("a.wav", "audio/x-wav");
  open("a.wav", "audio/x-wav");
  EXPECT_EQ(failure_, "");
}

}  // namespace
}  // namespace vaelo
