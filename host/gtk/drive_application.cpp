// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/drive_application.h"

namespace vaelo {

namespace {

struct DriveApplication {
  AdwApplication parent;
  BusExports* exports;
};

struct DriveApplicationClass {
  AdwApplicationClass parent;
};

gpointer parentClass = nullptr;

BusExports* exportsOf(GApplication* application) { return reinterpret_cast<DriveApplication*>(application)->exports; }

gboolean registerOnBus(GApplication* application, GDBusConnection* bus, const char* path, GError** error) {
  if (!G_APPLICATION_CLASS(parentClass)->dbus_register(application, bus, path, error)) return FALSE;
  return exportsOf(application)->add(bus, path, error);
}

void unregisterFromBus(GApplication* application, GDBusConnection* bus, const char* path) {
  // Also called at the end of an application that has let go of them.
  if (BusExports* exports = exportsOf(application)) exports->remove();
  G_APPLICATION_CLASS(parentClass)->dbus_unregister(application, bus, path);
}

void finalize(GObject* object) {
  BusExports*& exports = reinterpret_cast<DriveApplication*>(object)->exports;
  delete exports;
  exports = nullptr;
  G_OBJECT_CLASS(parentClass)->finalize(object);
}

void initClass(gpointer type, gpointer) {
  parentClass = g_type_class_peek_parent(type);
  G_OBJECT_CLASS(type)->finalize = finalize;
  G_APPLICATION_CLASS(type)->dbus_register = registerOnBus;
  G_APPLICATION_CLASS(type)->dbus_unregister = unregisterFromBus;
}

GType typeOfApplication() {
  static const GType type =
      g_type_register_static_simple(ADW_TYPE_APPLICATION, "VaeloDriveApplication", sizeof(DriveApplicationClass), initClass,
                                    sizeof(DriveApplication), nullptr, G_TYPE_FLAG_NONE);
  return type;
}

}  // namespace

AdwApplication* makeDriveApplication(const char* identifier, GApplicationFlags flags, BusExports exports) {
  gpointer made = g_object_new(typeOfApplication(), "application-id", identifier, "flags", flags, nullptr);
  static_cast<DriveApplication*>(made)->exports = new BusExports(std::move(exports));
  return ADW_APPLICATION(made);
}

}  // namespace vaelo
