// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/value.h"

#include <gtest/gtest.h>

#include "platform/notifications.h"

namespace vaelo {
namespace {

TEST(ValueTest, numbersConvertAndOthersDoNot) {
  EXPECT_EQ(Value(std::int64_t{-1}).unsignedValue(), UINT64_MAX);
  EXPECT_EQ(Value(2.9).signedValue(), 2);
  EXPECT_EQ(Value(1e300).signedValue(), 0);
  EXPECT_FALSE(Value(true).isNumber());
  EXPECT_FALSE(Value("7").isNumber());
  EXPECT_EQ(Value("7").unsignedValue(), 0u);
  EXPECT_FALSE(Value().isPresent());
}

TEST(ValueTest, containersCompareByContent) {
  const Value a(Dictionary{{"list", Array{Value(std::uint64_t{1}), Value("x")}}});
  const Value b(Dictionary{{"list", Array{Value(std::uint64_t{1}), Value("x")}}});
  const Value c(Dictionary{{"list", Array{Value(std::uint64_t{2}), Value("x")}}});
  EXPECT_EQ(a, b);
  EXPECT_FALSE(a == c);
  EXPECT_EQ(a.description(), "{ list = (1, x); }");
}

TEST(NotificationCenterTest, tellsObserversInOrderUntilTheirTokenGoes) {
  NotificationCenter center;
  std::string heard;
  auto first = center.addObserver("n", [&](const Notification&) { heard += "1"; });
  auto second = center.addObserver("n", [&](const Notification&) { heard += "2"; });
  center.post({"n", {}});
  first.reset();
  center.post({"n", {}});
  center.post({"other", {}});
  EXPECT_EQ(heard, "122");
}

TEST(NotificationCenterTest, aHandlerMayEndALaterObservation) {
  NotificationCenter center;
  int heard = 0;
  NotificationCenter::Token second;
  auto first = center.addObserver("n", [&](const Notification&) { second.reset(); });
  second = center.addObserver("n", [&](const Notification&) { ++heard; });
  center.post({"n", {}});
  EXPECT_EQ(heard, 0);
}

}  // namespace
}  // namespace vaelo
