// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/details_loader.h"

#include <utility>

#include "host/gtk/list/details_reader.h"

namespace vaelo {
namespace {

constexpr std::size_t BatchSize = 16;

struct Job {
  std::string name;
  EntryKind kind;
  std::shared_ptr<const ItemDetails> details;
};

}  // namespace

DetailsLoader::DetailsLoader(FolderModel& model, std::function<void(FolderItem&)> loaded)
    : model_(model), loaded_(std::move(loaded)) {}

void DetailsLoader::setFolder(const std::string& folder) {
  folder_ = folder;
  ++generation_;
  wanted_.clear();
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
      batch.push_back({item->name, item->kind, nullptr});
    } else if (item) {
      item->detailsAreFresh = false;  // asks again when it is drawn again
    }
    wanted_.pop_back();
  }
  reading_ = !batch.empty();
  if (!reading_) return;
  worker_.run([this, generation = generation_, folder = folder_, pixels = thumbnailPixels_,
               jobs = std::move(batch)]() mutable -> std::function<void()> {
    for (Job& job : jobs) job.details = readDetails(folder.empty() ? job.name : folder + "/" + job.name, job.kind, pixels);
    return [this, generation, done = std::move(jobs)] {
      if (generation == generation_) {
        for (const Job& job : done) {
          FolderItem* item = model_.liveItem(job.name);
          if (!item) continue;
          item->details = job.details;
          loaded_(*item);
        }
      }
      readNext();
    };
  });
}

}  // namespace vaelo
