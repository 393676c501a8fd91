// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/url_list.h"

#include <algorithm>
#include <map>
#include <memory>
#include <utility>

namespace vaelo {

URLList::URLList(std::vector<URL> urls) : size_(urls.size()) {
  const auto held = std::make_shared<const std::vector<URL>>(std::move(urls));
  auto places = std::make_shared<std::map<URL, std::size_t>>();
  for (std::size_t i = 0; i < held->size(); ++i) places->emplace((*held)[i], i);
  at_ = [held](std::size_t i) { return (*held)[i]; };
  indexOf_ = [places = std::move(places)](const URL& url, std::size_t) -> std::optional<std::size_t> {
    const auto found = places->find(url);
    return found == places->end() ? std::nullopt : std::optional(found->second);
  };
}

URLList::URLList(std::size_t size, At at, IndexOf indexOf, Hint hint)
    : size_(size), at_(std::move(at)), indexOf_(std::move(indexOf)), hint_(std::move(hint)) {}

std::vector<std::size_t> URLList::placesOf(const std::vector<URL>& wanted) const {
  std::vector<std::size_t> places;
  if (size_ == 0) return places;
  places.reserve(wanted.size());
  bool ascending = true;
  std::size_t next = 0;
  for (const URL& url : wanted) {
    const auto place = indexOf_(url, next);
    if (!place) continue;
    ascending = ascending && *place >= next;
    next = *place + 1;
    places.push_back(*place);
  }
  if (ascending) return places;
  std::sort(places.begin(), places.end());
  places.erase(std::unique(places.begin(), places.end()), places.end());
  return places;
}

std::vector<URL> URLList::thoseOf(const std::vector<URL>& wanted) const {
  const std::vector<std::size_t> places = placesOf(wanted);
  std::vector<URL> found;
  found.reserve(places.size());
  for (const std::size_t place : places) found.push_back(at_(place));
  return found;
}

std::vector<URL> URLList::all() const {
  std::vector<URL> urls;
  urls.reserve(size_);
  for (std::size_t i = 0; i < size_; ++i) urls.push_back(at_(i));
  return urls;
}

}  // namespace vaelo
