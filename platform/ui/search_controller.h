// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "platform/ui/document_list_controller.h"

namespace vaelo {

/// A search over the drive, presented by a list, whose delegate hears what is chosen among the results. Main thread.
class SearchController : public ViewController {
 public:
  SearchController(std::weak_ptr<DocumentListController> list, std::string query, bool wantsFocus);
  std::string className() const override { return "SearchController"; }
  DocumentListControllerRef list() const { return list_.lock(); }
  const std::string& query() const { return query_; }
  /// The user typed, or a new search began.
  void setQuery(std::string query, bool wantsFocus = false);
  /// The search field is to have the focus when it appears.
  bool wantsFocus() const { return wantsFocus_; }
  Signal<SearchController&>& queryChanged() { return queryChanged_; }

 private:
  std::weak_ptr<DocumentListController> list_;
  std::string query_;
  bool wantsFocus_;
  Signal<SearchController&> queryChanged_;
};

}  // namespace vaelo
