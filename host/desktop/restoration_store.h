// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "platform/result.h"
#include "platform/ui/restoration_coder.h"

namespace vaelo {

/// Keeps a screen's state between two runs, in a key file. Blocks; the file is small. Main thread.
class RestorationStore {
 public:
  explicit RestorationStore(std::string path) : path_(std::move(path)) {}
  /// Only URLs and integers are kept, the former with their folder hint. A failure leaves what was kept before; it costs
  /// the user one tap after the next start, so the log is told and nobody else.
  std::optional<Error> save(const Dictionary& values);
  /// Empty when nothing was kept or the file is damaged.
  Dictionary load() const;

 private:
  std::string path_;
};

}  // namespace vaelo
