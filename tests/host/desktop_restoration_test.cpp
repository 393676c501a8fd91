// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/restoration_store.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {

namespace {

class DesktopRestorationTest : public drive_test::DriveTest {
 protected:
  const std::string path = root + "/state/restoration.ini";
};

TEST_F(DesktopRestorationTest, PlacesAndNumbersComeBack) {
  const Dictionary values{{"url", Value(URL("/a/b = [c]\n\xff", true))},
                          {"document", Value(URL("/a/ü"))},
                          {"Preview = Mode", Value(std::int64_t{-1})},
                          {"dropped", Value("text")}};
  RestorationStore(path).save(values);
  const Dictionary back = RestorationStore(path).load();
  ASSERT_EQ(back.size(), 3u);
  EXPECT_EQ(*back.at("url").get<URL>(), *values.at("url").get<URL>());
  EXPECT_TRUE(back.at("url").get<URL>()->hasDirectoryPath());
  EXPECT_FALSE(back.at("document").get<URL>()->hasDirectoryPath());
  EXPECT_EQ(back.at("Preview = Mode").signedValue(), -1);
}

TEST_F(DesktopRestorationTest, NothingKeptAndDamageAreEmpty) {
  EXPECT_TRUE(RestorationStore(path).load().empty());
  write(path, "damaged");
  EXPECT_TRUE(RestorationStore(path).load().empty());
  write(path, "[URLs]\nurl=http://host/a\nbad=%zz\nnul=file:///a%00b\n[Integers]\nmode=12x\n");
  EXPECT_TRUE(RestorationStore(path).load().empty());
}

}  // namespace

}  // namespace vaelo
