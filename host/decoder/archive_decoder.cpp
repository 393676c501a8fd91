// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/archive_decoder.h"

#include <archive.h>
#include <archive_entry.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <clocale>
#include <cstring>

#include "host/decoder/archive_names.h"
#include "host/decoder/pixel_file.h"
#include "host/support/decoder_error.h"

namespace vaelo {

namespace {

constexpr int MostEntries = 50'000;
constexpr std::size_t MostBytes = 16 * 1024 * 1024;  // of lines
constexpr int MostRetries = 100;
constexpr std::size_t BlockBytes = 64 * 1024;
constexpr int EntriesOfAnAnswer = 5000;
constexpr std::chrono::milliseconds TimeOfAnAnswer(400);

// Without those that run programs of their own, and without lists of files that are elsewhere.
void supportFilters(archive* opened) {
  for (auto* support :
       {archive_read_support_filter_gzip, archive_read_support_filter_bzip2, archive_read_support_filter_xz,
        archive_read_support_filter_lzma, archive_read_support_filter_zstd, archive_read_support_filter_lz4,
        archive_read_support_filter_lzip, archive_read_support_filter_compress, archive_read_support_filter_rpm}) {
    support(opened);
  }
}

void supportFormats(archive* opened) {
  for (auto* support :
       {archive_read_support_format_zip, archive_read_support_format_tar, archive_read_support_format_7zip,
        archive_read_support_format_rar, archive_read_support_format_rar5, archive_read_support_format_iso9660,
        archive_read_support_format_cab, archive_read_support_format_cpio, archive_read_support_format_ar,
        archive_read_support_format_lha, archive_read_support_format_xar}) {
    support(opened);
  }
}

std::string nameOf(archive_entry* entry) {
  if (const char* name = archive_entry_pathname_utf8(entry)) return archiveName(name);
  const char* bytes = archive_entry_pathname(entry);
  return bytes ? archiveName(bytes) : "";
}

const char* typeOf(archive_entry* entry, const std::string& name) {
  const auto type = archive_entry_filetype(entry);
  if (type == AE_IFDIR || (!name.empty() && name.back() == '/')) return "folder";
  if (type == AE_IFLNK || archive_entry_hardlink(entry)) return "link";
  return type == AE_IFREG || type == 0 ? "file" : "other";
}

std::string lineFor(archive_entry* entry, bool single) {
  // What a compressed document was called is told only by some; the reader makes a name up then.
  std::string name = nameOf(entry);
  if (single && name == "data") name.clear();
  std::string line = typeOf(entry, name);
  if (archive_entry_is_encrypted(entry)) line += '*';
  const bool isSized = archive_entry_size_is_set(entry) && archive_entry_size(entry) >= 0 && !single;
  line += "\t" + (isSized ? std::to_string(archive_entry_size(entry)) : "-");
  line += "\t" + (archive_entry_mtime_is_set(entry) ? std::to_string(archive_entry_mtime(entry)) : "-");
  return line + "\t" + name + "\n";
}

}  // namespace

void ArchiveDecoder::Free::operator()(archive* opened) const { archive_read_free(opened); }

ArchiveDecoder::ArchiveDecoder(UniqueFd document) : document_(std::move(document)) {
  // Names that an archive keeps as UTF-16 come as UTF-8 in a locale of it only.
  std::setlocale(LC_CTYPE, "C.UTF-8");
}

ArchiveDecoder::~ArchiveDecoder() = default;

DecoderMessage ArchiveDecoder::answer(const std::string& request) {
  if (request == "open") return open(Reading::Archive);
  if (request == "open single") return open(Reading::Single);
  if (request == "next" && archive_) return next();
  return errorAnswer(DecoderError::Unsupported);
}

DecoderMessage ArchiveDecoder::open(Reading reading) {
  reading_ = reading;
  archive_.reset(archive_read_new());
  if (!archive_) return errorAnswer(DecoderError::TooBig);
  supportFilters(archive_.get());
  if (reading == Reading::Single) archive_read_support_format_raw(archive_.get());
  if (reading == Reading::Archive) supportFormats(archive_.get());
  if (reading == Reading::WithoutDirectory) archive_read_support_format_zip_streamable(archive_.get());
  if (::lseek(document_.get(), 0, SEEK_SET) != 0) return errorAnswer(DecoderError::Unreadable);
  if (archive_read_open_fd(archive_.get(), document_.get(), BlockBytes) != ARCHIVE_OK) return failure();
  return {"ok", UniqueFd()};
}

DecoderMessage ArchiveDecoder::failure() {
  const char* told = archive_error_string(archive_.get());
  const bool isLocked = archive_read_has_encrypted_entries(archive_.get()) > 0 || (told && std::strstr(told, "ncrypt"));
  return errorAnswer(isLocked ? DecoderError::Locked : DecoderError::Damaged);
}

DecoderMessage ArchiveDecoder::next() {
  std::string lines;
  int count = 0;
  const char* state = readSome(lines, count);
  if (listed_ == 0 && std::strcmp(state, "broken") == 0) {
    if (reading_ != Reading::Archive) return failure();
    // What a damaged directory at its end doesn't tell, a zip archive says before each of its files too.
    const DecoderMessage reason = failure();
    open(Reading::WithoutDirectory);
    state = readSome(lines, count);
    if (listed_ == 0) return {reason.text, UniqueFd()};
  }
  // It has been read in this way because its directory is gone.
  if (reading_ == Reading::WithoutDirectory && std::strcmp(state, "end") == 0) state = "broken";
  std::string answer = "ok " + std::to_string(count) + " " + state;
  if (lines.empty()) return {std::move(answer), UniqueFd()};
  PixelFile file(lines.size());
  if (!file.data()) return errorAnswer(DecoderError::TooBig);
  std::memcpy(file.data(), lines.data(), lines.size());
  return {std::move(answer), file.take()};
}

const char* ArchiveDecoder::readSome(std::string& lines, int& count) {
  const auto end = std::chrono::steady_clock::now() + TimeOfAnAnswer;
  const bool isSingle = reading_ == Reading::Single;
  int retries = 0;
  while (count < EntriesOfAnAnswer && std::chrono::steady_clock::now() < end) {
    archive_entry* entry = nullptr;
    const int result = archive_read_next_header(archive_.get(), &entry);
    if (result == ARCHIVE_EOF) return "end";
    if (result == ARCHIVE_RETRY && ++retries < MostRetries) continue;
    if (result < ARCHIVE_WARN) return "broken";
    // What is not even compressed is no compressed document.
    if (isSingle && archive_filter_count(archive_.get()) < 2) return "broken";
    if (listed_ >= MostEntries || listedBytes_ >= MostBytes) return "full";
    const std::string line = lineFor(entry, isSingle);
    lines += line;
    listedBytes_ += line.size();
    ++listed_;
    ++count;
    if (isSingle) return "end";
  }
  return "more";
}

}  // namespace vaelo
