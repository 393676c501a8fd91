// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/thumbnails/document_thumbnails.h"

#include <adwaita.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <condition_variable>
#include <filesystem>
#include <fstream>
#include <future>
#include <vector>

#include "host/files/glib_queues.h"
#include "host/gtk/pango_graphics.h"
#include "host/gtk/thumbnails/late_picture.h"
#include "host/gtk/thumbnails/thumbnail_cache.h"
#include "host/gtk/thumbnails/thumbnail_png.h"
#include "host/support/glib_ptr.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

std::string readWhole(const std::string& path) {
  std::ifstream stream(path, std::ios::binary);
  return std::string(std::istreambuf_iterator<char>(stream), {});
}

/// A document with a thumbnail of noise in the desktop's own cache, where it doesn't stay.
class DocumentThumbnailsTest : public testing::Test {
 protected:
  DocumentThumbnailsTest() {
    adw_init();
    std::ofstream(path) << "x";
  }
  ~DocumentThumbnailsTest() override { std::filesystem::remove(file()); }

  std::string file() const {
    return thumbnailFolderFor(g_get_user_cache_dir(), LargestThumbnail) + "/" + thumbnailNameOf(path)->file;
  }
  std::int64_t modified() const {
    struct stat status = {};
    EXPECT_EQ(::stat(path.c_str(), &status), 0);
    return status.st_mtim.tv_sec;
  }
  void store(int width, int height) {
    const GRef<GdkPixbuf> made(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, width, height));
    unsigned noise = 1;
    guchar* pixels = gdk_pixbuf_get_pixels(made.get());
    for (gsize i = 0; i < gdk_pixbuf_get_byte_length(made.get()); ++i) {
      pixels[i] = static_cast<guchar>((noise = noise * 1664525 + 1013904223) >> 24);
    }
    ASSERT_TRUE(storeThumbnail(file(), made.get(), thumbnailNameOf(path)->uri, modified()));
  }
  /// A byte in the middle of the picture's data.
  void damage() {
    std::string bytes = readWhole(file());
    bytes[bytes.size() / 2] = static_cast<char>(~bytes[bytes.size() / 2]);
    std::ofstream(file(), std::ios::binary) << bytes;
  }
  static bool isDrawn(const ImageRef& image) {
    GtkSnapshot* snapshot = gtk_snapshot_new();
    gdk_paintable_snapshot(dynamic_cast<const GtkImageData&>(*image).paintable(), snapshot, 100, 75);
    GskRenderNode* node = gtk_snapshot_free_to_node(snapshot);
    const bool isThere = node != nullptr;
    if (node) gsk_render_node_unref(node);
    return isThere;
  }
  bool waitUntilTold() {
    std::unique_lock lock(mutex);
    return changed.wait_for(lock, std::chrono::seconds(20), [this] { return !told.empty(); });
  }

  list_test::TestFolder root;
  const std::string path = root.path() + "/a.unknown-kind";
  GLibQueues queues;
  std::mutex mutex;
  std::condition_variable changed;
  std::vector<std::string> told;  // guarded by mutex
  DocumentThumbnails thumbnails{queues, [this](const std::string& made) {
                                  const std::lock_guard lock(mutex);
                                  told.push_back(made);
                                  changed.notify_all();
                                }};
};

TEST_F(DocumentThumbnailsTest, ALargeOneHasItsSizeAtOnceAndIsDrawnOnceDecoded) {
  store(1024, 768);
  const ImageRef image = thumbnails.thumbnailOf(path);
  ASSERT_TRUE(image);
  EXPECT_EQ(image->width(), 1024);
  EXPECT_EQ(image->height(), 768);
  GdkPaintable* picture = dynamic_cast<const GtkImageData&>(*image).paintable();
  EXPECT_FALSE(GDK_IS_TEXTURE(picture)) << "decoded by who asked";
  EXPECT_EQ(gdk_paintable_get_intrinsic_width(picture), 1024);
  EXPECT_EQ(gdk_paintable_get_intrinsic_height(picture), 768);
  EXPECT_TRUE(isDrawn(image));
  EXPECT_TRUE(isDrawn(image)) << "again";
  EXPECT_TRUE(told.empty());
}

/// What is drawn in a place so wide, in points.
GRef<GdkTexture> textureDrawn(GdkPaintable* picture, double width) {
  GtkSnapshot* snapshot = gtk_snapshot_new();
  gdk_paintable_snapshot(picture, snapshot, width, width / 2);
  GskRenderNode* node = gtk_snapshot_free_to_node(snapshot);
  EXPECT_EQ(gsk_render_node_get_node_type(node), GSK_TEXTURE_NODE);
  GRef<GdkTexture> texture(GDK_TEXTURE(g_object_ref(gsk_texture_node_get_texture(node))));
  gsk_render_node_unref(node);
  return texture;
}

