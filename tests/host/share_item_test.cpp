// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/application_launch.h"
#include "host/desktop/content_type.h"
#include "host/desktop/drive_link.h"
#include "host/desktop/mail_composer.h"
#include "host/desktop/shared_item.h"
#include "host/support/glib_ptr.h"
#include "platform/url_components.h"
#include "tests/host/drive_service_fixture.h"

namespace vaelo {

namespace {

using Words = std::vector<std::string>;

TEST(ShareLinkTest, IsDecodedTwiceToThePathItWasMadeFor) {
  for (const char* path : {"/a/b.txt", "/a b/100%.txt", "/a/%25?x=1&mode=info#f", "/Größe/日本.txt"}) {
    const std::optional<std::string> link = driveLinkTo(URL(path));
    ASSERT_TRUE(link) << path;
    const std::optional<URLComponents> parts = URLComponents::parse(*link);
    ASSERT_TRUE(parts) << *link;
    EXPECT_EQ(parts->scheme, "vaelodriveapp");
    EXPECT_TRUE(parts->queryItems.empty());
    EXPECT_EQ(percentDecoded(parts->path), path);
  }
  EXPECT_EQ(driveLinkTo(URL("/a/\xff.txt")), std::nullopt);
}

TEST(ShareMailTest, ProgramsWithAWayOfTheirOwnAreStartedThatWay) {
  EXPECT_EQ(MailComposer::ownCommand("thunderbird %u", "/a/it's, b.txt"),
            (Words{"thunderbird", "-compose", "attachment='file:///a/it%27s%2C%20b.txt'"}));
  EXPECT_EQ(MailComposer::ownCommand("/usr/bin/flatpak run org.mozilla.Thunderbird @@u %u @@", "/a")[3], "@@u");
  EXPECT_EQ(MailComposer::ownCommand("kmail -caption %c %u", "/a/b.txt"),
            (Words{"kmail", "-caption", "--composer", "--attach", "/a/b.txt", "--subject", "b.txt"}));
  EXPECT_TRUE(MailComposer::ownCommand("evolution %U", "/a").empty());
  EXPECT_TRUE(MailComposer::ownCommand("thunderbird \"", "/a").empty());
}

TEST(ShareMailTest, AllOthersGetALink) {
  EXPECT_EQ(MailComposer::mailtoLink("/a/b & c?.txt"), "mailto:?subject=b%20%26%20c%3F.txt&attach=/a/b%20%26%20c%3F.txt");
}

TEST(ShareLaunchTest, AProgramThatIsGoneIsTold) {
  std::string told;
  EXPECT_FALSE(launchProgram({"/no/such/program", "a b"}, "It", nullptr, [&](const std::string& reason) { told = reason; }));
  EXPECT_NE(told, "");
}

TEST(ShareLaunchTest, ArgumentsArriveAsTheyAre) {
  char folder[] = "/tmp/vaelo-launch-XXXXXX";
  ASSERT_TRUE(mkdtemp(folder));
  const std::string record = std::string(folder) + "/100% of \"it\"";
  EXPECT_TRUE(launchProgram({"/usr/bin/touch", record}, "It", nullptr, [](const std::string&) { ADD_FAILURE(); }));
  const gint64 end = g_get_monotonic_time() + 10 * G_TIME_SPAN_SECOND;
  while (!std::filesystem::exists(record) && g_get_monotonic_time() < end) g_main_context_iteration(nullptr, FALSE);
  EXPECT_TRUE(std::filesystem::exists(record));
  std::filesystem::remove_all(folder);
}

class ShareItemTest : public drive_test::DriveServiceTest {
 protected:
  SharedItem describe(const std::string& path) { return describeSharedItem(URL(path), *service); }
};

TEST_F(ShareItemTest, NamesDecideTheTypeAndFirstBytesWhereTheyDoNot) {
  write(root + "/a.csv", "%PDF-1.4\n");
  write(root + "/noname", "%PDF-1.4\n");
  write(root + "/folder/x", "x");
  EXPECT_EQ(contentTypeOf(root + "/a.csv"), "text/csv");
  EXPECT_EQ(contentTypeOf(root + "/noname"), "application/pdf");
  EXPECT_EQ(contentTypeOf(root + "/folder"), "inode/directory");
  EXPECT_EQ(contentTypeOf(root + "/gone.pdf"), "application/pdf");
}

TEST_F(ShareItemTest, ADocumentOfTheDriveHasOurLinkAndOneOutsideItsPlace) {
  start();
  write(drive + "/a.txt", "content");
  const SharedItem item = describe(drive + "/a.txt");
  EXPECT_TRUE(item.exists && item.downloaded && !item.folder);
  EXPECT_EQ(item.size, 7u);
  EXPECT_EQ(item.link, driveLinkTo(URL(drive + "/a.txt")));
  EXPECT_EQ(item.shareLink, std::nullopt);
  write(root + "/b.txt");
  EXPECT_EQ(describe(root + "/b.txt").link, URL(root + "/b.txt").absoluteString());
}

TEST_F(ShareItemTest, TheAccountsLinkIsToldWhenItIsOne) {
  start();
  write(drive + "/a.txt");
  setAttribute(drive + "/a.txt", "user.vaelo.sharelink", "https://drive.example/s/1");
  EXPECT_EQ(describe(drive + "/a.txt").shareLink, "https://drive.example/s/1");
  setAttribute(drive + "/a.txt", "user.vaelo.sharelink", "javascript:alert(1)");
  EXPECT_EQ(describe(drive + "/a.txt").shareLink, std::nullopt);
}

TEST_F(ShareItemTest, AnItemNotDownloadedIsKnownFromItsPromise) {
  start();
  PromiseInfo promise;
  promise.name = "Thesis.pdf";
  promise.size = 1234;
  makeFolder(drive);
  ASSERT_EQ(writePromise(drive, promise), std::nullopt);
  const SharedItem item = describe(drive + "/Thesis.pdf");
  EXPECT_TRUE(item.exists && !item.downloaded);
  EXPECT_EQ(item.size, 1234u);
  EXPECT_EQ(item.contentType, "application/pdf");
  EXPECT_FALSE(describe(drive + "/gone.pdf").exists);
}

}  // namespace

}  // namespace vaelo
