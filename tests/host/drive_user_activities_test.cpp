// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/drive_user_activities.h"

#include <thread>

#include "host/drive/activity_file.h"
#include "host/drive/device_identity.h"
#include "host/files/glib_queues.h"
#include "tests/host/drive_test_support.h"
#include "tests/host/list_test_folder.h"

namespace vaelo {

namespace {

using list_test::waitUntil;

constexpr const char* type = "org.example.viewing";

/// Two devices on one mirror: this one, and others as files that the drive carried here.
class DriveUserActivitiesTest : public drive_test::DriveTest {
 protected:
  DriveUserActivitiesTest() {
    makeFolder(mirror);
    makeFolder(folder);
    write(data + "/device.ini", "[Device]\nID=own\nName=Writing Desk\n");
  }
  ~DriveUserActivitiesTest() override { stop(); }
  void start() {
    activities = std::make_unique<DriveUserActivities>(layout, log, queues);
    activities->watchOthers([this](const std::optional<OfferedActivity>& now) {
      ++changes;
      offered = now;
    });
  }
  void stop() { activities.reset(); }
  std::shared_ptr<UserActivity> publish(const std::string& document) {
    const std::shared_ptr<UserActivity> activity = activities->makeActivity(type);
    activity->setEligibleForBaton(true);
    activity->setUserInfo({{UserActivityDocumentURLKey, document}});
    activity->becomeCurrent();
    return activity;
  }
  std::string documentOffered() const {
    if (!offered) return "";
    const Dictionary userInfo = offered->activity->userInfo();
    const auto found = userInfo.find(UserActivityDocumentURLKey);
    return found == userInfo.end() ? "" : *found->second.get<std::string>();
  }
  static long secondsAgo(long seconds) { return static_cast<long>(time(nullptr)) - seconds; }
  static std::string fileOf(const std::string& name, const std::string& document, long since) {
    return "[Activity]\nDevice=" + name + "\nType=" + type + "\nSince=" + std::to_string(since) +
           "\n[UserInfo]\nactivity-document-url=" + document + "\n";
  }
  /// As the drive puts a file there: in one step.
  void arrives(const std::string& file, const std::string& text) {
    write(root + "/arriving", text);
    rename(root + "/arriving", folder + "/" + file);
  }
  bool becomes(const std::function<bool()>& condition) { return waitUntil(condition); }

