// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

enum class SizeClass { Unspecified, Compact, Regular };
enum class InterfaceIdiom { Phone, Slate, Desktop };

/// The room and the kind of device that a screen finds itself in.
struct TraitCollection {
  SizeClass horizontalSizeClass = SizeClass::Unspecified;
  SizeClass verticalSizeClass = SizeClass::Unspecified;
  InterfaceIdiom idiom = InterfaceIdiom::Phone;
  double displayScale = 1;
  bool rightToLeft = false;
  friend bool operator==(const TraitCollection&, const TraitCollection&) = default;
};

}  // namespace vaelo
