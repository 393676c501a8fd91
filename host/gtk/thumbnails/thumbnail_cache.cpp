// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/thumbnails/thumbnail_cache.h"

#include <algorithm>
#include <cstdlib>
#include <utility>

#include "host/drive/small_file.h"
#include "host/gtk/thumbnails/thumbnail_png.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

struct Folder {
  const char* name;
  int side;
};
constexpr Folder Folders[] = {{"normal", 128}, {"large", 256}, {"x-large", 512}, {"xx-large", LargestThumbnail}};

constexpr const char* FailuresFolder = "/thumbnails/fail/vaelo-drive";

const Folder& folderFor(int pixels) {
  for (const Folder& folder : Folders) {
    if (folder.side >= pixels) return folder;
  }
  return Folders[3];
}

bool isOfVersion(const ThumbnailPng& png, const std::string& uri, std::int64_t modified) {
  // Some programs leave the name out; one that is there must be the file's.
  return (!png.uri || uri == *png.uri) && png.modified && std::strtoll(png.modified->c_str(), nullptr, 10) == modified;
}

/// The file at that place, unless it is no thumbnail of this version.
std::optional<ThumbnailFile> fileOfVersion(const std::string& place, const std::string& uri, std::int64_t modified) {
  Result<std::string> bytes = readSmallFile(place, LargestThumbnailFile);
  const std::optional<ThumbnailPng> png = bytes ? thumbnailPng(*bytes.value) : std::nullopt;
  if (!png || !isOfVersion(*png, uri, modified)) return std::nullopt;
  return ThumbnailFile{std::move(*bytes.value), png->width, png->height};
}

std::optional<ThumbnailFile> fileIn(const std::string& cacheFolder, const Folder& folder, const ThumbnailName& name,
                                    std::int64_t modified) {
  return fileOfVersion(cacheFolder + "/thumbnails/" + folder.name + "/" + name.file, name.uri, modified);
}

GRef<GdkPixbuf> decoded(const std::string& bytes) {
  const GRef<GdkPixbufLoader> loader(gdk_pixbuf_loader_new_with_type("png", nullptr));
  if (!loader) return nullptr;
  const bool written =
      gdk_pixbuf_loader_write(loader.get(), reinterpret_cast<const guchar*>(bytes.data()), bytes.size(), nullptr);
  const bool whole = gdk_pixbuf_loader_close(loader.get(), nullptr);
  GdkPixbuf* picture = written && whole ? gdk_pixbuf_loader_get_pixbuf(loader.get()) : nullptr;
  return GRef<GdkPixbuf>(picture ? GDK_PIXBUF(g_object_ref(picture)) : nullptr);
}

GRef<GdkPixbuf> pictureIn(const std::string& cacheFolder, const Folder& folder, const ThumbnailName& name,
                          std::int64_t modified) {
  const std::optional<ThumbnailFile> file = fileIn(cacheFolder, folder, name, modified);
  return file ? decoded(file->bytes) : nullptr;
}

}  // namespace

std::optional<ThumbnailName> thumbnailNameOf(const std::string& path) {
  const std::string uri = takeString(g_filename_to_uri(path.c_str(), nullptr, nullptr));
  if (uri.empty()) return std::nullopt;
  return ThumbnailName{uri, takeString(g_compute_checksum_for_string(G_CHECKSUM_MD5, uri.c_str(), -1)) + ".png"};
}

std::string thumbnailFolderFor(const std::string& cacheFolder, int pixels) {
  return cacheFolder + "/thumbnails/" + folderFor(pixels).name;
}

int thumbnailSideFor(int pixels) { return folderFor(pixels).side; }

GdkPixbuf* readThumbnail(const std::string& file) {
  const Result<std::string> bytes = readSmallFile(file, LargestThumbnailFile);
  return bytes && thumbnailPng(*bytes.value) ? decoded(*bytes.value).release() : nullptr;
}

