// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/device_identity.h"

#include <glib.h>

#include <algorithm>

#include "host/drive/small_file.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr const char* deviceGroup = "Device";

DeviceIdentity identityIn(const std::string& file) {
  const Result<KeyFile> keys = readKeyFile(file);
  if (!keys) return {};
  return {keyFileBytes(keys.value->get(), deviceGroup, "ID").value_or(""),
          keyFileBytes(keys.value->get(), deviceGroup, "Name").value_or("")};
}

}  // namespace

bool isDeviceID(const std::string& text) {
  const auto isPlain = [](char c) { return g_ascii_isalnum(c) || c == '-'; };
  return !text.empty() && text.size() <= 64 && std::all_of(text.begin(), text.end(), isPlain);
}

DeviceIdentity deviceIdentity(const DriveLayout& layout, LogSink& log) {
  const std::string file = layout.dataFolder() + "/device.ini";
  DeviceIdentity identity = identityIn(file);
  if (!isDeviceID(identity.id)) {
    identity.id = takeString(g_uuid_string_random());
    const KeyFile keys(g_key_file_new());
    g_key_file_set_string(keys.get(), deviceGroup, "ID", identity.id.c_str());
    if (!identity.name.empty()) g_key_file_set_string(keys.get(), deviceGroup, "Name", identity.name.c_str());
    if (const auto error = writeSmallFile(file, keyFileText(keys.get()))) {
      log.write(LogType::Error, "drive: can't keep the identity of this device: " + error->description());
    }
  }
  if (identity.name.empty()) identity.name = g_get_host_name();
  return identity;
}

}  // namespace vaelo
