// SPDX-License-Identifier: GPL-3.0-or-later
#include <array>

#include "host/files/icu_formatting.h"
#include "host/support/texts.h"
#include "tests/host/language_fixture.h"

namespace vaelo {

namespace {

constexpr std::array<const char*, 6> Languages = {"en", "de", "fr", "ar", "ru", "ja"};
constexpr std::array<std::int64_t, 9> Counts = {0, 1, 2, 3, 5, 11, 21, 100, 101};

class LanguagePluralsTest : public language_test::LanguageTest {
 protected:
  static std::string counted(const char* language, const char* key, std::int64_t count) {
    speak(language);
    return IcuFormatting(language, language).localizedCount(key, count);
  }
};

TEST_F(LanguagePluralsTest, EachLanguageHasItsFormForEachCount) {
  const std::map<std::string, std::array<const char*, Counts.size()>> expected = {
      {"en", {"0 items", "1 item", "2 items", "3 items", "5 items", "11 items", "21 items", "100 items", "101 items"}},
      {"de",
       {"0 Objekte", "1 Objekt", "2 Objekte", "3 Objekte", "5 Objekte", "11 Objekte", "21 Objekte", "100 Objekte",
        "101 Objekte"}},
      {"fr",
       {"0 élément", "1 élément", "2 éléments", "3 éléments", "5 éléments", "11 éléments", "21 éléments", "100 éléments",
        "101 éléments"}},
      {"ar", {"لا عناصر", "عنصر واحد", "عنصران", "٣ عناصر", "٥ عناصر", "١١ عنصرًا", "٢١ عنصرًا", "١٠٠ عنصر", "١٠١ عنصر"}},
      {"ru",
       {"0 объектов", "1 объект", "2 объекта", "3 объекта", "5 объектов", "11 объектов", "21 объект", "100 объектов",
        "101 объект"}},
      {"ja",
       {"0 個のアイテム", "1 個のアイテム", "2 個のアイテム", "3 個のアイテム", "5 個のアイテム", "11 個のアイテム",
        "21 個のアイテム", "100 個のアイテム", "101 個のアイテム"}}};
  for (const char* language : Languages) {
    for (std::size_t i = 0; i < Counts.size(); ++i) {
      EXPECT_EQ(counted(language, ".DICT.ITEMS.%d", Counts[i]), expected.at(language)[i]) << language;
    }
  }
}

TEST_F(LanguagePluralsTest, EveryCountedKeyIsAWholePhraseInEveryLanguage) {
  for (const char* key : {".DICT.ITEMS.%d", ".DICT.ITEMS_SELECTED.%d", ".DICT.MOVE_ITEMS.%d", ".DICT.CANNOT_MOVE_ITEMS.%d",
                          ".DICT.CANNOT_DELETE_ITEMS.%d"}) {
    for (const char* language : Languages) {
      for (const std::int64_t count : Counts) {
        const std::string text = counted(language, key, count);
        const std::string number = counted(language, "%@", count);
        EXPECT_EQ(text.find_first_of("%@"), std::string::npos) << text;
        // Arabic says none, one and two in words.
        const bool inWords = language == std::string("ar") && count < 3;
        EXPECT_EQ(text.find(number) == std::string::npos, inWords) << language << ' ' << text;
        EXPECT_EQ(text == counted("en", key, count), language == std::string("en")) << text;
      }
    }
  }
}

TEST_F(LanguagePluralsTest, FreeSpaceAgreesWithItsNumberAlsoWithAFraction) {
  const auto available = [](const char* language, double number, const std::string& text) {
    speak(language);
    return IcuFormatting(language, language).localizedAmount(".DICT.AVAILABLE.%g", number, text);
  };
  EXPECT_EQ(available("en", 1.5, "1.5 GB"), "1.5 GB available");
  EXPECT_EQ(available("fr", 0, "0 octet"), "0 octet disponible");
  EXPECT_EQ(available("fr", 1, "1 Go"), "1 Go disponible");
  EXPECT_EQ(available("fr", 1.99, "1,99 Go"), "1,99 Go disponible") << "less than two";
  EXPECT_EQ(available("fr", 2, "2 Go"), "2 Go disponibles");
  EXPECT_EQ(available("fr", 5.25, "5,25 Go"), "5,25 Go disponibles");
  EXPECT_EQ(available("de", 5.25, "5,25 GB"), "5,25 GB verfügbar");
  EXPECT_EQ(available("ru", 5.25, "5,25 ГБ"), "доступно 5,25 ГБ");
  EXPECT_EQ(available("ar", 5.25, "س"), "المتاح: س");
  EXPECT_EQ(available("ja", 5.25, "5.25 GB"), "5.25 GB 利用可能");
}

TEST_F(LanguagePluralsTest, SizesHaveTheUnitsAndTheDecimalMarkOfTheLanguage) {
  const auto size = [](const char* language, std::uint64_t bytes) {
    speak(language);
    return IcuFormatting(language, language).byteCount(bytes, ByteCountStyle::File);
  };
  EXPECT_EQ(size("en", 1250000), "1.3 MB");
  EXPECT_EQ(size("de", 1250000), "1,3\u00a0MB");
  EXPECT_EQ(size("de", 1), "1 Byte");
  EXPECT_EQ(size("fr", 1250000), "1,3\u00a0Mo");
  EXPECT_EQ(size("fr", 1), "1 octet");
  EXPECT_EQ(size("fr", 2), "2 octets");
  EXPECT_EQ(size("ru", 1250000), "1,3\u00a0МБ");
  EXPECT_EQ(size("ru", 2), "2 байта");
  EXPECT_EQ(size("ru", 5), "5 байт");
  EXPECT_EQ(size("ja", 1250000), "1.3\u00a0MB");
  EXPECT_EQ(size("ar", 1250000), "١٫٣\u00a0م.بايت");
  EXPECT_EQ(size("ar", 2), "بايتان");
}

TEST_F(LanguagePluralsTest, TheHostsOwnPluralsAreFilled) {
  const auto excess = [](const char* language, unsigned long count) {
    speak(language);
    return filled(ngettext("Moved %s item", "Moved %s items", count), {std::to_string(count)});
  };
  EXPECT_EQ(excess("de", 1), "1 Objekt verschoben");
  EXPECT_EQ(excess("ru", 21), "Перемещён 21 объект");
  EXPECT_EQ(excess("ru", 102), "Перемещено 102 объекта");
  EXPECT_EQ(excess("ar", 2), "نُقل عنصران");
  EXPECT_EQ(excess("ja", 7), "7 個のアイテムを移動しました");
}

}  // namespace

}  // namespace vaelo
