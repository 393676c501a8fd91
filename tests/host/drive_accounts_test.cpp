// SPDX-License-Identifier: GPL-3.0-or-later
#include <sys/wait.h>

#include "host/drive/local_accounts.h"
#include "tests/host/drive_service_fixture.h"

namespace vaelo::drive_test {

namespace {

class AccountFileTest : public DriveTest {
 protected:
  Result<AccountRecord> account(const std::string& text) {
    write(data + "/account.ini", "[Account]\nToken=t\n" + text);
    return readAccountFile(data + "/account.ini", log);
  }
};

TEST_F(AccountFileTest, SaysWhoIsSignedIn) {
  const auto read = account("Name=Ada\nSignedIn=true\nAllowance=1000\n");
  ASSERT_TRUE(read);
  EXPECT_EQ(read.value->name, "Ada");
  EXPECT_EQ(read.value->token, "t");
  EXPECT_TRUE(read.value->signedIn);
  EXPECT_EQ(read.value->allowance, 1000);
  EXPECT_EQ(read.value->mirror, "mirror");
  EXPECT_EQ(read.value->upgrade, std::nullopt);
}

TEST_F(AccountFileTest, AnAbsentFileIsNoDamage) {
  const auto read = readAccountFile(data + "/account.ini", log);
  EXPECT_EQ(read.error->code, FileErrorCode::ReadNoSuchFile);
}

TEST_F(AccountFileTest, AllowancesThatAreNoneAreLeftOutAndToldOf) {
  for (const char* text : {"-1", "", "9223372036854775808", "18446744073709551616", "1e9", "12 GB", "0x10", "nan"}) {
    EXPECT_EQ(account(std::string("Allowance=") + text + "\n").value->allowance, std::nullopt) << text;
  }
  EXPECT_EQ(log.count("no allowance in bytes"), 8);
  EXPECT_EQ(account("Allowance=9223372036854775807\n").value->allowance, INT64_MAX);
  EXPECT_EQ(account("Allowance=0\n").value->allowance, 0);
}

TEST_F(AccountFileTest, AProviderNamesItsPageAndThresholds) {
  const auto terms =
      account("UpgradePage=https://example.org/more?a=1\nUpgradeBelow=5;12.5;\nUpgradeAsksFirst=true\n").value;
  ASSERT_TRUE(terms->upgrade);
  EXPECT_EQ(terms->upgrade->page, "https://example.org/more?a=1");
  EXPECT_EQ(terms->upgrade->below, (std::vector<double>{12.5, 5}));
  EXPECT_TRUE(terms->upgrade->asksFirst);
  const auto usual = account("UpgradePage=http://example.org\n").value->upgrade;
  ASSERT_TRUE(usual);
  EXPECT_EQ(usual->below, (std::vector<double>{20, 10, 5}));
  EXPECT_FALSE(usual->asksFirst);
}

TEST_F(AccountFileTest, OnlyPagesOfTheWebAreOpened) {
  for (const char* page : {"", "example.org", "file:///etc/passwd", "javascript:alert(1)", "https:", "https:///path",
                           "vaelodriveapp:///x", "https://exa\\nmple.org"}) {
    EXPECT_EQ(account(std::string("UpgradePage=") + page + "\n").value->upgrade, std::nullopt) << page;
  }
  EXPECT_EQ(log.count("no address of the web"), 8);
}

TEST_F(AccountFileTest, ThresholdsThatAreNonePassedOver) {
  const auto some = account("UpgradePage=https://example.org\nUpgradeBelow=abc;0;-4;101;nan;7;7;100\n").value->upgrade;
  ASSERT_TRUE(some);
  EXPECT_EQ(some->below, (std::vector<double>{100, 7}));
  EXPECT_EQ(log.count("no threshold"), 5);
  EXPECT_EQ(account("UpgradePage=https://example.org\nUpgradeBelow=abc\n").value->upgrade, std::nullopt);
}

TEST_F(AccountFileTest, NamesAreFitToBeShown) {
  EXPECT_EQ(account("Name=A\\tb\\nc\xff\n").value->name, "A b c\xef\xbf\xbd");
}

TEST_F(AccountFileTest, DocumentsAreInAPlaceForThem) {
  for (const char* place :
       {"", "..", "../mirror", "/home", "accounts", "accounts/", "accounts/..", "accounts/a/b", "other"}) {
    EXPECT_TRUE(account(std::string("Mirror=") + place + "\n").error) << place;
  }
  EXPECT_EQ(account("Mirror=accounts/0a-B\n").value->mirror, "accounts/0a-B");
}

TEST(StorageFiguresTest, FileSystemsThatExaggerateHaveTheMostThereCanBe) {
  EXPECT_EQ(storageFigures(10, 100, 4096), (StorageFigures{40960, 409600}));
  EXPECT_EQ(storageFigures(UINT64_MAX, UINT64_MAX, 4096), (StorageFigures{INT64_MAX, INT64_MAX}));
  EXPECT_EQ(storageFigures(std::uint64_t{1} << 63, std::uint64_t{1} << 63, 1), (StorageFigures{INT64_MAX, INT64_MAX}));
}

TEST(StorageFiguresTest, TheFreeShareIsBetweenNothingAndAll) {
  EXPECT_DOUBLE_EQ((StorageFigures{25, 200}).freePercent(), 12.5);
  EXPECT_DOUBLE_EQ((StorageFigures{0, 0}).freePercent(), 0);
  EXPECT_DOUBLE_EQ((StorageFigures{300, 200}).freePercent(), 100);
}

class LocalAccountsTest : public DriveServiceTest {
 protected:
  LocalAccountsTest() {
    start();
    observation = notifications.addObserver(IdentityDidChangeNotification, [this](const Notification&) { ++changes; });
  }
  LocalAccounts accounts() { return {service->layout(), log}; }
  /// "name" for each, the current one with a star, in brackets when it is signed out.
  std::string known() {
    std::string text;
    for (const LocalAccounts::Known& each : accounts().all()) {
      const std::string name = each.record.name == g_get_real_name() ? "first" : each.record.name;
      text += (text.empty() ? "" : " ") + (each.isCurrent && !each.record.signedIn ? "(" + name + ")" : name);
      if (each.isCurrent) text += "*";
    }
    return text;
  }
  std::string tokenOf(const std::string& name) {
    for (const LocalAccounts::Known& each : accounts().all()) {
      if (each.record.name == name) return each.record.token;
    }
    return "";
  }
  bool waitForChanges(int count) {
    return waitFor([this, count] { return changes >= count; });
  }

