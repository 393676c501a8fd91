// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_file_provider.h"

#include <charconv>

#include "tests/support/memory_drive_places.h"
#include "tests/support/memory_error.h"

namespace vaelo {

namespace {

constexpr std::string_view Prefix = "memory:";

}  // namespace

Result<std::string> MemoryFileProvider::encoded(const URL& url) {
  const std::optional<std::string> relative = cloud_.pathRelativeToMirror(url);
  if (!relative || relative->empty()) {
    Error error = memoryError(NotInDrive, url.path(), "It is not in the drive");
    error.domain = CloudDocumentsErrorDomain;
    return error;
  }
  MemoryItem* item = disk_.logicalItem(url.path());
  if (!item) item = disk_.physicalItem(url.path());
  if (!item) return noSuchItem(url.path());
  return std::string(Prefix) + std::to_string(disk_.documentIDOf(*item)) + ":" + percentEncoded(*relative);
}

Result<URL> MemoryFileProvider::decoded(const std::string& text) {
  std::int64_t documentID = 0;
  const char* const end = text.data() + text.size();
  if (!text.starts_with(Prefix)) return memoryError(FileErrorCode::Formatting, text);
  const auto [after, failure] = std::from_chars(text.data() + Prefix.size(), end, documentID);
  if (failure != std::errc() || after == end || *after != ':') return memoryError(FileErrorCode::Formatting, text);
  if (const std::optional<std::string> path = disk_.pathOfDocument(documentID)) return URL(*path);
  const std::optional<std::string> relative = percentDecoded(std::string_view(after + 1, end));
  if (!relative || relative->empty()) return memoryError(FileErrorCode::Formatting, text);
  const URL place = Mirror.appendingPathComponent(*relative);
  if (cloud_.URLIsInDriveMirror(place) && disk_.logicalItem(place.path())) return place;
  return noSuchItem(place.path());
}

void MemoryFileProvider::answer(Block block) {
  if (holdsAnswers) {
    held.push_back(std::move(block));
  } else if (answersAtOnce) {
    block();
  } else {
    queues_.main().async(std::move(block));
  }
}

void MemoryFileProvider::BookmarkableStringFromDocumentURL(const URL& url, std::function<void(Result<std::string>)> done) {
  answer([this, url, done = std::move(done)] {
    const auto chosen = strings.find(url.path());
    done(chosen == strings.end() ? encoded(url) : chosen->second);
  });
}

void MemoryFileProvider::DocumentURLFromBookmarkableString(const std::string& text, std::function<void(Result<URL>)> done) {
  answer([this, text, done = std::move(done)] {
    const auto chosen = documents.find(text);
    done(chosen == documents.end() ? decoded(text) : chosen->second);
  });
}

}  // namespace vaelo
