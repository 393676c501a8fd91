// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// Why a document can't be shown. The decoder says the first ones; the last two are told of the decoder itself.
namespace DecoderError {
inline constexpr const char* Damaged = "damaged";
inline constexpr const char* TooBig = "too-big";
inline constexpr const char* Locked = "locked";  ///< needs a password
inline constexpr const char* Unsupported = "unsupported";
inline constexpr const char* Gone = "gone";  ///< no such document (any more)
inline constexpr const char* Unreadable = "unreadable";
inline constexpr const char* Crashed = "crashed";
inline constexpr const char* TooSlow = "too-slow";
}  // namespace DecoderError

}  // namespace vaelo
