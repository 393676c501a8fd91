// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/thumbnails/thumbnail_maker.h"

#include <sys/stat.h>

#include <fstream>

#include "host/gtk/thumbnails/thumbnail_cache.h"
#include "host/support/glib_ptr.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {
namespace {

using list_test::TestFolder;

/// A folder of documents, one of thumbnailers, and a cache.
class ThumbnailMakerTest : public testing::Test {
 protected:
  ThumbnailMakerTest() { std::filesystem::create_directory(root.path() + "/thumbnailers"); }

  std::string document(const std::string& name, const std::string& bytes = "x") {
    const std::string path = root.path() + "/" + name;
    std::ofstream(path) << bytes;
    return path;
  }
  std::string picture(const std::string& name, int width, int height) {
    const std::string path = root.path() + "/" + name;
    const GRef<GdkPixbuf> made(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, width, height));
    gdk_pixbuf_fill(made.get(), 0x336699ff);
    EXPECT_TRUE(gdk_pixbuf_save(made.get(), path.c_str(), "png", nullptr, nullptr));
    return path;
  }
  /// A thumbnailer for text that runs a line of shell with the output as $1 and the document as $2; it counts its runs.
  Thumbnailers shell(const std::string& line) {
    document("thumbnailers/test.thumbnailer", "[Thumbnailer Entry]\nExec=/bin/sh -c \"echo run >>" + root.path() +
                                                  "/runs; " + line + "\" sh %o %i %s\nMimeType=text/plain;\n");
    return Thumbnailers({root.path() + "/thumbnailers"});
  }
  int runs() {
    std::ifstream stream(root.path() + "/runs");
    int count = 0;
    for (std::string line; std::getline(stream, line);) ++count;
    return count;
  }
  std::int64_t modified(const std::string& path) {
    struct stat status = {};
    EXPECT_EQ(::stat(path.c_str(), &status), 0);
    return status.st_mtim.tv_sec;
  }
  GRef<GdkTexture> cached(const std::string& path, int pixels = 128) {
    return GRef<GdkTexture>(cachedThumbnail(cache(), path, modified(path), pixels));
  }
  std::string cache() { return root.path() + "/cache"; }
  std::string cacheFile(const std::string& folder, const std::string& path) {
    return cache() + "/thumbnails/" + folder + "/" + thumbnailNameOf(path)->file;
  }

  TestFolder root;
};

TEST_F(ThumbnailMakerTest, TheDesktopsThumbnailersAreRead) {
  const Thumbnailers some = shell("true");
  EXPECT_TRUE(some.canShow("a.txt"));
  EXPECT_FALSE(some.canShow("a.png"));
  const auto command = some.commandFor("/x/a b.txt", "/out.png", 256);
  ASSERT_TRUE(command);
  EXPECT_EQ((std::vector<std::string>{command->end() - 3, command->end()}),
            (std::vector<std::string>{"/out.png", "/x/a b.txt", "256"}));
}

TEST_F(ThumbnailMakerTest, FilesThatAreNoThumbnailersArePassedOver) {
  document("thumbnailers/a.thumbnailer", "garbage");
  document("thumbnailers/b.thumbnailer", "[Thumbnailer Entry]\nMimeType=text/plain;\n");
  document("thumbnailers/c.thumbnailer", "[Thumbnailer Entry]\nExec=/nowhere/program %o\nMimeType=text/plain;\n");
  document("thumbnailers/d.thumbnailer", "[Thumbnailer Entry]\nTryExec=/nowhere\nExec=/bin/true %o\nMimeType=text/plain;\n");
  document("thumbnailers/e.thumbnailer", "[Thumbnailer Entry]\nExec=\"unclosed\nMimeType=text/plain;\n");
  EXPECT_FALSE(Thumbnailers({root.path() + "/thumbnailers", "/nowhere"}).canShow("a.txt"));
}

