// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "host/decoder/decoder.h"

struct archive;
struct archive_entry;

namespace vaelo {

/// Lists what is in an archive. Nothing is unpacked but what stands before the next name, and nothing is written. Requests:
///   open          an archive of many entries
///   open single   one compressed document
///   next          some more entries; "COUNT STATE", and a file with a line for each: TYPE SIZE MODIFIED PATH, tabs between.
/// STATE is one of more, end, full (there are more than we list) and broken (the rest can't be read). TYPE is file, folder,
/// link or other, with a "*" behind it where the content is locked; SIZE is in bytes and MODIFIED in seconds since 1970,
/// "-" where the archive doesn't say. PATH is UTF-8 without control characters; empty where there is no name.
class ArchiveDecoder : public Decoder {
 public:
  explicit ArchiveDecoder(UniqueFd document);
  ~ArchiveDecoder() override;
  DecoderMessage answer(const std::string& request) override;

 private:
  struct Free {
    void operator()(archive* opened) const;
  };

  enum class Reading { Archive, Single, WithoutDirectory };
  DecoderMessage open(Reading reading);
  DecoderMessage next();
  const char* readSome(std::string& lines, int& count);
  DecoderMessage failure();

  UniqueFd document_;
  std::unique_ptr<archive, Free> archive_;
  Reading reading_ = Reading::Archive;
  int listed_ = 0;
  std::size_t listedBytes_ = 0;
};

}  // namespace vaelo
