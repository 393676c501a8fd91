// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <glib.h>
#include <gtest/gtest.h>

#include <clocale>
#include <map>
#include <optional>
#include <string>

#include "host/support/message_catalogue.h"

namespace vaelo::language_test {

/// Texts in the languages that a test chooses; afterwards everything is as it was.
class LanguageTest : public testing::Test {
 protected:
  LanguageTest() : locale_(std::setlocale(LC_ALL, nullptr)) {
    for (const char* name : {"LANGUAGE", "LC_ALL", "LC_MESSAGES", "LANG", "LC_NUMERIC"}) {
      const char* value = g_getenv(name);
      before_[name] = value ? std::optional<std::string>(value) : std::nullopt;
      g_unsetenv(name);
    }
  }
  ~LanguageTest() override {
    for (const auto& [name, value] : before_) {
      value ? g_setenv(name.c_str(), value->c_str(), TRUE) : (g_unsetenv(name.c_str()), TRUE);
    }
    std::setlocale(LC_ALL, locale_.c_str());
  }

  /// As the program starts with "LANGUAGE" and "LC_ALL"; empty ones are not set.
  static void speak(const std::string& languages, const std::string& locale = "C.UTF-8") {
    languages.empty() ? g_unsetenv("LANGUAGE") : (g_setenv("LANGUAGE", languages.c_str(), TRUE), void());
    locale.empty() ? g_unsetenv("LC_ALL") : (g_setenv("LC_ALL", locale.c_str(), TRUE), void());
    useMessageCatalogue();
  }

 private:
  std::string locale_;
  std::map<std::string, std::optional<std::string>> before_;
};

}  // namespace vaelo::language_test
