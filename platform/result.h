// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <utility>

#include "platform/error.h"

namespace vaelo {

/// A value, or the error that kept it from being made. Both may be absent where an operation says so.
template <typename T>
struct Result {
  std::optional<T> value;
  std::optional<Error> error;

  Result() = default;
  Result(T made) : value(std::move(made)) {}
  Result(Error failure) : error(std::move(failure)) {}
  explicit operator bool() const { return value.has_value(); }
};

}  // namespace vaelo
