// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/g_types.h"

#include <gio/gio.h>

#include <algorithm>
#include <iterator>
#include <sstream>
#include <unordered_map>
#include <vector>

#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

struct KnownType {
  const char* identifier;
  const char* parents;     ///< separated by blanks
  const char* mediaType;   ///< null for types that no file has by itself
  const char* extensions;  ///< separated by blanks
};

constexpr KnownType Known[] = {
    {"public.item", "", nullptr, ""},
    {"public.content", "", nullptr, ""},
    {"public.data", "public.item", "application/octet-stream", ""},
    {"public.directory", "public.item", nullptr, ""},
    {"public.folder", "public.directory", "inode/directory", ""},
    {"public.symlink", "public.item", "inode/symlink", ""},
    {"com.marrow.alias", "public.data", nullptr, ""},
    {"com.marrow.package", "public.directory public.content", nullptr, "bundle vlopackage sketchbundle"},
    {"com.marrow.rtfd", "com.marrow.package", nullptr, "rtfd"},
    {"org.textbundle.package", "com.marrow.package", nullptr, "textbundle"},
    {"public.image", "public.data public.content", nullptr, ""},
    {"public.jpeg", "public.image", "image/jpeg", "jpg jpeg jpe"},
    {"public.png", "public.image", "image/png", "png"},
    {"public.tiff", "public.image", "image/tiff", "tiff tif"},
    {"public.svg-image", "public.image", "image/svg+xml", "svg svgz"},
    {"public.heic", "public.image", "image/heif", "heic heif"},
    {"org.webmproject.webp", "public.image", "image/webp", "webp"},
    {"com.compuserve.gif", "public.image", "image/gif", "gif"},
    {"com.microsoft.bmp", "public.image", "image/bmp", "bmp"},
    {"public.audiovisual-content", "public.data public.content", nullptr, ""},
    {"public.movie", "public.audiovisual-content", nullptr, ""},
    {"public.mpeg-4", "public.movie", "video/mp4", "mp4 m4v"},
    {"public.mpeg", "public.movie", "video/mpeg", "mpg mpeg"},
    {"public.mov-movie", "public.movie", "video/quicktime", "mov qt"},
    {"public.avi", "public.movie", "video/x-msvideo", "avi"},
    {"org.webmproject.webm", "public.movie", "video/webm", "webm"},
    {"org.matroska.mkv", "public.movie", "video/x-matroska", "mkv"},
    {"public.audio", "public.audiovisual-content", nullptr, ""},
    {"public.mp3", "public.audio", "audio/mpeg", "mp3"},
    {"public.mpeg-4-audio", "public.audio", "audio/mp4", "m4a"},
    {"com.microsoft.waveform-audio", "public.audio", "audio/x-wav", "wav wave"},
    {"org.xiph.flac", "public.audio", "audio/flac", "flac"},
    {"org.xiph.ogg-audio", "public.audio", "audio/ogg", "ogg oga"},
    {"com.adobe.pdf", "public.data public.content", "application/pdf", "pdf"},
    {"public.text", "public.data public.content", nullptr, ""},
    {"public.plain-text", "public.text", "text/plain", "txt text"},
    {"net.daringfireball.markdown", "public.plain-text", "text/markdown", "md markdown"},
    {"public.comma-separated-values-text", "public.plain-text", "text/csv", "csv"},
    {"public.html", "public.text", "text/html", "html htm"},
    {"public.xml", "public.text", "application/xml", "xml"},
    {"public.json", "public.text", "application/json", "json"},
    {"public.rtf", "public.text", "application/rtf", "rtf"},
    {"public.archive", "public.data", nullptr, ""},
    {"public.zip-archive", "public.archive", "application/zip", "zip"},
    {"org.gnu.gnu-zip-archive", "public.archive", "application/gzip", "gz tgz"},
    {"public.bzip2-archive", "public.archive", "application/x-bzip", "bz2"},
    {"org.tukaani.xz-archive", "public.archive", "application/x-xz", "xz"},
    {"org.7-zip.7-zip-archive", "public.archive", "application/x-7z-compressed", "7z"},
    {"public.tar-archive", "public.archive", "application/x-tar", "tar"},
};

