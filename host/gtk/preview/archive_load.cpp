// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/archive_load.h"

#include <algorithm>
#include <cstdlib>

#include "host/gtk/preview/shared_bytes.h"

namespace vaelo {

namespace {

// Names in a compressed archive stand between all its content, which may be a day's work.
constexpr gint64 ListingTakes = 15 * G_TIME_SPAN_SECOND;
constexpr std::chrono::seconds AnswerTakes(10);
constexpr int MostEntriesOfAnswer = 1'000'000;  // of an answer

}  // namespace

ArchiveLoad::ArchiveLoad(const std::string& path, bool single, const std::string& unnamed, Events events)
    : events_(std::move(events)),
      unnamed_(unnamed),
      process_(std::make_unique<DecoderProcess>("archive", path)),
      until_(g_get_monotonic_time() + ListingTakes) {
  process_->ask(
      single ? "open single" : "open",
      [this](const DecoderProcess::Answer& answer) {
        if (!answer.error.empty()) return events_.failed(answer.error);
        askForMore();
      },
      AnswerTakes);
}

void ArchiveLoad::askForMore() {
  process_->ask(
      "next", [this](DecoderProcess::Answer answer) { received(std::move(answer)); }, AnswerTakes);
}

void ArchiveLoad::received(DecoderProcess::Answer answer) {
  if (!answer.error.empty()) {
    if (lines_.empty()) return events_.failed(answer.error);
    return finish(answer.error == DecoderError::TooSlow ? End::Slow : End::Broken);
  }
  if (GBytes* lines = takeSharedBytes(std::move(answer.file), 1)) lines_.emplace_back(lines, g_bytes_unref);
  const std::string state = answer.text.substr(answer.text.find(' ') + 1);
  if (state == "more") {
    if (g_get_monotonic_time() >= until_) return finish(End::Slow);
    entries_ += std::clamp(std::atoi(answer.text.c_str()), 0, MostEntriesOfAnswer);
    askForMore();
    return events_.progress(entries_);
  }
  if (state == "full") return finish(End::Full);
  finish(state == "end" ? End::Whole : End::Broken);
}

void ArchiveLoad::finish(End end) {
  process_.reset();
  worker_.run([this, pieces = std::move(lines_), unnamed = unnamed_, end]() -> std::function<void()> {
    auto listing = std::make_shared<ArchiveListing>(unnamed);
    for (const std::shared_ptr<GBytes>& piece : pieces) {
      gsize size = 0;
      const void* data = g_bytes_get_data(piece.get(), &size);
      listing->add({static_cast<const char*>(data), size});
    }
    listing->sort();
    return [this, listing, end] { events_.listed(listing, listing->isFull() ? End::Full : end); };
  });
}

}  // namespace vaelo
