// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "platform/image.h"
#include "platform/ui/color.h"
#include "platform/ui/font.h"

namespace vaelo {

struct TextAttributes {
  /// How far above the line's baseline the run stands, in points.
  double baselineOffset = 0;
  /// Absent: those of the view that shows the text.
  std::optional<Font> font;
  std::optional<Color> color;
  friend bool operator==(const TextAttributes&, const TextAttributes&) = default;
};

/// Text in runs, each either characters or one image that stands in the line like a character.
class AttributedString {
 public:
  struct Run {
    std::string text;  ///< empty for an image
    ImageRef image;    ///< null for text
    TextAttributes attributes;
    friend bool operator==(const Run&, const Run&) = default;
  };

  /// The room that is left before an image behind other things, so that it is seen to belong to what follows it. In points.
  static constexpr double RoomBeforeImage = 6;

  AttributedString() = default;
  explicit AttributedString(std::string text, TextAttributes attributes = {}) { append(std::move(text), attributes); }
  void append(std::string text, const TextAttributes& attributes = {});
  void appendImage(ImageRef image, const TextAttributes& attributes = {});

  const std::vector<Run>& runs() const { return runs_; }
  /// The characters alone, without the images.
  std::string plainText() const;
  bool empty() const { return runs_.empty(); }
  friend bool operator==(const AttributedString&, const AttributedString&) = default;

 private:
  std::vector<Run> runs_;
};

}  // namespace vaelo
