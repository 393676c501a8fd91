// SPDX-License-Identifier: GPL-3.0-or-later
#include <set>

#include "items/file_utils.h"
#include "items/vlo_log.h"
#include "platform/platform.h"

namespace vaelo {

bool FileUtils::isValidFilename(const std::string& name) {
  CharacterClasses& classes = Platform::current().characterClasses;
  if (name.empty() || name.front() == '.') return false;
  if (name.find_first_of("/:") != std::string::npos) return false;
  return !classes.containsIllegalCharacter(name) && !classes.containsControlCharacter(name) &&
         !classes.containsNewline(name);
}

std::optional<std::string> FileUtils::fileUTI(const URL& url) {
  const std::string extension = url.pathExtension();
  if (extension.empty()) return std::nullopt;
  return Platform::current().types.preferredIdentifierForExtension(extension);
}

bool FileUtils::isAudioVideoImageFile(const URL& url) {
  const std::optional<std::string> type = fileUTI(url);
  if (!type || type->empty()) return false;
  for (const char* media : {"public.image", "public.movie", "public.audio", "com.adobe.pdf"}) {
    if (Platform::current().types.conformsTo(*type, media)) {
      VLO_DEBUG("isAudioVideoImageFile: Extension %@ is %@ which conforms to UTI %@", url.pathExtension(), *type, media);
      return true;
    }
  }
  VLO_DEBUG("isAudioVideoImageFile: Extension %@ is %@ which is not.", url.pathExtension(), *type);
  return false;
}

bool FileUtils::isValidExtensionForContainer(const URL& url) {
  const std::string extension = url.pathExtension();
  const std::optional<std::string> type = fileUTI(url);
  if (!type || type->empty()) return true;
  CloudDocuments& cloud = Platform::current().cloudDocuments;
  const Result<CloudContainerRef> container = cloud.containerForURL(url);
  if (!container.value || !*container.value) return false;
  if ((*container.value)->identifier() == cloud.defaultContainerIdentifier()) return true;
  if (!(*container.value)->documentsFolderURL()) return false;
  const std::optional<std::vector<DeclaredDocumentType>> declared = (*container.value)->documentTypes();
  if (!declared || declared->empty()) return true;

  Array gathered;
  for (const DeclaredDocumentType& documentType : *declared) {
    if (!documentType.contentTypes.isPresent()) continue;
    const Array* types = documentType.contentTypes.array();
    if (!types) {
      VLO_ERROR("Expected content types of Set");
      return false;
    }
    for (const Value& entry : *types) {
      bool known = false;
      for (const Value& earlier : gathered) known = known || earlier == entry;
      if (!known) gathered.push_back(entry);
    }
  }
  for (const Value& entry : gathered) {
    const std::string* allowed = entry.get<std::string>();
    if (!allowed) {
      VLO_ERROR("Expected array of strings");
    } else if (*allowed == "public.data" || *allowed == "public.content") {
      VLO_INFO("Container supports all UTIs");
      return true;
    } else if (Platform::current().types.conformsTo(*type, *allowed)) {
      VLO_INFO("Extension %@ conforms to UTI %@", extension, *allowed);
      return true;
    }
  }
  return false;
}

}  // namespace vaelo
