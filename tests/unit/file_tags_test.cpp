// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/file_tags.h"

#include <gmock/gmock.h>

#include <cmath>
#include <cstdlib>

#include "items/color_additions.h"
#include "tests/support/memory_image.h"
#include "tests/support/memory_platform.h"

namespace vaelo {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class FileTagsTest : public ::testing::Test {
 protected:
  void store(std::uint64_t version, Array tags) {
    memory.syncedStore.values["RoverTagDict"] =
        Value(Dictionary{{"RoverTagDictVersion", Value(version)}, {"RoverTags", Value(std::move(tags))}});
    FileTags::_tagColorsDidChange();
  }
  static Value tag(const char* name, std::uint64_t label) {
    return Value(Dictionary{{"n", Value(name)}, {"l", Value(label)}});
  }
  MemoryPlatform memory;
};

TEST_F(FileTagsTest, TheEightColoursOfTheLabels) {
  const auto& colors = FileTags::_tagBlipColors();
  EXPECT_THAT(colors, ElementsAre(Color{0.8, 0.8, 0.8, 1}, Color::systemGray(), Color::systemGreen(), Color::systemPurple(),
                                  Color::systemBlue(), Color::systemYellow(), Color::systemRed(), Color::systemOrange()));
}

TEST_F(FileTagsTest, NamesComeInOrderWithTheirColours) {
  store(2, {tag("Work", 6), tag("Home", 2)});
  EXPECT_THAT(FileTags::allTags(), ElementsAre("Work", "Home"));
  EXPECT_EQ(FileTags::tagColorsByTag().at("Work"), Color::systemRed());
  EXPECT_EQ(FileTags::tagColorsByTag().at("Home"), Color::systemGreen());
}

TEST_F(FileTagsTest, OtherVersionsAreIgnoredWhole) {
  FileTags::allTags();  // the first use in a process reads, and tells, by itself
  memory.log.clear();
  for (const std::uint64_t version : {std::uint64_t{1}, std::uint64_t{3}}) {
    store(2, {tag("Work", 6)});
    store(version, {tag("Home", 2)});
    EXPECT_THAT(FileTags::allTags(), IsEmpty());
    EXPECT_THAT(FileTags::tagColorsByTag(), IsEmpty());
    EXPECT_TRUE(memory.log.has("DEBUG",
                               "Rover tag dictionary has incorrect version (" + std::to_string(version) + ", should be 2)"));
  }
  EXPECT_EQ(memory.log.count("WARNING", "Rover tag dictionary is empty"), 2u);
}

TEST_F(FileTagsTest, AMissingOrWrongDictionaryIsEmpty) {
  FileTags::allTags();  // the first use in a process reads, and tells, by itself
  memory.log.clear();
  memory.syncedStore.values.clear();
  FileTags::_tagColorsDidChange();
  EXPECT_TRUE(memory.log.has("WARNING", "Rover tag dictionary is empty"));
  memory.syncedStore.values["RoverTagDict"] = Value("text");
  FileTags::_tagColorsDidChange();
  EXPECT_EQ(memory.log.count("WARNING", "Rover tag dictionary is empty"), 2u);
  EXPECT_THAT(FileTags::allTags(), IsEmpty());
  memory.syncedStore.values["RoverTagDict"] = Value(Dictionary{});
  FileTags::_tagColorsDidChange();
  EXPECT_TRUE(memory.log.has("DEBUG", "Rover tag dictionary has incorrect version (0, should be 2)"));
  EXPECT_EQ(memory.log.count("WARNING", "Rover tag dictionary is empty"), 3u);
}

TEST_F(FileTagsTest, LabelsBeyondTheTableAreGreyAndNamesMayRepeat) {
  store(2, {tag("Odd", 9), tag("Twice", 6), tag("Twice", 2)});
  EXPECT_EQ(FileTags::tagColorsByTag().at("Odd"), FileTags::_tagBlipColors()[0]);
  EXPECT_THAT(FileTags::allTags(), ElementsAre("Odd", "Twice", "Twice"));
  EXPECT_EQ(FileTags::tagColorsByTag().at("Twice"), Color::systemGreen());
}

TEST_F(FileTagsTest, TheTableEndsAtSeven) {
  store(2, {tag("Seven", 7), tag("Eight", 8), tag("Most", ~std::uint64_t{0})});
  EXPECT_EQ(FileTags::tagColorsByTag().at("Seven"), Color::systemOrange());
  EXPECT_EQ(FileTags::tagColorsByTag().at("Eight"), FileTags::_tagBlipColors()[0]);
  EXPECT_EQ(FileTags::tagColorsByTag().at("Most"), FileTags::_tagBlipColors()[0]);
}

TEST_F(FileTagsTest, ALabelThatIsNoNumberOfTheTableIsNoColour) {
  const auto named = [](const char* name, Value label) { return Value(Dictionary{{"n", name}, {"l", std::move(label)}}); };
  store(2, {Value(Dictionary{{"n", "Without"}}), named("Negative", Value(std::int64_t{-1})), named("Text", Value("6")),
            named("List", Value(Array{})), named("Signed", Value(std::int64_t{6})), named("Real", Value(6.9))});
  const auto colors = FileTags::tagColorsByTag();
  for (const char* name : {"Without", "Negative", "Text", "List"}) {
    EXPECT_EQ(colors.at(name), FileTags::_tagBlipColors()[0]) << name;
  }
  EXPECT_EQ(colors.at("Signed"), Color::systemRed());
  EXPECT_EQ(colors.at("Real"), Color::systemRed());
}

TEST_F(FileTagsTest, ListsOfOtherKindsHoldNoTags) {
  for (const Value& list :
       {Value("Work"), Value(std::uint64_t{2}), Value(Dictionary{{"n", "Work"}}), Value(Array{}), Value()}) {
    store(2, {tag("Before", 6)});
    memory.syncedStore.values["RoverTagDict"] =
        Value(Dictionary{{"RoverTagDictVersion", Value(std::uint64_t{2})}, {"RoverTags", list}});
    memory.log.clear();
    FileTags::_tagColorsDidChange();
    EXPECT_THAT(FileTags::allTags(), IsEmpty()) << "none is left from before";
    EXPECT_THAT(FileTags::tagColorsByTag(), IsEmpty());
    EXPECT_FALSE(memory.log.has("WARNING", "Rover tag dictionary is empty")) << "it holds its version";
  }
}

TEST_F(FileTagsTest, VersionsOfOtherKindsAreReadAsNumbers) {
  const auto accepts = [this](Value version) {
    memory.syncedStore.values["RoverTagDict"] =
        Value(Dictionary{{"RoverTagDictVersion", std::move(version)}, {"RoverTags", Value(Array{tag("Work", 6)})}});
    FileTags::_tagColorsDidChange();
    return !FileTags::allTags().empty();
  };
  EXPECT_TRUE(accepts(Value(std::int64_t{2})));
  EXPECT_TRUE(accepts(Value(2.0)));
  memory.log.clear();
  EXPECT_FALSE(accepts(Value("2")));
  EXPECT_TRUE(memory.log.has("DEBUG", "Rover tag dictionary has incorrect version (0, should be 2)"));
  EXPECT_FALSE(accepts(Value(std::int64_t{-2})));
  EXPECT_TRUE(memory.log.has("DEBUG", "Rover tag dictionary has incorrect version (18446744073709551614, should be 2)"));
}

TEST_F(FileTagsTest, TenThousandTagsAndNamesOfControlCharactersAreKept) {
  Array tags;
  for (int i = 0; i < 10'000; ++i) {
    tags.push_back(tag(("Tag " + std::to_string(i)).c_str(), static_cast<std::uint64_t>(i % 8)));
  }
  const std::string odd("a\nb\0\x1b[31m\x7f", 10);
  tags.push_back(Value(Dictionary{{"n", Value(odd)}, {"l", Value(std::uint64_t{4})}}));
  store(2, std::move(tags));
  const std::vector<std::string> names = FileTags::allTags();
  ASSERT_EQ(names.size(), 10'001u);
  EXPECT_EQ(names[9'999], "Tag 9999");
  EXPECT_EQ(names[10'000], odd);
  const auto colors = FileTags::tagColorsByTag();
  EXPECT_EQ(colors.at("Tag 9999"), Color::systemOrange()) << "9999 is 7 more than 1249 times 8";
  EXPECT_EQ(colors.at(odd), Color::systemBlue());
}

TEST_F(FileTagsTest, WhatIsNoNamedTagIsPassedOver) {
  store(2, {Value("text"), Value(Dictionary{{"l", Value(std::uint64_t{2})}}), tag("Work", 6)});
  EXPECT_THAT(FileTags::allTags(), ElementsAre("Work"));
}

TEST_F(FileTagsTest, FollowsTheStoreFromTheFirstUse) {
  // The first use happens once in a process: this test gets one of its own.
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  EXPECT_EXIT(
      {
        memory.syncedStore.values["RoverTagDict"] =
            Value(Dictionary{{"RoverTagDictVersion", Value(std::uint64_t{2})}, {"RoverTags", Value(Array{tag("Work", 6)})}});
        const bool first = FileTags::allTags() == std::vector<std::string>{"Work"};
        memory.syncedStore.values["RoverTagDict"] =
            Value(Dictionary{{"RoverTagDictVersion", Value(std::uint64_t{2})}, {"RoverTags", Value(Array{tag("Home", 1)})}});
        memory.notifications.post({SyncedStoreDidChangeExternallyNotification, {}});
        const bool second = FileTags::allTags() == std::vector<std::string>{"Home"};
        std::_Exit(first && second ? 0 : 1);
      },
      ::testing::ExitedWithCode(0), "");
}

TEST_F(FileTagsTest, ABlipIsADotWithALighterRim) {
  store(2, {tag("Work", 4)});
  EXPECT_EQ(FileTags::blipWithTagImageSizeBlipHeightOffset("", {12, 16}, 10, {0, 3}), nullptr);
  const ImageRef blip = FileTags::blipWithTagImageSizeBlipHeightOffset("Work", {12, 16}, 10, {0, 3});
  ASSERT_NE(blip, nullptr);
  EXPECT_EQ(blip->width(), 12);
  EXPECT_EQ(blip->height(), 16);
  // Blue is 0.21, 0.52, 0.89; the circle of 10 points stands 1 point in from its place.
  EXPECT_THAT(std::dynamic_pointer_cast<const MemoryImage>(blip)->origin(),
              ElementsAre("fillColor 0.21 0.52 0.89 1", "fillEllipse 1 4 8 8", "lineWidth 1",
                          "strokeColor 0.605 0.76 0.945 1", "strokeEllipse 1 4 8 8"));
  const ImageRef blank = FileTags::blipWithTagImageSizeBlipHeightOffset("unknown", {12, 16}, 10, {0, 3});
  ASSERT_NE(blank, nullptr);
  EXPECT_EQ(blank->width(), 12);
  EXPECT_THAT(std::dynamic_pointer_cast<const MemoryImage>(blank)->origin(), IsEmpty());
}

class ColorBlendTest : public ::testing::Test {
 protected:
  static Color blend(const Color& d, const Color& s, const char* filter) {
    return vlo_colorBlendedWithColorCompositingFilter(d, s, std::string(filter));
  }
  static void expectNear(const Color& color, double red, double green, double blue, double alpha) {
    EXPECT_NEAR(color.red, red, 1e-12);
    EXPECT_NEAR(color.green, green, 1e-12);
    EXPECT_NEAR(color.blue, blue, 1e-12);
    EXPECT_NEAR(color.alpha, alpha, 1e-12);
  }
  // Backdrop and source of the numbers below, which are worked out by hand.
  const Color d{0.2, 0.5, 0.8, 0.5};
  const Color s{0.5, 0.25, 1, 0.5};
};

TEST_F(ColorBlendTest, NoColourATransparentOneAndAnUnknownModeChangeNothing) {
  EXPECT_EQ(vlo_colorBlendedWithColor(d, std::nullopt), d);
  EXPECT_EQ(blend(d, s.withAlpha(0), CompositingFilter::Multiply), d);
  EXPECT_EQ(blend(d, s.withAlpha(1e-8), CompositingFilter::Screen), d);
  EXPECT_EQ(blend(d, s, "exclusion"), d);
}

// Epsilon is 1.19e-7.
TEST_F(ColorBlendTest, AnAlphaIsNothingUpToEpsilonOnEitherSide) {
  for (const char* mode : {CompositingFilter::SourceOver, CompositingFilter::Multiply}) {
    EXPECT_EQ(blend(d, s.withAlpha(1.1e-7), mode), d);
    EXPECT_EQ(blend(d, s.withAlpha(-1.1e-7), mode), d);
    EXPECT_FALSE(blend(d, s.withAlpha(1.3e-7), mode) == d);
    EXPECT_FALSE(blend(d, s.withAlpha(-0.5), mode) == d);
  }
  // 0.5 + 0.5 * (1e-7 - 1) = 5e-8
  expectNear(blend(d.withAlpha(1e-7 - 1), s, CompositingFilter::SourceOver), 1, 1, 1, 5e-8);
}

TEST_F(ColorBlendTest, AllButSourceOverKeepTheBackdropsAlpha) {
  for (const char* mode : {CompositingFilter::Multiply, CompositingFilter::Screen, CompositingFilter::Overlay,
                           CompositingFilter::Darken, CompositingFilter::Lighten, CompositingFilter::ColorDodge,
                           CompositingFilter::ColorBurn, CompositingFilter::PlusLighter, CompositingFilter::PlusDarker}) {
    EXPECT_EQ(blend(d.withAlpha(0.25), s, mode).alpha, 0.25) << mode;
  }
}

TEST_F(ColorBlendTest, SourceOver) {
  // alpha 0.5 + 0.5 * 0.5 = 0.75; red (0.25 + 0.05) / 0.75, green (0.125 + 0.125) / 0.75, blue (0.5 + 0.2) / 0.75
  expectNear(vlo_colorBlendedWithColor(d, s), 0.4, 1.0 / 3, 0.7 / 0.75, 0.75);
  EXPECT_EQ(blend(d, s, CompositingFilter::Normal), vlo_colorBlendedWithColor(d, s));
  EXPECT_EQ(vlo_colorBlendedWithColorCompositingFilter(d, s, std::nullopt), vlo_colorBlendedWithColor(d, s));
  EXPECT_EQ(vlo_colorBlendedWithColor(d, Color{1, 0, 0, 1}), (Color{1, 0, 0, 1}));
  const Color faint = vlo_colorBlendedWithColor(d.withAlpha(-1), s.withAlpha(0.5));
  expectNear(faint, 1, 1, 1, 0);
}

TEST_F(ColorBlendTest, MultiplyAndScreen) {
  // 0.5 * s * d + 0.5 * d
  expectNear(blend(d, s, CompositingFilter::Multiply), 0.15, 0.3125, 0.8, 0.5);
  // 0.5 * d + 0.5 * (1 - (1 - s)(1 - d))
  expectNear(blend(d, s, CompositingFilter::Screen), 0.4, 0.5625, 0.9, 0.5);
}

TEST_F(ColorBlendTest, OverlayDarkenLighten) {
  // f: 2 * 0.5 * 0.2 = 0.2; d is 0.5: 1 - 2 * 0.75 * 0.5 = 0.25; 1 - 2 * 0 * 0.2 = 1
  expectNear(blend(d, s, CompositingFilter::Overlay), 0.2, 0.375, 0.9, 0.5);
  expectNear(blend(d, s, CompositingFilter::Darken), 0.2, 0.375, 0.8, 0.5);
  expectNear(blend(d, s, CompositingFilter::Lighten), 0.35, 0.5, 0.9, 0.5);
}

// d decides: 2 * 0.8 * 0.2; 1 - 2 * 0.7 * 0.4; 2 * 0.4 * 0.3
TEST_F(ColorBlendTest, OverlayIsDecidedByTheBackdrop) {
  expectNear(blend({0.2, 0.6, 0.3, 1}, {0.8, 0.3, 0.4, 1}, CompositingFilter::Overlay), 0.32, 0.44, 0.24, 1);
}

TEST_F(ColorBlendTest, DodgeAndBurnHaveTheirGuardsAndNoClamps) {
  // 0.9 / (1 - 0.5); 0.9 / (1 - 2); s of 1e-8 is none
  const Color bright = blend({0.9, 0.9, 0.9, 1}, {0.5, 2, 1e-8, 1}, CompositingFilter::ColorDodge);
  expectNear(bright, 1.8, -0.9, 1, 1);
  // dodge: 0.2 / 0.5 = 0.4, 0.5 / 0.75, 0.8 / 0 = infinity (the guard looks at s)
  const Color dodged = blend(d, s, CompositingFilter::ColorDodge);
  EXPECT_NEAR(dodged.red, 0.3, 1e-12);
  EXPECT_NEAR(dodged.green, 0.5 * (0.5 / 0.75) + 0.25, 1e-12);
  EXPECT_TRUE(std::isinf(dodged.blue));
  EXPECT_NEAR(blend(d, Color{0, 0, 0, 0.5}, CompositingFilter::ColorDodge).red, 0.6, 1e-12) << "f is 1";
  // burn: 1 - (1 - d * 0.5) / s: -0.8, -2, 0.4; out 0.5 * f + 0.25 * d
  expectNear(blend(d, s, CompositingFilter::ColorBurn), -0.35, -0.875, 0.4, 0.5);
  EXPECT_NEAR(blend(d, Color{0, 0, 0, 0.5}, CompositingFilter::ColorBurn).red, 0.05, 1e-12) << "f is 0";
}

TEST_F(ColorBlendTest, PlusLighterAndPlusDarker) {
  // min(s + d, 1): 0.7, 0.75, 1
  expectNear(blend(d, s, CompositingFilter::PlusLighter), 0.45, 0.625, 0.9, 0.5);
  // t = 1; u = (0.5 - 0.5 s) + (0.5 - d): 0.25 + 0.3, 0.375 + 0, 0 - 0.3 -> 0; out 1 - u / 0.5 clamped
  expectNear(blend(d, s, CompositingFilter::PlusDarker), 0, 0.25, 1, 0.5);
  expectNear(blend(d.withAlpha(0), s, CompositingFilter::PlusDarker), 0, 0, 0, 0);
}

TEST_F(ColorBlendTest, PlusDarkerClampsAtEachStep) {
  // t: 1 + 1 is 1; u = 0.2 + 0.3, 0.9 + 0.8 is 1, 0 + 0; out = t - u
  expectNear(blend({0.7, 0.2, 1, 1}, {0.8, 0.1, 1, 1}, CompositingFilter::PlusDarker), 0.5, 0, 1, 1);
  // t = 0.7; u = 0 + 0.4 - 0.8 is 0
  expectNear(blend({0.8, 0.8, 0.8, 0.4}, {1, 1, 1, 0.3}, CompositingFilter::PlusDarker), 0.7, 0.7, 0.7, 0.4);
  // A = 2: t is 1; u = (1 - 0.1) + (2 - 1.2) = 1.7 is 1; 1 - 1 / 2
  expectNear(blend({1.2, 1.2, 1.2, 2}, {0.1, 0.1, 0.1, 1}, CompositingFilter::PlusDarker), 0.5, 0.5, 0.5, 2);
  // An alpha below epsilon is none: t - 0 / A would be 0.5.
  expectNear(blend({0.8, 0.8, 0.8, 1e-8}, {1, 1, 1, 0.5}, CompositingFilter::PlusDarker), 0, 0, 0, 1e-8);
  // t = 0, which ends it: 0 - 0.5 / -0.5 would be 1.
  expectNear(blend({-1, -1, -1, -0.5}, {1, 1, 1, 0.5}, CompositingFilter::PlusDarker), 0, 0, 0, -0.5);
}

// With s of -0.5 and -1e-8: 0.3 / 1.5; within epsilon of none, 1. Burn: 1 - (1 - 0.3) / -0.5; 0.
TEST_F(ColorBlendTest, DodgeAndBurnTakeTheSizeOfTheSource) {
  const Color dodged = blend({0.3, 0.3, 0.3, 1}, {-0.5, -1e-8, 0.5, 1}, CompositingFilter::ColorDodge);
  expectNear(dodged, 0.2, 1, 0.6, 1);
  const Color burnt = blend({0.3, 0.3, 0.3, 1}, {-0.5, -1e-8, 0.5, 1}, CompositingFilter::ColorBurn);
  expectNear(burnt, 2.4, 0, -0.4, 1);
}

// Each formula by hand for d and s of (2, 3), (-1, 0.5) and (-1, -1), both opaque.
TEST_F(ColorBlendTest, NothingIsClamped) {
  const Color beyond{2, -1, -1, 1};
  const Color over{3, 0.5, -1, 1};
  expectNear(blend(beyond, over, CompositingFilter::SourceOver), 3, 0.5, -1, 1);
  expectNear(blend(beyond, over, CompositingFilter::Multiply), 6, -0.5, 1, 1);
  // 1 - -2 * -1; 1 - 0.5 * 2; 1 - 2 * 2
  expectNear(blend(beyond, over, CompositingFilter::Screen), -1, 0, -3, 1);
  // 1 - 2 * -2 * -1; 2 * 0.5 * -1; 2 * -1 * -1
  expectNear(blend(beyond, over, CompositingFilter::Overlay), -3, -1, 2, 1);
  expectNear(blend(beyond, over, CompositingFilter::Darken), 2, -1, -1, 1);
  expectNear(blend(beyond, over, CompositingFilter::Lighten), 3, 0.5, -1, 1);
  // min(5, 1); -0.5; -2
  expectNear(blend(beyond, over, CompositingFilter::PlusLighter), 1, -0.5, -2, 1);
}

}  // namespace
}  // namespace vaelo