  DriveLayout layout{data};
  const std::string folder = mirror + "/.vaelo/activities";
  const std::string own = folder + "/own.ini";
  GLibQueues queues;
  std::unique_ptr<DriveUserActivities> activities;
  std::optional<OfferedActivity> offered;
  int changes = 0;
};

TEST_F(DriveUserActivitiesTest, TheCurrentActivityIsAFileThatGoesWhenItResigns) {
  start();
  const auto activity = publish("vlo1:7:a");
  stop();  // waits for what is to be written
  const Result<ActivityRecord> record = readActivityFile(own, queues.now());
  ASSERT_TRUE(record);
  EXPECT_EQ(record.value->deviceName, "Writing Desk");
  EXPECT_EQ(record.value->type, type);
  EXPECT_EQ(record.value->userInfo.at(UserActivityDocumentURLKey), "vlo1:7:a");

  start();
  const auto again = publish("vlo1:8:b");
  again->resignCurrent();
  stop();
  EXPECT_FALSE(exists(own));
}

TEST_F(DriveUserActivitiesTest, WhatIsCurrentIsNotToldToTheDevicesOfAnotherAccount) {
  start();
  const auto activity = publish("vlo1:7:a");
  ASSERT_TRUE(becomes([this] { return exists(own); }));
  layout.setMirror("accounts/0b");
  activities->accountChanged();
  const auto later = publish("vlo1:8:b");
  stop();
  EXPECT_FALSE(exists(own));
  EXPECT_NE(read(data + "/accounts/0b/.vaelo/activities/own.ini").find("vlo1:8:b"), std::string::npos);
}

TEST_F(DriveUserActivitiesTest, OneReplacesTheOtherAndThenOnlyItsOwnResignationCounts) {
  start();
  const auto first = publish("first");
  const auto second = publish("second");
  first->resignCurrent();
  stop();
  EXPECT_NE(read(own).find("second"), std::string::npos);
}

TEST_F(DriveUserActivitiesTest, WhatIsNotOfferedIsNotWritten) {
  start();
  const auto activity = activities->makeActivity(type);
  activity->setUserInfo({{UserActivityDocumentURLKey, "secret"}});
  activity->becomeCurrent();
  stop();
  EXPECT_FALSE(exists(own));
}

TEST_F(DriveUserActivitiesTest, AnActivityThatSaysSomethingElseIsWrittenAnew) {
  start();
  const auto activity = publish("first");
  activity->setUserInfo({{UserActivityDocumentURLKey, "second"}, {"a=b]\n", "no key"}, {"number", 3.0}});
  stop();
  EXPECT_NE(read(own).find("second"), std::string::npos);
  EXPECT_EQ(read(own).find("no key"), std::string::npos);
}

TEST_F(DriveUserActivitiesTest, WhatACrashLeftBehindGoes) {
  write(own, fileOf("Writing Desk", "left", secondsAgo(60)));
  start();
  stop();
  EXPECT_FALSE(exists(own));
}

TEST_F(DriveUserActivitiesTest, TheLatestOfTheOthersIsOffered) {
  arrives("phone.ini", fileOf("Phone", "older", secondsAgo(100)));
  arrives("slate.ini", fileOf("Slate", "newer", secondsAgo(10)));
  start();
  ASSERT_TRUE(becomes([&] { return offered.has_value(); }));
  EXPECT_EQ(offered->deviceID, "slate");
  EXPECT_EQ(offered->deviceName, "Slate");
  EXPECT_EQ(offered->activity->activityType(), type);
  EXPECT_EQ(documentOffered(), "newer");

  std::filesystem::remove(folder + "/slate.ini");
  EXPECT_TRUE(becomes([&] { return documentOffered() == "older"; }));
  arrives("phone.ini", fileOf("Phone", "another", secondsAgo(5)));
  EXPECT_TRUE(becomes([&] { return documentOffered() == "another"; }));
  std::filesystem::remove(folder + "/phone.ini");
  EXPECT_TRUE(becomes([&] { return !offered; }));
}

TEST_F(DriveUserActivitiesTest, WhatIsOpenHereTooIsNotOffered) {
  start();
  const auto activity = publish("same");
  arrives("slate.ini", fileOf("Slate", "same", secondsAgo(10)));
  arrives("phone.ini", fileOf("Phone", "other", secondsAgo(100)));
  ASSERT_TRUE(becomes([&] { return documentOffered() == "other"; }));
  activity->resignCurrent();
  EXPECT_TRUE(becomes([&] { return documentOffered() == "same"; }));
}

TEST_F(DriveUserActivitiesTest, WhatCantBeBelievedIsIgnoredAndToldOnce) {
  const auto bad = [this](const std::string& id, const std::string& text) { arrives(id + ".ini", text); };
  bad("old", fileOf("Old", "x", secondsAgo(25 * 3600)));
  bad("future", fileOf("Future", "x", secondsAgo(-3600)));
  bad("binary", std::string("\0\1\2\xff[[[", 7));
  bad("empty", "");
  bad("huge", fileOf("Huge", std::string(2 << 20, 'x'), secondsAgo(1)));
  bad("timeless", "[Activity]\nDevice=x\nType=a.b\n");
  bad("overflow", "[Activity]\nDevice=x\nType=a.b\nSince=99999999999999999999\n");
  bad("typeless", "[Activity]\nDevice=x\nSince=" + std::to_string(secondsAgo(1)) + "\n");
  arrives("no device's name!.ini", fileOf("x", "x", secondsAgo(1)));
  arrives("other.txt", fileOf("x", "x", secondsAgo(1)));
  makeFolder(folder + "/folder.ini");
  link("/etc/passwd", folder + "/link.ini");
  ASSERT_EQ(::mkfifo((folder + "/pipe.ini").c_str(), 0600), 0);
  arrives("good.ini", fileOf("Good", "good", secondsAgo(50)));
  start();
  ASSERT_TRUE(becomes([&] { return documentOffered() == "good"; }));
  constexpr int files = 13;
  EXPECT_EQ(log.count("ignored: "), files);
  arrives("good.ini", fileOf("Good", "better", secondsAgo(40)));
  ASSERT_TRUE(becomes([&] { return documentOffered() == "better"; }));
  EXPECT_EQ(log.count("ignored: "), files);
  EXPECT_EQ(log.count("activity old.ini ignored: the activity is too old"), 1);
}

TEST_F(DriveUserActivitiesTest, AFloodOfFilesIsNotReadToItsEnd) {
  for (int i = 0; i < 300; ++i) arrives("d" + std::to_string(i) + ".ini", "nothing");
  start();
  ASSERT_TRUE(becomes([&] { return log.count("too many activities") == 1; }));
  stop();
  EXPECT_LE(log.count("ignored: "), 64);
}

TEST_F(DriveUserActivitiesTest, ANameIsMadeFitToBeShown) {
  const auto shown = [this](const std::string& name) {
    arrives("x.ini", fileOf(name, "x", secondsAgo(1)));
    return readActivityFile(folder + "/x.ini", queues.now()).value->deviceName;
  };
  EXPECT_EQ(shown("Küche"), "Küche");
  EXPECT_EQ(shown("a\xE2\x80\xAE"
                  "b\\nc\\td"),
            "abcd");
  EXPECT_EQ(shown("\xff\xfe"), "another device");
  EXPECT_EQ(shown("  "), "another device");
  EXPECT_EQ(shown(std::string(500, 'n')), std::string(40, 'n') + "…");
}

TEST_F(DriveUserActivitiesTest, AMirrorThatCantBeWrittenIsToldAndNothingElseHappens) {
  std::filesystem::remove_all(mirror);
  write(mirror, "a file in its place");
  start();
  const auto activity = publish("x");
  stop();
  EXPECT_GE(log.count("drive: can't"), 1);
}

/// Without the main loop, whose hand-overs a thread checker does not see.
using DriveUserActivitiesThreadsTest = DriveUserActivitiesTest;

TEST_F(DriveUserActivitiesThreadsTest, ActivitiesComeAndGoOnManyThreads) {
  activities = std::make_unique<DriveUserActivities>(layout, log, queues);
  std::vector<std::thread> threads;
  for (int thread = 0; thread < 4; ++thread) {
    threads.emplace_back([&, thread] {
      for (int i = 0; i < 50; ++i) {
        const auto activity = publish(std::to_string(thread));
        activity->resignCurrent();
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  stop();
  EXPECT_FALSE(exists(own));
}

TEST_F(DriveUserActivitiesTest, ADeviceKeepsItsIdentity) {
  std::filesystem::remove(data + "/device.ini");
  const DeviceIdentity first = deviceIdentity(layout, log);
  EXPECT_TRUE(isDeviceID(first.id));
  EXPECT_EQ(first.name, g_get_host_name());
  EXPECT_EQ(deviceIdentity(layout, log).id, first.id);
  write(data + "/device.ini", "[Device]\nID=../../x\nName=Mine\n");
  const DeviceIdentity mended = deviceIdentity(layout, log);
  EXPECT_TRUE(isDeviceID(mended.id));
  EXPECT_EQ(mended.name, "Mine");
}

}  // namespace

}  // namespace vaelo
