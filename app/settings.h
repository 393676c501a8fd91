// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// What is fixed for the whole application. Stateless; any thread.
class Settings {
 public:
  /// A chosen document goes to its default application first.
  static bool quickLaunch() { return true; }
  /// The type of the activity by which another device can continue viewing a document.
  static const char* batonVaeloActivityType() { return "com.marrow.kestrel.viewing"; }
};

}  // namespace vaelo
