// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/url_additions.h"

#include <cstdlib>

#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

std::optional<URL> vlo_URLByResolvingBookmark(const URL& url) {
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  if (!cloud.isExternalDocumentReference(url)) return url;
  const Result<URL> resolved = cloud.resolveExternalDocumentReference(url);
  if (!resolved.value) return std::nullopt;
  return vlo_URLByResolvingPromise(*resolved.value);
}

URL vlo_URLByResolvingPromise(const URL& url) {
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  return cloud.isPromise(url) ? cloud.logicalURLOfPromise(url) : url;
}

URL vlo_URLByResolvingAlias(const URL& url) {
  const Result<URL> resolved = Platform::current().cloudDocuments.resolveExternalDocumentReference(url);
  return resolved.value && !resolved.error ? vlo_URLByResolvingPromise(*resolved.value) : url;
}

bool vlo_isDesktopOrDocumentsFolder(const URL& url) {
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  // The path comes first, since thousands of items may be asked for and few of them need the container.
  const std::optional<std::string> path = cloud.pathRelativeToMirror(url);
  if (path != "com~marrow~Kestrel/Documents" && path != "com~marrow~Kestrel/Desktop") return false;
  const Result<CloudContainerRef> container = cloud.containerForURL(url);
  return container.value && *container.value && (*container.value)->identifier() == cloud.defaultContainerIdentifier();
}

bool vlo_canCrossZoneMoveURLs(const std::vector<URL>& urls) {
  if (urls.empty()) return false;
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  const std::vector<CloudContainerRef> containers = cloud.allContainers();
  if (containers.empty()) return false;
  const Result<CloudContainerRef> source = cloud.containerForURL(urls.front());
  if (!source.value || !*source.value) return false;
  for (const CloudContainerRef& container : containers) {
    if (container->identifier() != (*source.value)->identifier() &&
        cloud.canMoveWithoutDownloading(**source.value, *container)) {
      return true;
    }
  }
  return false;
}

std::int64_t vlo_DocumentID(const URL& url) {
  Platform& platform = Platform::current();
  platform.log.write(LogType::Default, logFormatted("%@", {"URL"}));
  const std::vector<ResourceKey> keys{ResourceKey::DocumentIdentifier};
  for (const bool promised : {true, false}) {
    const Result<ResourceMap> values = promised ? platform.resourceValues.promisedItemResourceValues(url, keys)
                                                : platform.resourceValues.resourceValues(url, keys);
    if (!values.value) continue;
    const auto found = values.value->find(ResourceKey::DocumentIdentifier);
    if (found != values.value->end() && found->second.isPresent()) return found->second.signedValue();
  }
  return 0;
}

namespace {

DocumentStore::Device findDriveDevice() {
  Platform& platform = Platform::current();
  const std::optional<URL> folder = platform.cloudDocuments.defaultContainerURL();
  const std::optional<DocumentStore::Device> found = folder ? platform.documentStore.deviceOf(*folder) : std::nullopt;
  if (!found) {
    VLO_ERROR("could not get device ID");
    std::abort();
  }
  return *found;
}

DocumentStore::Device driveDevice() {
  // The drive does not change its file system while the program runs.
  static const DocumentStore::Device device = findDriveDevice();
  return device;
}

/// The number that the text begins with, after blanks; 0 for none, the largest one when it does not fit.
std::uint64_t scannedUnsigned(const std::string& text) {
  std::uint64_t number = 0;
  for (std::size_t i = text.find_first_not_of(" \t\n"); i < text.size() && text[i] >= '0' && text[i] <= '9'; ++i) {
    const auto digit = static_cast<std::uint64_t>(text[i] - '0');
    if (number > (UINT64_MAX - digit) / 10) return UINT64_MAX;
    number = number * 10 + digit;
  }
  return number;
}

class OpenFile {
 public:
  OpenFile(DocumentStore& store, int handle) : store_(store), handle_(handle) {}
  ~OpenFile() { store_.close(handle_); }
  OpenFile(const OpenFile&) = delete;
  OpenFile& operator=(const OpenFile&) = delete;

 private:
  DocumentStore& store_;
  int handle_;
};

}  // namespace

std::optional<URL> vlo_URLFromDocumentID(const std::optional<std::string>& documentID) {
  if (!documentID) {
    VLO_ERROR("vlo_URLFromDocumentID: missing document ID");
    return std::nullopt;
  }
  const std::uint64_t number = scannedUnsigned(*documentID);
  const DocumentStore::Device device = driveDevice();
  DocumentStore& store = Platform::current().documentStore;
  const SystemResult<DocumentStore::FileID> file = store.resolveDocumentID(device, number);
  if (!file.value) {
    VLO_ERROR("TBLibraryResolveDocumentId2 failed, errno:%d(%s)", file.error.number, file.error.text);
    return std::nullopt;
  }
  const SystemResult<int> handle = store.openByID(device, *file.value);
  if (!handle.value) {
    VLO_ERROR("openbyid_np failed, errno:%d(%s)", handle.error.number, handle.error.text);
    return std::nullopt;
  }
  if (*handle.value < 0) {
    VLO_ERROR("fd >= 0");
    std::abort();
  }
  const OpenFile closesAtEnd(store, *handle.value);
  const SystemResult<DocumentStore::OpenFileAttributes> attributes = store.attributesOfOpenFile(*handle.value);
  if (!attributes.value) {
    VLO_ERROR("fgetattrlist failed, error:%d(%s)", attributes.error.number, attributes.error.text);
    return std::nullopt;
  }
  if (attributes.value->documentID != static_cast<std::int64_t>(number)) {
    VLO_ERROR("document IDs didn't match (%d v/s %@)", attributes.value->documentID, *documentID);
    return std::nullopt;
  }
  return URL(attributes.value->path);
}

bool wantsDefaultMediaPlayer(const URL&) { return true; }

}  // namespace vaelo
