// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/shared_bytes.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>

namespace vaelo {

namespace {

struct Mapping {
  void* data;
  std::size_t size;
};

void unmap(gpointer data) {
  auto* mapping = static_cast<Mapping*>(data);
  ::munmap(mapping->data, mapping->size);
  delete mapping;
}

}  // namespace

GBytes* takeSharedBytes(UniqueFd file, std::size_t atLeast) {
  struct stat status = {};
  // Reading behind the end of a file that was cut short would kill the application.
  const int seals = file ? ::fcntl(file.get(), F_GET_SEALS) : -1;
  if (seals < 0 || !(seals & F_SEAL_SHRINK) || ::fstat(file.get(), &status) != 0 || status.st_size <= 0) return nullptr;
  const auto size = static_cast<std::size_t>(status.st_size);
  if (size < atLeast) return nullptr;
  void* data = ::mmap(nullptr, size, PROT_READ, MAP_SHARED, file.get(), 0);
  if (data == MAP_FAILED) return nullptr;
  return g_bytes_new_with_free_func(data, size, unmap, new Mapping{data, size});
}

GRef<GdkTexture> takeTexture(UniqueFd file, int width, int height) {
  constexpr int mostPixels = 32768;
  if (width <= 0 || height <= 0 || width > mostPixels || height > mostPixels) return {};
  const std::size_t stride = static_cast<std::size_t>(width) * 4;
  GBytes* bytes = takeSharedBytes(std::move(file), stride * static_cast<std::size_t>(height));
  if (!bytes) return {};
  GRef<GdkTexture> texture(gdk_memory_texture_new(width, height, GDK_MEMORY_DEFAULT, bytes, stride));
  g_bytes_unref(bytes);
  return texture;
}

}  // namespace vaelo
