// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/cloud_container.h"

#include <dirent.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <memory>

#include "host/drive/small_file.h"

namespace vaelo {

namespace {

constexpr const char* containerGroup = "Container";

bool isFolder(const std::string& path) {
  struct stat status = {};
  return ::lstat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode);
}

bool isIdentifier(const std::string& text) {
  return !text.empty() && text.front() != '.' && text.find('/') == std::string::npos && text.find('\0') == std::string::npos;
}

std::string displayName(const std::string& identifier) {
  if (identifier == DriveLayout::DefaultContainer) return "Vaelo Drive";
  gchar* name = g_filename_display_name(identifier.c_str());
  std::string text(name);
  g_free(name);
  return text;
}

}  // namespace

CloudContainerRef LocalContainer::read(const DriveLayout& layout, const std::string& identifier, LogSink& log,
                                       TreeRemovals& removals) {
  if (!isIdentifier(identifier)) return nullptr;
  const std::string folder = layout.containerFolder(identifier);
  if (!isFolder(folder)) return nullptr;
  std::shared_ptr<LocalContainer> container(new LocalContainer(removals));
  container->identifier_ = identifier;
  container->folder_ = folder;
  container->localizedName_ = displayName(identifier);
  const bool isDefault = identifier == DriveLayout::DefaultContainer;
  const std::string documents = isDefault ? folder : folder + "/Documents";
  if (isDefault || isFolder(documents)) container->documentsFolder_ = URL(documents, true);
  container->readManifest(folder + "/" + ContainerManifestName, log);
  return container;
}

void LocalContainer::readManifest(const std::string& path, LogSink& log) {
  const Result<KeyFile> file = readKeyFile(path);
  if (!file && file.error->code == FileErrorCode::ReadNoSuchFile) return;
  if (!file || !g_key_file_has_group(file.value->get(), containerGroup)) {
    const std::string reason = file.error ? file.error->description() : "it has no container in it";
    log.write(LogType::Error, "drive: the manifest of " + localizedName_ + " is broken: " + reason);
    return;
  }
  GKeyFile* keys = file.value->get();
  if (gchar* name = g_key_file_get_locale_string(keys, containerGroup, "Name", nullptr, nullptr)) {
    if (*name) localizedName_ = name;
    g_free(name);
  }
  if (const auto types = keyFileList(keys, containerGroup, "DocumentTypes")) {
    Array identifiers;
    for (const std::string& type : *types) identifiers.emplace_back(type);
    documentTypes_.emplace();
    if (!identifiers.empty()) documentTypes_->push_back({Value(std::move(identifiers))});
  }
  folderLevels_ = keyFileBytes(keys, containerGroup, "FolderLevels");
  owners_ = keyFileList(keys, containerGroup, "Owners").value_or(std::vector<std::string>());
}

std::optional<Error> LocalContainer::deleteAllContents() {
  std::optional<Error> first = removeEntriesOf(folder_);
  if (!documentsFolder_ || documentsFolder_->path() == folder_) return first;
  std::optional<Error> second = removeEntriesOf(documentsFolder_->path());
  return first ? first : second;
}

std::optional<Error> LocalContainer::removeEntriesOf(const std::string& folder) {
  const std::unique_ptr<DIR, int (*)(DIR*)> stream(::opendir(folder.c_str()), ::closedir);
  if (!stream) return errorFromErrno(errno, folder, FileAccess::Write);
  std::vector<std::string> paths;
  while (const dirent* entry = ::readdir(stream.get())) {
    const std::string name = entry->d_name;
    if (name != "." && name != "..") paths.push_back(folder + "/" + name);
  }
  std::optional<Error> first;
  for (const std::string& path : paths) {
    if (path == folder_ + "/" + ContainerManifestName || (documentsFolder_ && path == documentsFolder_->path())) continue;
    const int number = isFolder(path) ? removals_.remove(path) : ::unlink(path.c_str()) == 0 ? 0 : errno;
    if (number != 0 && number != ENOENT && !first) first = errorFromErrno(number, path, FileAccess::Write);
  }
  return first;
}

}  // namespace vaelo
