// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/account_record.h"

#include <algorithm>
#include <charconv>

#include "host/drive/drive_layout.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr std::size_t mostThresholds = 10;
constexpr double usualThresholds[] = {20, 10, 5};
constexpr std::string_view otherMirrors = "accounts/";

/// Numbers in the file are digits, whatever the user's language makes of them; all of the text or nothing.
template <typename Number>
std::optional<Number> numberIn(const std::string& text) {
  Number number = 0;
  const auto [end, failure] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (failure != std::errc() || end != text.data() + text.size()) return std::nullopt;
  return number;
}

bool isControl(char c) { return static_cast<unsigned char>(c) < 0x20 || c == 0x7f; }

std::string shownName(const std::string& bytes) {
  std::string name = takeString(g_utf8_make_valid(bytes.data(), static_cast<gssize>(bytes.size())));
  std::replace_if(name.begin(), name.end(), isControl, ' ');
  return name;
}

/// Anything else could be a program to start or a file of the user's.
bool isWebPage(const std::string& address) {
  GUri* uri = g_uri_parse(address.c_str(), G_URI_FLAGS_NONE, nullptr);
  if (!uri) return false;
  const std::string scheme = g_uri_get_scheme(uri);
  const bool hasHost = g_uri_get_host(uri) && *g_uri_get_host(uri);
  g_uri_unref(uri);
  return (scheme == "https" || scheme == "http") && hasHost && std::none_of(address.begin(), address.end(), isControl);
}

/// One component below the folder of mirrors, or the first mirror: the file must not open the rest of the disk as a drive.
bool isMirrorPlace(const std::string& folder) {
  if (folder == DriveLayout::FirstMirror) return true;
  if (!folder.starts_with(otherMirrors) || folder.size() == otherMirrors.size()) return false;
  return std::all_of(folder.begin() + otherMirrors.size(), folder.end(),
                     [](char c) { return g_ascii_isalnum(c) || c == '-'; });
}

std::vector<double> thresholdsIn(GKeyFile* keys, const std::string& path, LogSink& log) {
  const auto list = keyFileList(keys, AccountGroup, "UpgradeBelow");
  if (!list) return {std::begin(usualThresholds), std::end(usualThresholds)};
  std::vector<double> thresholds;
  for (const std::string& text : *list) {
    const std::optional<double> percent = numberIn<double>(text);
    if (percent && *percent > 0 && *percent <= 100 && thresholds.size() < mostThresholds) {
      thresholds.push_back(*percent);
    } else {
      log.write(LogType::Error, "drive: " + path + ": no threshold for offers: " + shownName(text));
    }
  }
  std::sort(thresholds.begin(), thresholds.end(), std::greater<>());
  thresholds.erase(std::unique(thresholds.begin(), thresholds.end()), thresholds.end());
  return thresholds;
}

std::optional<UpgradeTerms> termsIn(GKeyFile* keys, const std::string& path, LogSink& log) {
  const std::optional<std::string> page = keyFileBytes(keys, AccountGroup, "UpgradePage");
  if (!page) return std::nullopt;
  if (!isWebPage(*page)) {
    log.write(LogType::Error, "drive: " + path + ": the page for upgrades is no address of the web: " + shownName(*page));
    return std::nullopt;
  }
  UpgradeTerms terms{*page, thresholdsIn(keys, path, log), keyFileBool(keys, AccountGroup, "UpgradeAsksFirst", false)};
  if (terms.below.empty()) return std::nullopt;
  return terms;
}

}  // namespace

Result<AccountRecord> accountIn(GKeyFile* keys, const std::string& path, LogSink& log) {
  AccountRecord record;
  record.name = shownName(keyFileBytes(keys, AccountGroup, "Name").value_or(""));
  record.token = keyFileBytes(keys, AccountGroup, "Token").value_or("");
  record.signedIn = keyFileBool(keys, AccountGroup, "SignedIn", false);
  record.mirror = keyFileBytes(keys, AccountGroup, "Mirror").value_or(DriveLayout::FirstMirror);
  if (record.token.empty()) return fileError(FileErrorCode::ReadUnknown, path, "there is no account in it");
  if (!isMirrorPlace(record.mirror)) {
    return fileError(FileErrorCode::ReadUnknown, path, "its documents are in no place for them");
  }
  if (const std::optional<std::string> text = keyFileBytes(keys, AccountGroup, "Allowance")) {
    const auto bytes = numberIn<std::int64_t>(*text);
    if (bytes && *bytes >= 0) {
      record.allowance = bytes;
    } else {
      log.write(LogType::Error, "drive: " + path + ": no allowance in bytes: " + shownName(*text));
    }
  }
  record.upgrade = termsIn(keys, path, log);
  return record;
}

Result<AccountRecord> readAccountFile(const std::string& path, LogSink& log) {
  const Result<KeyFile> file = readKeyFile(path);
  if (!file) return *file.error;
  return accountIn(file.value->get(), path, log);
}

}  // namespace vaelo
