// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/support/own_folder.h"

#include <glib.h>

#include <filesystem>

#include "host/support/glib_ptr.h"

namespace vaelo {

std::string ownFolder(const std::string& name, const std::string& installedName, const std::string& file) {
  const std::filesystem::path program =
      std::filesystem::path(takeString(g_file_read_link("/proc/self/exe", nullptr))).parent_path();
  const std::filesystem::path above = program.parent_path();
  for (const std::filesystem::path& folder : {program / name, above / name, above / installedName}) {
    if (g_file_test((folder / file).c_str(), G_FILE_TEST_IS_REGULAR)) return folder;
  }
  return "";
}

}  // namespace vaelo
