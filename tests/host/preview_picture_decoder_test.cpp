// SPDX-License-Identifier: GPL-3.0-or-later
// What the process that decodes pictures makes of them: their size, their turn, their parts and what moves in them.
#include <gdk-pixbuf/gdk-pixbuf.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <optional>
#include <sstream>

#include "host/gtk/preview/decoder_process.h"
#include "host/support/glib_ptr.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

using list_test::waitUntil;

struct Decoded {
  std::string error;
  std::string text;
  int width = 0;
  std::string bytes;

  /// The letter of the colour that the pixel is nearest to: red, green, blue, white or black.
  char colourAt(int x, int y) const {
    const std::size_t at = (static_cast<std::size_t>(y) * static_cast<std::size_t>(width) + static_cast<std::size_t>(x)) * 4;
    if (at + 4 > bytes.size()) return '?';
    const auto isBright = [&](std::size_t channel) { return static_cast<unsigned char>(bytes[at + channel]) > 127; };
    const bool blue = isBright(0);
    const bool green = isBright(1);
    const bool red = isBright(2);
    if (red && green && blue) return 'W';
    return red ? 'R' : green ? 'G' : blue ? 'B' : '-';
  }
  char middle() const { return colourAt(width / 2, static_cast<int>(bytes.size()) / 4 / std::max(width, 1) / 2); }
};

class PictureDecoderTest : public testing::Test {
 protected:
  std::string pathOf(const std::string& name) const { return folder_.path() + "/" + name; }
  void open(const std::string& name) { process_ = std::make_unique<DecoderProcess>("picture", pathOf(name)); }
  /// `sizeAt`: which of the words of the answer is the width of the pixels.
  Decoded ask(const std::string& request, int sizeAt) {
    std::optional<Decoded> got;
    process_->ask(request, [&](DecoderProcess::Answer answer) {
      got = Decoded{answer.error, answer.text, 0, ""};
      std::istringstream words(answer.text);
      for (int i = 0; i <= sizeAt; ++i) words >> got->width;
      char buffer[4096];
      for (off_t at = 0;;) {
        const ssize_t count = answer.file ? ::pread(answer.file.get(), buffer, sizeof buffer, at) : 0;
        if (count <= 0) break;
        got->bytes.append(buffer, static_cast<std::size_t>(count));
        at += count;
      }
    });
    EXPECT_TRUE(waitUntil([&] { return got.has_value(); })) << request;
    return got.value_or(Decoded{});
  }
  Decoded whole(int width, int height) { return ask("whole " + std::to_string(width) + " " + std::to_string(height), 2); }
  Decoded part(const std::string& area, int width, int height) {
    return ask("part " + area + " " + std::to_string(width) + " " + std::to_string(height), 0);
  }
  Decoded next(int width, int height) { return ask("next " + std::to_string(width) + " " + std::to_string(height), 0); }

  /// Red and green above blue and white.
  void writeQuarters(const std::string& name, const char* format, int width, int height) const {
    const GRef<GdkPixbuf> all(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, width, height));
    const guint32 colours[] = {0xff0000ff, 0x00ff00ff, 0x0000ffff, 0xffffffff};
    for (int i = 0; i < 4; ++i) {
      const GRef<GdkPixbuf> quarter(
          gdk_pixbuf_new_subpixbuf(all.get(), i % 2 * width / 2, i / 2 * height / 2, width / 2, height / 2));
      gdk_pixbuf_fill(quarter.get(), colours[i]);
    }
    ASSERT_TRUE(gdk_pixbuf_save(all.get(), pathOf(name).c_str(), format, nullptr, nullptr));
  }
  std::string contentOf(const std::string& name) const {
    gchar* bytes = nullptr;
    gsize size = 0;
    EXPECT_TRUE(g_file_get_contents(pathOf(name).c_str(), &bytes, &size, nullptr));
    std::string content(bytes, size);
    g_free(bytes);
    return content;
  }
  /// What a camera notes: nothing but how it was held.
  static std::string notes(int orientation, bool little) {
    const char held = static_cast<char>(orientation);
    const auto number = [&](int value, int count) {
      std::string text;
      for (int i = 0; i < count; ++i) text += static_cast<char>(value >> 8 * (little ? i : count - 1 - i));
      return text;
    };
    return std::string(little ? "II" : "MM") + number(42, 2) + number(8, 4) + number(2, 2) +              //
           number(0x100, 2) + number(3, 2) + number(1, 4) + number(held + 1, 2) + std::string(2, '\0') +  // not this one
           number(0x112, 2) + number(3, 2) + number(1, 4) + number(held, 2) + std::string(2, '\0') + number(0, 4);
  }
  static std::string corners(const Decoded& picture, int width, int height) {
    return {picture.colourAt(3, 3), picture.colourAt(width - 4, 3), picture.colourAt(3, height - 4),
            picture.colourAt(width - 4, height - 4)};
  }

  list_test::TestFolder folder_;
  std::unique_ptr<DecoderProcess> process_;
};

