// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/pixel_file.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <unistd.h>

namespace vaelo {

PixelFile::PixelFile(std::size_t bytes) : file_(::memfd_create("pixels", MFD_CLOEXEC | MFD_ALLOW_SEALING)), bytes_(bytes) {
  if (!file_ || bytes == 0 || ::ftruncate(file_.get(), static_cast<off_t>(bytes)) != 0) return;
  if (::fcntl(file_.get(), F_ADD_SEALS, F_SEAL_SHRINK | F_SEAL_GROW) != 0) return;
  void* mapped = ::mmap(nullptr, bytes, PROT_READ | PROT_WRITE, MAP_SHARED, file_.get(), 0);
  if (mapped != MAP_FAILED) data_ = static_cast<unsigned char*>(mapped);
}

PixelFile::~PixelFile() {
  if (data_) ::munmap(data_, bytes_);
}

}  // namespace vaelo
