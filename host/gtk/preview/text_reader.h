// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "host/gtk/list/worker.h"

namespace vaelo {

/// How much of a text is shown. A text view takes some multiple of a text's size and a record for each line.
struct TextLimits {
  std::uint64_t bytes = 64 * 1024 * 1024;
  std::size_t lines = 1'000'000;
  std::size_t lineCharacters = 2000;
};

/// The next piece of a text document.
struct TextPiece {
  std::string text;             ///< for a text view; may be empty
  const char* error = nullptr;  ///< a word of DecoderError; then there is nothing else
  bool last = false;
  bool shortened = false;       ///< with the last piece: the document goes on, but not for us
  bool brokeLines = false;      ///< lines were too long, and go on in the next
  std::size_t longestLine = 0;  ///< in characters, up to here
  std::uint64_t bytesRead = 0;  ///< of the document, up to here
  std::uint64_t documentBytes = 0;
};

/// Reads a text document on a thread of its own, a piece each time it is asked to, so that no more is in memory than what is
/// shown. The first piece is small, for a quick first screen. Main thread.
class TextReader {
 public:
  explicit TextReader(const std::string& path, const TextLimits& limits = {});

  /// To be asked when the piece before was received, and not after the last one. `received` is not called after the object
  /// is gone.
  void next(std::function<void(TextPiece)> received);

 private:
  struct Reading;
  std::shared_ptr<Reading> reading_;
  Worker worker_;
};

}  // namespace vaelo