TEST_F(DocumentThumbnailsTest, ALargePictureComesInTheSizeInWhichItIsDrawn) {
  constexpr int width = 64;
  constexpr int height = 32;
  // Columns of white and opaque black, by turns.
  std::vector<guint32> columns(std::size_t{width} * height);
  for (std::size_t i = 0; i < columns.size(); ++i) columns[i] = i % 2 ? 0xFF000000U : 0xFFFFFFFFU;
  GBytes* bytes = g_bytes_new(columns.data(), columns.size() * sizeof(guint32));
  std::promise<GRef<GdkTexture>> decoded;
  decoded.set_value(
      GRef<GdkTexture>(gdk_memory_texture_new(width, height, GDK_MEMORY_DEFAULT, bytes, width * sizeof(guint32))));
  g_bytes_unref(bytes);
  const GRef<GdkPaintable> picture = makeLatePicture(width, height, decoded.get_future());
  for (const int drawn : {100, 40, 32, 20, 16, 64, 7, 2}) {
    const GRef<GdkTexture> texture = textureDrawn(picture.get(), drawn);
    const int expected = std::min(drawn, width);
    ASSERT_EQ(gdk_texture_get_width(texture.get()), expected);
    ASSERT_EQ(gdk_texture_get_height(texture.get()), (expected + 1) / 2) << expected;
    if (expected > width / 2) continue;
    std::vector<guint32> pixels(static_cast<std::size_t>(expected) * static_cast<std::size_t>((expected + 1) / 2));
    gdk_texture_download(texture.get(), reinterpret_cast<guchar*>(pixels.data()),
                         static_cast<gsize>(expected) * sizeof(guint32));
    for (const guint32 pixel : pixels) {
      EXPECT_EQ(pixel >> 24, 0xFFU) << "at " << expected;
      EXPECT_NEAR(static_cast<int>(pixel & 0xFF), 0x80, 1) << "the mean of black and white, at " << expected;
    }
  }
}

TEST_F(DocumentThumbnailsTest, ASmallOneIsDecodedAtOnce) {
  store(512, 384);
  const ImageRef image = thumbnails.thumbnailOf(path);
  ASSERT_TRUE(image);
  EXPECT_TRUE(GDK_IS_TEXTURE(dynamic_cast<const GtkImageData&>(*image).paintable()));
}

TEST_F(DocumentThumbnailsTest, ADamagedOneIsDrawnAsNothingAndAskedForAnew) {
  store(1024, 768);
  damage();
  const ImageRef image = thumbnails.thumbnailOf(path);
  ASSERT_TRUE(image);
  EXPECT_FALSE(isDrawn(image));
  ASSERT_TRUE(waitUntilTold());
  EXPECT_EQ(told, std::vector<std::string>{path});
  EXPECT_FALSE(thumbnails.thumbnailOf(path));
}

TEST_F(DocumentThumbnailsTest, WhatIsNeverDrawnEndsWithIt) {
  store(1024, 768);
  auto shortLived = std::make_unique<DocumentThumbnails>(queues, [](const std::string&) {});
  const ImageRef image = shortLived->thumbnailOf(path);
  shortLived.reset();
  EXPECT_EQ(image->width(), 1024);
}

TEST_F(DocumentThumbnailsTest, AnotherVersionHasNone) {
  store(1024, 768);
  std::filesystem::last_write_time(path, std::filesystem::file_time_type::clock::now() - std::chrono::hours(1));
  EXPECT_FALSE(thumbnails.thumbnailOf(path));
}

TEST_F(DocumentThumbnailsTest, AFileSaysWhatItShowsBeforeItIsDecoded) {
  store(640, 480);
  const std::string bytes = readWhole(file());
  const auto png = thumbnailPng(bytes);
  ASSERT_TRUE(png);
  EXPECT_EQ(png->width, 640);
  EXPECT_EQ(png->height, 480);
  EXPECT_EQ(png->uri, thumbnailNameOf(path)->uri);
  EXPECT_EQ(png->modified, std::to_string(modified()));
  for (std::size_t length : {std::size_t{0}, std::size_t{8}, std::size_t{20}, std::size_t{32}, bytes.size() - 1}) {
    EXPECT_FALSE(thumbnailPng(bytes.substr(0, length))) << length;
  }
  std::string wide = bytes;
  wide[18] = '\x04';  // 1024 and some
  EXPECT_FALSE(thumbnailPng(wide));
  std::string longChunk = bytes;
  longChunk[33] = '\x7f';  // the length of the chunk after the header
  EXPECT_FALSE(thumbnailPng(longChunk));
}

}  // namespace
}  // namespace vaelo
