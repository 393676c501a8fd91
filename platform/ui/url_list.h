// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <initializer_list>
#include <optional>
#include <vector>

#include "platform/url.h"

namespace vaelo {

/// What a list knows of an item without a look at the disk.
enum class ItemHint {
  Unknown,
  Document,  ///< no folder that can be opened, and no link
  Folder,    ///< a folder and nothing more: no link, no top of a library, neither Desktop nor Documents
};

/// The URLs of a list's items, in its order, each made when it is asked for: those of 100,000 items would take 15 MiB and
/// the time of several frames. A value that is cheap to copy when it was made of functions.
class URLList {
 public:
  URLList() = default;
  URLList(std::vector<URL> urls);
  URLList(std::initializer_list<URL> urls) : URLList(std::vector<URL>(urls)) {}
  using At = std::function<URL(std::size_t)>;
  /// `guess` is where the URL is likely to be, and may lie outside.
  using IndexOf = std::function<std::optional<std::size_t>(const URL&, std::size_t guess)>;
  using Hint = std::function<ItemHint(std::size_t)>;
  /// The functions answer for something that does not change any more, for as long as the list lives. Without `hint`
  /// nothing is known of the items.
  URLList(std::size_t size, At at, IndexOf indexOf, Hint hint = nullptr);

  std::size_t size() const { return size_; }
  URL operator[](std::size_t i) const { return at_(i); }
  ItemHint hint(std::size_t i) const { return hint_ ? hint_(i) : ItemHint::Unknown; }
  std::optional<std::size_t> indexOf(const URL& url) const { return size_ == 0 ? std::nullopt : indexOf_(url, size_); }
  /// Where those of `wanted` are that the list has, each once, ascending. For URLs in the list's order O(k) besides k calls
  /// of indexOf with good guesses, else O(k log k).
  std::vector<std::size_t> placesOf(const std::vector<URL>& wanted) const;
  /// Those of `wanted` that are in the list, each once, in the list's order.
  std::vector<URL> thoseOf(const std::vector<URL>& wanted) const;
  std::vector<URL> all() const;

 private:
  std::size_t size_ = 0;
  At at_;
  IndexOf indexOf_;
  Hint hint_;
};

}  // namespace vaelo
