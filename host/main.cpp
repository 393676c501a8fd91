// SPDX-License-Identifier: GPL-3.0-or-later
#include "app/main.h"

#include <gtk/gtk.h>

#include "host/desktop/restoration_store.h"
#include "host/gtk/change_toasts.h"
#include "host/gtk/gtk_application_loop.h"
#include "host/gtk/gtk_screens.h"
#include "host/gtk/long_work_dialog.h"
#include "host/host_platform.h"
#include "host/support/graphics_device.h"
#include "host/support/message_catalogue.h"

int main(int argc, char** argv) {
  vaelo::useMessageCatalogue();
  gtk_disable_setlocale();
  vaelo::drawWithoutGLWhereItIsEmulated();
  const vaelo::HostFolders folders = vaelo::HostFolders::fromEnvironment();
  vaelo::HostPlatform platform(folders);
  vaelo::GtkScreens screens(platform.drive(), platform.syncedStore());
  vaelo::GtkApplicationLoop loop(screens, platform.drive(), platform.notifications(), platform.userActivities(),
                                 vaelo::RestorationStore(folders.restorationFile));
  platform.install(loop, screens);
  const vaelo::ChangeToasts toasts(screens, platform.drive(), platform.moves());
  const vaelo::LongWorkDialog progress(screens, platform.longWork());
  return vaelo::vaeloMain(argc, argv);
}
