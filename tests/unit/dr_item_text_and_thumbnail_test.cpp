// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/dr_item.h"
#include "tests/support/test_image.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

using K = ResourceKey;

const URL Item("/drive/mirror/com~marrow~Kestrel/item");

/// What a record tells of itself, and its thumbnail.
class DRItemTextTest : public ItemsTest {
 protected:
  std::shared_ptr<DRItem> filled(ResourceMap values = {}) {
    world.addFile(Item, std::move(values));
    auto item = DRItem::initWithURL(Item);
    world.calls.clear();
    return item;
  }
};

TEST_F(DRItemTextTest, descriptionOfALocalDirectory) {
  const auto item = filled({{K::Name, "item"}, {K::IsDirectory, true}});
  EXPECT_EQ(item->description(),
            "Name=item, Size=(null), URL=file:///drive/mirror/com~marrow~Kestrel/item, ResURL=<same>, "
            "PromiseURL=<same>, Directory, Local,");
}

TEST_F(DRItemTextTest, descriptionOfAPromisedPackageBehindALink) {
  world.linkTargets.insert_or_assign(Item.path(), URL("/target"));
  world.physicalOfLogical.insert_or_assign(Item.path(), URL("/physical"));
  const auto item = filled(
      {{K::Name, "item"}, {K::FileSize, std::uint64_t{9}}, {K::TypeIdentifier, "public.symlink"}, {K::IsPackage, true}});
  item->setIsPromise(true);
  EXPECT_EQ(item->description(),
            "Name=item, Size=9, URL=file:///drive/mirror/com~marrow~Kestrel/item, ResURL=file:///target, "
            "PromiseURL=file:///physical, Package, Promise, Symlink, ");
}

TEST_F(DRItemTextTest, datesAreToldInTheStyleAskedForWithAShortTime) {
  const auto item = filled({{K::CreationDate, Date(std::chrono::seconds(60))}});
  EXPECT_EQ(item->friendlyCreationDate(DateStyle::Long), "60 s, date 3, time 1...");
  EXPECT_FALSE(item->friendlyContentModificationDate(DateStyle::Long));
  item->setContentModificationDate(Date(std::chrono::seconds(61)));
  EXPECT_EQ(item->friendlyContentModificationDate(DateStyle::Medium), "61 s, date 2, time 1..");
  EXPECT_FALSE(DRItem::friendlyDateStyle(Value("yesterday"), DateStyle::Long));
}

TEST_F(DRItemTextTest, theThumbnailIsLookedForOnceInAFill) {
  const auto image = std::make_shared<TestImage>();
  const auto item = filled({{K::ThumbnailDictionary, Dictionary{{Thumbnail1024SizeKey, ImageRef(image)}}}});
  world.securityScoped = true;
  EXPECT_FALSE(item->thumbnailFetched());
  EXPECT_EQ(item->thumbnail(), image);
  EXPECT_TRUE(item->thumbnailFetched());
  const std::string path = Item.path();
  EXPECT_EQ(world.calls,
            (std::vector<std::string>{"start " + path, "coordinator", "read " + path, "promised " + path, "stop " + path}));
  EXPECT_EQ(world.lastOptions, ReadingImmediatelyAvailableMetadataOnly);
  EXPECT_EQ(world.lastKeys, std::vector{K::ThumbnailDictionary});
  EXPECT_TRUE(logged("DEBUG", std::string("URL Thumbs: { ") + Thumbnail1024SizeKey + " = <image>; }"));
  world.calls.clear();
  EXPECT_EQ(item->thumbnail(), image);
  EXPECT_TRUE(world.calls.empty());
}

TEST_F(DRItemTextTest, aFailedLookForTheThumbnailIsNotRepeatedUntilTheNextFill) {
  const auto item = filled();
  EXPECT_FALSE(item->thumbnail());
  EXPECT_FALSE(world.called("stop " + Item.path()));
  world.calls.clear();
  EXPECT_FALSE(item->thumbnail());
  EXPECT_TRUE(world.calls.empty());
  item->cacheValues();
  world.calls.clear();
  item->thumbnail();
  EXPECT_TRUE(world.called("read " + Item.path()));
}

TEST_F(DRItemTextTest, onlyAnImageOfTheRightSizeInADictionaryIsAThumbnail) {
  const auto item = filled();
  const auto first = std::make_shared<TestImage>();
  item->setThumbnail(first);
  world.recordedLog.clear();
  item->updateThumbnailImage("no dictionary");
  item->updateThumbnailImage(Value());
  EXPECT_TRUE(messages().empty());
  item->updateThumbnailImage(Dictionary{});
  item->updateThumbnailImage(Dictionary{{"64", ImageRef(std::make_shared<TestImage>())}});
  item->updateThumbnailImage(Dictionary{{Thumbnail1024SizeKey, "no image"}});
  EXPECT_EQ(messages().size(), 3u);
  EXPECT_TRUE(logged("DEBUG", "URL Thumbs: { }"));
  EXPECT_EQ(item->thumbnail(), first);
}

TEST_F(DRItemTextTest, theRecordDrawsNoThumbnails) {
  const auto item = filled();
  EXPECT_FALSE(item->canGenerateThumbnail());
  int completions = 0;
  item->generateThumbnail([&](const ImageRef& image) {
    ++completions;
    EXPECT_FALSE(image);
  });
  EXPECT_EQ(completions, 1);
}

TEST_F(DRItemTextTest, theThumbnailQueueIsOneAndInTheBackground) {
  const auto& queue = DRItem::getThumbnailQueue();
  EXPECT_EQ(queue, DRItem::getThumbnailQueue());
  EXPECT_EQ(queue->name(), "thumbnailQueue");
  EXPECT_EQ(queue->qualityOfService(), QualityOfService::Background);
}

}  // namespace
}  // namespace vaelo
