// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/url_list.h"

#include <gtest/gtest.h>

namespace vaelo {
namespace {

const URL a("/drive/a");
const URL b("/drive/b");
const URL c("/drive/c");

TEST(URLListTest, HasNothingAtFirst) {
  const URLList list;
  EXPECT_EQ(list.size(), 0u);
  EXPECT_EQ(list.indexOf(a), std::nullopt);
  EXPECT_TRUE(list.thoseOf({a}).empty());
}

TEST(URLListTest, GivesThoseWantedOnceInItsOwnOrder) {
  const URLList list{c, a, b};
  EXPECT_EQ(list.thoseOf({b, URL("/drive/other"), c, b}), (std::vector<URL>{c, b}));
  EXPECT_EQ(list.all(), (std::vector<URL>{c, a, b}));
  EXPECT_EQ(list.indexOf(a), 1u);
}

TEST(URLListTest, MakesItsURLsOnlyWhenAsked) {
  int made = 0;
  const URLList list(
      100000,
      [&made](std::size_t i) {
        ++made;
        return URL("/drive/" + std::to_string(i));
      },
      [](const URL& url) { return std::optional<std::size_t>(std::stoul(url.lastPathComponent())); });
  EXPECT_EQ(made, 0);
  EXPECT_EQ(list[7], URL("/drive/7"));
  EXPECT_EQ(list.thoseOf({URL("/drive/99"), URL("/drive/5")}), (std::vector<URL>{URL("/drive/5"), URL("/drive/99")}));
  EXPECT_EQ(made, 3);
}

}  // namespace
}  // namespace vaelo
