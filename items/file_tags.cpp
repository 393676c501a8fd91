// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/file_tags.h"

#include <memory>
#include <mutex>

#include "items/vlo_log.h"
#include "platform/platform.h"
#include "platform/ui/graphics.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

namespace {

constexpr const char* TagDictionaryKey = "RoverTagDict";
constexpr const char* VersionKey = "RoverTagDictVersion";
constexpr const char* TagsKey = "RoverTags";
constexpr const char* NameKey = "n";
constexpr const char* LabelKey = "l";
constexpr std::uint64_t KnownVersion = 2;

struct Tags {
  std::vector<std::string> names;
  std::map<std::string, Color> colors;
};

std::mutex mutex;
std::shared_ptr<const Tags> tags = std::make_shared<Tags>();  // guarded by mutex; what it points to never changes
std::once_flag firstUse;
NotificationCenter::Token observation;  // written once, at the first use

std::shared_ptr<const Tags> currentTags() {
  std::call_once(firstUse, [] {
    observation = Platform::current().notifications.addObserver(
        SyncedStoreDidChangeExternallyNotification, [](const Notification&) { FileTags::_tagColorsDidChange(); });
    FileTags::_tagColorsDidChange();
  });
  const std::lock_guard lock(mutex);
  return tags;
}

Value entryOf(const Dictionary& dictionary, const char* key) {
  const auto found = dictionary.find(key);
  return found == dictionary.end() ? Value() : found->second;
}

Color blendedWithWhite(const Color& color) {
  const auto half = [](double channel) { return (channel + 1) / 2; };
  return {half(color.red), half(color.green), half(color.blue), 1};
}

}  // namespace

std::map<std::string, Color> FileTags::tagColorsByTag() { return currentTags()->colors; }

std::vector<std::string> FileTags::allTags() { return currentTags()->names; }

const std::array<Color, 8>& FileTags::_tagBlipColors() {
  static const std::array<Color, 8> colors = {
      Color{0.8, 0.8, 0.8, 1}, Color::systemGray(),   Color::systemGreen(), Color::systemPurple(),
      Color::systemBlue(),     Color::systemYellow(), Color::systemRed(),   Color::systemOrange(),
  };
  return colors;
}

void FileTags::_tagColorsDidChange() {
  const Value stored = Platform::current().syncedStore.objectForKey(TagDictionaryKey);
  const Dictionary* dictionary = stored.dictionary();
  if (dictionary) {
    const std::uint64_t version = entryOf(*dictionary, VersionKey).unsignedValue();
    if (version != KnownVersion) {
      VLO_DEBUG("Rover tag dictionary has incorrect version (%lu, should be 2)", version);
      dictionary = nullptr;
    }
  }
  auto read = std::make_shared<Tags>();
  if (!dictionary || dictionary->empty()) VLO_WARNING("Rover tag dictionary is empty");
  const Value list = dictionary ? entryOf(*dictionary, TagsKey) : Value();
  if (const Array* entries = list.array()) {
    const auto& table = _tagBlipColors();
    for (const Value& value : *entries) {
      // Other programs write the list: what isn't a named tag is passed over.
      const Dictionary* entry = value.dictionary();
      const Value name = entry ? entryOf(*entry, NameKey) : Value();
      const std::string* text = name.get<std::string>();
      if (!text) continue;
      const std::uint64_t label = entryOf(*entry, LabelKey).unsignedValue();
      read->names.push_back(*text);
      read->colors[*text] = table[label < table.size() ? label : 0];
    }
  }
  const std::lock_guard lock(mutex);
  tags = std::move(read);
}

ImageRef FileTags::blipWithTagImageSizeBlipHeightOffset(const std::string& tag, const Size& imageSize, double blipHeight,
                                                        const Point& offset) {
  if (tag.empty()) return nullptr;
  // Not a copy: there may be thousands of tags, and an item may have many of them.
  const std::shared_ptr<const Tags> known = currentTags();
  const auto color = known->colors.find(tag);
  return Platform::current().screens.graphics().renderImage(imageSize, [&](DrawingContext& context) {
    if (color == known->colors.end()) return;
    const Rect circle = Rect{offset.x, offset.y, blipHeight, blipHeight}.insetBy(1, 1);
    context.setFillColor(color->second);
    context.fillEllipse(circle);
    context.setLineWidth(1);
    context.setStrokeColor(blendedWithWhite(color->second));
    context.strokeEllipse(circle);
  });
}

}  // namespace vaelo
