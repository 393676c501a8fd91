// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/thumbnails/thumbnail_cache.h"
#include "host/support/glib_ptr.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

using list_test::TestFolder;

/// Puts a picture of 100 by 50 into the cache, as a thumbnailer that saw the file at `modified` does.
void store(const TestFolder& cache, const std::string& path, const std::string& size, const std::string& modified) {
  const std::string uri = takeString(g_filename_to_uri(path.c_str(), nullptr, nullptr));
  const std::string hash = takeString(g_compute_checksum_for_string(G_CHECKSUM_MD5, uri.c_str(), -1));
  const std::string folder = cache.path() + "/thumbnails/" + size;
  std::filesystem::create_directories(folder);
  const GRef<GdkPixbuf> picture(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, 100, 50));
  gdk_pixbuf_fill(picture.get(), 0x336699ff);
  ASSERT_TRUE(gdk_pixbuf_save(picture.get(), (folder + "/" + hash + ".png").c_str(), "png", nullptr, "tEXt::Thumb::URI",
                              uri.c_str(), "tEXt::Thumb::MTime", modified.c_str(), nullptr));
}

TEST(ThumbnailCache, GivesThePictureOfThisVersion) {
  const TestFolder cache;
  const std::string path = "/nowhere/a picture.jpg";
  EXPECT_EQ(cachedThumbnail(cache.path(), path, 1000, 40), nullptr);
  store(cache, path, "large", "1000");
  const GRef<GdkTexture> texture(cachedThumbnail(cache.path(), path, 1000, 40));
  ASSERT_TRUE(texture);
  EXPECT_EQ(gdk_texture_get_width(texture.get()), 40);
  EXPECT_EQ(gdk_texture_get_height(texture.get()), 20);
  EXPECT_EQ(cachedThumbnail(cache.path(), path, 1001, 40), nullptr);
}

TEST(ThumbnailCache, BrokenPictureIsNone) {
  const TestFolder cache;
  const std::string path = "/nowhere/a.jpg";
  store(cache, path, "normal", "1");
  for (const auto& entry : std::filesystem::directory_iterator(cache.path() + "/thumbnails/normal")) {
    std::ofstream(entry.path()) << "no picture";
  }
  EXPECT_EQ(cachedThumbnail(cache.path(), path, 1, 40), nullptr);
}

}  // namespace
}  // namespace vaelo
