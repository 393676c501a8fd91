// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <variant>
#include <vector>

#include "platform/date.h"
#include "platform/image.h"
#include "platform/url.h"

namespace vaelo {

class Value;
using Data = std::vector<std::uint8_t>;
using Dictionary = std::map<std::string, Value>;
using Array = std::vector<Value>;

/// What comes from outside without a fixed type: resource values, user info of activities and shortcuts, the synced store,
/// restoration state. Readers ask for the type they need and get nothing when it is another.
class Value {
 public:
  Value() = default;
  Value(bool value) : held_(value) {}
  Value(std::int64_t value) : held_(value) {}
  Value(std::uint64_t value) : held_(value) {}
  Value(double value) : held_(value) {}
  Value(std::string value) : held_(std::move(value)) {}
  Value(const char* value) : held_(std::string(value)) {}
  Value(Date value) : held_(value) {}
  Value(URL value) : held_(std::move(value)) {}
  Value(Data value) : held_(std::move(value)) {}
  Value(ImageRef value) : held_(std::move(value)) {}
  Value(Dictionary value);
  Value(Array value);

  bool isPresent() const { return held_.index() != 0; }
  /// True for the three number types; a bool is not a number.
  bool isNumber() const;
  /// The number as it would be after a conversion in C: negative ones wrap, fractions are dropped; 0 when it is none.
  std::uint64_t unsignedValue() const;
  std::int64_t signedValue() const;
  bool boolValue() const;

  template <typename T>
  const T* get() const {
    return std::get_if<T>(&held_);
  }
  const Dictionary* dictionary() const;
  const Array* array() const;

  /// For log lines.
  std::string description() const;
  /// What kind of thing it holds, for log lines: "URL", "String"…
  const char* className() const;
  friend bool operator==(const Value& a, const Value& b);

 private:
  std::variant<std::monostate, bool, std::int64_t, std::uint64_t, double, std::string, Date, URL, Data, ImageRef,
               std::shared_ptr<const Dictionary>, std::shared_ptr<const Array>>
      held_;
};

}  // namespace vaelo
