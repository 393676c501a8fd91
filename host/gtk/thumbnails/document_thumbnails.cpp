// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/thumbnails/document_thumbnails.h"

#include <sys/stat.h>

#include <future>

#include "host/gtk/pango_graphics.h"
#include "host/gtk/thumbnails/late_picture.h"
#include "host/gtk/thumbnails/thumbnail_maker.h"

namespace vaelo {

DocumentThumbnails::DocumentThumbnails(Queues& queues, std::function<void(const std::string&)> made)
    : made_(std::move(made)),
      maker_(queues.makeOperationQueue("com.marrow.VaeloDrive.thumbnails", QualityOfService::Utility)),
      decoder_(queues.makeOperationQueue("com.marrow.VaeloDrive.pictures", QualityOfService::UserInitiated)) {}

ImageRef DocumentThumbnails::thumbnailOf(const std::string& path) {
  struct stat status = {};
  if (::lstat(path.c_str(), &status) != 0 || !S_ISREG(status.st_mode)) return nullptr;
  const char* cache = g_get_user_cache_dir();
  const std::int64_t modified = status.st_mtim.tv_sec;
  if (!isDamaged(path)) {
    std::optional<ThumbnailFile> file = cachedThumbnailFile(cache, path, modified, LargestThumbnail);
    if (file && std::max(file->width, file->height) > thumbnailSideFor(LargestThumbnail / 2)) {
      return comingPicture(path, std::move(*file));
    }
  }
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

ImageRef DocumentThumbnails::comingPicture(const std::string& path, ThumbnailFile file) {
  const auto promise = std::make_shared<std::promise<GRef<GdkTexture>>>();
  GRef<GdkPaintable> picture = makeLatePicture(file.width, file.height, promise->get_future());
  const auto image = std::make_shared<GtkImageData>(picture.release(), file.width, file.height);
  decoder_->addOperation([this, path, promise, file = std::move(file)] {
    GRef<GdkTexture> texture(decodedThumbnail(file));
    const bool isDamaged = !texture;
    promise->set_value(std::move(texture));
    if (isDamaged) foundDamaged(path);
  });
  return image;
}

bool DocumentThumbnails::isDamaged(const std::string& path) {
  const std::lock_guard lock(mutex_);
  return damaged_.contains(path);
}

void DocumentThumbnails::foundDamaged(const std::string& path) {
  {
    const std::lock_guard lock(mutex_);
    damaged_.insert(path);
  }
  // Who shows it asks again, and gets what else there is.
  made_(path);
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
