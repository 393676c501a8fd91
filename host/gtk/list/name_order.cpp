// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/name_order.h"

#include <unicode/ucol.h>
#include <unicode/uset.h>
#include <unicode/ustring.h>

#include <algorithm>
#include <array>
#include <clocale>
#include <cstring>
#include <string>

namespace vaelo {
namespace {

constexpr std::size_t LongestFastNumber = 200;  // the collator cuts longer runs of digits into several numbers

bool isDigit(unsigned char c) { return c >= '0' && c <= '9'; }

/// The collator of the user's language, and what it thinks of each ASCII character. The tables are read out of the collator,
/// so that the fast comparison agrees with it in every language; where a language orders combinations of ASCII letters (as
/// "ch"), there is no fast comparison.
class Order {
 public:
  static const Order& current() {
    static const Order order;
    return order;
  }

  bool isFast(std::string_view name) const {
    if (!fast_) return false;
    std::size_t digits = 0;
    for (const char c : name) {
      if (static_cast<unsigned char>(c) >= 0x80) return false;
      digits = isDigit(static_cast<unsigned char>(c)) ? digits + 1 : 0;
      if (digits > LongestFastNumber) return false;
    }
    return true;
  }

  /// A key that memcmp() orders as the collator orders names by their base characters and numbers.
  void appendFastKey(std::string_view name, std::string& key) const {
    for (std::size_t i = 0; i < name.size();) {
      const auto c = static_cast<unsigned char>(name[i]);
      if (!isDigit(c)) {
        if (base_[c]) key.push_back(static_cast<char>(base_[c]));
        ++i;
        continue;
      }
      const std::size_t end = endOfNumber(name, i);
      while (i + 1 < end && name[i] == '0') ++i;
      key.push_back(static_cast<char>(base_['0']));
      key.push_back(static_cast<char>(end - i));
      key.append(name.substr(i, end - i));
      i = end;
    }
  }

  /// For two fast names with the same key: lower or upper case first, then the bytes.
  int compareVariants(std::string_view left, std::string_view right) const {
    std::size_t i = 0;
    std::size_t j = 0;
    while (true) {
      const int l = nextVariant(left, i);
      const int r = nextVariant(right, j);
      if (l != r) return l < r ? -1 : 1;
      if (l < 0) return left.compare(right);
    }
  }

  int compareFast(std::string_view left, std::string_view right) const {
    std::size_t i = 0;
    std::size_t j = 0;
    while (true) {
      while (i < left.size() && !base_[static_cast<unsigned char>(left[i])]) ++i;
      while (j < right.size() && !base_[static_cast<unsigned char>(right[j])]) ++j;
      if (i == left.size() || j == right.size()) break;
      const auto l = static_cast<unsigned char>(left[i]);
      const auto r = static_cast<unsigned char>(right[j]);
      if (isDigit(l) && isDigit(r)) {
        const std::size_t leftEnd = endOfNumber(left, i);
        const std::size_t rightEnd = endOfNumber(right, j);
        while (i + 1 < leftEnd && left[i] == '0') ++i;
        while (j + 1 < rightEnd && right[j] == '0') ++j;
        if (leftEnd - i != rightEnd - j) return leftEnd - i < rightEnd - j ? -1 : 1;
        if (const int order = left.substr(i, leftEnd - i).compare(right.substr(j, rightEnd - j))) return order;
        i = leftEnd;
        j = rightEnd;
        continue;
      }
      const int leftBase = isDigit(l) ? base_['0'] : base_[l];
      const int rightBase = isDigit(r) ? base_['0'] : base_[r];
      if (leftBase != rightBase) return leftBase - rightBase;
      ++i;
      ++j;
    }
    if (i < left.size() || j < right.size()) return i < left.size() ? 1 : -1;
    return compareVariants(left, right);
  }

  int compareByCollator(std::string_view left, std::string_view right) const {
    thread_local std::vector<UChar> leftText;
    thread_local std::vector<UChar> rightText;
    toUtf16(left, leftText);
    toUtf16(right, rightText);
    const UCollationResult result = ucol_strcoll(collator_, leftText.data(), static_cast<int32_t>(leftText.size()),
                                                 rightText.data(), static_cast<int32_t>(rightText.size()));
    return result == UCOL_EQUAL ? left.compare(right) : static_cast<int>(result);
  }

