// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/bluetooth_sender.h"

#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

std::string program() {
  for (const char* name : {"bluetooth-sendto", "blueman-sendto"}) {
    const std::string found = takeString(g_find_program_in_path(name));
    if (!found.empty()) return found;
  }
  return "";
}

}  // namespace

bool BluetoothSender::isAvailable() { return !program().empty(); }

bool BluetoothSender::send(const std::string& path, GAppLaunchContext* context, LaunchFailed failed) {
  const std::string found = program();
  if (found.empty()) {
    failed(_("This desktop can’t send by Bluetooth."));
    return false;
  }
  return launchProgram({found, path}, _("Bluetooth"), context, std::move(failed));
}

}  // namespace vaelo