TEST_F(PictureDecoderTest, APictureIsMadeSmallerButNotLarger) {
  writeQuarters("a.png", "png", 300, 200);
  open("a.png");
  EXPECT_EQ(whole(60, 60).text, "300 200 60 40 -1");
  EXPECT_EQ(whole(900, 900).text, "300 200 300 200 -1");
  const Decoded corner = part("150 0 150 100", 30, 20);
  EXPECT_EQ(corner.text, "30 20");
  EXPECT_EQ(corner.middle(), 'G');
}

TEST_F(PictureDecoderTest, PicturesStandAsTheCameraWasHeld) {
  writeQuarters("straight.jpg", "jpeg", 64, 32);
  const std::string straight = contentOf("straight.jpg");
  const char* shown[] = {"RGBW", "GRWB", "WBGR", "BWRG", "RBGW", "BRWG", "WGBR", "GWRB"};
  for (int orientation = 1; orientation <= 8; ++orientation) {
    SCOPED_TRACE(orientation);
    const bool lies = orientation >= 5;
    const std::string exif = std::string("Exif\0\0", 6) + notes(orientation, orientation % 2 == 0);
    const std::string segment = std::string("\xFF\xE1\0", 3) + static_cast<char>(exif.size() + 2) + exif;
    folder_.write("turned.jpg", straight.substr(0, 2) + segment + straight.substr(2));
    open("turned.jpg");
    const Decoded all = whole(64, 64);
    EXPECT_EQ(all.text, lies ? "32 64 32 64 -1" : "64 32 64 32 -1");
    EXPECT_EQ(corners(all, lies ? 32 : 64, lies ? 64 : 32), shown[orientation - 1]);
    EXPECT_EQ(all.colourAt(lies ? 3 : 20, lies ? 20 : 3), shown[orientation - 1][0]) << "in rows as long as it is wide";
    EXPECT_EQ(part(lies ? "16 0 16 32" : "32 0 32 16", 8, 8).middle(), shown[orientation - 1][1])
        << "the part at the top right";
    EXPECT_EQ(part(lies ? "0 32 16 32" : "0 16 32 16", 8, 8).middle(), shown[orientation - 1][2]) << "at the bottom left";
  }
}

TEST_F(PictureDecoderTest, APhotographIsReadAgainForItsDetail) {
  // Stripes that are grey where the photograph was read small.
  const GRef<GdkPixbuf> striped(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, 512, 256));
  gdk_pixbuf_fill(striped.get(), 0x000000ff);
  for (int x = 0; x < 512; x += 16) {
    const GRef<GdkPixbuf> stripe(gdk_pixbuf_new_subpixbuf(striped.get(), x, 0, 8, 256));
    gdk_pixbuf_fill(stripe.get(), x < 256 ? 0xff0000ff : 0x0000ffff);
  }
  ASSERT_TRUE(gdk_pixbuf_save(striped.get(), pathOf("a.jpg").c_str(), "jpeg", nullptr, nullptr));
  open("a.jpg");
  EXPECT_EQ(whole(32, 32).text, "512 256 32 16 -1");
  const Decoded left = part("0 0 32 32", 32, 32);
  const Decoded right = part("480 200 32 32", 32, 32);
  for (int x = 4; x < 32; x += 8) {
    EXPECT_EQ(left.colourAt(x, 16), x % 16 < 8 ? 'R' : '-') << x;
    EXPECT_EQ(right.colourAt(x, 16), x % 16 < 8 ? 'B' : '-') << x;
  }
  EXPECT_EQ(whole(32, 32).text, "512 256 32 16 -1");
}

TEST_F(PictureDecoderTest, WhatCannotBeAskedForIsRefused) {
  writeQuarters("a.png", "png", 300, 200);
  open("a.png");
  EXPECT_EQ(part("0 0 10 10", 10, 10).error, DecoderError::Damaged) << "before it was opened";
  EXPECT_EQ(whole(60, 60).error, "");
  for (const char* area : {"290 0 30 20", "0 190 30 20", "-1 0 30 20", "0 -1 30 20", "0 0 0 20", "0 0 20 0", "x y z u"}) {
    EXPECT_EQ(part(area, 10, 10).error, DecoderError::Damaged) << area;
  }
  EXPECT_EQ(part("0 0 30 20", 100000, 100000).error, DecoderError::Damaged);
  EXPECT_EQ(whole(0, 10).error, DecoderError::Damaged);
  EXPECT_EQ(ask("turn 1 1", 0).error, DecoderError::Unsupported);
  EXPECT_EQ(next(10, 10).text, "10 7 -1") << "of a still one there is no other";
}

