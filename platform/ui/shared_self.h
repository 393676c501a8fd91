// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

namespace vaelo {

/// The owner of `self` as a pointer of its own class, for delegates and weak captures. Not in a constructor: nobody owns the
/// object yet.
template <typename T>
std::shared_ptr<T> sharedSelf(T* self) {
  return std::static_pointer_cast<T>(self->shared_from_this());
}

template <typename T>
std::weak_ptr<T> weakSelf(T* self) {
  return sharedSelf(self);
}

}  // namespace vaelo
