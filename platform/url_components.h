// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace vaelo {

/// The parts of a URL string of any scheme, split as RFC 3986 says and percent-decoded once.
struct URLComponents {
  struct QueryItem {
    std::string name;
    std::optional<std::string> value;
  };

  std::string scheme;
  std::string host;
  std::string path;
  std::vector<QueryItem> queryItems;

  /// Nothing when the text has characters that no URL may hold, broken percent-encoding, or encodes bytes that are not
  /// UTF-8.
  static std::optional<URLComponents> parse(std::string_view text);
};

}  // namespace vaelo
