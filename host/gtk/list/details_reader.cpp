// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/details_reader.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unicode/locid.h>
#include <unicode/udat.h>
#include <unicode/ustring.h>

#include <array>
#include <chrono>
#include <filesystem>
#include <initializer_list>
#include <optional>
#include <system_error>

#include "host/drive/item_attributes.h"
#include "host/drive/promise_file.h"
#include "host/files/icu_formatting.h"
#include "host/files/user_locale.h"
#include "host/gtk/list/folder_reader.h"
#include "host/gtk/thumbnails/thumbnail_cache.h"
#include "host/gtk/thumbnails/thumbnail_maker.h"
#include "host/support/texts.h"
#include "platform/url.h"

namespace vaelo {
namespace {

/// "Today" and "Yesterday" read faster than dates; the language decides on the rest.
std::string dateText(double secondsSince1970) {
  struct Closer {
    void operator()(UDateFormat* format) const { udat_close(format); }
  };
  UErrorCode status = U_ZERO_ERROR;
  thread_local const std::unique_ptr<UDateFormat, Closer> format(static_cast<UDateFormat*>(
      udat_open(UDAT_NONE, UDAT_MEDIUM_RELATIVE, icu::Locale::createCanonical(userLocale("LC_TIME").c_str()).getName(),
                nullptr, -1, nullptr, 0, &status)));
  if (!format) return {};
  std::array<UChar, 128> text;
  const int32_t length =
      udat_format(format.get(), secondsSince1970 * 1000, text.data(), static_cast<int32_t>(text.size()), nullptr, &status);
  std::array<char, 512> utf8;
  int32_t bytes = 0;
  u_strToUTF8(utf8.data(), static_cast<int32_t>(utf8.size()), &bytes, text.data(), length, &status);
  return U_SUCCESS(status) ? std::string(utf8.data(), static_cast<std::size_t>(bytes)) : std::string();
}

IcuFormatting& formatting() {
  static IcuFormatting made;
  return made;
}

std::string sizeText(std::uint64_t bytes) { return formatting().byteCount(bytes, ByteCountStyle::File); }

void setFacts(ItemDetails& details, std::initializer_list<std::string> facts) {
  for (const std::string& fact : facts) {
    if (fact.empty()) continue;
    if (details.shortLine.empty()) details.shortLine = fact;
    details.secondLine += (details.secondLine.empty() ? "" : " · ") + fact;
  }
}

std::string countText(long count) {
  return count < 0 ? std::string() : formatting().localizedCount(".DICT.ITEMS.%d", count);
}

std::string nameWithoutExtension(const std::string& path) {
  const std::string name = path.substr(path.rfind('/') + 1);
  char* text = g_filename_display_name(name.substr(0, name.size() - URL(path).pathExtension().size()).c_str());
  std::string shown(text);
  g_free(text);
  if (shown.ends_with('.')) shown.pop_back();
  return shown;
}

/// What the files of a package take together; 0 for one with so many that adding them up would keep other rows waiting.
std::uint64_t packageSize(const std::string& path) {
  constexpr int mostEntries = 1000;
  std::uint64_t sum = 0;
  int entries = 0;
  std::error_code error;
  constexpr auto options = std::filesystem::directory_options::skip_permission_denied;
  for (std::filesystem::recursive_directory_iterator at(path, options, error), end; !error && at != end;
       at.increment(error)) {
    if (++entries > mostEntries) return 0;
    const std::string file = at->path().string();
    struct stat status;
    if (isPromiseName(at->path().filename().string())) {
      if (const auto promise = readPromise(file)) sum += promise.value->size;
    } else if (lstat(file.c_str(), &status) == 0 && !S_ISDIR(status.st_mode)) {
      sum += static_cast<std::uint64_t>(status.st_size);
    }
  }
  return error ? 0 : sum;
}

}  // namespace

std::shared_ptr<const ItemDetails> readDetails(const std::string& path, EntryKind kind, int thumbnailPixels) {
  auto details = std::make_shared<ItemDetails>();
  if (isPromised(kind)) {
    std::string size;
    std::string date;
    if (const auto promise = readPromise(promisePathFor(path))) {
      if (promise.value->extensionHidden) details->displayName = nameWithoutExtension(path);
      if (promise.value->size) size = sizeText(promise.value->size);
      if (promise.value->modified)
        date = dateText(std::chrono::duration<double>(promise.value->modified->time_since_epoch()).count());
    }
    setFacts(*details, {_("Not downloaded"), size, date});
    return details;
  }
  if (isListedAsFolder(kind)) {
    setFacts(*details, {countText(countEntries(AT_FDCWD, path.c_str()))});
    return details;
  }
  struct statx status;
  if (statx(AT_FDCWD, path.c_str(), AT_STATX_DONT_SYNC, STATX_TYPE | STATX_SIZE | STATX_MTIME, &status) != 0) {
    if (kind == EntryKind::Symlink) setFacts(*details, {_("Broken link")});
    return details;
  }
  if (kind == EntryKind::Bookmark || kind == EntryKind::Alias || extensionIsHiddenAt(path)) {
    details->displayName = nameWithoutExtension(path);
  }
  const std::string date = dateText(static_cast<double>(status.stx_mtime.tv_sec));
  if (!S_ISREG(status.stx_mode)) {
    const std::uint64_t size = kind == EntryKind::Package ? packageSize(path) : 0;
    setFacts(*details, {size == 0 ? std::string() : sizeText(size), date});
    return details;
  }
  setFacts(*details, {sizeText(status.stx_size), date});
  const char* cache = g_get_user_cache_dir();
  details->thumbnail = cachedThumbnail(cache, path, status.stx_mtime.tv_sec, thumbnailPixels);
  details->mayHaveThumbnail = !details->thumbnail && status.stx_size > 0 &&
                              mayHaveThumbnail(Thumbnailers::installed(), cache, path, status.stx_mtime.tv_sec);
  return details;
}

}  // namespace vaelo
