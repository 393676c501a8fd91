// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>

#include "host/support/unique_fd.h"

namespace vaelo {

/// Memory that is handed to the application: zeroes at first, of a size that can't change any more. The mapping lives as
/// long as the object, the file as long as anybody holds it.
class PixelFile {
 public:
  explicit PixelFile(std::size_t bytes);
  ~PixelFile();
  PixelFile(const PixelFile&) = delete;
  PixelFile& operator=(const PixelFile&) = delete;
  /// Null when there was no memory.
  unsigned char* data() const { return data_; }
  /// Gives the file away; data() stays.
  UniqueFd take() { return std::move(file_); }

 private:
  UniqueFd file_;
  unsigned char* data_ = nullptr;
  std::size_t bytes_;
};

}  // namespace vaelo
