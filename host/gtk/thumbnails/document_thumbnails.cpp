// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/thumbnails/document_thumbnails.h"

#include <sys/stat.h>

#include "host/gtk/pango_graphics.h"
#include "host/gtk/thumbnails/thumbnail_cache.h"
#include "host/gtk/thumbnails/thumbnail_maker.h"

namespace vaelo {

DocumentThumbnails::DocumentThumbnails(Queues& queues, std::function<void(const std::string&)> made)
    : made_(std::move(made)),
      maker_(queues.makeOperationQueue("com.marrow.VaeloDrive.thumbnails", QualityOfService::Utility)) {}

ImageRef DocumentThumbnails::thumbnailOf(const std::string& path) {
  struct stat status = {};
  if (::lstat(path.c_str(), &status) != 0 || !S_ISREG(status.st_mode)) return nullptr;
  const char* cache = g_get_user_cache_dir();
  const std::int64_t modified = status.st_mtim.tv_sec;
  GdkTexture* texture = cachedThumbnail(cache, path, modified, LargestThumbnail);
  const int side = texture ? std::max(gdk_texture_get_width(texture), gdk_texture_get_height(texture)) : 0;
  // One of the lists' size is shown until the large one is there, which a small document never has.
  const bool isLarge =
      side > thumbnailSideFor(LargestThumbnail / 2) || hasThumbnail(cache, path, modified, LargestThumbnail);
  if (!isLarge && mayHaveThumbnail(Thumbnailers::installed(), cache, path, modified)) make(path);
  if (!texture) return nullptr;
  return std::make_shared<GtkImageData>(GDK_PAINTABLE(texture), gdk_texture_get_width(texture),
                                        gdk_texture_get_height(texture));
}

void DocumentThumbnails::make(const std::string& path) {
  {
    const std::lock_guard lock(mutex_);
    if (!making_.insert(path).second) return;
  }
  maker_->addOperation([this, path] {
    const bool done = makeThumbnail(Thumbnailers::installed(), g_get_user_cache_dir(), path, LargestThumbnail);
    {
      const std::lock_guard lock(mutex_);
      making_.erase(path);
    }
    if (done) made_(path);
  });
}

}  // namespace vaelo
