// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/activity_file.h"

#include <algorithm>
#include <charconv>

#include "host/drive/small_file.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr const char* activityGroup = "Activity";
constexpr const char* infoGroup = "UserInfo";
constexpr std::chrono::hours oldest(24);
constexpr std::chrono::minutes clockDifference(10);  // that two devices may have
constexpr long longestName = 40;                     // characters
constexpr std::size_t longestType = 255;

bool isPlainWord(const std::string& text) {
  const auto isPlain = [](char c) { return g_ascii_isalnum(c) || c == '-' || c == '.' || c == '_'; };
  return !text.empty() && std::all_of(text.begin(), text.end(), isPlain);
}

// What could make the line look like another one goes.
std::string shownDeviceName(const std::string& name) {
  std::string shown;
  if (!g_utf8_validate(name.data(), static_cast<gssize>(name.size()), nullptr)) return shown;
  long characters = 0;
  const char* next = nullptr;
  for (const char* at = name.c_str(); *at; at = next) {
    next = g_utf8_next_char(at);
    switch (g_unichar_type(g_utf8_get_char(at))) {
      case G_UNICODE_CONTROL:
      case G_UNICODE_FORMAT:
      case G_UNICODE_LINE_SEPARATOR:
      case G_UNICODE_PARAGRAPH_SEPARATOR:
      case G_UNICODE_PRIVATE_USE:
      case G_UNICODE_UNASSIGNED:
        continue;
      default:
        break;
    }
    if (++characters > longestName) return shown + "…";
    shown.append(at, next);
  }
  return takeString(g_strstrip(g_strdup(shown.c_str())));
}

std::optional<Date> dateIn(const std::optional<std::string>& text) {
  std::int64_t seconds = 0;
  if (!text) return std::nullopt;
  const auto [end, failure] = std::from_chars(text->data(), text->data() + text->size(), seconds);
  // Beyond this a date does not fit into the clock's nanoseconds.
  if (failure != std::errc() || end != text->data() + text->size() || seconds < 0 || seconds > 9'000'000'000) {
    return std::nullopt;
  }
  return Date(std::chrono::seconds(seconds));
}

}  // namespace

std::string activityFileText(const ActivityRecord& record) {
  const KeyFile file(g_key_file_new());
  const auto since = std::chrono::floor<std::chrono::seconds>(record.since).time_since_epoch().count();
  g_key_file_set_string(file.get(), activityGroup, "Device", record.deviceName.c_str());
  g_key_file_set_string(file.get(), activityGroup, "Type", record.type.c_str());
  g_key_file_set_string(file.get(), activityGroup, "Since", std::to_string(since).c_str());
  for (const auto& [key, value] : record.userInfo) {
    if (isPlainWord(key)) g_key_file_set_string(file.get(), infoGroup, key.c_str(), value.c_str());
  }
  return keyFileText(file.get());
}

Result<ActivityRecord> readActivityFile(const std::string& path, Date now) {
  const Result<KeyFile> file = readKeyFile(path);
  if (!file) return *file.error;
  GKeyFile* keys = file.value->get();
  const auto refused = [&path](const char* reason) { return fileError(FileErrorCode::ReadUnknown, path, reason); };
  ActivityRecord record;
  record.type = keyFileBytes(keys, activityGroup, "Type").value_or("");
  if (!isPlainWord(record.type) || record.type.size() > longestType) return refused("the file says no type of activity");
  const std::optional<Date> since = dateIn(keyFileBytes(keys, activityGroup, "Since"));
  if (!since) return refused("the file says no time");
  if (*since < now - oldest) return refused("the activity is too old");
  if (*since > now + clockDifference) return refused("the activity is from the future");
  record.since = *since;
  record.deviceName = shownDeviceName(keyFileBytes(keys, activityGroup, "Device").value_or(""));
  if (record.deviceName.empty()) record.deviceName = _("another device");
  gchar** names = g_key_file_get_keys(keys, infoGroup, nullptr, nullptr);
  for (gchar** name = names; name && *name; ++name) {
    if (const auto value = keyFileBytes(keys, infoGroup, *name)) record.userInfo[*name] = *value;
  }
  g_strfreev(names);
  return record;
}

}  // namespace vaelo
