// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/observable.h"

#include <algorithm>

namespace vaelo {

void Observable::notifyChanged() {
  std::erase_if(observers_, [](const auto& observer) { return observer.expired(); });
  // A copy, since an observer may come or go while it is told.
  for (const auto& observer : std::vector(observers_)) {
    if (const auto alive = observer.lock()) (*alive)();
  }
}

}  // namespace vaelo