TEST_F(ThumbnailMakerTest, WhatIsMadeIsStoredAsTheStandardSays) {
  const std::string made = picture("made.png", 90, 60);
  const Thumbnailers copying = shell("cp " + made + " $1");
  const std::string path = document("a.txt");
  ASSERT_TRUE(makeThumbnail(copying, cache(), path, 100));
  const std::string file = cacheFile("normal", path);
  struct stat status = {};
  ASSERT_EQ(::stat(file.c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 0777, 0600u);
  const GRef<GdkPixbuf> stored(gdk_pixbuf_new_from_file(file.c_str(), nullptr));
  EXPECT_EQ(gdk_pixbuf_get_option(stored.get(), "tEXt::Thumb::URI"), "file://" + path);
  EXPECT_EQ(gdk_pixbuf_get_option(stored.get(), "tEXt::Thumb::MTime"), std::to_string(modified(path)));
  ASSERT_TRUE(cached(path));
  EXPECT_EQ(gdk_texture_get_width(cached(path).get()), 90);
  ASSERT_TRUE(makeThumbnail(copying, cache(), path, 100));
  EXPECT_EQ(runs(), 1);
  // A larger one is another picture.
  ASSERT_TRUE(makeThumbnail(copying, cache(), path, 1024));
  EXPECT_TRUE(std::filesystem::exists(cacheFile("xx-large", path)));
  EXPECT_EQ(runs(), 2);
}

TEST_F(ThumbnailMakerTest, AnotherVersionOfTheDocumentHasAnotherThumbnail) {
  const Thumbnailers copying = shell("cp " + picture("made.png", 90, 60) + " $1");
  const std::string path = document("a.txt");
  ASSERT_TRUE(makeThumbnail(copying, cache(), path, 100));
  std::filesystem::last_write_time(path, std::filesystem::last_write_time(path) + std::chrono::seconds(5));
  EXPECT_FALSE(cached(path));
  ASSERT_TRUE(makeThumbnail(copying, cache(), path, 100));
  EXPECT_TRUE(cached(path));
}

TEST_F(ThumbnailMakerTest, WhatCannotBeMadeIsNotTriedAgain) {
  const std::string path = document("a.txt");
  for (const char* line : {"exit 1", "true", "echo no picture >$1", "kill -9 $$"}) {
    const Thumbnailers failing = shell(line);
    const int before = runs();
    EXPECT_FALSE(makeThumbnail(failing, cache(), path, 100)) << line;
    EXPECT_FALSE(makeThumbnail(failing, cache(), path, 100)) << line;
    EXPECT_EQ(runs(), before + 1) << line;
    EXPECT_FALSE(mayHaveThumbnail(failing, cache(), path, modified(path)));
    std::filesystem::remove_all(cache());
  }
}

TEST_F(ThumbnailMakerTest, AThumbnailerWithoutEndIsEndedWithAllItStarted) {
  const Thumbnailers endless = shell("sleep 1000 & echo $! >" + root.path() + "/child; sleep 1000");
  const std::string path = document("a.txt");
  EXPECT_FALSE(makeThumbnail(endless, cache(), path, 100, {std::chrono::milliseconds(300)}));
  pid_t child = 0;
  std::ifstream(root.path() + "/child") >> child;
  ASSERT_GT(child, 0);
  EXPECT_TRUE(list_test::waitUntil([child] {
    g_main_context_wakeup(nullptr);
    // It is gone, or a corpse that nobody has buried yet.
    std::ifstream state("/proc/" + std::to_string(child) + "/stat");
    std::string number, name, letter = "Z";
    state >> number >> name >> letter;
    return letter == "Z" || letter == "X";
  }));
}

TEST_F(ThumbnailMakerTest, AThumbnailerThatFillsTheDiskIsStopped) {
  const Thumbnailers greedy = shell("exec cat /dev/zero >$1");
  EXPECT_FALSE(makeThumbnail(greedy, cache(), document("a.txt"), 100));
}

TEST_F(ThumbnailMakerTest, PicturesThatAreNoThumbnailsAreRefused) {
  const std::string path = document("a.txt");
  EXPECT_FALSE(makeThumbnail(shell("cp " + picture("wide.png", 1025, 2) + " $1"), cache(), path, 100));
  std::filesystem::remove_all(cache());
  EXPECT_TRUE(makeThumbnail(shell("cp " + picture("just.png", 1024, 2) + " $1"), cache(), path, 100));
}

TEST_F(ThumbnailMakerTest, ADocumentThatChangesMeanwhileIsTriedAgain) {
  const std::string made = picture("made.png", 9, 6);
  const std::string path = document("a.txt");
  const Thumbnailers slow = shell("cp " + made + " $1; touch -d @1000 $2");
  EXPECT_FALSE(makeThumbnail(slow, cache(), path, 100));
  EXPECT_TRUE(mayHaveThumbnail(slow, cache(), path, modified(path)));
  EXPECT_TRUE(makeThumbnail(slow, cache(), path, 100));
}

TEST_F(ThumbnailMakerTest, OnlyFilesAreShown) {
  const Thumbnailers copying = shell("cp " + picture("made.png", 9, 6) + " $1");
  std::filesystem::create_directory(root.path() + "/folder.txt");
  std::filesystem::create_symlink(document("a.txt"), root.path() + "/link.txt");
  EXPECT_FALSE(makeThumbnail(copying, cache(), root.path() + "/folder.txt", 100));
  EXPECT_FALSE(makeThumbnail(copying, cache(), root.path() + "/link.txt", 100));
  EXPECT_FALSE(makeThumbnail(copying, cache(), root.path() + "/gone.txt", 100));
  EXPECT_EQ(runs(), 0);
}

TEST_F(ThumbnailMakerTest, TruncatedAndEnormousPicturesInTheCacheAreNone) {
  const std::string path = document("a.txt");
  const std::string file = cacheFile("normal", path);
  const GRef<GdkPixbuf> made(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, 100, 100));
  gdk_pixbuf_fill(made.get(), 0x123456ff);
  ASSERT_TRUE(storeThumbnail(file, made.get(), "file://" + path, modified(path)));
  ASSERT_TRUE(cached(path));
  std::ifstream stream(file, std::ios::binary);
  const std::string whole(std::istreambuf_iterator<char>(stream), {});
  for (const std::size_t length : {std::size_t{0}, std::size_t{10}, std::size_t{24}, whole.size() / 2, whole.size() - 1}) {
    std::ofstream(file, std::ios::binary) << whole.substr(0, length);
    EXPECT_FALSE(cached(path)) << length;
  }
  std::string enormous = whole;
  enormous[17] = '\x7f';  // its width
  std::ofstream(file, std::ios::binary) << enormous;
  EXPECT_FALSE(cached(path));
  std::ofstream(file, std::ios::binary) << whole << std::string(LargestThumbnailFile, ' ');
  EXPECT_FALSE(cached(path));
  std::filesystem::remove(file);
  ASSERT_EQ(::mkfifo(file.c_str(), 0600), 0);
  EXPECT_FALSE(cached(path));
}

