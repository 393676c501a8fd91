// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_types.h"

#include <algorithm>
#include <cctype>

namespace vaelo {

std::optional<std::string> MemoryTypes::preferredIdentifierForExtension(const std::string& extension) {
  if (extension.empty()) return std::nullopt;
  std::string lower = extension;
  std::transform(lower.begin(), lower.end(), lower.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  const auto found = typeOfExtension.find(lower);
  if (found != typeOfExtension.end()) return found->second;
  return makesTypes ? std::optional("dyn." + lower) : std::nullopt;
}

bool MemoryTypes::conformsTo(const std::string& type, const std::string& other) {
  if (type == other) return true;
  const auto found = conformances.find(type);
  if (found != conformances.end()) return found->second.contains(other);
  // What nobody knows is data.
  return type.starts_with("dyn.") && (other == "public.data" || other == "public.item");
}

std::optional<std::string> MemoryTypes::description(const std::string& type) {
  const auto found = descriptions.find(type);
  return found == descriptions.end() ? std::nullopt : std::optional(found->second);
}

}  // namespace vaelo
