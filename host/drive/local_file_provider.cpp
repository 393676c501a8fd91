// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/local_file_provider.h"

#include <glib.h>

#include <charconv>

#include "host/drive/local_cloud_documents.h"
#include "host/drive/promise_file.h"
#include "host/drive/small_file.h"

namespace vaelo {

namespace {

constexpr std::string_view prefix = "vlo1:";

struct Reference {
  std::int64_t id = 0;  // 0 when the document had none
  std::string path;     // below the mirror
};

// Unlike text, a path need not be UTF-8.
std::optional<std::string> decodedPath(const std::string& text) {
  gchar* bytes = g_uri_unescape_string(text.c_str(), nullptr);
  if (!bytes) return std::nullopt;
  std::string path(bytes);
  g_free(bytes);
  return path;
}

// A path that climbs or starts over is refused even when it would end in the mirror: we never wrote it.
bool isPlainRelativePath(const std::string& path) {
  if (path.empty()) return false;
  for (std::size_t start = 0; start <= path.size();) {
    const std::size_t end = std::min(path.find('/', start), path.size());
    const std::string_view name = std::string_view(path).substr(start, end - start);
    if (name.empty() || name == "." || name == "..") return false;
    start = end + 1;
  }
  return true;
}

std::optional<Reference> parsedReference(const std::string& text) {
  if (text.compare(0, prefix.size(), prefix) != 0 || text.find('\0') != std::string::npos) return std::nullopt;
  Reference reference;
  const char* const end = text.data() + text.size();
  const auto [after, failure] = std::from_chars(text.data() + prefix.size(), end, reference.id);
  if (failure != std::errc() || reference.id < 0 || after == end || *after != ':') return std::nullopt;
  const std::optional<std::string> path = decodedPath(std::string(after + 1, end));
  if (!path || !isPlainRelativePath(*path)) return std::nullopt;
  reference.path = *path;
  return reference;
}

}  // namespace

LocalFileProvider::LocalFileProvider(const DriveLayout& layout, DocumentIndex& index, Queues& queues)
    : layout_(layout),
      index_(index),
      workers_(queues.makeOperationQueue("com.marrow.VaeloDrive.file-provider", QualityOfService::UserInitiated)) {}

void LocalFileProvider::BookmarkableStringFromDocumentURL(const URL& url, std::function<void(Result<std::string>)> done) {
  workers_->addOperation([this, url, done = std::move(done)] { done(encoded(url)); });
}

void LocalFileProvider::DocumentURLFromBookmarkableString(const std::string& text, std::function<void(Result<URL>)> done) {
  workers_->addOperation([this, text, done = std::move(done)] { done(decoded(text)); });
}

Result<std::string> LocalFileProvider::encoded(const URL& url) {
  const std::optional<std::string> relative = layout_.relativeToMirror(url.path());
  if (!relative || relative->empty()) {
    return cloudError(CloudDocumentsErrorCode::NotInDrive, url.path(), "the document is not in the drive");
  }
  const std::string place = layout_.mirrorRoot() + "/" + *relative;
  if (!physicalPathOf(place)) return fileError(FileErrorCode::NoSuchFile, url.path(), "there is no such document");
  // Without an identifier (a drive that can't be written to) the path must do.
  const std::int64_t id = index_.documentIDFor(place, true).value.value_or(0);
  return std::string(prefix) + std::to_string(id) + ":" + percentEncoded(*relative);
}

Result<URL> LocalFileProvider::decoded(const std::string& text) {
  const std::optional<Reference> reference = parsedReference(text);
  if (!reference) return fileError(FileErrorCode::Formatting, "", "the text names no document of a drive");
  if (const Result<IndexedDocument> found = index_.resolve(reference->id); found && layout_.isInMirror(found.value->path)) {
    return URL(logicalNameOf(found.value->path).value_or(found.value->path));
  }
  const std::string place = layout_.mirrorRoot() + "/" + reference->path;
  if (layout_.isInMirror(place) && physicalPathOf(place)) return URL(place);
  return fileError(FileErrorCode::NoSuchFile, place, "the document is not in the drive");
}

}  // namespace vaelo
