// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/search_controller.h"

#include <utility>

namespace vaelo {

SearchController::SearchController(std::weak_ptr<DocumentListController> list, std::string query, bool wantsFocus)
    : list_(std::move(list)), query_(std::move(query)), wantsFocus_(wantsFocus) {}

void SearchController::setQuery(std::string query, bool wantsFocus) {
  query_ = std::move(query);
  wantsFocus_ = wantsFocus_ || wantsFocus;
  queryChanged_.emit(*this);
}

}  // namespace vaelo