TEST_F(PictureDecoderTest, NotesThatMakeNoSenseTurnNothing) {
  writeQuarters("straight.jpg", "jpeg", 64, 32);
  const std::string straight = contentOf("straight.jpg");
  for (const std::string& bad : {notes(9, false), notes(0, true), notes(6, false).substr(0, 20), std::string("XX")}) {
    const std::string exif = std::string("Exif\0\0", 6) + bad;
    const std::string segment = std::string("\xFF\xE1\0", 3) + static_cast<char>(exif.size() + 2) + exif;
    folder_.write("odd.jpg", straight.substr(0, 2) + segment + straight.substr(2));
    open("odd.jpg");
    const Decoded all = whole(64, 64);
    EXPECT_EQ(all.text, "64 32 64 32 -1");
    EXPECT_EQ(corners(all, 64, 32), "RGBW");
  }
}

TEST_F(PictureDecoderTest, PngStandsAsTheCameraWasHeldToo) {
  writeQuarters("straight.png", "png", 64, 32);
  const std::string straight = contentOf("straight.png");
  const std::string exif = "eXIf" + notes(6, false);
  std::uint32_t checksum = 0xFFFFFFFF;
  for (const char byte : exif) {
    checksum ^= static_cast<unsigned char>(byte);
    for (int bit = 0; bit < 8; ++bit) checksum = checksum >> 1 ^ (checksum & 1 ? 0xEDB88320 : 0);
  }
  checksum = ~checksum;
  const std::string end{static_cast<char>(checksum >> 24), static_cast<char>(checksum >> 16),
                        static_cast<char>(checksum >> 8), static_cast<char>(checksum)};
  const std::string chunk = std::string(3, '\0') + static_cast<char>(exif.size() - 4) + exif + end;
  constexpr std::size_t afterHead = 33;
  folder_.write("turned.png", straight.substr(0, afterHead) + chunk + straight.substr(afterHead));
  open("turned.png");
  const Decoded all = whole(64, 64);
  EXPECT_EQ(all.text, "32 64 32 64 -1");
  EXPECT_EQ(corners(all, 32, 64), "BRWG");
  folder_.write("late.png", straight + chunk);
  open("late.png");
  EXPECT_EQ(whole(64, 64).text, "64 32 64 32 -1") << "behind the end is no part of the picture";
}

TEST_F(PictureDecoderTest, WebpStandsAsTheCameraWasHeldToo) {
  const GRef<GdkPixbuf> all(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, 32, 16));
  gdk_pixbuf_fill(all.get(), 0xff0000ff);
  if (!gdk_pixbuf_save(all.get(), pathOf("a.webp").c_str(), "webp", nullptr, nullptr)) GTEST_SKIP() << "no WebP loader";
  open("a.webp");
  EXPECT_EQ(whole(64, 64).text.substr(0, 12), "32 16 32 16 ");
  // The extended form: the flag that there are notes, the size less one, the picture, the notes.
  const std::string body = contentOf("a.webp").substr(12);
  const auto length = [](std::size_t size) {
    return std::string{static_cast<char>(size), static_cast<char>(size >> 8), static_cast<char>(size >> 16), 0};
  };
  const std::string picture = body.starts_with("VP8X") ? body.substr(18) : body;
  for (const std::string& exif : {notes(6, true), std::string("Exif\0\0", 6) + notes(6, false)}) {
    const std::string extended = "WEBPVP8X" + length(10) + std::string("\x08\0\0\0\x1F\0\0\x0F\0\0", 10) + picture + "EXIF" +
                                 length(exif.size()) + exif;
    folder_.write("turned.webp", "RIFF" + length(extended.size()) + extended);
    open("turned.webp");
    EXPECT_EQ(whole(64, 64).text.substr(0, 12), "16 32 16 32 ");
  }
}

