// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/url_list.h"

#include <gtest/gtest.h>

namespace vaelo {
namespace {

const URL itemA("/drive/a");
const URL itemB("/drive/b");
const URL itemC("/drive/c");

TEST(URLListTest, HasNothingAtFirst) {
  const URLList list;
  EXPECT_EQ(list.size(), 0u);
  EXPECT_EQ(list.indexOf(itemA), std::nullopt);
  EXPECT_TRUE(list.thoseOf({itemA}).empty());
}

TEST(URLListTest, GivesThoseWantedOnceInItsOwnOrder) {
  const URLList list{itemC, itemA, itemB};
  EXPECT_EQ(list.thoseOf({itemB, URL("/drive/other"), itemC, itemB}), (std::vector<URL>{itemC, itemB}));
  EXPECT_EQ(list.all(), (std::vector<URL>{itemC, itemA, itemB}));
  EXPECT_EQ(list.indexOf(itemA), 1u);
}

TEST(URLListTest, GuessesThatThoseWantedStandInItsOrder) {
  std::vector<std::size_t> guesses;
  const URLList list(
      10, [](std::size_t i) { return URL("/drive/" + std::to_string(i)); },
      [&guesses](const URL& url, std::size_t guess) -> std::optional<std::size_t> {
        guesses.push_back(guess);
        if (url == itemA) return std::nullopt;
        return std::stoul(url.lastPathComponent());
      });
  EXPECT_EQ(list.placesOf({list[0], list[1], itemA, list[5], list[6]}), (std::vector<std::size_t>{0, 1, 5, 6}));
  EXPECT_EQ(guesses, (std::vector<std::size_t>{0, 1, 2, 2, 6}));
  EXPECT_EQ(list.placesOf({list[5], list[1], list[5]}), (std::vector<std::size_t>{1, 5}));
}

TEST(URLListTest, KnowsOfItsItemsWhatItIsTold) {
  const auto at = [](std::size_t) { return itemA; };
  const auto indexOf = [](const URL&, std::size_t) { return std::optional<std::size_t>(0); };
  EXPECT_EQ(URLList({itemA}).hint(0), ItemHint::Unknown);
  EXPECT_EQ(URLList(1, at, indexOf).hint(0), ItemHint::Unknown);
  EXPECT_EQ(URLList(1, at, indexOf, [](std::size_t) { return ItemHint::Folder; }).hint(0), ItemHint::Folder);
}

TEST(URLListTest, MakesItsURLsOnlyWhenAsked) {
  int made = 0;
  const URLList list(
      100000,
      [&made](std::size_t i) {
        ++made;
        return URL("/drive/" + std::to_string(i));
      },
      [](const URL& url, std::size_t) { return std::optional<std::size_t>(std::stoul(url.lastPathComponent())); });
  EXPECT_EQ(made, 0);
  EXPECT_EQ(list[7], URL("/drive/7"));
  EXPECT_EQ(list.thoseOf({URL("/drive/99"), URL("/drive/5")}), (std::vector<URL>{URL("/drive/5"), URL("/drive/99")}));
  EXPECT_EQ(made, 3);
}

}  // namespace
}  // namespace vaelo
