// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "host/drive/small_file.h"
#include "platform/logging.h"
#include "platform/preferences.h"

namespace vaelo {

/// Preferences in a key file, read once and written at each change. What can't be written is kept until the program ends,
/// and the log tells. Main thread.
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
  KeyFile file_;
};

}  // namespace vaelo