  int changes = 0;
  NotificationCenter::Token observation;
};

TEST_F(LocalAccountsTest, SigningOutAndInKeepsTheDocuments) {
  const auto token = service->ubiquityIdentityToken();
  write(drive + "/mine.txt");
  ASSERT_FALSE(accounts().signOut());
  ASSERT_TRUE(waitForChanges(1));
  EXPECT_FALSE(service->ubiquityIdentityToken());
  EXPECT_EQ(service->defaultContainerURL(), std::nullopt);
  EXPECT_EQ(known(), "(first)*");
  ASSERT_FALSE(accounts().signIn(token->opaque));
  ASSERT_TRUE(waitForChanges(2));
  EXPECT_EQ(service->ubiquityIdentityToken(), token);
  EXPECT_TRUE(exists(drive + "/mine.txt"));
}

TEST_F(LocalAccountsTest, EachAccountHasDocumentsOfItsOwn) {
  const std::string first = service->ubiquityIdentityToken()->opaque;
  write(drive + "/mine.txt");
  ASSERT_FALSE(accounts().add("Ada"));
  ASSERT_TRUE(waitForChanges(1));
  EXPECT_EQ(known(), "Ada* first");
  const URL other = *service->defaultContainerURL();
  EXPECT_NE(other, URL(drive));
  EXPECT_TRUE(service->URLIsInDriveMirror(other));
  EXPECT_FALSE(service->URLIsInDriveMirror(URL(drive + "/mine.txt")));
  EXPECT_TRUE(exists(other.path() + "/Welcome to Vaelo Drive.md"));
  EXPECT_FALSE(exists(other.path() + "/mine.txt"));
  EXPECT_EQ(service->allContainers().size(), 1u);
  ASSERT_FALSE(accounts().signIn(first));
  ASSERT_TRUE(waitForChanges(2));
  EXPECT_EQ(service->defaultContainerURL(), URL(drive));
  EXPECT_EQ(known(), "Ada first*");
  // And back, which a start of the program finds again.
  ASSERT_FALSE(accounts().signIn(tokenOf("Ada")));
  start();
  EXPECT_EQ(service->defaultContainerURL(), other);
}

TEST_F(LocalAccountsTest, WhatTheFileSaysOtherwiseStaysWithTheAccount) {
  writeAccount("Token=abc\nSignedIn=true\nAllowance=5000\nUpgradePage=https://example.org\nOther=x\n");
  ASSERT_FALSE(accounts().add("Ada"));
  EXPECT_EQ(readAccountFile(data + "/account.ini", log).value->upgrade, std::nullopt);
  ASSERT_FALSE(accounts().signIn("abc"));
  const std::string text = read(data + "/account.ini");
  EXPECT_NE(text.find("Allowance=5000"), std::string::npos);
  EXPECT_NE(text.find("UpgradePage=https://example.org"), std::string::npos);
  EXPECT_NE(text.find("Other=x"), std::string::npos);
}

TEST_F(LocalAccountsTest, NamesAreNamesAndOnce) {
  EXPECT_EQ(accounts().add("")->code, FileErrorCode::WriteInvalidFileName);
  EXPECT_EQ(accounts().add("  \t ")->code, FileErrorCode::WriteInvalidFileName);
  EXPECT_EQ(accounts().add("a\nb")->code, FileErrorCode::WriteInvalidFileName);
  EXPECT_EQ(accounts().add("a\xff")->code, FileErrorCode::WriteInvalidFileName);
  EXPECT_EQ(accounts().add(std::string(101, 'a'))->code, FileErrorCode::WriteInvalidFileName);
  ASSERT_FALSE(accounts().add("  Ada [=;] "));
  EXPECT_EQ(known(), "Ada [=;]* first");
  EXPECT_EQ(accounts().add("Ada [=;]")->code, FileErrorCode::WriteFileExists);
}

TEST_F(LocalAccountsTest, UnknownAndDamagedAccountsAreRefused) {
  const std::string before = read(data + "/account.ini");
  EXPECT_EQ(accounts().signIn("unknown")->code, FileErrorCode::NoSuchFile);
  EXPECT_EQ(accounts().signIn("../account")->code, FileErrorCode::NoSuchFile);
  write(data + "/accounts/bad.ini", "garbage");
  EXPECT_EQ(accounts().signIn("bad")->code, FileErrorCode::NoSuchFile);
  EXPECT_EQ(known(), "first*");
  EXPECT_GE(log.count("can't read an account"), 1);
  EXPECT_EQ(read(data + "/account.ini"), before);
}

TEST_F(LocalAccountsTest, AnAccountThatIsKnownOutlivesItsDamagedFile) {
  const std::string first = service->ubiquityIdentityToken()->opaque;
  ASSERT_FALSE(accounts().add("Ada"));
  const std::string ada = tokenOf("Ada");
  write(data + "/account.ini", "garbage");
  start();
  EXPECT_EQ(service->ubiquityIdentityToken()->opaque, first);
  EXPECT_EQ(known(), "Ada first*");
  ASSERT_FALSE(accounts().signIn(ada));
}

TEST_F(LocalAccountsTest, AWriteThatCrashesLeavesTheAccountThatWas) {
  const std::string before = read(data + "/account.ini");
  // What a crash in the middle of a write leaves: a temporary file beside the true one.
  write(data + "/.vaelo-0123456789abcdef.tmp", "[Account]\nTok");
  write(data + "/accounts/.vaelo-0123456789abcdef.tmp", "[Acc");
  start();
  EXPECT_FALSE(service->accountWasDamaged());
  EXPECT_EQ(read(data + "/account.ini"), before);
  EXPECT_EQ(known(), "first*");
}

TEST_F(LocalAccountsTest, ADiskThatRefusesKeepsTheAccount) {
  if (::geteuid() == 0) GTEST_SKIP() << "root may write everywhere";
  const auto token = service->ubiquityIdentityToken();
  std::filesystem::permissions(data, std::filesystem::perms::owner_read | std::filesystem::perms::owner_exec);
  EXPECT_TRUE(accounts().add("Ada"));
  EXPECT_TRUE(accounts().signOut());
  std::filesystem::permissions(data, std::filesystem::perms::owner_all);
  EXPECT_EQ(service->ubiquityIdentityToken(), token);
  EXPECT_EQ(known(), "first*");
}

/// Another process, which does to the account file what a second window of the program would.
void runOther(const std::string& script) {
  std::string shell = "/bin/sh", option = "-c", text = script;
  char* arguments[] = {shell.data(), option.data(), text.data(), nullptr};
  int status = -1;
  ASSERT_TRUE(
      g_spawn_sync(nullptr, arguments, nullptr, G_SPAWN_DEFAULT, nullptr, nullptr, nullptr, nullptr, &status, nullptr));
  ASSERT_EQ(status, 0);
}

TEST_F(LocalAccountsTest, AnotherProcessSwitchesTheAccountOfThisOne) {
  const std::string first = service->ubiquityIdentityToken()->opaque;
  ASSERT_FALSE(accounts().add("Ada"));
  ASSERT_TRUE(waitForChanges(1));
  runOther("cd '" + data + "' && cp accounts/" + first + ".ini x && mv x account.ini");
  ASSERT_TRUE(waitForChanges(2));
  EXPECT_EQ(service->ubiquityIdentityToken()->opaque, first);
  EXPECT_EQ(service->defaultContainerURL(), URL(drive));
  runOther("cd '" + data + "' && sed s/SignedIn=true/SignedIn=false/ account.ini >x && mv x account.ini");
  ASSERT_TRUE(waitForChanges(3));
  EXPECT_FALSE(service->ubiquityIdentityToken());
}

TEST_F(LocalAccountsTest, ProcessesThatChangeAtOnceLeaveOneWholeAccount) {
  ASSERT_FALSE(accounts().add("Ada"));
  const pid_t child = ::fork();
  if (child == 0) {
    LocalAccounts theirs = accounts();
    for (int i = 0; i < 20; ++i) theirs.add("theirs " + std::to_string(i));
    ::_exit(0);
  }
  for (int i = 0; i < 20; ++i) EXPECT_FALSE(accounts().add("ours " + std::to_string(i)));
  int status = 0;
  ASSERT_EQ(::waitpid(child, &status, 0), child);
  EXPECT_EQ(accounts().all().size(), 42u);
  EXPECT_TRUE(readAccountFile(data + "/account.ini", log));
}

}  // namespace

}  // namespace vaelo::drive_test
