// SPDX-License-Identifier: GPL-3.0-or-later
#include <fcntl.h>
#include <sys/mount.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "host/desktop/restoration_store.h"
#include "host/files/ini_preferences.h"
#include "host/files/local_file_manager.h"
#include "tests/host/drive_service_fixture.h"

namespace vaelo::drive_test {

/// The data folder lies on a small disk of its own, which a test can fill.
class BadInputDiskTest : public DriveServiceTest {
 protected:
  void SetUp() override {
    makeFolder(data);
    if (::mount("none", data.c_str(), "tmpfs", 0, "size=1m") != 0) {
      GTEST_SKIP() << "a disk of its own can't be mounted: " << std::strerror(errno);
    }
    mounted_ = true;
  }
  void TearDown() override {
    service.reset();
    if (mounted_) ::umount2(data.c_str(), MNT_DETACH);
  }
  void fill() {
    const int file = ::open((data + "/filler").c_str(), O_WRONLY | O_CREAT | O_APPEND, 0600);
    const std::string page(4096, 'x');
    while (::write(file, page.data(), page.size()) > 0) {
    }
    EXPECT_EQ(errno, ENOSPC);
    ::close(file);
  }
  void makeRoom() { std::filesystem::remove(data + "/filler"); }
  /// What stands below the data folder besides the index and the filler: nothing half written may stay behind.
  std::vector<std::string> leftovers() const {
    std::vector<std::string> found;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(data)) {
      const std::string name = entry.path().filename();
      if (name.find(".tmp") != std::string::npos || name.find(".vaelo-move") != std::string::npos) found.push_back(name);
    }
    return found;
  }

 private:
  bool mounted_ = false;
};

TEST_F(BadInputDiskTest, TheFirstStartFailsWithAReasonAndGoesWellLater) {
  fill();
  start();
  EXPECT_FALSE(service->ubiquityIdentityToken());
  ASSERT_TRUE(service->setUpFailure());
  EXPECT_EQ(service->setUpFailure()->code, FileErrorCode::WriteOutOfSpace);
  EXPECT_EQ(log.count("drive: can't make the local account: "), 1);
  EXPECT_EQ(leftovers(), std::vector<std::string>());
  makeRoom();
  start();
  EXPECT_FALSE(service->setUpFailure());
  EXPECT_TRUE(service->ubiquityIdentityToken());
  EXPECT_TRUE(exists(drive + "/Welcome to Vaelo Drive.md"));
}

TEST_F(BadInputDiskTest, ADriveIsReadAndItsDocumentsAreWhole) {
  start();
  write(drive + "/a.txt");
  fill();
  start();
  EXPECT_TRUE(service->ubiquityIdentityToken());
  EXPECT_EQ(service->allContainers().size(), 1u);
  EXPECT_EQ(read(drive + "/a.txt"), "content");
  // An identifier may fail, but then with a reason, and the document has none afterwards rather than half of one.
  const Result<std::int64_t> id = service->index().documentIDFor(drive + "/a.txt", true);
  if (id.error) {
    EXPECT_EQ(id.error->domain, FileErrorDomain);
    EXPECT_EQ(attribute(drive + "/a.txt", "user.vaelo.docid"), "");
  }
  makeRoom();
  EXPECT_GT(service->index().documentIDFor(drive + "/a.txt", true).value.value_or(0), 0);
  EXPECT_FALSE(service->index().wasRebuilt());
}

TEST_F(BadInputDiskTest, APromiseThatCannotBeRewrittenStaysAsItWas) {
  start();
  PromiseInfo info;
  info.name = "away.pdf";
  info.size = 5;
  ASSERT_FALSE(writePromise(drive, info));
  fill();
  info.size = 7;
  const auto error = writePromise(drive, info);
  ASSERT_TRUE(error);
  EXPECT_EQ(error->code, FileErrorCode::WriteOutOfSpace);
  EXPECT_EQ(readPromise(drive + "/.away.pdf.vlopromise").value->size, 5u);
  EXPECT_EQ(leftovers(), std::vector<std::string>());
}

TEST_F(BadInputDiskTest, AMoveOntoItLeavesTheSourceWhole) {
  start();
  write(root + "/outside/big", std::string(900000, 'b'));
  write(root + "/outside/bigger", std::string(900000, 'c'));
  LocalFileManager manager;
  const auto error = manager.moveItemAtURL(URL(root + "/outside", true), URL(drive + "/inside", true));
  ASSERT_TRUE(error);
  EXPECT_EQ(error->code, FileErrorCode::WriteOutOfSpace);
  EXPECT_TRUE(error->localizedDescription);
  EXPECT_EQ(read(root + "/outside/big"), std::string(900000, 'b'));
  EXPECT_EQ(read(root + "/outside/bigger"), std::string(900000, 'c'));
  EXPECT_FALSE(exists(drive + "/inside"));
  EXPECT_EQ(leftovers(), std::vector<std::string>());
}

TEST_F(BadInputDiskTest, AMoveWithinItNeedsNoRoom) {
  start();
  write(drive + "/a.txt");
  fill();
  LocalFileManager manager;
  EXPECT_FALSE(manager.moveItemAtURL(URL(drive + "/a.txt"), URL(drive + "/b.txt")));
  EXPECT_EQ(read(drive + "/b.txt"), "content");
}

TEST_F(BadInputDiskTest, StateAndPreferencesKeepWhatTheyHad) {
  RestorationStore state(data + "/restoration.ini");
  ASSERT_FALSE(state.save({{"place", Value(URL(drive, true))}}));
  IniPreferences preferences(data + "/preferences.ini", log);
  preferences.setDataForKey("kept", {1, 2});
  fill();
  const auto error = state.save({{"place", Value(URL("/elsewhere"))}});
  ASSERT_TRUE(error);
  EXPECT_EQ(error->code, FileErrorCode::WriteOutOfSpace);
  preferences.setDataForKey("kept", {3});
  EXPECT_EQ(log.count("Preferences can't be saved: "), 1);
  EXPECT_EQ(state.load()["place"].get<URL>()->path(), drive);
  EXPECT_EQ(IniPreferences(data + "/preferences.ini", log).dataForKey("kept"), (Data{1, 2}));
  EXPECT_EQ(leftovers(), std::vector<std::string>());
}

}  // namespace vaelo::drive_test
