// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/files/ini_preferences.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {

namespace {

class FilesPreferencesTest : public drive_test::DriveTest {
 protected:
  const std::string path = root + "/config/vaelo-drive/preferences.ini";
  std::vector<std::string> namesInFolder() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(path.substr(0, path.rfind('/')))) {
      names.push_back(entry.path().filename());
    }
    std::sort(names.begin(), names.end());
    return names;
  }
};

TEST_F(FilesPreferencesTest, WhatIsSetIsThereAfterARestart) {
  const Data bytes{0, 1, 255, 10, 61};
  const std::string odd = "odd = [key]\n#ü";
  {
    IniPreferences preferences(path, log);
    EXPECT_EQ(preferences.dataForKey("a"), std::nullopt);
    preferences.setDataForKey("com.marrow.Token", bytes);
    preferences.setDataForKey(odd, bytes);
    preferences.setDataForKey("empty", {});
    preferences.setDataForKey("gone", bytes);
    preferences.removeKey("gone");
    preferences.removeKey("never there");
  }
  IniPreferences preferences(path, log);
  EXPECT_EQ(preferences.dataForKey("com.marrow.Token"), bytes);
  EXPECT_EQ(preferences.dataForKey(odd), bytes);
  EXPECT_EQ(preferences.dataForKey("empty"), Data{});
  EXPECT_EQ(preferences.dataForKey("gone"), std::nullopt);
  EXPECT_EQ(namesInFolder(), std::vector<std::string>{"preferences.ini"});
}

TEST_F(FilesPreferencesTest, ADamagedFileIsEmptyAndKeptAside) {
  write(path, "no key file");
  IniPreferences(path, log).setDataForKey("a", {1});
  EXPECT_EQ(read(path + ".damaged-1"), "no key file");
  EXPECT_EQ(IniPreferences(path, log).dataForKey("a"), Data{1});
  write(path, "[Preferences\na=AQ==");
  EXPECT_EQ(IniPreferences(path, log).dataForKey("a"), std::nullopt);
  EXPECT_EQ(read(path + ".damaged-1"), "no key file");
  EXPECT_TRUE(exists(path + ".damaged-2"));
}

TEST_F(FilesPreferencesTest, ADamagedValueIsAbsent) {
  write(path, "[Preferences]\na=@@@@\nb=AQ=\nc=AQ==\n");
  IniPreferences preferences(path, log);
  EXPECT_EQ(preferences.dataForKey("a"), std::nullopt);
  EXPECT_EQ(preferences.dataForKey("b"), std::nullopt);
  EXPECT_EQ(preferences.dataForKey("c"), Data{1});
}

TEST_F(FilesPreferencesTest, AWriteThatFailsLeavesTheOldFileAndIsLogged) {
  IniPreferences(path, log).setDataForKey("a", {1});
  IniPreferences preferences(path, log);
  preferences.setDataForKey("a", Data(100000));
  EXPECT_EQ(log.count("Preferences can't be saved"), 1);
  EXPECT_EQ(preferences.dataForKey("a"), Data(100000));
  EXPECT_EQ(IniPreferences(path, log).dataForKey("a"), Data{1});
  write(root + "/file");
  IniPreferences(root + "/file/preferences.ini", log).setDataForKey("a", {1});
  EXPECT_EQ(log.count("Preferences can't be saved"), 2);
}

}  // namespace

}  // namespace vaelo
