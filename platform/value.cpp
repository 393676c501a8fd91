// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/value.h"

#include <type_traits>

namespace vaelo {

Value::Value(Dictionary value) : held_(std::make_shared<const Dictionary>(std::move(value))) {}
Value::Value(Array value) : held_(std::make_shared<const Array>(std::move(value))) {}

bool Value::isNumber() const { return get<std::int64_t>() || get<std::uint64_t>() || get<double>(); }

std::uint64_t Value::unsignedValue() const {
  if (const auto* number = get<std::uint64_t>()) return *number;
  return static_cast<std::uint64_t>(signedValue());
}

std::int64_t Value::signedValue() const {
  if (const auto* number = get<std::int64_t>()) return *number;
  if (const auto* number = get<std::uint64_t>()) return static_cast<std::int64_t>(*number);
  if (const auto* number = get<double>()) {
    // Outside this range the conversion is undefined.
    constexpr double limit = 9.2e18;
    return *number > -limit && *number < limit ? static_cast<std::int64_t>(*number) : 0;
  }
  return 0;
}

bool Value::boolValue() const {
  if (const auto* flag = get<bool>()) return *flag;
  return isNumber() && signedValue() != 0;
}

const Dictionary* Value::dictionary() const {
  const auto* held = get<std::shared_ptr<const Dictionary>>();
  return held ? held->get() : nullptr;
}

const Array* Value::array() const {
  const auto* held = get<std::shared_ptr<const Array>>();
  return held ? held->get() : nullptr;
}

std::string Value::description() const {
  if (const Dictionary* entries = dictionary()) {
    std::string text = "{";
    for (const auto& [key, value] : *entries) text += " " + key + " = " + value.description() + ";";
    return text + " }";
  }
  if (const Array* entries = array()) {
    std::string text = "(";
    for (const Value& value : *entries) text += (text.size() > 1 ? ", " : "") + value.description();
    return text + ")";
  }
  return std::visit(
      [](const auto& held) -> std::string {
        using T = std::decay_t<decltype(held)>;
        if constexpr (std::is_same_v<T, bool>) {
          return held ? "1" : "0";
        } else if constexpr (std::is_arithmetic_v<T>) {
          return std::to_string(held);
        } else if constexpr (std::is_same_v<T, std::string>) {
          return held;
        } else if constexpr (std::is_same_v<T, URL>) {
          return held.absoluteString();
        } else if constexpr (std::is_same_v<T, Date>) {
          return std::to_string(std::chrono::duration<double>(held.time_since_epoch()).count());
        } else if constexpr (std::is_same_v<T, Data>) {
          return "<" + std::to_string(held.size()) + " bytes>";
        } else if constexpr (std::is_same_v<T, ImageRef>) {
          return "<image>";
        } else {
          return "(null)";
        }
      },
      held_);
}

bool operator==(const Value& a, const Value& b) {
  if (a.dictionary() && b.dictionary()) return *a.dictionary() == *b.dictionary();
  if (a.array() && b.array()) return *a.array() == *b.array();
  return a.held_ == b.held_;
}

const char* Value::className() const {
  static constexpr const char* Names[] = {"Null", "Boolean", "Number", "Number", "Number",     "String",
                                          "Date", "URL",     "Data",   "Image",  "Dictionary", "Array"};
  return Names[held_.index()];
}

}  // namespace vaelo