  void appendCollatorKey(std::string_view name, std::string& key) const {
    thread_local std::vector<UChar> text;
    toUtf16(name, text);
    std::array<uint8_t, 4096> bytes;
    const int32_t length = ucol_getSortKey(collator_, text.data(), static_cast<int32_t>(text.size()), bytes.data(),
                                           static_cast<int32_t>(bytes.size()));
    key.append(reinterpret_cast<const char*>(bytes.data()),
               std::min<std::size_t>(static_cast<std::size_t>(length), bytes.size()));
  }

 private:
  Order() {
    const char* language = std::setlocale(LC_COLLATE, nullptr);
    // The plain locales order by code, which nobody wants to read.
    const std::string_view name = language ? language : "";
    const bool plain = name.empty() || name == "C" || name == "POSIX" || name.starts_with("C.");
    UErrorCode status = U_ZERO_ERROR;
    collator_ = ucol_open(plain ? "" : language, &status);
    ucol_setAttribute(collator_, UCOL_NUMERIC_COLLATION, UCOL_ON, &status);
    ucol_setAttribute(collator_, UCOL_NORMALIZATION_MODE, UCOL_ON, &status);
    fast_ = U_SUCCESS(status) && !tailorsCombinations() && readTables();
  }

  bool tailorsCombinations() const {
    UErrorCode status = U_ZERO_ERROR;
    USet* tailored = ucol_getTailoredSet(collator_, &status);
    if (U_FAILURE(status)) return true;
    bool found = false;
    for (int32_t i = uset_getItemCount(tailored) - 1; i >= 0 && !found; --i) {
      UChar32 first = 0;
      UChar32 last = 0;
      std::array<UChar, 32> text;
      status = U_ZERO_ERROR;
      const int32_t length =
          uset_getItem(tailored, i, &first, &last, text.data(), static_cast<int32_t>(text.size()), &status);
      found = length > 1 &&
              std::all_of(text.begin(), text.begin() + std::min<int32_t>(length, 32), [](UChar c) { return c < 0x80; });
    }
    uset_close(tailored);
    return found;
  }

  bool readTables() {
    UErrorCode status = U_ZERO_ERROR;
    UCollator* bases = ucol_clone(collator_, &status);
    if (U_FAILURE(status)) return false;
    ucol_setStrength(bases, UCOL_PRIMARY);
    const auto compare = [](const UCollator* with, UChar left, UChar right) {
      return ucol_strcoll(with, &left, 1, &right, 1);
    };
    std::array<UChar, 128> characters;
    for (UChar c = 0; c < 128; ++c) characters[c] = c;
    std::stable_sort(characters.begin(), characters.end(),
                     [&](UChar l, UChar r) { return compare(bases, l, r) == UCOL_LESS; });
    int rank = 0;
    int variant = 0;
    bool twoCases = true;
    for (std::size_t i = 0; i < characters.size(); ++i) {
      const UChar c = characters[i];
      if (ucol_strcoll(bases, &c, 1, &c, 0) == UCOL_EQUAL) continue;  // ignored: stays 0
      const bool same = rank && compare(bases, characters[i - 1], c) == UCOL_EQUAL;
      if (!same) {
        ++rank;
        variant = 0;
      }
      base_[c] = static_cast<std::uint8_t>(rank);
      // Characters of one base stand in the order of their codes here, two of them at most: a letter's cases.
      variant_[c] = static_cast<std::uint8_t>(variant);
      if (same) {
        const UChar other = characters[i - 1];
        variant_[c] = compare(collator_, other, c) == UCOL_LESS ? 1 : 0;
        variant_[other] = 1 - variant_[c];
      }
      ++variant;
      twoCases = twoCases && variant <= 2;
    }
    ucol_close(bases);
    return twoCases && rank > 0;
  }

  static std::size_t endOfNumber(std::string_view name, std::size_t i) {
    while (i < name.size() && isDigit(static_cast<unsigned char>(name[i]))) ++i;
    return i;
  }

  /// The case of the next character that counts, -1 at the end. A number is one character.
  int nextVariant(std::string_view name, std::size_t& i) const {
    while (i < name.size() && !base_[static_cast<unsigned char>(name[i])]) ++i;
    if (i == name.size()) return -1;
    const auto c = static_cast<unsigned char>(name[i]);
    if (isDigit(c)) {
      i = endOfNumber(name, i);
      return 0;
    }
    ++i;
    return variant_[c];
  }

