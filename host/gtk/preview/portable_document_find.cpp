// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/portable_document_find.h"

#include <algorithm>

namespace vaelo {

namespace {
constexpr std::size_t LongestText = 1000;  // bytes; more is a mistake, and no page has it
}

void PortableDocumentFind::setSource(PortableDocumentSource* source, int pages) {
  source_ = source;
  pages_ = pages;
  search(text_, std::max(currentPage_, 0));
}

void PortableDocumentFind::search(std::string text, int fromPage) {
  ++search_;
  std::replace(text.begin(), text.end(), '\n', ' ');
  text_ = text.size() > LongestText ? "" : std::move(text);
  places_.clear();
  currentPage_ = -1;
  begin_ = next_ = std::clamp(fromPage, 0, std::max(pages_ - 1, 0));
  wrapped_ = false;
  searching_ = !text_.empty() && source_ && pages_ > 0;
  if (searching_) askNext();
  events_.changed();
}

void PortableDocumentFind::askNext() {
  source_->ask("find " + std::to_string(next_) + " " + text_,
               [this, search = search_](const DecoderProcess::Answer& answer) { answered(search, answer); });
}

void PortableDocumentFind::answered(int search, const DecoderProcess::Answer& answer) {
  if (search != search_) return;
  const std::vector<double> numbers = numbersIn(answer.text);
  if (!answer.error.empty() || numbers.empty() || numbers[0] <= next_ || numbers[0] > pages_) return finish();
  next_ = static_cast<int>(numbers[0]);
  const int page = next_ - 1;
  const bool isNew = !wrapped_ || page < begin_;
  for (std::size_t i = 1; isNew && i + 3 < numbers.size(); i += 4) {
    places_[page].push_back({numbers[i], numbers[i + 1], numbers[i + 2], numbers[i + 3]});
  }
  if (next_ == pages_ && !wrapped_) {
    wrapped_ = true;
    next_ = 0;
  }
  if (currentPage_ < 0 && !places_.empty()) {
    currentPage_ = places_.begin()->first;
    currentIndex_ = 0;
    events_.reach(currentPage_, places_.begin()->second.front());
  }
  if (wrapped_ && next_ >= begin_) return finish();
  askNext();
  events_.changed();
}

void PortableDocumentFind::finish() {
  searching_ = false;
  events_.changed();
}

void PortableDocumentFind::step(bool forward) {
  auto page = places_.find(currentPage_);
  if (page == places_.end()) return;
  if (forward && ++currentIndex_ == page->second.size()) {
    if (++page == places_.end()) page = places_.begin();
    currentIndex_ = 0;
  } else if (!forward && currentIndex_ == 0) {
    page = page == places_.begin() ? std::prev(places_.end()) : std::prev(page);
    currentIndex_ = page->second.size() - 1;
  } else if (!forward) {
    --currentIndex_;
  }
  currentPage_ = page->first;
  events_.reach(currentPage_, page->second[currentIndex_]);
  events_.changed();
}

int PortableDocumentFind::count() const {
  std::size_t all = 0;
  for (const auto& [page, places] : places_) all += places.size();
  return static_cast<int>(all);
}

int PortableDocumentFind::position() const {
  if (currentPage_ < 0) return 0;
  std::size_t before = currentIndex_ + 1;
  for (auto page = places_.begin(); page != places_.end() && page->first < currentPage_; ++page) {
    before += page->second.size();
  }
  return static_cast<int>(before);
}

const std::vector<PageRect>& PortableDocumentFind::placesOn(int page) const {
  static const std::vector<PageRect> none;
  const auto found = places_.find(page);
  return found == places_.end() ? none : found->second;
}

bool PortableDocumentFind::isCurrent(int page, std::size_t index) const {
  return page == currentPage_ && index == currentIndex_;
}

}  // namespace vaelo
