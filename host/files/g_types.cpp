// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/g_types.h"

#include <gio/gio.h>

#include <algorithm>
#include <array>
#include <cctype>

#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

struct KnownType {
  const char* identifier;
  const char* parent;
  const char* mediaType;   ///< null for types that no file has by itself
  const char* extensions;  ///< separated by blanks
};

constexpr KnownType Known[] = {
    {"public.data", nullptr, "application/octet-stream", ""},
    {"public.content", nullptr, nullptr, ""},
    {"public.folder", nullptr, "inode/directory", ""},
    {"public.symlink", nullptr, "inode/symlink", ""},
    {"com.marrow.package", "public.content", nullptr, "bundle vlopackage sketchbundle"},
    {"public.image", "public.data", nullptr, ""},
    {"public.jpeg", "public.image", "image/jpeg", "jpg jpeg jpe"},
    {"public.png", "public.image", "image/png", "png"},
    {"public.tiff", "public.image", "image/tiff", "tiff tif"},
    {"public.svg-image", "public.image", "image/svg+xml", "svg svgz"},
    {"public.heic", "public.image", "image/heif", "heic heif"},
    {"org.webmproject.webp", "public.image", "image/webp", "webp"},
    {"com.compuserve.gif", "public.image", "image/gif", "gif"},
    {"public.audiovisual-content", "public.data", nullptr, ""},
    {"public.movie", "public.audiovisual-content", nullptr, ""},
    {"public.mpeg-4", "public.movie", "video/mp4", "mp4 m4v"},
    {"public.avi", "public.movie", "video/x-msvideo", "avi"},
    {"org.webmproject.webm", "public.movie", "video/webm", "webm"},
    {"public.audio", "public.audiovisual-content", nullptr, ""},
    {"public.mp3", "public.audio", "audio/mpeg", "mp3"},
    {"com.microsoft.waveform-audio", "public.audio", "audio/x-wav", "wav wave"},
    {"org.xiph.flac", "public.audio", "audio/flac", "flac"},
    {"com.adobe.pdf", "public.data", "application/pdf", "pdf"},
    {"public.text", "public.data", nullptr, ""},
    {"public.plain-text", "public.text", "text/plain", "txt text"},
    {"net.daringfireball.markdown", "public.plain-text", "text/markdown", "md markdown"},
    {"public.html", "public.text", "text/html", "html htm"},
    {"public.comma-separated-values-text", "public.plain-text", "text/csv", "csv"},
    {"public.rtf", "public.text", "application/rtf", "rtf"},
    {"com.marrow.rtfd", "com.marrow.package", nullptr, "rtfd"},
    {"org.textbundle.package", "com.marrow.package", nullptr, "textbundle"},
    {"public.archive", "public.data", nullptr, ""},
    {"public.zip-archive", "public.archive", "application/zip", "zip"},
    {"org.gnu.gnu-zip-archive", "public.archive", "application/gzip", "gz tgz"},
    {"public.tar-archive", "public.archive", "application/x-tar", "tar"},
};

const KnownType* knownType(const std::string& identifier) {
  const auto* found = std::find_if(std::begin(Known), std::end(Known),
                                   [&](const KnownType& type) { return identifier == type.identifier; });
  return found == std::end(Known) ? nullptr : found;
}

std::string lowered(std::string text) {
  std::transform(text.begin(), text.end(), text.begin(), [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  return text;
}

constexpr std::string_view DynamicPrefix = "dyn.";

std::string mediaTypeForExtension(const std::string& extension) {
  return takeString(g_content_type_guess(("name." + extension).c_str(), nullptr, 0, nullptr));
}

std::string mediaTypeOf(const std::string& identifier) {
  if (const KnownType* type = knownType(identifier)) return type->mediaType ? type->mediaType : "";
  if (identifier.compare(0, DynamicPrefix.size(), DynamicPrefix) != 0) return "";
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

}  // namespace

std::optional<std::string> GTypes::preferredIdentifierForExtension(const std::string& extension) {
  if (extension.empty()) return std::nullopt;
  const std::string wanted = " " + lowered(extension) + " ";
  for (const KnownType& type : Known) {
    if ((std::string(" ") + type.extensions + " ").find(wanted) != std::string::npos) return type.identifier;
  }
  return std::string(DynamicPrefix) + lowered(extension);
}

bool GTypes::conformsTo(const std::string& type, const std::string& other) {
  std::string at = type;
  // The table is no deeper than this.
  for (int steps = 0; steps < 8; ++steps) {
    if (at == other) return true;
    const KnownType* known = knownType(at);
    const bool dynamic = at.compare(0, DynamicPrefix.size(), DynamicPrefix) == 0;
    if (known && known->parent) {
      at = known->parent;
    } else if (dynamic) {
      at = kindOfMediaType(mediaTypeOf(at));
    } else {
      break;
    }
  }
  const std::string mine = mediaTypeOf(type);
  const std::string theirs = mediaTypeOf(other);
  // Everything is data to the MIME database, folders too, so that one is left to the table.
  return !mine.empty() && !theirs.empty() && theirs != "application/octet-stream" &&
         g_content_type_is_a(mine.c_str(), theirs.c_str());
}

std::optional<std::string> GTypes::description(const std::string& type) {
  const std::string mediaType = mediaTypeOf(type);
  if (mediaType.empty()) return std::nullopt;
  return takeString(g_content_type_get_description(mediaType.c_str()));
}

}  // namespace vaelo
