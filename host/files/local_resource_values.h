// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>

#include "host/drive/document_index.h"
#include "host/drive/drive_layout.h"
#include "platform/resource_values.h"
#include "platform/type_identifiers.h"

namespace vaelo {

/// Metadata of files on this machine; that of items which are not downloaded comes from their promises. Of content it reads
/// only that of alias files; thumbnails are the cache's. Safe from any thread.
class LocalResourceValues : public ResourceValues {
 public:
  LocalResourceValues(const DriveLayout& layout, DocumentIndex& index, TypeIdentifiers& types);
  /// The large thumbnail of the document at a physical path; null for none. Called from any thread.
  using Thumbnails = std::function<ImageRef(const std::string& path)>;
  /// Before the first question.
  void setThumbnails(Thumbnails thumbnails) { thumbnails_ = std::move(thumbnails); }
  Result<ResourceMap> promisedItemResourceValues(const URL& url, const std::vector<ResourceKey>& keys) override;
  Result<ResourceMap> resourceValues(const URL& url, const std::vector<ResourceKey>& keys) override;
  bool promisedItemIsReachable(const URL& url) override;
  URL resolvingSymlinks(const URL& url) override;
  Result<URL> resolveAliasFile(const URL& url) override;
  /// Nothing on this platform is behind such a door.
  bool startAccessingSecurityScopedResource(const URL&) override { return false; }
  void stopAccessingSecurityScopedResource(const URL&) override {}

 private:
  class Reader;

  const DriveLayout& layout_;
  DocumentIndex& index_;
  TypeIdentifiers& types_;
  Thumbnails thumbnails_;
};

}  // namespace vaelo
