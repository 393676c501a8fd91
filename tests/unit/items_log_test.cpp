// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/vlo_log.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

using LogTest = ItemsTest;

TEST_F(LogTest, aLineHasLevelFunctionSourceLineAndMessage) {
  VLO_WARNING("Evict error: %@", "full");
  EXPECT_EQ(world.recordedLog.lines().back(),
            "(VLO)[WARNING] TestBody (" + std::to_string(__LINE__ - 2) + ") Evict error: full");
}

TEST_F(LogTest, aLineFromALambdaNamesTheFunctionAroundIt) {
  const auto nested = [](int number) { [number] { VLO_INFO("%d", number); }(); };
  nested(7);
  EXPECT_EQ(world.recordedLog.lines().back(), "(VLO)[INFO] TestBody (" + std::to_string(__LINE__ - 2) + ") 7");
  EXPECT_EQ(functionInLog("operator()", "vaelo::{anonymous}::Service::ask(int)::<lambda(bool)>"), "ask");
  EXPECT_EQ(functionInLog("tell", "void vaelo::tell(int)"), "tell");
}

TEST_F(LogTest, levelsGoToTheTypesOfThePlatformsLog) {
  VLO_ERROR("e");
  VLO_WARNING("w");
  VLO_INFO("i");
  VLO_DEBUG("d");
  EXPECT_EQ(messages(), (std::vector<std::string>{"ERROR e", "WARNING w", "INFO i", "DEBUG d"}));
  EXPECT_EQ(world.recordedLog.types(), (std::vector{LogType::Error, LogType::Default, LogType::Default, LogType::Debug}));
}

TEST_F(LogTest, debugLinesThatNobodyReadsAreNotMade) {
  world.recordedLog.debugIsWanted = false;
  int made = 0;
  const auto text = [&] {
    ++made;
    return std::string("long");
  };
  VLO_DEBUG("%@", text());
  VLO_INFO("%@", text());
  EXPECT_EQ(made, 1);
  EXPECT_EQ(messages(), std::vector<std::string>{"INFO long"});
}

TEST_F(LogTest, conversionsOfEachKind) {
  EXPECT_EQ(logFormatted("%@|%{public}@|%d|%i|%u|%s|%%", {"a", "b", -3, 4, 5u, "s"}), "a|b|-3|4|5|s|%");
  EXPECT_EQ(logFormatted("%lu and %llu", {6ul, 7ull}), "6 and 7");
  EXPECT_EQ(logFormatted("%lf seconds", {2.5}), "2.500000 seconds");
  EXPECT_EQ(logFormatted("%2$@ before %1$@", {"b", "a"}), "a before b");
  EXPECT_EQ(logFormatted("100%", {}), "100%");
}

TEST_F(LogTest, argumentsAreNotReadAsFormats) { EXPECT_EQ(logFormatted("%@ %@", {"%@", "x"}), "%@ x"); }

TEST_F(LogTest, whatIsAbsentIsNull) {
  EXPECT_EQ(logFormatted("%@ %@ %@ %@", {std::optional<URL>(), std::optional<Error>(), Value(), "end"}),
            "(null) (null) (null) end");
  EXPECT_EQ(logFormatted("%@", {}), "(null)");
}

TEST_F(LogTest, urlsErrorsFlagsAndLists) {
  EXPECT_EQ(logFormatted("%@ %@", {URL("/a b"), true}), "file:///a%20b 1");
  EXPECT_EQ(logFormatted("%@", {std::vector<URL>{URL("/a"), URL("/b")}}), "(file:///a, file:///b)");
  EXPECT_EQ(logFormatted("%@", {Error{"Dom", 4, {}, "gone", {}}}), "Error Domain=Dom Code=4 \"gone\"");
}

TEST_F(LogTest, aUserActionIsTracedAndLogged) {
  VLO_USER_ACTION("Pressed Move");
  EXPECT_EQ(world.userActions, std::vector<std::string>{"Pressed Move"});
  EXPECT_EQ(world.recordedLog.lines().back(),
            "(VLO)[INFO] TestBody (" + std::to_string(__LINE__ - 3) + ") ================= Pressed Move");
}

}  // namespace
}  // namespace vaelo
