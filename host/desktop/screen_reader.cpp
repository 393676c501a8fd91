// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/screen_reader.h"

#include <utility>

namespace vaelo {

ScreenReader::ScreenReader(std::function<void()> changed) : changed_(std::move(changed)), asking_(g_cancellable_new()) {
  g_dbus_proxy_new_for_bus(
      G_BUS_TYPE_SESSION, G_DBUS_PROXY_FLAGS_DO_NOT_AUTO_START, nullptr, "org.a11y.Bus", "/org/a11y/bus", "org.a11y.Status",
      asking_.get(),
      [](GObject*, GAsyncResult* result, gpointer self) {
        GError* error = nullptr;
        GRef<GDBusProxy> status(g_dbus_proxy_new_for_bus_finish(result, &error));
        const GErrorPtr owned(error);
        // A cancelled one belongs to an object that is gone; without a bus there is no screen reader.
        if (!status) return;
        auto* reader = static_cast<ScreenReader*>(self);
        reader->status_ = std::move(status);
        g_signal_connect_swapped(reader->status_.get(), "g-properties-changed",
                                 G_CALLBACK(+[](ScreenReader* told) { told->look(); }), reader);
        reader->look();
      },
      this);
}

ScreenReader::~ScreenReader() {
  g_cancellable_cancel(asking_.get());
  if (status_) g_signal_handlers_disconnect_by_data(status_.get(), this);
}

void ScreenReader::look() {
  GVariant* enabled = g_dbus_proxy_get_cached_property(status_.get(), "ScreenReaderEnabled");
  const bool on = enabled && g_variant_is_of_type(enabled, G_VARIANT_TYPE_BOOLEAN) && g_variant_get_boolean(enabled);
  if (enabled) g_variant_unref(enabled);
  if (std::exchange(on_, on) != on) changed_();
}

}  // namespace vaelo
