// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/type_identifiers.h"

namespace vaelo {

/// Type identifiers over the shared MIME database: a table for the well-known ones, "dyn." and the extension for the rest.
class GTypes : public TypeIdentifiers {
 public:
  std::optional<std::string> preferredIdentifierForExtension(const std::string& extension) override;
  bool conformsTo(const std::string& type, const std::string& other) override;
  std::optional<std::string> description(const std::string& type) override;
};

}  // namespace vaelo
