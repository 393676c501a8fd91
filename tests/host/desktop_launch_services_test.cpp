// SPDX-License-Identifier: GPL-3.0-or-later
#include <gio/gio.h>

#include "host/desktop/gio_launch_services.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {

namespace {

/// The desktop's databases are looked for once in a process, so each case runs this program again with applications of its
/// own.
class DesktopLaunchServicesTest : public drive_test::DriveTest {
 protected:
  void application(const std::string& id, const std::string& exec, const std::string& types) {
    write(root + "/share/applications/" + id + ".desktop",
          "[Desktop Entry]\nType=Application\nName=" + id + "\nExec=" + exec + "\nMimeType=" + types + "\n");
  }
  /// Runs the disabled test of that name there.
  void runApart(const std::string& test) {
    char* arguments[] = {const_cast<char*>("/proc/self/exe"), nullptr, const_cast<char*>("--gtest_also_run_disabled_tests"),
                         nullptr};
    std::string filter = "--gtest_filter=DesktopLaunchServicesApart.DISABLED_" + test;
    arguments[1] = filter.data();
    char** environment = g_get_environ();
    environment = g_environ_setenv(environment, "XDG_DATA_HOME", (root + "/share").c_str(), TRUE);
    environment = g_environ_setenv(environment, "XDG_CONFIG_HOME", (root + "/config").c_str(), TRUE);
    environment = g_environ_setenv(environment, "HOME", root.c_str(), TRUE);
    char* output = nullptr;
    int status = -1;
    ASSERT_TRUE(g_spawn_sync(nullptr, arguments, environment, G_SPAWN_DEFAULT, nullptr, nullptr, &output, nullptr, &status,
                             nullptr));
    EXPECT_EQ(status, 0) << output;
    EXPECT_NE(std::string(output).find("[  PASSED  ] 1 test."), std::string::npos) << output;
    g_free(output);
    g_strfreev(environment);
  }
};

std::vector<std::string> identifiers(const DocumentRecord::Ranked& ranked, const std::string& rank) {
  std::vector<std::string> found;
  for (const auto& [name, applications] : ranked) {
    if (name != rank) continue;
    for (const ApplicationRecord& application : applications) found.push_back(application.bundleIdentifier);
  }
  return found;
}

TEST(DesktopLaunchServicesApart, DISABLED_OwnersComeFirst) {
  GioLaunchServices services;
  const auto record = services.documentRecord(URL("/nowhere/a.csv"), false);
  EXPECT_EQ(record->url(), URL("/nowhere/a.csv"));
  const auto ranked = record->applicationsAvailableForOpeningByHandlerRank();
  ASSERT_TRUE(ranked);
  const std::vector<std::string> owners = identifiers(*ranked.value, HandlerRankOwner);
  ASSERT_GE(owners.size(), 2u);
  EXPECT_EQ(owners[0], "org.example.Chosen");
  EXPECT_EQ(std::count(owners.begin(), owners.end(), "org.example.Chosen"), 1);
  EXPECT_NE(std::find(owners.begin(), owners.end(), "org.example.Table"), owners.end());
  const std::vector<std::string> others = identifiers(*ranked.value, "Alternate");
  EXPECT_NE(std::find(others.begin(), others.end(), "org.example.Text"), others.end());
  EXPECT_EQ(std::find(owners.begin(), owners.end(), "org.example.Text"), owners.end());
  EXPECT_EQ(std::find(owners.begin(), owners.end(), "org.example.Lines"), owners.end()) << "it needs a terminal";
  EXPECT_EQ(std::count(others.begin(), others.end(), "org.example.Lines"), 1);
}

TEST(DesktopLaunchServicesApart, DISABLED_RecordsSayWhatTheEntrySays) {
  GioLaunchServices services;
  const auto table = services.applicationRecord("org.example.Table");
  ASSERT_TRUE(table);
  EXPECT_EQ(table->localizedName, "org.example.Table");
  EXPECT_EQ(table->itemID, "org.example.Table.desktop");
  EXPECT_EQ(table->executableName, "true");
  EXPECT_TRUE(table->isInstalled);
  EXPECT_TRUE(table->supportsOpenInPlace);
  EXPECT_FALSE(services.applicationRecord("org.example.Alone")->supportsOpenInPlace);
  EXPECT_EQ(services.applicationRecord("org.example.Missing"), std::nullopt);
  EXPECT_EQ(services.applicationRecord("../org.example.Table"), std::nullopt);
  EXPECT_EQ(services.applicationRecord(""), std::nullopt);
}

TEST_F(DesktopLaunchServicesTest, OwnersComeFirst) {
  application("org.example.Table", "true %F", "text/csv;");
  application("org.example.Chosen", "true %U", "text/csv;");
  application("org.example.Text", "true %f", "text/plain;");
  // An editor for a terminal, which is on every desktop and would take each text from the preview.
  application("org.example.Lines", "true %F", "text/csv;\nTerminal=true");
  // What update-desktop-database makes of them.
  write(root + "/share/applications/mimeinfo.cache",
        "[MIME "
        "Cache]\ntext/csv=org.example.Lines.desktop;org.example.Table.desktop;org.example.Chosen.desktop;\ntext/"
        "plain=org.example.Text.desktop;\n");
  write(root + "/config/mimeapps.list", "[Default Applications]\ntext/csv=org.example.Chosen.desktop\n");
  runApart("OwnersComeFirst");
}

TEST_F(DesktopLaunchServicesTest, RecordsSayWhatTheEntrySays) {
  application("org.example.Table", "true %F", "text/csv;");
  application("org.example.Alone", "true", "text/csv;");
  runApart("RecordsSayWhatTheEntrySays");
}

TEST_F(DesktopLaunchServicesTest, ItsOwnName) {
  EXPECT_EQ(GioLaunchServices().ownBundleIdentifier(), "com.marrow.VaeloDrive");
}

}  // namespace

}  // namespace vaelo
