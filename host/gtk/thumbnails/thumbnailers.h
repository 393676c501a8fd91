// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <optional>
#include <string>
#include <vector>

namespace vaelo {

/// The programs that make thumbnails, as the files of `thumbnailers` folders name them. Immutable; any thread.
class Thumbnailers {
 public:
  /// Those in the folders; of two for a type the first folder's counts.
  explicit Thumbnailers(const std::vector<std::string>& folders);
  /// Those that are installed; read once.
  static const Thumbnailers& installed();

  /// Whether there is one for files of such a name; judged without a look at the file.
  bool canShow(const std::string& fileName) const;
  /// The program and its arguments, for a thumbnail of `pixels` a side of the file at `path`, to be written to `output`.
  std::optional<std::vector<std::string>> commandFor(const std::string& path, const std::string& output, int pixels) const;

 private:
  std::map<std::string, std::vector<std::string>> commands_;  // by media type, with the marks that stand for arguments
};

}  // namespace vaelo
