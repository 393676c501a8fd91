// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/support/glib_ptr.h"
#include "platform/logging.h"
#include "platform/preferences.h"

namespace vaelo {

/// Preferences in a key file, read once and written at each change. Main thread.
class IniPreferences : public Preferences {
 public:
  IniPreferences(std::string path, LogSink& log);
  std::optional<Data> dataForKey(const std::string& key) override;
  void setDataForKey(const std::string& key, const Data& data) override;
  void removeKey(const std::string& key) override;

 private:
  void save();

  std::string path_;
  LogSink& log_;
  GKeyFilePtr file_;
};

}  // namespace vaelo