TEST_F(ThumbnailMakerTest, AThumbnailOfAnotherFileIsNone) {
  const std::string path = document("a.txt");
  const GRef<GdkPixbuf> made(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, 10, 10));
  gdk_pixbuf_fill(made.get(), 0);
  ASSERT_TRUE(storeThumbnail(cacheFile("normal", path), made.get(), "file:///other", modified(path)));
  EXPECT_FALSE(cached(path));
}

TEST_F(ThumbnailMakerTest, TheLargestThereIsStandsForALargerOne) {
  const std::string path = document("a.txt");
  const auto store = [&](const char* folder, int side) {
    const GRef<GdkPixbuf> made(gdk_pixbuf_new(GDK_COLORSPACE_RGB, FALSE, 8, side, side));
    gdk_pixbuf_fill(made.get(), 0);
    ASSERT_TRUE(storeThumbnail(cacheFile(folder, path), made.get(), "file://" + path, modified(path)));
  };
  store("normal", 128);
  store("x-large", 512);
  EXPECT_EQ(gdk_texture_get_width(cached(path, 1024).get()), 512);
  EXPECT_EQ(gdk_texture_get_width(cached(path, 200).get()), 200);
  EXPECT_EQ(gdk_texture_get_width(cached(path, 128).get()), 128);
  EXPECT_FALSE(hasThumbnail(cache(), path, modified(path), 1024));
  EXPECT_TRUE(hasThumbnail(cache(), path, modified(path), 512));
}

TEST_F(ThumbnailMakerTest, TheInstalledThumbnailersShowPictures) {
  if (!Thumbnailers::installed().canShow("a.png")) GTEST_SKIP() << "no thumbnailer for pictures is installed";
  const std::string path = picture("a.png", 2000, 1000);
  ASSERT_TRUE(makeThumbnail(Thumbnailers::installed(), cache(), path, 1024));
  const GRef<GdkTexture> large = cached(path, 1024);
  EXPECT_EQ(gdk_texture_get_width(large.get()), 1024);
  EXPECT_EQ(gdk_texture_get_height(large.get()), 512);
}

}  // namespace
}  // namespace vaelo
