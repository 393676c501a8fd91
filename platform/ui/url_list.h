// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <initializer_list>
#include <optional>
#include <vector>

#include "platform/url.h"

namespace vaelo {

/// The URLs of a list's items, in its order, each made when it is asked for: those of 100,000 items would take 15 MiB and
/// the time of several frames. A value that is cheap to copy when it was made of functions.
class URLList {
 public:
  URLList() = default;
  URLList(std::vector<URL> urls);
  URLList(std::initializer_list<URL> urls) : URLList(std::vector<URL>(urls)) {}
  /// `at` and `indexOf` answer for something that does not change any more, for as long as the list lives.
  URLList(std::size_t size, std::function<URL(std::size_t)> at,
          std::function<std::optional<std::size_t>(const URL&)> indexOf);

  std::size_t size() const { return size_; }
  URL operator[](std::size_t i) const { return at_(i); }
  std::optional<std::size_t> indexOf(const URL& url) const { return size_ == 0 ? std::nullopt : indexOf_(url); }
  /// Those of `wanted` that are in the list, each once, in the list's order. O(k log k) besides k calls of indexOf.
  std::vector<URL> thoseOf(const std::vector<URL>& wanted) const;
  std::vector<URL> all() const;

 private:
  std::size_t size_ = 0;
  std::function<URL(std::size_t)> at_;
  std::function<std::optional<std::size_t>(const URL&)> indexOf_;
};

}  // namespace vaelo
