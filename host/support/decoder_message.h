// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <optional>
#include <string>

#include "host/support/unique_fd.h"

namespace vaelo {

/// What the application and the decoder of previews send each other over a SOCK_SEQPACKET socket: a line of words, and a
/// file for what is long (pixels, text). What comes from the decoder has seen hostile documents and is read with care.
struct DecoderMessage {
  static constexpr std::size_t MaximumText = 64 * 1024;

  std::string text;
  UniqueFd file;
};

/// Blocks until it is sent; false when the other side is gone or the text is longer than MaximumText. Any thread.
bool sendDecoderMessage(int socket, const DecoderMessage& message);
/// Blocks until one comes; nothing when the other side is gone. Any thread.
std::optional<DecoderMessage> receiveDecoderMessage(int socket);

}  // namespace vaelo
