// SPDX-License-Identifier: GPL-3.0-or-later
#include <chrono>

#include "tests/contract/contract_test.h"

namespace vaelo::contract {
namespace {

/// Types, numbers, dates, characters: what people read.
class WordsContract : public ContractTest {
 protected:
  Formatting& formatting() { return platform->formatting(); }
  TypeIdentifiers& types() { return platform->types(); }
  CharacterClasses& characters() { return platform->characters(); }
};

VAELO_CONTRACT_SUITE(WordsContract);

TEST_P(WordsContract, ByteCounts) {
  struct Case {
    std::uint64_t bytes;
    ByteCountStyle style;
    const char* text;
    const char* number;
  };
  constexpr auto File = ByteCountStyle::File;
  constexpr auto Binary = ByteCountStyle::Binary;
  for (const Case& row :
       {Case{0, File, "0 bytes", "0"}, Case{1, File, "1 byte", "1"}, Case{999, File, "999 bytes", "999"},
        Case{1000, File, "1 KB", "1"}, Case{1499, File, "1 KB", "1"}, Case{1500, File, "2 KB", "2"},
        Case{999'499, File, "999 KB", "999"}, Case{999'500, File, "1 MB", "1"}, Case{1'250'000, File, "1.3 MB", "1.3"},
        Case{1'234'000'000, File, "1.23 GB", "1.23"}, Case{5'000'000'000'000, File, "5 TB", "5"},
        Case{1023, Binary, "1,023 bytes", "1023"}, Case{1024, Binary, "1 KB", "1"}, Case{1536, Binary, "2 KB", "2"},
        Case{1'048'576, Binary, "1 MB", "1"}, Case{1'610'612'736, Binary, "1.5 GB", "1.5"},
        Case{UINT64_MAX, Binary, "16 EB", "16"}}) {
    EXPECT_EQ(formatting().byteCount(row.bytes, row.style), row.text) << row.bytes;
    EXPECT_EQ(formatting().byteCount(row.bytes, row.style, false), row.number) << row.bytes;
  }
}

TEST_P(WordsContract, DatesHaveTextsOfTheirOwn) {
  const Date date{std::chrono::hours(24 * 365 * 30)};
  const auto text = [&](DateStyle day, DateStyle time) { return formatting().localizedDate(date, day, time); };
  EXPECT_EQ(text(DateStyle::None, DateStyle::None), "");
  EXPECT_NE(text(DateStyle::Long, DateStyle::None), "");
  EXPECT_NE(text(DateStyle::Long, DateStyle::None), text(DateStyle::Short, DateStyle::None));
  EXPECT_NE(text(DateStyle::Medium, DateStyle::Short), text(DateStyle::Medium, DateStyle::None));
  EXPECT_EQ(text(DateStyle::Long, DateStyle::Short), text(DateStyle::Long, DateStyle::Short));
  EXPECT_NE(text(DateStyle::Long, DateStyle::Short),
            formatting().localizedDate(date + std::chrono::hours(48), DateStyle::Long, DateStyle::Short));
}

TEST_P(WordsContract, AKeyWithoutTranslationIsItsOwnText) {
  for (const char* key : {"No such text", "", "%@ and %1$@"}) EXPECT_EQ(formatting().localizedString(key), key);
}

TEST_P(WordsContract, CountsAndAmountsAreInTheirTexts) {
  EXPECT_NE(formatting().localizedCount(".DICT.ITEMS.%d", 7).find('7'), std::string::npos);
  EXPECT_NE(formatting().localizedCount(".DICT.ITEMS.%d", 1), formatting().localizedCount(".DICT.ITEMS.%d", 2));
  EXPECT_NE(formatting().localizedAmount(".DICT.AVAILABLE.%g", 3.5, "3.5 GB").find("3.5 GB"), std::string::npos);
}

TEST_P(WordsContract, FormatsAreFilledInTheirOrderOrByNumber) {
  const auto filled = [&](const std::string& format) { return formatting().filled(format, {"A", "B"}); };
  EXPECT_EQ(filled("%@ then %@"), "A then B");
  EXPECT_EQ(filled("%2$@ before %1$@"), "B before A");
  EXPECT_EQ(filled("%1$@%1$@"), "AA");
  EXPECT_EQ(filled("%@ %@ %@!"), "A B !");
  EXPECT_EQ(filled("%3$@!"), "!");
  EXPECT_EQ(filled("100% %d %"), "100% %d %");
  EXPECT_EQ(filled(""), "");
  EXPECT_EQ(formatting().filled("%@ %@", {"%@", "x"}), "%@ x") << "arguments are not formats";
}

// Types.

TEST_P(WordsContract, WellKnownExtensionsHaveWellKnownTypes) {
  for (const auto& [extension, type] :
       {std::pair{"png", "public.png"}, std::pair{"JPG", "public.jpeg"}, std::pair{"Pdf", "com.adobe.pdf"},
        std::pair{"txt", "public.plain-text"}, std::pair{"mp3", "public.mp3"}, std::pair{"bundle", "com.marrow.package"}}) {
    EXPECT_EQ(types().preferredIdentifierForExtension(extension), type);
  }
  EXPECT_FALSE(types().preferredIdentifierForExtension(""));
}

TEST_P(WordsContract, OtherExtensionsHaveTypesOfTheirOwn) {
  const auto type = types().preferredIdentifierForExtension("nosuchext");
  ASSERT_TRUE(type);
  EXPECT_EQ(types().preferredIdentifierForExtension("NoSuchExt"), type);
  EXPECT_NE(types().preferredIdentifierForExtension("nosuchext2"), type);
  EXPECT_TRUE(types().conformsTo(*type, *type));
  EXPECT_TRUE(types().conformsTo(*type, "public.data"));
  EXPECT_FALSE(types().conformsTo(*type, "public.image"));
}

TEST_P(WordsContract, TypesAreOfAllKindsAboveThem) {
  for (const auto& [type, kind] :
       {std::pair{"public.png", "public.image"}, std::pair{"public.png", "public.data"},
        std::pair{"public.png", "public.item"}, std::pair{"public.jpeg", "public.content"},
        std::pair{"public.mp3", "public.audio"}, std::pair{"public.mp3", "public.audiovisual-content"},
        std::pair{"public.plain-text", "public.text"}, std::pair{"com.adobe.pdf", "public.data"},
        std::pair{"public.folder", "public.directory"}, std::pair{"com.marrow.rtfd", "com.marrow.package"},
        std::pair{"no.such.type", "no.such.type"}}) {
    EXPECT_TRUE(types().conformsTo(type, kind)) << type << " " << kind;
  }
  for (const auto& [type, kind] : {std::pair{"public.image", "public.png"}, std::pair{"public.png", "public.jpeg"},
                                   std::pair{"public.folder", "public.data"},
                                   std::pair{"com.marrow.package", "public.folder"}, std::pair{"public.mp3", "public.movie"},
                                   std::pair{"no.such.type", "public.data"}, std::pair{"public.png", "no.such.type"}}) {
    EXPECT_FALSE(types().conformsTo(type, kind)) << type << " " << kind;
  }
}

TEST_P(WordsContract, FoldersAreDescribedAndUnknownTypesAreNot) {
  const auto folder = types().description("public.folder");
  ASSERT_TRUE(folder);
  EXPECT_FALSE(folder->empty());
  EXPECT_FALSE(types().description("no.such.type"));
  EXPECT_FALSE(types().description(""));
}

// Characters.

TEST_P(WordsContract, WhatIsNotTextIsIllegal) {
  for (const char* text : {"", "plain", "ünï", "日本", "😀", "a\tb", "100%", "e\xCC\x81", "\xE2\x80\x8F"}) {
    EXPECT_FALSE(characters().containsIllegalCharacter(text)) << text;
  }
  for (const char* text : {"\xff", "a\xC3", "\xED\xA0\x80", "\xC0\xAF", "\xEF\xBF\xBF"}) {
    EXPECT_TRUE(characters().containsIllegalCharacter(text)) << text;
  }
}

TEST_P(WordsContract, ControlCharacters) {
  for (const std::string& text : {std::string("\t"), std::string("a\x01"), std::string("\x7f"), std::string("a\0b", 3),
                                  std::string("\xC2\x80"), std::string("\n")}) {
    EXPECT_TRUE(characters().containsControlCharacter(text));
  }
  for (const char* text : {"", "a b", "ü", "\xC2\xA0", "\xE2\x80\x8F"}) {
    EXPECT_FALSE(characters().containsControlCharacter(text)) << text;
  }
}

TEST_P(WordsContract, Newlines) {
  for (const char* text : {"a\nb", "\r", "\v", "\f", "\xC2\x85", "\xE2\x80\xA8", "\xE2\x80\xA9"}) {
    EXPECT_TRUE(characters().containsNewline(text));
  }
  for (const char* text : {"", "a b\t", "\xC2\xA0"}) EXPECT_FALSE(characters().containsNewline(text));
}

TEST_P(WordsContract, BlanksAreTrimmedAtBothEndsAlone) {
  for (const auto& [text, trimmed] :
       {std::pair{"  a b \n", "a b"},
        std::pair{"\xE3\x80\x80"
                  "a\xC2\xA0",
                  "a"},
        std::pair{" \t\r\n", ""}, std::pair{"", ""}, std::pair{"a", "a"}, std::pair{"\xE2\x80\xA8x", "x"}}) {
    EXPECT_EQ(characters().trimmingWhitespaceAndNewlines(text), trimmed);
  }
}

TEST_P(WordsContract, CaseDoesNotCount) {
  for (const auto& [a, b] : {std::pair{"Report.TXT", "report.txt"}, std::pair{"ÄRGER", "ärger"}, std::pair{"", ""}}) {
    EXPECT_TRUE(characters().localizedCaseInsensitiveEquals(a, b)) << a;
  }
  for (const auto& [a, b] : {std::pair{"a", "b"}, std::pair{"a", "a "}, std::pair{"a", "ä"}, std::pair{"a", "aa"}}) {
    EXPECT_FALSE(characters().localizedCaseInsensitiveEquals(a, b)) << a;
  }
}

}  // namespace
}  // namespace vaelo::contract