  static void toUtf16(std::string_view name, std::vector<UChar>& text) {
    text.resize(name.size() + 1);
    int32_t length = 0;
    UErrorCode status = U_ZERO_ERROR;
    u_strFromUTF8WithSub(text.data(), static_cast<int32_t>(text.size()), &length, name.data(),
                         static_cast<int32_t>(name.size()), 0xFFFD, nullptr, &status);
    text.resize(static_cast<std::size_t>(length));
  }

  UCollator* collator_ = nullptr;
  bool fast_ = false;
  std::array<std::uint8_t, 128> base_{};
  std::array<std::uint8_t, 128> variant_{};
};

/// Sorts `indices` (of names) by keys that memcmp() orders, equal keys by `tie`.
template <typename AppendKey, typename Tie>
void sortByKeys(std::vector<std::uint32_t>& indices, const std::vector<std::string_view>& names, AppendKey appendKey,
                Tie tie) {
  struct Key {
    std::uint64_t head;  // eight bytes behind what all keys share, so that most comparisons are one of integers
    std::uint32_t offset;
    std::uint32_t length;
    std::uint32_t index;
  };
  if (indices.size() < 2) return;
  std::string bytes;
  std::vector<Key> keys;
  keys.reserve(indices.size());
  for (const std::uint32_t index : indices) {
    const auto offset = static_cast<std::uint32_t>(bytes.size());
    appendKey(names[index], bytes);
    keys.push_back({0, offset, static_cast<std::uint32_t>(bytes.size()) - offset, index});
  }
  std::uint32_t shared = keys.front().length;
  for (const Key& key : keys) {
    shared = std::min(shared, key.length);
    std::uint32_t same = 0;
    while (same < shared && bytes[key.offset + same] == bytes[keys.front().offset + same]) ++same;
    shared = same;
  }
  for (Key& key : keys) {
    key.offset += shared;
    key.length -= shared;
    for (std::uint32_t i = 0; i < 8; ++i) {
      key.head = key.head << 8 | (i < key.length ? static_cast<std::uint8_t>(bytes[key.offset + i]) : 0U);
    }
  }
  std::sort(keys.begin(), keys.end(), [&](const Key& l, const Key& r) {
    if (l.head != r.head) return l.head < r.head;
    const int order = std::memcmp(bytes.data() + l.offset, bytes.data() + r.offset, std::min(l.length, r.length));
    if (order) return order < 0;
    if (l.length != r.length) return l.length < r.length;
    return tie(names[l.index], names[r.index]) < 0;
  });
  std::transform(keys.begin(), keys.end(), indices.begin(), [](const Key& key) { return key.index; });
}

}  // namespace

int compareNamesByCollator(std::string_view left, std::string_view right) {
  return Order::current().compareByCollator(left, right);
}

int compareNames(std::string_view left, std::string_view right) {
  const Order& order = Order::current();
  return order.isFast(left) && order.isFast(right) ? order.compareFast(left, right) : order.compareByCollator(left, right);
}

std::vector<std::uint32_t> sortedOrder(const std::vector<std::string_view>& names) {
  const Order& order = Order::current();
  std::vector<std::uint32_t> fast;
  std::vector<std::uint32_t> slow;
  fast.reserve(names.size());
  for (std::uint32_t i = 0; i < names.size(); ++i) (order.isFast(names[i]) ? fast : slow).push_back(i);
  sortByKeys(
      fast, names, [&](std::string_view name, std::string& key) { order.appendFastKey(name, key); },
      [&](std::string_view l, std::string_view r) { return order.compareVariants(l, r); });
  sortByKeys(
      slow, names, [&](std::string_view name, std::string& key) { order.appendCollatorKey(name, key); },
      [](std::string_view l, std::string_view r) { return l.compare(r); });

  std::vector<std::uint32_t> merged;
  merged.reserve(names.size());
  const auto before = [&](std::uint32_t l, std::uint32_t r) { return order.compareByCollator(names[l], names[r]) < 0; };
  if (slow.size() > fast.size() / 16) {
    std::merge(fast.begin(), fast.end(), slow.begin(), slow.end(), std::back_inserter(merged), before);
    return merged;
  }
  auto from = fast.cbegin();
  for (const std::uint32_t name : slow) {
    const auto place = std::lower_bound(from, fast.cend(), name, before);
    merged.insert(merged.end(), from, place);
    merged.push_back(name);
    from = place;
  }
  merged.insert(merged.end(), from, fast.cend());
  return merged;
}

}  // namespace vaelo
