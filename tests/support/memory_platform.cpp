// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_platform.h"

#include <algorithm>
#include <cctype>

namespace vaelo {

std::optional<std::string> MemoryTypes::preferredIdentifierForExtension(const std::string& extension) {
  std::string lower = extension;
  std::transform(lower.begin(), lower.end(), lower.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  if (lower.empty() || lower == "untyped") return std::nullopt;
  if (lower == "pdf") return "com.adobe.pdf";
  if (lower == "png") return "public.png";
  if (lower == "mov") return "public.quick-movie";
  if (lower == "mp3") return "public.mp3";
  return "type." + lower;
}

bool MemoryTypes::conformsTo(const std::string& type, const std::string& other) {
  static const std::map<std::string, std::string> kinds{
      {"public.png", "public.image"}, {"public.quick-movie", "public.movie"}, {"public.mp3", "public.audio"}};
  const auto kind = kinds.find(type);
  return type == other || (kind != kinds.end() && kind->second == other);
}

std::optional<std::string> MemoryTypes::description(const std::string& type) {
  if (type == "public.folder") return "Folder";
  return std::nullopt;
}

bool MemoryCharacters::containsControlCharacter(const std::string& text) {
  return std::any_of(text.begin(), text.end(), [](unsigned char c) { return c < 0x20; });
}

bool MemoryCharacters::localizedCaseInsensitiveEquals(const std::string& a, const std::string& b) {
  return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                    [](unsigned char x, unsigned char y) { return std::tolower(x) == std::tolower(y); });
}

std::string MemoryFormatting::byteCount(std::uint64_t bytes, ByteCountStyle style, bool withUnit) {
  const std::string number = std::to_string(bytes);
  return withUnit ? number + (style == ByteCountStyle::File ? " bytes" : " binary bytes") : number;
}

std::string MemoryFormatting::localizedDate(Date date, DateStyle dateStyle, DateStyle timeStyle) {
  const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(date.time_since_epoch()).count();
  return std::to_string(seconds) + " in " + std::to_string(static_cast<int>(dateStyle)) + "," +
         std::to_string(static_cast<int>(timeStyle));
}

std::string MemoryFormatting::filled(const std::string& format, const std::vector<std::string>& arguments) {
  std::string result = format;
  for (const std::string& argument : arguments) {
    const std::size_t at = result.find("%@");
    if (at != std::string::npos) result.replace(at, 2, argument);
  }
  return result;
}

MemoryPlatform::MemoryPlatform()
    : platform_{.application = application,
                .activityTracing = tracing,
                .cloudDocuments = drive,
                .characterClasses = characters,
                .documentStore = documentStore,
                .fileCoordination = drive,
                .fileManager = drive,
                .fileProgress = fileProgress,
                .fileProvider = fileProvider,
                .formatting = formatting,
                .launchServices = launchServices,
                .log = log,
                .notifications = notifications,
                .offers = offers,
                .preferences = preferences,
                .queues = queues,
                .resourceValues = drive,
                .screens = screens,
                .types = types,
                .userActivities = userActivities} {
  Platform::install(&platform_);
}

}  // namespace vaelo
