// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/url_list.h"

#include <map>
#include <memory>
#include <set>
#include <utility>

namespace vaelo {

URLList::URLList(std::vector<URL> urls) : size_(urls.size()) {
  const auto held = std::make_shared<const std::vector<URL>>(std::move(urls));
  auto places = std::make_shared<std::map<URL, std::size_t>>();
  for (std::size_t i = 0; i < held->size(); ++i) places->emplace((*held)[i], i);
  at_ = [held](std::size_t i) { return (*held)[i]; };
  indexOf_ = [places = std::move(places)](const URL& url) -> std::optional<std::size_t> {
    const auto found = places->find(url);
    return found == places->end() ? std::nullopt : std::optional(found->second);
  };
}

URLList::URLList(std::size_t size, std::function<URL(std::size_t)> at,
                 std::function<std::optional<std::size_t>(const URL&)> indexOf)
    : size_(size), at_(std::move(at)), indexOf_(std::move(indexOf)) {}

std::vector<URL> URLList::thoseOf(const std::vector<URL>& wanted) const {
  std::set<std::size_t> places;
  for (const URL& url : wanted) {
    if (const auto place = indexOf(url)) places.insert(*place);
  }
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
