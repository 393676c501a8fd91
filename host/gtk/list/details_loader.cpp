// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/details_loader.h"

#include <utility>

#include "host/gtk/list/details_reader.h"
#include "host/gtk/thumbnails/thumbnail_maker.h"

namespace vaelo {
namespace {

constexpr std::size_t BatchSize = 16;
constexpr std::size_t MostWatched = 256;  // more than the rows that are kept in a list

struct Job {
  std::string name;
  EntryKind kind;
  std::shared_ptr<const ItemDetails> details;
  int watch = -1;
};

}  // namespace

DetailsLoader::DetailsLoader(FolderModel& model, std::function<void(FolderItem&)> loaded)
    : model_(model), loaded_(std::move(loaded)), contents_([this](const std::string& name) { contentChanged(name); }) {}

void DetailsLoader::setFolder(const std::string& folder) {
  folder_ = folder;
  ++generation_;
  wanted_.clear();
  missing_.clear();
  contents_.keep([](const std::string&) { return false; });
}

void DetailsLoader::contentChanged(const std::string& name) {
  FolderItem* item = model_.liveItem(name);
  if (!item) return;
  item->detailsAreFresh = false;
  if (item->row) gtk_widget_queue_draw(item->row);
}

void DetailsLoader::request(FolderItem& item) {
  if (std::exchange(item.detailsAreFresh, true)) return;
  wanted_.push_back(item.name);
  if (!reading_) readNext();
}

void DetailsLoader::readNext() {
  std::vector<Job> batch;
  while (!wanted_.empty() && batch.size() < BatchSize) {
    FolderItem* item = model_.liveItem(wanted_.back());
    if (item && item->row) {
      batch.push_back({item->name, item->kind, nullptr, -1});
    } else if (item) {
      item->detailsAreFresh = false;  // asks again when it is drawn again
    }
    wanted_.pop_back();
  }
  reading_ = !batch.empty();
  if (!reading_) return;
  worker_.run([this, generation = generation_, folder = folder_, pixels = thumbnailPixels_, queue = contents_.queue(),
               jobs = std::move(batch)]() mutable -> std::function<void()> {
    for (Job& job : jobs) {
      const std::string path = folder.empty() ? job.name : folder + "/" + job.name;
      // Before it is counted, so that nothing is missed in between.
      if (isListedAsFolder(job.kind)) job.watch = queue->watch(path);
      job.details = readDetails(path, job.kind, pixels);
    }
    return [this, generation, queue, done = std::move(jobs)] {
      for (const Job& job : done) contents_.add(queue, job.watch, job.name);
      if (contents_.size() > MostWatched) {
        contents_.keep([this](const std::string& name) { return model_.liveItem(name) != nullptr; });
      }
      if (generation == generation_) {
        for (const Job& job : done) {
          FolderItem* item = model_.liveItem(job.name);
          if (!item) continue;
          item->details = job.details;
          loaded_(*item);
          if (job.details->mayHaveThumbnail) missing_.push_back(job.name);
        }
      }
      readNext();
      if (!making_) makeNextThumbnail();
    };
  });
}

FolderItem* DetailsLoader::shownItem(const std::string& name) {
  FolderItem* item = model_.liveItem(name);
  return item && item->row ? item : nullptr;
}

void DetailsLoader::makeNextThumbnail() {
  FolderItem* item = nullptr;
  while (!missing_.empty() && !item) {
    item = shownItem(missing_.back());
    if (!item) {
      // Asks again when it is drawn again.
      if (FolderItem* gone = model_.liveItem(missing_.back())) gone->detailsAreFresh = false;
      missing_.pop_back();
    }
  }
  making_ = item != nullptr;
  if (!making_) return;
  missing_.pop_back();
  maker_.run([this, generation = generation_, name = item->name, kind = item->kind, folder = folder_,
              pixels = thumbnailPixels_]() -> std::function<void()> {
    const std::string path = folder.empty() ? name : folder + "/" + name;
    std::shared_ptr<const ItemDetails> details;
    if (makeThumbnail(Thumbnailers::installed(), g_get_user_cache_dir(), path, pixels)) {
      details = readDetails(path, kind, pixels);
    }
    return [this, generation, name, details] {
      FolderItem* made = generation == generation_ ? model_.liveItem(name) : nullptr;
      if (made && details) {
        made->details = details;
        loaded_(*made);
      }
      makeNextThumbnail();
    };
  });
}

}  // namespace vaelo
