// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/url.h"

#include <gtest/gtest.h>

#include "platform/archive.h"
#include "platform/url_components.h"

namespace vaelo {
namespace {

TEST(URLTest, dropsDoubledAndTrailingSlashesButKeepsDots) {
  EXPECT_EQ(URL("/a//b/../c/").path(), "/a/b/../c");
  EXPECT_TRUE(URL("/a/").hasDirectoryPath());
  EXPECT_FALSE(URL("/a").hasDirectoryPath());
  EXPECT_EQ(URL("/").lastPathComponent(), "/");
}

TEST(URLTest, equalityIsThatOfPathsAndIdentityThatOfTheObject) {
  const URL a("/a/b");
  const URL copy = a;
  const URL other("/a/b", true);
  EXPECT_EQ(a, other);
  EXPECT_TRUE(a.sameObject(copy));
  EXPECT_FALSE(a.sameObject(other));
}

TEST(URLTest, extensionNeedsAStemAndNoBlank) {
  EXPECT_EQ(URL("/archive.tar.gz").pathExtension(), "gz");
  EXPECT_EQ(URL("/.hidden").pathExtension(), "");
  EXPECT_EQ(URL("/plain").pathExtension(), "");
  EXPECT_EQ(URL("/Dr. Who").pathExtension(), "");
  EXPECT_EQ(URL("/ends.").pathExtension(), "");
}

TEST(URLTest, insideComparesComponentsNotLetters) {
  EXPECT_TRUE(URL("/mirror/a").isInside(URL("/mirror")));
  EXPECT_TRUE(URL("/mirror").isInside(URL("/mirror")));
  EXPECT_FALSE(URL("/mirror2/a").isInside(URL("/mirror")));
}

TEST(URLTest, fileURLStringsRoundTripAnyBytes) {
  const URL url("/a b/\xff%/\xc3\xa4", true);
  EXPECT_EQ(url.absoluteString(), "file:///a%20b/%FF%25/%C3%A4/");
  EXPECT_EQ(URL::fromFileURLString(url.absoluteString()), url);
}

TEST(URLTest, refusesWhatIsNoLocalFile) {
  for (const char* text :
       {"http:///a", "file://elsewhere/a", "file:relative", "file:///a%2", "file:///a%zz", "file:///%00", ""}) {
    EXPECT_EQ(URL::fromFileURLString(text), std::nullopt) << text;
  }
  EXPECT_EQ(URL::fromFileURLString("file://localhost/a"), URL("/a"));
}

TEST(URLComponentsTest, splitsAndDecodesOnce) {
  const auto parts = URLComponents::parse("scheme://host/a%2520b?mode=info&flag&x=%26#part");
  ASSERT_TRUE(parts);
  EXPECT_EQ(parts->scheme, "scheme");
  EXPECT_EQ(parts->host, "host");
  EXPECT_EQ(parts->path, "/a%20b");
  ASSERT_EQ(parts->queryItems.size(), 3u);
  EXPECT_EQ(parts->queryItems[0].value, "info");
  EXPECT_EQ(parts->queryItems[1].name, "flag");
  EXPECT_EQ(parts->queryItems[1].value, std::nullopt);
  EXPECT_EQ(parts->queryItems[2].value, "&");
}

TEST(URLComponentsTest, refusesWhatNoURLMayHold) {
  for (const char* text :
       {"scheme:/a b", "scheme:/%zz", "scheme:/%ff", "scheme:/%00", "1x:/a", "scheme:/\xc3\xa4", "s:/?a=%2"}) {
    EXPECT_FALSE(URLComponents::parse(text)) << text;
  }
}

TEST(PercentTest, encodesAllButUnreservedAndSlash) {
  EXPECT_EQ(percentEncoded("/a-._~ ?%"), "/a-._~%20%3F%25");
  EXPECT_EQ(percentDecoded("%E2%82%AC"), "\xe2\x82\xac");
  EXPECT_EQ(percentDecoded("%C0%80"), std::nullopt);
  EXPECT_EQ(percentDecoded("%ED%A0%80"), std::nullopt);
}

TEST(ArchiveTest, unarchivesOnlyItsOwnKind) {
  const URL url("/a/b");
  const UbiquityIdentityToken token{"secret"};
  EXPECT_EQ(unarchiveURL(archiveURL(url)), url);
  EXPECT_EQ(unarchiveToken(archiveToken(token)), token);
  EXPECT_EQ(unarchiveURL(archiveToken(token)), std::nullopt);
  EXPECT_EQ(unarchiveToken(archiveURL(url)), std::nullopt);
  EXPECT_EQ(unarchiveURL(Data{1, 2, 3}), std::nullopt);
  EXPECT_EQ(unarchiveToken(Data{}), std::nullopt);
}

}  // namespace
}  // namespace vaelo
