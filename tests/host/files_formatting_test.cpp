// SPDX-License-Identifier: GPL-3.0-or-later
#include <glib.h>
#include <gtest/gtest.h>

#include "host/files/icu_character_classes.h"
#include "host/files/icu_formatting.h"

namespace vaelo {

namespace {

class FilesFormattingTest : public testing::Test {
 protected:
  IcuFormatting formatting{"en_US", "en_US"};
  IcuFormatting german{"de_DE", "de_DE"};
};

TEST_F(FilesFormattingTest, ByteCounts) {
  struct Case {
    std::uint64_t bytes;
    const char* file;
    const char* binary;
  };
  for (const Case& row :
       {Case{0, "0 bytes", "0 bytes"}, Case{1, "1 byte", "1 byte"}, Case{999, "999 bytes", "999 bytes"},
        Case{1000, "1 KB", "1,000 bytes"}, Case{1024, "1 KB", "1 KB"}, Case{1499, "1 KB", "1 KB"},
        Case{999499, "999 KB", "976 KB"}, Case{999500, "1 MB", "976 KB"}, Case{1250000, "1.3 MB", "1.2 MB"},
        Case{999950000, "1 GB", "953.6 MB"}, Case{5368709120, "5.37 GB", "5 GB"}, Case{1234567890123, "1.23 TB", "1.12 TB"},
        Case{UINT64_MAX, "18.45 EB", "16 EB"}}) {
    EXPECT_EQ(formatting.byteCount(row.bytes, ByteCountStyle::File), row.file);
    EXPECT_EQ(formatting.byteCount(row.bytes, ByteCountStyle::Binary), row.binary);
  }
  EXPECT_EQ(german.byteCount(1250000, ByteCountStyle::File), "1,3 MB");
}

TEST_F(FilesFormattingTest, TheNumberAloneIsReadBackWhateverTheLanguage) {
  EXPECT_EQ(german.byteCount(5637144576, ByteCountStyle::Binary, false), "5.25");
  EXPECT_EQ(formatting.byteCount(0, ByteCountStyle::Binary, false), "0");
  EXPECT_EQ(formatting.byteCount(1023, ByteCountStyle::Binary, false), "1023");
}

TEST_F(FilesFormattingTest, DatesAreInTheUsersLanguage) {
  g_setenv("TZ", "UTC", TRUE);
  const Date date(std::chrono::seconds(1234567890));
  EXPECT_EQ(formatting.localizedDate(date, DateStyle::Long, DateStyle::None), "February 13, 2009");
  EXPECT_EQ(formatting.localizedDate(date, DateStyle::Medium, DateStyle::None), "Feb 13, 2009");
  EXPECT_EQ(formatting.localizedDate(date, DateStyle::Short, DateStyle::None), "2/13/09");
  EXPECT_EQ(german.localizedDate(date, DateStyle::Long, DateStyle::None), "13. Februar 2009");
  EXPECT_NE(formatting.localizedDate(date, DateStyle::Long, DateStyle::Short).find("February 13, 2009 at"),
            std::string::npos);
  EXPECT_EQ(formatting.localizedDate(date, DateStyle::None, DateStyle::None), "");
  const Date landing(std::chrono::seconds(-14'212'800));
  const Date distant(std::chrono::seconds(5'685'422'400));
  EXPECT_EQ(formatting.localizedDate(landing, DateStyle::Long, DateStyle::None), "July 20, 1969");
  EXPECT_EQ(formatting.localizedDate(distant, DateStyle::Long, DateStyle::None), "March 1, 2150");
  EXPECT_EQ(formatting.localizedDate(Date::max(), DateStyle::Medium, DateStyle::None), "Apr 11, 2262");
  EXPECT_EQ(formatting.localizedDate(Date::min(), DateStyle::Medium, DateStyle::None), "Sep 21, 1677");
}

TEST_F(FilesFormattingTest, CountsAreWordsWithThePluralForm) {
  EXPECT_EQ(formatting.localizedCount(".DICT.ITEMS.%d", 0), "0 items");
  EXPECT_EQ(formatting.localizedCount(".DICT.ITEMS.%d", 1), "1 item");
  EXPECT_EQ(formatting.localizedCount(".DICT.ITEMS.%d", 5000), "5,000 items");
  EXPECT_EQ(formatting.localizedCount(".DICT.MOVE_ITEMS.%d", 1), "Move 1 Item");
  EXPECT_EQ(formatting.localizedCount(".DICT.CANNOT_DELETE_ITEMS.%d", 2), "2 items can’t be deleted.");
  EXPECT_EQ(german.localizedCount(".DICT.ITEMS.%d", 5000), "5.000 items");
}

TEST_F(FilesFormattingTest, TheFreeSpaceIsSaidOnceEitherWay) {
  EXPECT_EQ(formatting.localizedAmount(".DICT.AVAILABLE.%g", 5.25, "5.25 GB"), "5.25 GB available");
  EXPECT_EQ(formatting.filled(formatting.localizedString(".DICT.AVAILABLE.%g"), {"5.25", "5.25 GB"}), "5.25 GB available");
}

TEST_F(FilesFormattingTest, KeysAreTheirOwnEnglishText) {
  EXPECT_EQ(formatting.localizedString("Select Items"), "Select Items");
  EXPECT_EQ(formatting.localizedString(""), "");
}

TEST_F(FilesFormattingTest, Filling) {
  EXPECT_EQ(formatting.filled("%@ and %@", {"a", "b"}), "a and b");
  EXPECT_EQ(formatting.filled("%2$@, %1$@", {"a", "b"}), "b, a");
  EXPECT_EQ(formatting.filled("“%@” 100%", {"%@"}), "“%@” 100%");
  EXPECT_EQ(formatting.filled("%@%3$@%", {}), "%");
}

TEST(FilesCharacterClassesTest, IllegalIsWhatNoNameCanHold) {
  IcuCharacterClasses classes;
  for (const char* legal : {"", "Report 1.pdf", "ü", "\xf0\x9f\x90\xa6", "\u05d0\u200f", "tab\t"}) {
    EXPECT_FALSE(classes.containsIllegalCharacter(legal)) << legal;
  }
  for (const char* illegal :
       {"\xff", "a\xc3", "\xed\xa0\x80", "\xc0\xaf", "\xef\xbf\xbe", "\xef\xbf\xbf", "\xf4\x90\x80\x80", "\xcd\xb8"}) {
    EXPECT_TRUE(classes.containsIllegalCharacter(illegal)) << illegal;
  }
}

TEST(FilesCharacterClassesTest, ControlsNewlinesAndBlanks) {
  IcuCharacterClasses classes;
  EXPECT_TRUE(classes.containsControlCharacter("a\tb"));
  EXPECT_TRUE(classes.containsControlCharacter("a\x7f"));
  EXPECT_TRUE(classes.containsControlCharacter(std::string("a\0b", 3)));
  EXPECT_FALSE(classes.containsControlCharacter("a b\u200d"));
  for (const char* newline : {"\n", "\r", "\u0085", "\u2028", "\u2029"}) EXPECT_TRUE(classes.containsNewline(newline));
  EXPECT_FALSE(classes.containsNewline("a b\t"));
  EXPECT_EQ(classes.trimmingWhitespaceAndNewlines(" \t\n\u00a0\u3000 a b \u2028\n"), "a b");
  EXPECT_EQ(classes.trimmingWhitespaceAndNewlines(" \n "), "");
  EXPECT_EQ(classes.trimmingWhitespaceAndNewlines(""), "");
  EXPECT_EQ(classes.trimmingWhitespaceAndNewlines(" \xff "), "\xff");
}

TEST(FilesCharacterClassesTest, EqualityIsThatOfTheLanguage) {
  IcuCharacterClasses classes;
  EXPECT_TRUE(classes.localizedCaseInsensitiveEquals("alias", "ALIAS"));
  EXPECT_TRUE(classes.localizedCaseInsensitiveEquals("\u00fc", "u\u0308"));
  EXPECT_FALSE(classes.localizedCaseInsensitiveEquals("a", "\u00e4"));
  EXPECT_FALSE(classes.localizedCaseInsensitiveEquals("alias", "alia"));
}

}  // namespace

}  // namespace vaelo