std::vector<std::string> words(const char* text) {
  std::istringstream stream(text);
  return {std::istream_iterator<std::string>(stream), {}};
}

/// The table by identifier and by extension: lists ask for every row.
struct Index {
  std::unordered_map<std::string, const KnownType*> byIdentifier;
  std::unordered_map<std::string, const KnownType*> byExtension;
  Index() {
    for (const KnownType& type : Known) {
      byIdentifier.emplace(type.identifier, &type);
      for (const std::string& extension : words(type.extensions)) byExtension.emplace(extension, &type);
    }
  }
  static const Index& shared() {
    static const Index index;
    return index;
  }
};

const KnownType* found(const std::unordered_map<std::string, const KnownType*>& types, const std::string& key) {
  const auto at = types.find(key);
  return at == types.end() ? nullptr : at->second;
}

const KnownType* knownType(const std::string& identifier) { return found(Index::shared().byIdentifier, identifier); }

/// Beyond ASCII extensions are compared as they are.
std::string lowered(const std::string& text) {
  return takeString(g_ascii_strdown(text.data(), static_cast<gssize>(text.size())));
}

constexpr std::string_view DynamicPrefix = "dyn.";

std::string mediaTypeForExtension(const std::string& extension) {
  return takeString(g_content_type_guess(("name." + extension).c_str(), nullptr, 0, nullptr));
}

std::string mediaTypeOf(const std::string& identifier) {
  if (const KnownType* type = knownType(identifier)) return type->mediaType ? type->mediaType : "";
  if (!identifier.starts_with(DynamicPrefix)) return "";
  return mediaTypeForExtension(identifier.substr(DynamicPrefix.size()));
}

/// The well-known kind of a type that the table does not have.
const char* kindOfMediaType(const std::string& mediaType) {
  constexpr const char* kinds[][2] = {
      {"image/", "public.image"}, {"video/", "public.movie"}, {"audio/", "public.audio"}, {"text/", "public.text"}};
  for (const auto& [prefix, kind] : kinds) {
    if (mediaType.compare(0, std::char_traits<char>::length(prefix), prefix) == 0) return kind;
  }
  return "public.data";
}

bool conformsByTable(const std::string& type, const std::string& other) {
  if (type == other) return true;
  if (const KnownType* known = knownType(type)) {
    const std::vector<std::string> parents = words(known->parents);
    return std::any_of(parents.begin(), parents.end(),
                       [&](const std::string& parent) { return conformsByTable(parent, other); });
  }
  return type.starts_with(DynamicPrefix) && conformsByTable(kindOfMediaType(mediaTypeOf(type)), other);
}

}  // namespace

std::optional<std::string> GTypes::preferredIdentifierForExtension(const std::string& extension) {
  if (extension.empty()) return std::nullopt;
  const std::string wanted = lowered(extension);
  if (const KnownType* type = found(Index::shared().byExtension, wanted)) return type->identifier;
  return std::string(DynamicPrefix) + wanted;
}

bool GTypes::conformsTo(const std::string& type, const std::string& other) {
  if (conformsByTable(type, other)) return true;
  const std::string mine = mediaTypeOf(type);
  const std::string theirs = mediaTypeOf(other);
  // To the MIME database everything is data, folders too, so that one is left to the table.
  return !mine.empty() && !theirs.empty() && theirs != "application/octet-stream" &&
         g_content_type_is_a(mine.c_str(), theirs.c_str());
}

std::optional<std::string> GTypes::description(const std::string& type) {
  const std::string mediaType = mediaTypeOf(type);
  if (mediaType.empty()) return std::nullopt;
  return takeString(g_content_type_get_description(mediaType.c_str()));
}

}  // namespace vaelo
