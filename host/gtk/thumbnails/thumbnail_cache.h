// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gdk/gdk.h>

#include <cstdint>
#include <optional>
#include <string>

namespace vaelo {

/// The desktop's shared cache of thumbnails (Thumbnail Managing Standard), in the user's `cacheFolder`. Pictures in it are
/// other programs' work on documents of strangers: they are believed as far as their size, their format and what they say
/// they show. All functions block and may be called from any thread.

inline constexpr int LargestThumbnail = 1024;                          ///< pixels of a side
inline constexpr std::size_t LargestThumbnailFile = 16 * 1024 * 1024;  ///< bytes

/// What the cache calls the thumbnail of a file; nothing for a path that is not absolute.
struct ThumbnailName {
  std::string uri;
  std::string file;
};
std::optional<ThumbnailName> thumbnailNameOf(const std::string& path);
/// The cache's folder for thumbnails of at least `pixels` a side, where it has such a one.
std::string thumbnailFolderFor(const std::string& cacheFolder, int pixels);
/// Sides of the thumbnails in that folder.
int thumbnailSideFor(int pixels);

/// The picture in a PNG file, null unless it is a whole one of a size that thumbnails have. Owned by the caller.
GdkPixbuf* readThumbnail(const std::string& file);

/// A thumbnail that is yet to be decoded.
struct ThumbnailFile {
  std::string bytes;
  int width = 0;  ///< pixels, as it says
  int height = 0;
};
/// What the cache keeps of this version of a file (see below) for just that size.
std::optional<ThumbnailFile> cachedThumbnailFile(const std::string& cacheFolder, const std::string& path,
                                                 std::int64_t modified, int pixels);
/// Null when it is damaged. Owned by the caller.
GdkTexture* decodedThumbnail(const ThumbnailFile& file);

/// The picture that the cache keeps of a file, at most `pixels` wide and high, the smallest that is large enough or else the
/// largest there is; null when there is none or when it is of another file or another version of it (`modified`: the file's
/// own time, seconds since 1970). Owned by the caller. Looks up only: makes nothing, and never opens the file itself.
GdkTexture* cachedThumbnail(const std::string& cacheFolder, const std::string& path, std::int64_t modified, int pixels);
/// Whether the cache has one of this version that is as large as that.
bool hasThumbnail(const std::string& cacheFolder, const std::string& path, std::int64_t modified, int pixels);

/// Remembers, and tells, that no thumbnail can be made of this version of a file.
void rememberFailure(const std::string& cacheFolder, const std::string& path, std::int64_t modified);
bool hasFailed(const std::string& cacheFolder, const std::string& path, std::int64_t modified);

/// Puts a picture into the cache. False when the disk refuses.
bool storeThumbnail(const std::string& file, GdkPixbuf* picture, const std::string& uri, std::int64_t modified);

}  // namespace vaelo
