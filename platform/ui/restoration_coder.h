// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <utility>

#include "platform/value.h"

namespace vaelo {

/// Keeps what a screen needs to come back as it was. Main thread.
class RestorationCoder {
 public:
  virtual ~RestorationCoder() = default;
  /// An absent value removes the key.
  virtual void encode(const std::string& key, Value value) = 0;
  /// Absent when there is no such key.
  virtual Value decode(const std::string& key) const = 0;
};

/// A coder in memory, which the host stores and loads as a dictionary.
class DictionaryRestorationCoder : public RestorationCoder {
 public:
  DictionaryRestorationCoder() = default;
  explicit DictionaryRestorationCoder(Dictionary values) : values_(std::move(values)) {}
  void encode(const std::string& key, Value value) override;
  Value decode(const std::string& key) const override;
  const Dictionary& values() const { return values_; }

 private:
  Dictionary values_;
};

}  // namespace vaelo
