// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <set>
#include <string>

#include "platform/type_identifiers.h"

namespace vaelo {

/// Types as small tables, which a test may change.
class MemoryTypes : public TypeIdentifiers {
 public:
  std::map<std::string, std::string> typeOfExtension{{"pdf", "com.adobe.pdf"},
                                                     {"png", "public.png"},
                                                     {"jpg", "public.jpeg"},
                                                     {"txt", "public.plain-text"},
                                                     {"mov", "public.mov-movie"},
                                                     {"mp3", "public.mp3"},
                                                     {"bundle", "com.marrow.package"},
                                                     {"vlopackage", "com.marrow.package"},
                                                     {"sketchbundle", "com.marrow.package"},
                                                     {"rtfd", "com.marrow.rtfd"},
                                                     {"textbundle", "org.textbundle.package"}};
  /// All kinds that a type is of.
  std::map<std::string, std::set<std::string>> conformances{
      {"com.adobe.pdf", {"public.content", "public.data", "public.item"}},
      {"public.png", {"public.image", "public.content", "public.data", "public.item"}},
      {"public.jpeg", {"public.image", "public.content", "public.data", "public.item"}},
      {"public.plain-text", {"public.text", "public.content", "public.data", "public.item"}},
      {"public.mov-movie", {"public.movie", "public.audiovisual-content", "public.content", "public.data", "public.item"}},
      {"public.mp3", {"public.audio", "public.audiovisual-content", "public.content", "public.data", "public.item"}},
      {"com.marrow.alias", {"public.data", "public.item"}},
      {"com.marrow.package", {"public.directory", "public.content", "public.item"}},
      {"com.marrow.rtfd", {"com.marrow.package", "public.directory", "public.content", "public.item"}},
      {"org.textbundle.package", {"com.marrow.package", "public.directory", "public.content", "public.item"}},
      {"public.symlink", {"public.item"}},
      {"public.folder", {"public.directory", "public.item"}}};
  std::map<std::string, std::string> descriptions{{"public.folder", "Folder"}};
  /// False: extensions that are not in the table have no type.
  bool makesTypes = true;

  std::optional<std::string> preferredIdentifierForExtension(const std::string& extension) override;
  bool conformsTo(const std::string& type, const std::string& other) override;
  std::optional<std::string> description(const std::string& type) override;
};

}  // namespace vaelo
