// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/restoration_coder.h"

namespace vaelo {

void DictionaryRestorationCoder::encode(const std::string& key, Value value) {
  if (value.isPresent()) {
    values_[key] = std::move(value);
  } else {
    values_.erase(key);
  }
}

Value DictionaryRestorationCoder::decode(const std::string& key) const {
  const auto found = values_.find(key);
  return found == values_.end() ? Value() : found->second;
}

}  // namespace vaelo
