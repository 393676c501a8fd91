// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "platform/cloud_documents.h"
#include "platform/url.h"

namespace vaelo {

/// What can be told of an item that is to be shared.
struct SharedItem {
  URL url;
  std::string name;  ///< for people
  bool exists = false;
  bool downloaded = false;  ///< its content is here
  bool folder = false;      ///< a folder or a package
  std::string contentType;
  std::uint64_t size = 0;  ///< bytes of a document; 0 for a folder
  /// Leads to the item in this drive; for what lies outside it, its place on this machine. Absent for names that no link
  /// can hold.
  std::optional<std::string> link;
  /// What the account gave for people who have no access to the drive; kept with the item.
  std::optional<std::string> shareLink;
};

/// Reads what is there now. Content is read of downloaded items alone, and at most a few kilobytes. Blocks shortly; any
/// thread.
SharedItem describeSharedItem(const URL& url, CloudDocuments& drive);

}  // namespace vaelo
