// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/ui/keyboard_notice.h"

namespace vaelo {

namespace {

constexpr const char* BeginFrameKey = "KeyboardBeginFrame";
constexpr const char* EndFrameKey = "KeyboardEndFrame";
constexpr const char* SecondsKey = "KeyboardAnimationSeconds";
constexpr const char* CurveKey = "KeyboardAnimationCurve";

Value packed(const Rect& rect) { return Array{rect.x, rect.y, rect.width, rect.height}; }

double number(const Value& value) {
  const double* const held = value.get<double>();
  return held ? *held : 0;
}

Value entry(const Dictionary& dictionary, const char* key) {
  const auto found = dictionary.find(key);
  return found == dictionary.end() ? Value() : found->second;
}

Rect unpacked(const Value& value) {
  const Array* const parts = value.array();
  if (!parts || parts->size() != 4) return {};
  return {number((*parts)[0]), number((*parts)[1]), number((*parts)[2]), number((*parts)[3])};
}

}  // namespace

Dictionary KeyboardNotice::userInfo() const {
  return {{BeginFrameKey, packed(beginFrame)},
          {EndFrameKey, packed(endFrame)},
          {SecondsKey, seconds},
          {CurveKey, static_cast<std::int64_t>(curve)}};
}

KeyboardNotice KeyboardNotice::from(const Notification& notification) {
  const Dictionary& info = notification.userInfo;
  return {unpacked(entry(info, BeginFrameKey)), unpacked(entry(info, EndFrameKey)), number(entry(info, SecondsKey)),
          static_cast<AnimationCurve>(entry(info, CurveKey).signedValue())};
}

}  // namespace vaelo