TEST_F(PictureDecoderTest, AnAnimationGoesRoundInItsOwnTime) {
  const auto frame = [](int hundredths, char pixel) {
    return std::string("!\xF9\x04\0", 4) + static_cast<char>(hundredths) + std::string("\0\0\0,\0\0\0\0\1\0\1\0\0\2\2", 15) +
           pixel + std::string("\1\0", 2);
  };
  const std::string head = std::string("GIF89a\1\0\1\0\x80\0\0\xFF\0\0\0\xFF\0", 19);
  const std::string again = std::string("!\xFF\x0BNETSCAPE2.0\3\1\0\0\0", 19);
  folder_.write("moving.gif", head + again + frame(30, 0x44) + frame(70, 0x4C) + ";");
  open("moving.gif");
  const Decoded first = whole(10, 10);
  EXPECT_EQ(first.text.substr(0, 11), "1 1 1 1 300");
  EXPECT_EQ(first.middle(), 'R');
  for (int round = 0; round < 2; ++round) {
    const Decoded second = next(10, 10);
    EXPECT_EQ(second.text, "1 1 700");
    EXPECT_EQ(second.middle(), 'G');
    const Decoded third = next(10, 10);
    EXPECT_EQ(third.text, "1 1 300");
    EXPECT_EQ(third.middle(), 'R');
  }
  folder_.write("hasty.gif", head + again + frame(0, 0x44) + frame(1, 0x4C) + ";");
  open("hasty.gif");
  EXPECT_EQ(whole(10, 10).text.substr(0, 11), "1 1 1 1 100") << "nobody could see it so quickly";
  folder_.write("once.gif", head + frame(30, 0x44) + frame(70, 0x4C) + ";");
  open("once.gif");
  EXPECT_EQ(whole(10, 10).text.substr(0, 11), "1 1 1 1 300");
  EXPECT_EQ(next(10, 10).text, "1 1 700");
  const Decoded last = next(10, 10);
  EXPECT_EQ(last.text, "1 1 -1");
  EXPECT_EQ(last.middle(), 'G') << "where it ends";
  folder_.write("still.gif", head + frame(30, 0x44) + ";");
  open("still.gif");
  EXPECT_EQ(whole(10, 10).text.substr(0, 10), "1 1 1 1 -1");
}

TEST_F(PictureDecoderTest, ADrawingIsSharpAtAnySize) {
  folder_.write("a.svg",
                "<svg xmlns='http://www.w3.org/2000/svg' width='40' height='30'><rect width='20' height='30' fill='red'/>"
                "<rect x='20' width='20' height='30' fill='blue'/></svg>");
  open("a.svg");
  const Decoded all = whole(200, 200);
  EXPECT_EQ(all.text.substr(0, 16), "40 30 200 150 -1");
  EXPECT_NE(all.text.find(" scalable"), std::string::npos);
  EXPECT_EQ(all.colourAt(98, 70), 'R');
  EXPECT_EQ(all.colourAt(101, 70), 'B');
  EXPECT_EQ(part("20 0 20 30", 10, 10).middle(), 'B');
}

TEST_F(PictureDecoderTest, WhatIsSeenThroughSaysSo) {
  const GRef<GdkPixbuf> glass(gdk_pixbuf_new(GDK_COLORSPACE_RGB, TRUE, 8, 4, 4));
  gdk_pixbuf_fill(glass.get(), 0xff000080);
  ASSERT_TRUE(gdk_pixbuf_save(glass.get(), pathOf("glass.png").c_str(), "png", nullptr, nullptr));
  open("glass.png");
  const Decoded all = whole(10, 10);
  EXPECT_EQ(all.text, "4 4 4 4 -1 transparent");
  ASSERT_EQ(all.bytes.size(), 64u);
  EXPECT_EQ(static_cast<unsigned char>(all.bytes[3]), 0x80);
  EXPECT_EQ(static_cast<unsigned char>(all.bytes[2]), 0x80) << "times its opacity";
}

TEST_F(PictureDecoderTest, OfAPictureThatIsCutTheBeginningIsShown) {
  for (const char* format : {"png", "jpeg"}) {
    SCOPED_TRACE(format);
    // Noise, which doesn't get so small that it comes in one piece.
    const GRef<GdkPixbuf> noise(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, 256, 256));
    guchar* pixels = gdk_pixbuf_get_pixels(noise.get());
    for (gsize i = 0; i < gdk_pixbuf_get_byte_length(noise.get()); ++i) pixels[i] = static_cast<guchar>(i * i % 251);
    ASSERT_TRUE(gdk_pixbuf_save(noise.get(), pathOf("whole").c_str(), format, nullptr, nullptr));
    open("whole");
    EXPECT_EQ(whole(256, 256).text, "256 256 256 256 -1");
    const std::string content = contentOf("whole");
    folder_.write("cut", content.substr(0, content.size() / 2));
    open("cut");
    EXPECT_EQ(whole(256, 256).text, "256 256 256 256 -1 partial");
  }
}

}  // namespace
}  // namespace vaelo
