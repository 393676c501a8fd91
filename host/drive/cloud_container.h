// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/drive/drive_layout.h"
#include "host/files/tree_removals.h"
#include "platform/cloud_documents.h"
#include "platform/logging.h"

namespace vaelo {

inline constexpr const char* ContainerManifestName = ".vaelo-container";

/// A container folder and what its manifest says, as they were when it was read. Immutable, so safe from any thread.
class LocalContainer : public CloudContainer {
 public:
  /// Reads a container; null when there is no folder of that name (a link is none). One whose manifest is absent is called
  /// by its identifier, and so is one whose manifest is broken, which the log tells.
  /// `removals` outlives it.
  static CloudContainerRef read(const DriveLayout& layout, const std::string& identifier, LogSink& log,
                                TreeRemovals& removals);

  std::string identifier() const override { return identifier_; }
  std::string localizedName() const override { return localizedName_; }
  std::optional<URL> documentsFolderURL() const override { return documentsFolder_; }
  std::optional<std::vector<DeclaredDocumentType>> documentTypes() const override { return documentTypes_; }
  std::optional<std::string> supportedFolderLevels() const override { return folderLevels_; }
  std::vector<std::string> ownerBundleIdentifiers() const override { return owners_; }
  /// Removes all but the manifest and the documents folder itself, and goes on after a failure; the first one is returned.
  std::optional<Error> deleteAllContents() override;

 private:
  explicit LocalContainer(TreeRemovals& removals) : removals_(removals) {}
  void readManifest(const std::string& path, LogSink& log);

  std::optional<Error> removeEntriesOf(const std::string& folder);

  TreeRemovals& removals_;
  std::string identifier_;
  std::string folder_;
  std::string localizedName_;
  std::optional<URL> documentsFolder_;
  std::optional<std::vector<DeclaredDocumentType>> documentTypes_;
  std::optional<std::string> folderLevels_;
  std::vector<std::string> owners_;
};

}  // namespace vaelo