std::optional<ThumbnailFile> cachedThumbnailFile(const std::string& cacheFolder, const std::string& path,
                                                 std::int64_t modified, int pixels) {
  const std::optional<ThumbnailName> name = thumbnailNameOf(path);
  return name ? fileIn(cacheFolder, folderFor(pixels), *name, modified) : std::nullopt;
}

GdkTexture* decodedThumbnail(const ThumbnailFile& file) {
  const GRef<GdkPixbuf> picture = decoded(file.bytes);
  return picture ? gdk_texture_new_for_pixbuf(picture.get()) : nullptr;
}

GdkTexture* cachedThumbnail(const std::string& cacheFolder, const std::string& path, std::int64_t modified, int pixels) {
  const std::optional<ThumbnailName> name = thumbnailNameOf(path);
  if (!name) return nullptr;
  GRef<GdkPixbuf> picture;
  const Folder* const enough = &folderFor(pixels);
  for (const Folder* folder = enough; folder != std::end(Folders) && !picture; ++folder) {
    picture = pictureIn(cacheFolder, *folder, *name, modified);
  }
  for (const Folder* folder = enough; folder != std::begin(Folders) && !picture; --folder) {
    picture = pictureIn(cacheFolder, folder[-1], *name, modified);
  }
  if (!picture) return nullptr;
  const int width = gdk_pixbuf_get_width(picture.get());
  const int height = gdk_pixbuf_get_height(picture.get());
  const double scale = static_cast<double>(pixels) / std::max(width, height);
  if (scale < 1) {
    picture.reset(gdk_pixbuf_scale_simple(picture.get(), std::max(1, static_cast<int>(width * scale)),
                                          std::max(1, static_cast<int>(height * scale)), GDK_INTERP_BILINEAR));
  }
  return picture ? gdk_texture_new_for_pixbuf(picture.get()) : nullptr;
}

bool hasThumbnail(const std::string& cacheFolder, const std::string& path, std::int64_t modified, int pixels) {
  const std::optional<ThumbnailName> name = thumbnailNameOf(path);
  if (!name) return false;
  return std::any_of(std::begin(Folders), std::end(Folders), [&](const Folder& folder) {
    return folder.side >= std::min(pixels, LargestThumbnail) && fileIn(cacheFolder, folder, *name, modified);
  });
}

void rememberFailure(const std::string& cacheFolder, const std::string& path, std::int64_t modified) {
  const std::optional<ThumbnailName> name = thumbnailNameOf(path);
  if (!name) return;
  const GRef<GdkPixbuf> nothing(gdk_pixbuf_new(GDK_COLORSPACE_RGB, TRUE, 8, 1, 1));
  gdk_pixbuf_fill(nothing.get(), 0);
  storeThumbnail(cacheFolder + FailuresFolder + "/" + name->file, nothing.get(), name->uri, modified);
}

bool hasFailed(const std::string& cacheFolder, const std::string& path, std::int64_t modified) {
  const std::optional<ThumbnailName> name = thumbnailNameOf(path);
  if (!name) return true;
  return fileOfVersion(cacheFolder + FailuresFolder + "/" + name->file, name->uri, modified).has_value();
}

bool storeThumbnail(const std::string& file, GdkPixbuf* picture, const std::string& uri, std::int64_t modified) {
  char* data = nullptr;
  gsize size = 0;
  const std::string time = std::to_string(modified);
  if (!gdk_pixbuf_save_to_buffer(picture, &data, &size, "png", nullptr, "tEXt::Thumb::URI", uri.c_str(),
                                 "tEXt::Thumb::MTime", time.c_str(), "tEXt::Software", "Vaelo Drive", nullptr)) {
    return false;
  }
  const std::string folder = file.substr(0, file.rfind('/'));
  constexpr int ownerOnly = 0600;  // they show what only the owner may see
  const bool stored = g_mkdir_with_parents(folder.c_str(), 0700) == 0 &&
                      g_file_set_contents_full(file.c_str(), data, static_cast<gssize>(size), G_FILE_SET_CONTENTS_CONSISTENT,
                                               ownerOnly, nullptr);
  g_free(data);
  return stored;
}

}  // namespace vaelo
