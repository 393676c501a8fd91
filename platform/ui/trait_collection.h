// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

enum class SizeClass { Compact, Regular };
enum class LayoutDirection { LeftToRight, RightToLeft };
enum class InterfaceIdiom { Phone, Slate, Desktop };

/// What a screen knows of the room that it is shown in.
struct TraitCollection {
  SizeClass horizontalSizeClass = SizeClass::Compact;
  SizeClass verticalSizeClass = SizeClass::Regular;
  LayoutDirection layoutDirection = LayoutDirection::LeftToRight;
  InterfaceIdiom idiom = InterfaceIdiom::Phone;
  double displayScale = 1;
  friend bool operator==(const TraitCollection&, const TraitCollection&) = default;
};

}  // namespace vaelo
