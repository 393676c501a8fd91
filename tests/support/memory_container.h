// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/cloud_documents.h"
#include "tests/support/memory_disk.h"

namespace vaelo {

/// A container as a test describes it.
struct MemoryContainer : CloudContainer {
  MemoryContainer(std::string containerID, std::string localizedName, std::optional<URL> documentsFolder)
      : id(std::move(containerID)), name(std::move(localizedName)), folder(std::move(documentsFolder)) {}

  std::string id;
  std::string name;
  std::optional<URL> folder;
  std::optional<std::vector<DeclaredDocumentType>> types;
  std::optional<std::string> levels;
  std::vector<std::string> owners;
  std::optional<Error> deletionError;
  /// Where its content is; nothing is deleted without it.
  MemoryDisk* disk = nullptr;
  int deletions = 0;

  std::string identifier() const override { return id; }
  std::string localizedName() const override { return name; }
  std::optional<URL> documentsFolderURL() const override {
    const bool isGone = folder && disk && !disk->hasFolder(folder->path());
    return isGone ? std::nullopt : folder;
  }
  std::optional<std::vector<DeclaredDocumentType>> documentTypes() const override { return types; }
  std::optional<std::string> supportedFolderLevels() const override { return levels; }
  std::vector<std::string> ownerBundleIdentifiers() const override { return owners; }
  std::optional<Error> deleteAllContents() override {
    ++deletions;
    if (deletionError || !disk) return deletionError;
    const URL root("/drive/mirror/" + id);
    std::erase_if(disk->items, [&](const auto& entry) {
      const URL url(entry.first);
      return url.isInside(root) && !(url == root) && !(folder && url == *folder);
    });
    return std::nullopt;
  }
};

}  // namespace vaelo
