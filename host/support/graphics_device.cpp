// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/support/graphics_device.h"

#include <glib.h>

#include <initializer_list>

namespace vaelo {

void drawWithoutGLWhereItIsEmulated() {
  for (const char* device : {"/dev/dri", "/dev/nvidiactl", "/dev/dxg"}) {
    if (g_file_test(device, G_FILE_TEST_EXISTS)) return;
  }
  g_setenv("GDK_DEBUG", "gl-disable", false);
  g_setenv("GSK_RENDERER", "cairo", false);
}

}  // namespace vaelo
