// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <string>

#include "host/gtk/list/name_order.h"

namespace vaelo {
namespace {

int sign(int order) { return (order > 0) - (order < 0); }

std::vector<std::string> sortedNames(const std::vector<std::string>& names) {
  const std::vector<std::string_view> views(names.begin(), names.end());
  std::vector<std::string> result;
  for (const std::uint32_t i : sortedOrder(views)) result.push_back(names[i]);
  return result;
}

/// Names like those that people give, and such as nobody would, out of few characters so that many are nearly the same.
std::vector<std::string> randomNames(std::size_t count, const std::vector<std::string>& pieces, unsigned seed) {
  std::mt19937 random(seed);
  std::vector<std::string> names;
  for (std::size_t i = 0; i < count; ++i) {
    std::string name;
    for (unsigned length = random() % 9; length > 0; --length) name += pieces[random() % pieces.size()];
    names.push_back(name);
  }
  return names;
}

TEST(NameOrder, CountsAsPeopleDo) {
  const std::vector<std::string> order = {"_x",     "-a",     "(copy)",  "0",        "1",
                                          "file 1", "file 2", "file 10", "file 10b", "file 1000000000000000000001",
                                          "file a", "File b", "zebra"};
  std::vector<std::string> shuffled = order;
  std::shuffle(shuffled.begin(), shuffled.end(), std::mt19937(3));
  EXPECT_EQ(sortedNames(shuffled), order);
}

TEST(NameOrder, TwinsAreTwoNames) {
  EXPECT_LT(compareNames("readme", "README"), 0);
  EXPECT_NE(compareNames("\u00e9", "e\u0301"), 0);
  EXPECT_EQ(sign(compareNames("\u00e9", "e\u0301")), -sign(compareNames("e\u0301", "\u00e9")));
  EXPECT_NE(compareNames("file 1", "file 01"), 0);
  EXPECT_NE(compareNames("bad\xff", "bad\xfe"), 0);
  EXPECT_EQ(compareNames("same", "same"), 0);
}

TEST(NameOrder, FastComparisonAgreesWithCollator) {
  std::vector<std::string> pieces = {"a", "A", "b", "B", "0", "1", "9", "00", " ", "_", "-", ".", "~", "file "};
  for (char c = 1; c < 127; ++c) pieces.emplace_back(1, c);
  const std::vector<std::string> names = randomNames(700, pieces, 11);
  for (const std::string& left : names) {
    for (const std::string& right : names) {
      ASSERT_EQ(sign(compareNames(left, right)), sign(compareNamesByCollator(left, right))) << left << " | " << right;
    }
  }
}

TEST(NameOrder, SortingAgreesWithComparing) {
  for (const unsigned foreign : {0U, 1U, 20U}) {
    std::vector<std::string> pieces = {"a", "A", "b", "0", "1", "10", "007", " ", "_", ".txt", "file ", "\x01"};
    const std::vector<std::string> letters = {"\u00e9", "e\u0301", "\u4e2d", "\u0645", "\U0001f389", "\xff"};
    for (unsigned i = 0; i < foreign; ++i) pieces.push_back(letters[i % letters.size()]);
    // One foreign name among many ASCII ones takes another way than many of them.
    std::vector<std::string> names = randomNames(4000, pieces, foreign);
    if (foreign == 1) names.resize(300);
    const std::vector<std::string> sorted = sortedNames(names);
    ASSERT_EQ(sorted.size(), names.size());
    for (std::size_t i = 1; i < sorted.size(); ++i) {
      ASSERT_LE(compareNamesByCollator(sorted[i - 1], sorted[i]), 0) << sorted[i - 1] << " | " << sorted[i];
    }
  }
}

TEST(NameOrder, LongNumbersAreCompared) {
  const std::string digits(255, '7');
  EXPECT_EQ(sign(compareNames(digits, digits.substr(1))), sign(compareNamesByCollator(digits, digits.substr(1))));
  EXPECT_EQ(compareNames(digits, digits), 0);
}

}  // namespace
}  // namespace vaelo
