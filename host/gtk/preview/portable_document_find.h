// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <map>
#include <string>
#include <vector>

#include "host/gtk/preview/page_text.h"
#include "host/gtk/preview/portable_document_source.h"

namespace vaelo {

/// Where a text stands in a portable document. It is searched a few pages at a time in the decoder's process, from the page
/// that is read onwards and then from the first one; pages are rendered between, and another search gives this one up. Main
/// thread.
class PortableDocumentFind {
 public:
  struct Events {
    std::function<void()> changed;                               ///< more was found, or another place is the current one
    std::function<void(int page, const PageRect& place)> reach;  ///< the current place, to be looked at
  };

  explicit PortableDocumentFind(Events events) : events_(std::move(events)) {}
  /// The source goes before this object, or another one is set.
  void setSource(PortableDocumentSource* source, int pages);
  /// Empty gives up.
  void search(std::string text, int fromPage);
  void step(bool forward);

  const std::string& text() const { return text_; }
  bool isSearching() const { return searching_; }
  int count() const;
  /// Of the current place, counted from 1; 0 when there is none.
  int position() const;
  const std::vector<PageRect>& placesOn(int page) const;
  bool isCurrent(int page, std::size_t index) const;

 private:
  void askNext();
  void answered(int search, const DecoderProcess::Answer& answer);
  void finish();

  Events events_;
  PortableDocumentSource* source_ = nullptr;
  int pages_ = 0;
  std::string text_;
  int search_ = 0;  // its number, by which the answers to one given up are known
  int begin_ = 0;
  int next_ = 0;
  bool wrapped_ = false;
  bool searching_ = false;
  std::map<int, std::vector<PageRect>> places_;
  int currentPage_ = -1;
  std::size_t currentIndex_ = 0;
};

}  // namespace vaelo
