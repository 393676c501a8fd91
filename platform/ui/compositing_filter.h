// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// Names of the ways in which one colour is laid over another, as in the W3C's Compositing and Blending Level 1.
namespace CompositingFilter {
inline constexpr const char* Normal = "normal";
inline constexpr const char* SourceOver = "source-over";
inline constexpr const char* Multiply = "multiply";
inline constexpr const char* Screen = "screen";
inline constexpr const char* Overlay = "overlay";
inline constexpr const char* Darken = "darken";
inline constexpr const char* Lighten = "lighten";
inline constexpr const char* ColorDodge = "color-dodge";
inline constexpr const char* ColorBurn = "color-burn";
inline constexpr const char* PlusLighter = "plus-lighter";
inline constexpr const char* PlusDarker = "plus-darker";
}  // namespace CompositingFilter

}  // namespace vaelo
