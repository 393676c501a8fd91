// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/user_locale.h"
#include "host/support/texts.h"
#include "tests/host/language_fixture.h"

namespace vaelo {

namespace {

class LanguageChoiceTest : public language_test::LanguageTest {};

TEST_F(LanguageChoiceTest, TheFirstLanguageThatHasATranslationIsSpoken) {
  struct Case {
    const char* languages;
    const char* locale;
    const char* spoken;
    const char* cancel;
  };
  for (const Case& row : {Case{"de", "C.UTF-8", "de", "Abbrechen"}, Case{"de_AT", "C.UTF-8", "de", "Abbrechen"},
                          Case{"fr", "C.UTF-8", "fr", "Annuler"}, Case{"ar", "C.UTF-8", "ar", "ألغِ"},
                          Case{"ru", "C.UTF-8", "ru", "Отмена"}, Case{"ja", "C.UTF-8", "ja", "キャンセル"},
                          // Without a catalogue of its own gettext would pass over English.
                          Case{"en_GB:en:de", "C.UTF-8", "en", "Cancel"}, Case{"he:fr", "C.UTF-8", "fr", "Annuler"},
                          Case{"he", "C.UTF-8", "en", "Cancel"}, Case{"", "C.UTF-8", "en", "Cancel"},
                          // Who asks for the plain C locale gets it.
                          Case{"de", "C", "en", "Cancel"}}) {
    speak(row.languages, row.locale);
    EXPECT_EQ(messageLocale(), row.spoken) << row.languages;
    EXPECT_STREQ(_("Cancel"), row.cancel) << row.languages;
  }
}

TEST_F(LanguageChoiceTest, ALocaleThatIsNotInstalledIsSpokenAllTheSame) {
  for (const char* locale : {"de_DE.UTF-8", "de_CH.UTF-8@euro"}) {
    speak("", locale);
    EXPECT_EQ(messageLocale(), "de") << locale;
    EXPECT_STREQ(_("Cancel"), "Abbrechen") << locale;
    EXPECT_NE(std::string(std::setlocale(LC_CTYPE, nullptr)), "C") << "names are bytes then";
  }
  speak("fr", "de_DE.UTF-8");
  EXPECT_EQ(messageLocale(), "fr") << "the list of languages goes first";
}

TEST_F(LanguageChoiceTest, ArabicIsReadFromTheRight) {
  speak("ar");
  EXPECT_TRUE(messagesAreRightToLeft());
  for (const char* others : {"de", "fr", "ja", "ru", "en", "", "he", "he:de"}) {
    speak(others);
    EXPECT_FALSE(messagesAreRightToLeft()) << others;
  }
}

TEST_F(LanguageChoiceTest, NumbersFollowTheLanguageWhereTheLocaleSaysNothing) {
  const auto numbers = [](const char* languages, const char* locale) {
    speak(languages, locale);
    return userLocale("LC_NUMERIC");
  };
  EXPECT_EQ(numbers("de:en", "C.UTF-8"), "de");
  EXPECT_EQ(numbers("", "C.UTF-8"), "en_US");
  EXPECT_EQ(numbers("C", "C.UTF-8"), "en_US");
  EXPECT_EQ(numbers("de", "C"), "en_US");
  EXPECT_EQ(numbers("de", ""), "en_US");
  EXPECT_EQ(numbers("ja", "fr_FR.UTF-8"), "fr_FR.UTF-8");
}

TEST(TextsTest, AFormatIsFilledWithWhatThereIs) {
  EXPECT_EQ(filled("%s and %s", {"a", "b"}), "a and b");
  EXPECT_EQ(filled("%2$s, %1$s", {"a", "b"}), "b, a");
  EXPECT_EQ(filled("“%s” 100%%", {"%s %%"}), "“%s %%” 100%");
  EXPECT_EQ(filled("%s%3$s%", {}), "%");
  EXPECT_EQ(filled("%n %x", {"a"}), "%n %x");
}

TEST(TextsTest, TextsAreJoinedAndEmptyOnesAreNoKeys) {
  EXPECT_EQ(listedText("a", "b"), "a, b");
  EXPECT_EQ(sentences("A.", "B."), "A. B.");
  EXPECT_EQ(translated(""), "");
  EXPECT_EQ(translated("no text of ours"), "no text of ours");
  EXPECT_EQ(numberText(1234567), "1,234,567");
}

}  // namespace

}  // namespace vaelo
